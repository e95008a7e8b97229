// The interface of those who see the trees of a line: rules, and what finds occurrences.
#pragma once

#include "syntax/nodes.h"

namespace codeloom {

// A type hint and what it is about, both by their bytes in the file.
struct CHintNote {
    CSpan name;  // the name or chain; that of the hint where the name isn't on the line
    CSpan hint;
    bool of_function = false;  // a parameter's, or what the function gives back
    bool is_return = false;
    bool in_comment = false;
    int argument_i = -1;  // in a hint that has a function's form, the argument that it is for
};

class CTreeObserver {
  public:
    CTreeObserver() = default;
    CTreeObserver(const CTreeObserver&) = delete;
    CTreeObserver& operator=(const CTreeObserver&) = delete;

    // The tree of a line that parses, then that of each logical embedded in it. A fault may still be found.
    // The tree is good during the call.
    virtual void Take(const CRawLogical& part, const CTree& tree) = 0;

    // A part of a tree that a hint in a comment of the line was made into. `shift` leads from its places to
    // those in the file, as unsigned numbers wrap.
    virtual void TakeHint(const CTree& /*tree*/, const CTreeNode& /*node*/, uint32_t /*shift*/) {}

    // Each hint of a line, after its tree. Asked for only where it is wanted.
    virtual bool WantsHints() const { return false; }
    virtual void TakeHintOf(const CHintNote& /*note*/) {}

  protected:
    ~CTreeObserver() = default;
};

}  // namespace codeloom
