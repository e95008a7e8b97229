// The loop that runs over a grammar's tables.
//   in     leaves with their labels, one after the other
//   out    nodes in a tree; CRefusal at a leaf that the grammar doesn't allow
//   keeps  its stacks, reused from parse to parse
//   start  at Begin and Feed
//
// An open rule that has more than one child is a frame of its own. Rules that have one child so far share the
// frame of their chain (grammar/parse_tables.h). The children of all frames are on one stack. Nothing here
// calls itself: nesting of the text costs frames, no call depth.
#pragma once

#include <vector>

#include "syntax/form_notes.h"
#include "syntax/language.h"
#include "syntax/syntax_grammar.h"
#include "syntax/tree.h"

namespace codeloom {

// A token that is refused. Thrown within the parser, and caught by it.
struct CRefusal {
    uint32_t token_i;  // the tail of the span where the text ends too early
};

// A node, or none.
class CParsed {
  public:
    CParsed() = default;
    CParsed(const CTreeNode& node) : _fNode(node) {}

    explicit operator bool() const { return _fNode.kind != ENodeKind::kCount; }
    const CTreeNode& operator*() const { return _fNode; }
    const CTreeNode* operator->() const { return &_fNode; }

  private:
    CTreeNode _fNode{.kind = ENodeKind::kCount};
};

class CTableParser {
  public:
    // Both must outlive the parser. Forms that nodes show are noted.
    CTableParser(const CLanguage& language, CFormNotes& forms);

    // Starts a file of at most so many leaves.
    void Begin(size_t most_leaves, CTree& tree);

    // Feeds a leaf that isn't as its token, or stands for none.
    void Feed(const CLeafClass& leaf_class, uint32_t token_i, uint32_t first_child) {
        CTops tops = _fTops;
        _Feed(leaf_class, token_i, first_child, tops);
        _fTops = tops;
    }

    // Feeds tokens of the line from `from` up to the first that isn't simply fed, and gives its index; `to`
    // when all are fed.
    uint32_t FeedTokens(const CLeafClasses& classes, uint32_t from, uint32_t to);

    // Ends the file with a newline and the end marker, which are at `tail`. Gives the only statement that
    // it holds; none when it holds another number of them.
    CParsed Finish(const CLeafClasses& classes, uint32_t tail);

  private:
    // An open rule, or a chain of rules with one child. The frame at the bottom holds the file.
    struct CFrame {
        CTreeNode* first_child;  // in _fNodes
        uint32_t row;
        uint32_t chain;  // whose last rule is open here; not yet decided while there is one child
    };
    struct CTops {
        CFrame* frame;
        CTreeNode* nodes_end;
    };

    const CMove& _FindMove(uint8_t label, uint32_t token_i, CTops& tops);
    void _Feed(const CLeafClass& leaf_class, uint32_t token_i, uint32_t first_child, CTops& tops);
    CParsed _FinishFile(const CLeafClasses& classes, uint32_t tail, CTops tops);
    CTops _CompleteRule(CTops tops);
    CTops _CompleteUnusualRule(CTops tops);
    static CTops _Completed(CTops tops, const CChainClass& chain) {
        tops.frame->row = static_cast<uint32_t>(chain.row_around);
        const bool is_closed = chain.row_around == CParseTables::kLastRow;
        return {tops.frame - is_closed, tops.frame->first_child + 1};
    }
    void _NoteRule(const CTreeNode& node);
    void _NoteLiteral(const CTreeNode& leaf);

    const CSyntaxGrammar& _fGrammar;
    CFormNotes& _fForms;
    const uint16_t* const _fCells;
    const CMove* const _fMoves;
    const CChainClass* const _fChains;

    CTree* _fTree = nullptr;
    std::vector<CFrame> _fFrames;    // storage that stays
    std::vector<CTreeNode> _fNodes;  // storage that stays
    CTops _fTops{};
};

// Completes rules until one can do something with a token, and gives the move to make there.
[[gnu::always_inline]] inline const CMove& CTableParser::_FindMove(uint8_t label, uint32_t token_i,
                                                                   CTops& tops) {
    for (;;) {
        const CMove& move = _fMoves[_fCells[size_t{tops.frame->row} + label]];
        if (move.kind >= EMove::kShift) return move;
        if (move.kind == EMove::kPromote) {
            --tops.frame;
        } else if (move.kind == EMove::kComplete) {
            tops = _CompleteRule(tops);
        } else {
            throw CRefusal{token_i};
        }
    }
}

[[gnu::always_inline]] inline void CTableParser::_Feed(const CLeafClass& leaf_class, uint32_t token_i,
                                                       uint32_t first_child, CTops& tops) {
    const CMove& move = _FindMove(leaf_class.label, token_i, tops);
    if (move.chain != 0) tops.frame->chain = move.chain;
    tops.frame->row = static_cast<uint32_t>(move.next_row);
    CTreeNode* const leaf = tops.nodes_end++;
    *leaf = leaf_class.LeafAt(token_i, first_child);
    if (leaf_class.IsLiteral()) [[unlikely]]
        _NoteLiteral(*leaf);
    if (move.kind == EMove::kBegin) {
        *++tops.frame = {leaf, static_cast<uint32_t>(move.new_row), 0};
    } else {
        while (tops.frame->row == CParseTables::kLastRow) tops = _CompleteRule(tops);
    }
}

}  // namespace codeloom
