#pragma once

#include <vector>

#include "signatures/signatures.h"
#include "syntax/arguments.h"
#include "syntax/tree.h"
#include "syntax/tree_observer.h"

namespace codeloom {

class CSignatureFinder {
  public:
    explicit CSignatureFinder(CSignatures& found) : _fFound(found) {}

    // Call for every line, in order.
    void BeginLine(const CRawLogical& line, uint32_t line_i);
    // The tree of the line itself.
    void Take(const CTree& tree);
    void TakeHintOf(const CHintNote& note);
    // Call for every line at its end. One with a fault leaves nothing.
    void EndLine(bool has_fault);

  private:
    static constexpr uint32_t kNone = UINT32_MAX;

    void _AddFuncdef(const CTree& tree, const CTreeNode& funcdef, bool is_async);
    void _AddParameters(const CTree& tree, const CTreeNode& parameters, int depth);
    void _MarkPositionalOnly(const CTree& tree, const CTreeNode& parameters);
    void _AddHintOfFunction(const CHintNote& note);
    void _PlaceIndexedHints();

    CSignatures& _fFound;
    const CRawLogical* _fLine = nullptr;
    uint32_t _fLine_i = 0;
    size_t _fFirstSignature = 0;  // of the line
    size_t _fFirstParameter = 0;
    size_t _fFirstHint = 0;
    bool _fIsAfterStar = false;
    std::vector<uint32_t> _fIndexedHints;  // of a hint in a function's form, by argument
};

}  // namespace codeloom
