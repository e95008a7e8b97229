// Nodes into short texts, as names are recorded with them: `a.b.c`, `f(x)`.
//
// What is in brackets is shown, and strings of harmless characters as they are; `(a)` is shown as `a`.
// What nests deeper than kMostNesting throws CLimitHit.
#pragma once

#include <cstdint>

#include "syntax/atoms.h"
#include "text/text_buffer.h"

namespace codeloom {

class CTokenJoiner;

enum class ECallText : uint8_t { kWithArguments, kBare };

class CNodeText {
  public:
    explicit CNodeText(const CTree& tree, ECallText calls = ECallText::kWithArguments)
        : _fTree(tree), _fCalls(calls) {}

    void Append(const CTreeNode& node, CTextBuffer& text);

    // An atom and its trailers. Parentheses around an atom with trailers stay.
    void AppendChain(const CChain& chain, CTextBuffer& text);
    void AppendTrailer(const CTreeNode& trailer, CTextBuffer& text);

    // Of an expression with operators. The text is meaningless, and may end early, once it exceeds `most`
    // bytes.
    void AppendOperators(const CTreeNode& node, CTextBuffer& text, size_t most, bool with_parentheses);

    // A name or a chain of names alone, cut at the first call or subscript. False for what begins otherwise.
    bool AppendDottedName(const CTreeNode& node, CTextBuffer& text);

  private:
    void _AppendShown(const CTreeNode& node, CTextBuffer& text);
    void _AppendLeaf(const CTreeNode& leaf, CTextBuffer& text);
    size_t _AppendNames(const CChain& chain, CTextBuffer& text);
    void _AppendAtom(const CTreeNode& atom, CTextBuffer& text);
    void _AppendJoined(const CTreeNode& node, CTextBuffer& text);
    void _AppendString(std::string_view literal, CTextBuffer& text) const;

    const CTree& _fTree;
    const ECallText _fCalls;
    size_t _fMostBytes = SIZE_MAX;
    uint32_t _fDepth = 0;
};

}  // namespace codeloom
