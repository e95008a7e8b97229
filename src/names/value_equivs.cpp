// What a value stands for: a typed literal, the text of a name or chain, the text of an expression.
#include "names/encode_literal.h"
#include "names/name_walker.h"
#include "names/record_kinds.h"

namespace codeloom {

namespace {

constexpr size_t kMaxExpressionLength = 120;  // bytes, without a trailer
constexpr char kNoEquiv = 0;

// What is in any number of parentheses that aren't a tuple's.
const CTreeNode& InnermostOf(const CTree& tree, const CTreeNode& atom) {
    const CTreeNode* inner = &atom;
    while (inner->Is(ENodeKind::kAtom) && BracketOf(tree, *inner) == EBracket::kParenthesis)
        inner = &tree.Child(*inner, 1);
    return *inner;
}

}  // namespace

char CNameWalker::_AppendEquiv(const CTreeNode& value) {
    if (value.IsLeaf()) return _AppendEquivOfLeaf(value);
    switch (value.kind) {
        case ENodeKind::kAtom:
            return _AppendEquivOfAtom(value);
        case ENodeKind::kAtomExpr:
            return _AppendEquivOfChain(ChainOfAtomExpr(*_fTree, value));
        case ENodeKind::kPower:
            if (ExponentOf(*_fTree, value) != nullptr) return kNoEquiv;
            return _AppendEquivOfChain(ChainOfPower(*_fTree, value));
        case ENodeKind::kTestList:
            return _AppendEquivOfTuple(value);
        case ENodeKind::kFactor:
            if (const CTreeNode* const number = SignedNumberOf(*_fTree, value))
                return _AppendNumber(*number, _fTree->Text(_fTree->Child(value, 0)));
            return _AppendEquivOfOperators(value);
        case ENodeKind::kOperators:
            return _AppendEquivOfOperators(value);
        default:
            return kNoEquiv;
    }
}

char CNameWalker::_AppendEquivOfLeaf(const CTreeNode& leaf) {
    const bool is_name = leaf.Is(ENodeKind::kNameLiteral);
    if (is_name && !IsValueWord(leaf.word)) {
        (_fRecords->values += _fTree->Text(leaf)) += _fTrailer.View();
        return kPlainEquivKind;
    }
    // No part of a literal is known.
    if (!_fTrailer.empty()) return kNoEquiv;
    if (leaf.Is(ENodeKind::kNumberLiteral)) return _AppendNumber(leaf, {});
    if (leaf.Is(ENodeKind::kStringLiteral)) return _AppendString(leaf);
    if (!IsValueWord(leaf.word)) return kNoEquiv;
    const char kind = _AppendLiteral(leaf.word == EWord::kNoneValue ? "None" : "bool", " ");
    _fRecords->values += _fTree->Text(leaf);
    return kind;
}

// Brackets, and adjacent strings. Parentheses that aren't a tuple's are looked through.
char CNameWalker::_AppendEquivOfAtom(const CTreeNode& atom) {
    const EBracket bracket = BracketOf(*_fTree, atom);
    if (bracket == EBracket::kParenthesis && !IsTuple(*_fTree, atom))
        return _AppendEquiv(InnermostOf(*_fTree, atom));
    if (bracket == EBracket::kNone) {
        CNodeText(*_fTree).Append(atom, _fRecords->values);
        _fRecords->values += _fTrailer.View();
        return kPlainEquivKind;
    }
    if (!_fTrailer.empty()) return kNoEquiv;
    const char kind = _AppendLiteral(bracket == EBracket::kParenthesis ? "tuple"
                                     : bracket == EBracket::kSquare    ? "list"
                                     : IsSetDisplay(*_fTree, atom)     ? "set"
                                                                       : "dict",
                                     " ");
    CNodeText(*_fTree).Append(atom, _fRecords->values);
    return kind;
}

char CNameWalker::_AppendEquivOfTuple(const CTreeNode& list) {
    if (!IsTupleList(*_fTree, list) || !_fTrailer.empty()) return kNoEquiv;
    const char kind = _AppendLiteral("tuple", " (");
    CNodeText(*_fTree).Append(list, _fRecords->values);
    _fRecords->values += ')';
    return kind;
}

char CNameWalker::_AppendEquivOfChain(const CChain& chain) {
    CNodeText(*_fTree).AppendChain(chain, _fRecords->values);
    _fRecords->values += _fTrailer.View();
    return kPlainEquivKind;
}

char CNameWalker::_AppendEquivOfOperators(const CTreeNode& node) {
    CTextBuffer& values = _fRecords->values;
    const size_t start = values.size();
    CNodeText(*_fTree).AppendOperators(node, values, kMaxExpressionLength, !_fTrailer.empty());
    if (values.size() - start > kMaxExpressionLength) {
        values.CutTo(start);
        return kNoEquiv;
    }
    values += _fTrailer.View();
    return kExpressionEquivKind;
}

// Literals: the type, a colon, and the value where it is known.

char CNameWalker::_AppendLiteral(std::string_view type_name, std::string_view value) {
    CTextBuffer& values = _fRecords->values;
    values += type_name;
    values += kClassInstanceSuffix;
    values += value;
    return kTypedLiteralKind;
}

char CNameWalker::_AppendNumber(const CTreeNode& number, std::string_view sign) {
    if (!_fTrailer.empty()) return kNoEquiv;
    const std::string_view text = _fTree->Text(number);
    const char kind = _AppendLiteral(IsFloatText(text) ? "float" : "int", " ");
    (_fRecords->values += sign) += text;
    return kind;
}

char CNameWalker::_AppendString(const CTreeNode& literal) {
    const std::string_view text = _fTree->Text(literal);
    const char kind = _AppendLiteral(IsBytesText(text)                     ? "bytes"
                                     : IsUnicodeText(text) && !_fIsPython3 ? "unicode"
                                                                           : "str",
                                     " ");
    _fRecords->values += EncodeStringLiteral(text, _fEncoded);
    return kind;
}

}  // namespace codeloom
