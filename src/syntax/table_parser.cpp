#include "syntax/table_parser.h"

#include <cassert>

namespace codeloom {

CTableParser::CTableParser(const CLanguage& language, CFormNotes& forms)
    : _fGrammar(*language.grammar),
      _fForms(forms),
      _fCells(_fGrammar.Tables().Cells()),
      _fMoves(_fGrammar.Tables().Moves()),
      _fChains(language.chain_classes.data()) {}

void CTableParser::Begin(size_t most_leaves, CTree& tree) {
    if (_fFrames.size() < most_leaves + 2) {  // a leaf begins a frame at most, and two hold the file
        _fFrames.resize(2 * most_leaves + 2);
        _fNodes.resize(2 * most_leaves + 2 + CTree::kMost);
    }
    _fTree = &tree;
    _fTops = {_fFrames.data(), _fNodes.data()};
    *_fTops.frame = {_fNodes.data(), static_cast<uint32_t>(_fGrammar.StartRow()), 0};
}

uint32_t CTableParser::FeedTokens(const CLeafClasses& classes, uint32_t from, uint32_t to) {
    const CRawToken* const tokens = _fTree->Line().tokens.data();
    CTops tops = _fTops;
    uint32_t i = from;
    for (; i < to; ++i) {
        const CLeafClass& leaf_class = classes.Of(tokens[i]);
        if (leaf_class.IsSpecial()) [[unlikely]]
            break;
        _Feed(leaf_class, i, 0, tops);
    }
    _fTops = tops;
    return i;
}

// A line of simple statements is complete with its newline, and is its only statement alone.
CParsed CTableParser::Finish(const CLeafClasses& classes, uint32_t tail) {
    CTops tops = _fTops;
    const CMove& move = _FindMove(classes.OfType(kTokenId_NEWLINE).label, tail, tops);
    const uint32_t chain = move.chain != 0 ? move.chain : tops.frame->chain;
    const bool is_alone = tops.frame == &_fFrames[1] && tops.nodes_end == &_fNodes[1];
    return _fChains[chain].is_line && is_alone ? _fNodes.front() : _FinishFile(classes, tail, tops);
}

// Other statements are complete when the file is, which then holds them and the end marker.
[[gnu::noinline]] CParsed CTableParser::_FinishFile(const CLeafClasses& classes, uint32_t tail, CTops tops) {
    _Feed(classes.OfType(kTokenId_NEWLINE), tail, CTreeNode::kInventedText, tops);
    _Feed(classes.OfType(kTokenId_ENDMARKER), tail, CTreeNode::kInventedText, tops);
    assert(tops.frame->row == static_cast<uint32_t>(_fGrammar.Tables().DoneRow()));
    const CTreeNode& file = _fNodes.front();
    return file.child_count == 2 ? _fTree->Child(file, 0) : CParsed();
}

// Makes the node of the rule on top, which then is the single child of the rules around it. A statement and
// the newline after it are the statement alone.
[[gnu::noinline]] CTableParser::CTops CTableParser::_CompleteRule(CTops tops) {
    CTreeNode* const first = tops.frame->first_child;
    const auto count = static_cast<size_t>(tops.nodes_end - first);
    const CChainClass& chain = _fChains[tops.frame->chain];
    if (count > CTree::kMost || chain.may_be_refused || !_fTree->HasRoomForFew()) [[unlikely]]
        return _CompleteUnusualRule(tops);
    if (count != 2 || first[1].symbol != kTokenId_NEWLINE)
        *first = _fTree->AddParentOfFew(chain.kind, chain.rule_number, first, count);
    return _Completed(tops, chain);
}

[[gnu::noinline]] CTableParser::CTops CTableParser::_CompleteUnusualRule(CTops tops) {
    CTreeNode* const first = tops.frame->first_child;
    const CChainClass& chain = _fChains[tops.frame->chain];
    if (tops.nodes_end - first != 2 || first[1].symbol != kTokenId_NEWLINE) {
        *first = _fTree->AddParent(chain.kind, chain.rule_number, first->token, {first, tops.nodes_end});
        if (chain.may_be_refused) _NoteRule(*first);
    }
    return _Completed(tops, chain);
}

void CTableParser::_NoteRule(const CTreeNode& node) {
    const CRuleForm& rule_form = *_fGrammar.FormOfRule(node.symbol);
    const int32_t child_i = rule_form.find({*_fTree, node});
    if (child_i >= 0)
        _fForms.Note(*rule_form.form, _fTree->Child(node, static_cast<uint32_t>(child_i)).token);
}

void CTableParser::_NoteLiteral(const CTreeNode& leaf) {
    const std::string_view text = _fTree->Text(leaf);
    const char first = text.front();
    if (first == '\'' || first == '"') return;
    const CForm* const form = leaf.symbol == kTokenId_STRING ? FormOfString(text) : FormOfNumber(text);
    if (form != nullptr) _fForms.Note(*form, leaf.token);
}

}  // namespace codeloom
