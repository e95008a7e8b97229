// Who wants to see the trees of a line: rules and what finds occurrences.
#pragma once

#include "syntax/tree.h"

namespace codeloom {

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

  protected:
    ~CTreeObserver() = default;
};

}  // namespace codeloom
