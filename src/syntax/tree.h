// syntax/: the tokens of one logical line into a tree of plain records.
//   in     a CRawLogical: tokens that view the text of the file
//   out    a CTree, or the fault that the line has
//   keeps  the storage of its stacks and of the tree, from line to line
//   start  at CLineParser::Parse
// A tree has the same nodes in the same layout as the typed nodes that a host sees.
#pragma once

#include <algorithm>
#include <cassert>
#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

#include "syntax/node_kinds.h"
#include "text/words.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// A node by value. Children lie side by side in the tree's storage.
struct CTreeNode {
    static constexpr uint32_t kInventedText = UINT32_MAX;

    uint32_t first_child =
        0;  // in the tree; of a leaf zero, or kInventedText when its text isn't its token's
    uint32_t child_count = 0;  // zero for a leaf
    uint32_t token = 0;        // index of its first token in the line; of an invented one, where it is
    uint16_t symbol = 0;       // token type of a leaf, else the number of the grammar rule
    ENodeKind kind = ENodeKind::kNode;
    EWord word = EWord::kNone;  // of a leaf

    bool IsLeaf() const { return child_count == 0; }
    bool Is(ENodeKind base) const { return IsKind(kind, base); }
};

static_assert(sizeof(CTreeNode) == 16);

class CTree {
  public:
    // Empties the tree for another line, which must outlive the use of the tree and not change meanwhile.
    void Reset(const CRawLogical& line) {
        _fLine = &line;
        _fTokens = line.tokens;
        _fCount = 0;
        _fKinds = 0;
        fRoot = CTreeNode();
        fIsEmpty = true;
    }

    // A node around `children`, which are copied into the tree. Invalidates references to nodes in the tree.
    CTreeNode AddParent(ENodeKind kind, uint16_t symbol, uint32_t token,
                        std::span<const CTreeNode> children) {
        if (_fNodes.size() < _fCount + children.size()) [[unlikely]]
            _Grow(children.size());
        std::copy(children.begin(), children.end(), _fNodes.begin() + _fCount);
        return _Parent(kind, symbol, token, children.size());
    }

    // The same around up to kMost nodes that are the last of a stack on which kMost may be read, whatever
    // they are. Requires: HasRoomForFew().
    static constexpr size_t kMost = 4;
    bool HasRoomForFew() const { return _fCount + kMost <= _fNodes.size(); }
    CTreeNode AddParentOfFew(ENodeKind kind, uint16_t symbol, const CTreeNode* children, size_t count) {
        assert(count <= kMost && HasRoomForFew());
        CTreeNode* const copies = _fNodes.data() + _fCount;
        for (size_t i = 0; i < kMost; ++i) copies[i] = children[i];
        return _Parent(kind, symbol, children->token, count);
    }

    std::span<const CTreeNode> Children(const CTreeNode& node) const {
        return {_fNodes.data() + node.first_child, node.child_count};
    }

    // All nodes but the root, each before the one that it is a child of.
    std::span<const CTreeNode> NodesBelowRoot() const { return {_fNodes.data(), _fCount}; }

    // True for the root, which may lie among the nodes too.
    bool IsRoot(const CTreeNode& node) const {
        return node.IsLeaf() == fRoot.IsLeaf() && node.first_child == fRoot.first_child &&
               node.token == fRoot.token;
    }

    // Requires: i < node.child_count.
    const CTreeNode& Child(const CTreeNode& node, uint32_t i) const {
        assert(i < node.child_count);
        return _fNodes[node.first_child + i];
    }

    // The text of a leaf; empty for any other node.
    std::string_view Text(const CTreeNode& node) const {
        if (!node.IsLeaf()) return {};
        if (node.first_child == CTreeNode::kInventedText) [[unlikely]]
            return InventedText(node);
        const CRawToken& token = _fTokens[node.token];
        return {_fLine->file_text.data() + token.start, token.length};
    }

    // The same of a leaf that isn't invented, as a name.
    std::string_view TextOfName(const CTreeNode& leaf) const {
        return TextOf(Token(leaf), _fLine->file_text);
    }

    // Requires: the leaf isn't invented, as a name may be.
    const CRawToken& Token(const CTreeNode& leaf) const {
        assert(leaf.IsLeaf() && leaf.token < _fTokens.size());
        return _fTokens[leaf.token];
    }

    // The same of any leaf; null for a leaf that was invented after the last one.
    const CRawToken* TryToken(const CTreeNode& leaf) const {
        return leaf.token < _fTokens.size() ? &_fTokens[leaf.token] : nullptr;
    }

    const CRawLogical& Line() const { return *_fLine; }

    // True when a node of exactly this kind was made that isn't a leaf.
    bool HasKind(ENodeKind kind) const { return (_fKinds & BitOf(kind)) != 0; }

    // A bit for each kind of node that was made and isn't a leaf.
    uint64_t Kinds() const { return _fKinds; }
    static constexpr uint64_t BitOf(ENodeKind kind) { return uint64_t{1} << static_cast<unsigned>(kind); }

    CTreeNode fRoot;       // the statement
    bool fIsEmpty = true;  // the line holds no statement, or not just one

  private:
    static constexpr size_t kFewNodes = 256;

    void _Grow(size_t count);
    CTreeNode _Parent(ENodeKind kind, uint16_t symbol, uint32_t token, size_t child_count) {
        const CTreeNode parent{_fCount, static_cast<uint32_t>(child_count), token, symbol, kind};
        _fCount += parent.child_count;
        _fKinds |= BitOf(kind);
        return parent;
    }
    static_assert(static_cast<unsigned>(ENodeKind::kCount) <= 64);

    static std::string_view InventedText(const CTreeNode& leaf);

    const CRawLogical* _fLine = nullptr;
    std::span<const CRawToken> _fTokens;  // of the line
    std::vector<CTreeNode> _fNodes;       // storage that stays; the first _fCount are the tree's
    uint32_t _fCount = 0;
    uint64_t _fKinds = 0;  // a bit for each kind that is there
};

}  // namespace codeloom
