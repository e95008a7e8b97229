#include "names/node_text.h"

#include "names/encode_literal.h"
#include "names/join_tokens.h"
#include "names/walk_limits.h"

namespace codeloom {

void CNodeText::Append(const CTreeNode& node, CTextBuffer& text) {
    if (node.IsLeaf()) return _AppendLeaf(node, text);
    _AppendShown(DropParentheses(_fTree, node), text);
}

void CNodeText::_AppendShown(const CTreeNode& node, CTextBuffer& text) {
    if (node.IsLeaf()) return _AppendLeaf(node, text);
    const CNesting nesting(_fDepth);
    switch (node.kind) {
        case ENodeKind::kAtomExpr:
            return AppendChain(ChainOfAtomExpr(_fTree, node), text);
        case ENodeKind::kPower:
            return AppendChain(ChainOfPower(_fTree, node), text);
        case ENodeKind::kAtom:
            return _AppendAtom(node, text);
        default:
            return _AppendJoined(node, text);
    }
}

void CNodeText::_AppendLeaf(const CTreeNode& leaf, CTextBuffer& text) {
    const std::string_view own_text = _fTree.Text(leaf);
    if (leaf.Is(ENodeKind::kStringLiteral)) return _AppendString(own_text, text);
    text += own_text;
}

void CNodeText::_AppendAtom(const CTreeNode& atom, CTextBuffer& text) {
    const EBracket bracket = BracketOf(_fTree, atom);
    if (bracket == EBracket::kParenthesis && atom.child_count == 2) {
        text += "( )";
    } else if (bracket == EBracket::kNone && AreAllStrings(_fTree, atom)) {
        _AppendString(_fTree.Text(_fTree.Child(atom, 0)), text);  // the first piece stands for all
    } else {
        _AppendJoined(atom, text);
    }
}

// Whatever has no form of its own: the texts of its children, joined as tokens are.
void CNodeText::_AppendJoined(const CTreeNode& node, CTextBuffer& text) {
    CTokenJoiner joiner;
    for (const CTreeNode& child : _fTree.Children(node)) {
        const CTreeNode& shown = child.IsLeaf() ? child : DropParentheses(_fTree, child);
        if (shown.IsLeaf()) {
            joiner.PartFromToken(text, static_cast<int16_t>(shown.symbol), shown.word);
            _AppendLeaf(shown, text);
        } else {
            const size_t start = joiner.BeginPiece(text);
            _AppendShown(shown, text);
            joiner.EndPiece(text, start);
        }
        if (text.size() > _fMostBytes) break;
    }
}

void CNodeText::AppendOperators(const CTreeNode& node, CTextBuffer& text, size_t most,
                                bool with_parentheses) {
    _fMostBytes = text.size() + most;
    if (with_parentheses) text += '(';
    _AppendJoined(node, text);
    if (with_parentheses) text += ')';
    _fMostBytes = SIZE_MAX;
}

// Chains

void CNodeText::AppendChain(const CChain& chain, CTextBuffer& text) {
    if (chain.trailers.empty()) return Append(*chain.atom, text);
    size_t shown_count = 0;
    if (chain.atom->Is(ENodeKind::kNameLiteral)) {
        shown_count = _AppendNames(chain, text);
    } else {
        _AppendShown(*chain.atom, text);
    }
    for (const CTreeNode& trailer : chain.trailers.subspan(shown_count)) AppendTrailer(trailer, text);
}

// As much of `a.b.c` as the source has without blanks, in one piece. Gives the count of its trailers.
size_t CNodeText::_AppendNames(const CChain& chain, CTextBuffer& text) {
    const CRawToken* last = &_fTree.Token(*chain.atom);
    const uint32_t start = last->start;
    size_t count = 0;
    for (; count < chain.trailers.size(); ++count) {
        const CTreeNode& dot = _fTree.Child(chain.trailers[count], 0);
        const uint32_t end = last->start + last->length;
        if (!IsToken(dot, kTokenId_DOT) || _fTree.Token(dot).start != end) break;
        const CRawToken& name = _fTree.Token(_fTree.Child(chain.trailers[count], 1));
        if (name.start != end + 1) break;
        last = &name;
    }
    text += std::string_view(_fTree.Line().file_text.data() + start, last->start + last->length - start);
    return count;
}

void CNodeText::AppendTrailer(const CTreeNode& trailer, CTextBuffer& text) {
    const CTreeNode& token = _fTree.Child(trailer, 0);
    if (IsToken(token, kTokenId_DOT)) {
        (text += '.') += _fTree.Text(_fTree.Child(trailer, 1));
        return;
    }
    const bool is_call = IsToken(token, kTokenId_LPAR);
    const bool has_contents = trailer.child_count == 3 && (!is_call || _fCalls == ECallText::kWithArguments);
    text += is_call ? '(' : '[';
    if (has_contents) Append(_fTree.Child(trailer, 1), text);
    text += is_call ? ')' : ']';
}

bool CNodeText::AppendDottedName(const CTreeNode& node, CTextBuffer& text) {
    const CTreeNode* first = &DropParentheses(_fTree, node);
    CChain chain;
    while (!first->IsLeaf() && chain.trailers.empty()) {
        if (!first->Is(ENodeKind::kAtomExpr) && !first->Is(ENodeKind::kPower)) return false;
        chain = ChainOf(_fTree, *first);
        first = chain.trailers.empty() ? &DropParentheses(_fTree, *chain.atom) : chain.atom;
    }
    if (!first->Is(ENodeKind::kNameLiteral)) return false;
    text += _fTree.Text(*first);
    for (const CTreeNode& trailer : chain.trailers) {
        if (DotNameOf(_fTree, trailer) == nullptr) break;
        AppendTrailer(trailer, text);
    }
    return true;
}

// Strings

void CNodeText::_AppendString(std::string_view literal, CTextBuffer& text) const {
    if (IsHarmlessLiteral(literal)) {
        text += literal;
    } else {
        text += IsBytesText(literal) ? "b''" : IsUnicodeText(literal) ? "u''" : "''";
    }
}

}  // namespace codeloom
