// Reading a CTree: what any node answers. What a kind of node answers is in the header of its topic; each
// says above it which source it reads. An index is that of a child, as the comment lays the children out.
#pragma once

#include "syntax/tree.h"
#include "text/token_type.h"

namespace codeloom {

// Bytes of the file.
struct CSpan {
    uint32_t start = 0;
    uint32_t end = 0;

    bool operator==(const CSpan&) const = default;
};

inline bool IsToken(const CTreeNode& node, int16_t token_type) {
    return node.symbol == token_type;
}

inline bool IsWord(const CTreeNode& node, EWord word) {
    return node.word == word;
}

// None, True and False: names that are values.
inline bool IsValueWord(EWord word) {
    return word == EWord::kNoneValue || word == EWord::kTrue || word == EWord::kFalse;
}

// The child at `i` as far as there is one, null otherwise.
inline const CTreeNode* TryChild(const CTree& tree, const CTreeNode& node, uint32_t i) {
    return i < node.child_count ? &tree.Child(node, i) : nullptr;
}

// The same for a child of the kind.
inline const CTreeNode* TryChild(const CTree& tree, const CTreeNode& node, uint32_t i, ENodeKind kind) {
    const CTreeNode* const child = TryChild(tree, node, i);
    return child != nullptr && child->Is(kind) ? child : nullptr;
}

inline bool HasTokenAt(const CTree& tree, const CTreeNode& node, uint32_t i, int16_t token_type) {
    return i < node.child_count && IsToken(tree.Child(node, i), token_type);
}

inline bool HasWordAt(const CTree& tree, const CTreeNode& node, uint32_t i, EWord word) {
    return i < node.child_count && IsWord(tree.Child(node, i), word);
}

// Requires: the node isn't a leaf.
inline const CTreeNode& LastChild(const CTree& tree, const CTreeNode& node) {
    return tree.Child(node, node.child_count - 1);
}

// True when a direct child is this token.
inline bool HasToken(const CTree& tree, const CTreeNode& node, int16_t token_type) {
    for (const CTreeNode& child : tree.Children(node))
        if (IsToken(child, token_type)) return true;
    return false;
}

inline const CTreeNode& LastLeaf(const CTree& tree, const CTreeNode& node) {
    const CTreeNode* last = &node;
    while (!last->IsLeaf()) last = &LastChild(tree, *last);
    return *last;
}

CSpan SpanAfterLastToken(const CTree& tree);

// Of a leaf that was invented after the last token: the empty place after that.
inline CSpan SpanOfLeaf(const CTree& tree, const CTreeNode& leaf) {
    const CRawToken* const token = tree.TryToken(leaf);
    if (token == nullptr) [[unlikely]]
        return SpanAfterLastToken(tree);
    return {token->start, token->start + token->length};
}

// From the first byte of the first token of `first` to the last of the last token of `last`.
inline CSpan SpanBetween(const CTree& tree, const CTreeNode& first, const CTreeNode& last) {
    return {SpanOfLeaf(tree, first).start, SpanOfLeaf(tree, LastLeaf(tree, last)).end};
}

inline CSpan SpanOf(const CTree& tree, const CTreeNode& node) {
    return SpanBetween(tree, node, node);
}

}  // namespace codeloom
