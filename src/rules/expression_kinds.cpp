#include "rules/expression_kinds.h"

#include <array>

#include "syntax/atoms.h"

namespace codeloom {

namespace {

#define CODELOOM_EXPRESSION_TEXT(name, text) std::string_view(text),
constexpr auto kTexts = std::to_array<std::string_view>({CODELOOM_EXPRESSIONS(CODELOOM_EXPRESSION_TEXT)});
#undef CODELOOM_EXPRESSION_TEXT

EExpression KindOfString(std::string_view literal) {
    if (HasPrefixLetter(literal, 'f')) return EExpression::kFString;
    return HasPrefixLetter(literal, 't') ? EExpression::kTString : EExpression::kLiteral;
}

EExpression KindOfStrings(const CTree& tree, const CTreeNode& atom) {
    for (const CTreeNode& child : tree.Children(atom)) {
        const EExpression kind = KindOfString(tree.Text(child));
        if (kind != EExpression::kLiteral) return kind;
    }
    return EExpression::kLiteral;
}

EExpression KindOfBraces(const CTree& tree, const CTreeNode& atom) {
    const CTreeNode* const contents = ContentsOfBrackets(tree, atom);
    const bool is_dict = contents == nullptr || HasTokenAt(tree, *contents, 0, kTokenId_DOUBLESTAR) ||
                         HasTokenAt(tree, *contents, 1, kTokenId_COLON);
    if (IsComprehension(tree, atom))
        return is_dict ? EExpression::kDictComprehension : EExpression::kSetComprehension;
    return is_dict ? EExpression::kDict : EExpression::kSet;
}

EExpression KindOfAtom(const CTree& tree, const CTreeNode& atom) {
    switch (BracketOf(tree, atom)) {
        case EBracket::kParenthesis:
            return IsComprehension(tree, atom) ? EExpression::kGenerator : EExpression::kTuple;
        case EBracket::kSquare:
            return IsComprehension(tree, atom) ? EExpression::kListComprehension : EExpression::kList;
        case EBracket::kCurly:
            return KindOfBraces(tree, atom);
        default:
            return KindOfStrings(tree, atom);
    }
}

EExpression KindOfChain(const CTree& tree, const CTreeNode& node) {
    if (node.Is(ENodeKind::kPower) && ExponentOf(tree, node) != nullptr) return EExpression::kOperation;
    const CChain chain = ChainOf(tree, node);
    if (chain.is_awaited) return EExpression::kAwait;
    if (chain.trailers.empty()) return EExpression::kOperation;
    const CTreeNode& last = chain.trailers.back();
    if (HasTokenAt(tree, last, 0, kTokenId_LPAR)) return EExpression::kCall;
    return HasTokenAt(tree, last, 0, kTokenId_DOT) ? EExpression::kAttribute : EExpression::kSubscript;
}

bool IsComparison(const CTree& tree, const CTreeNode& operators) {
    const CTreeNode& sign = tree.Child(operators, operators.child_count == 2 ? 0 : 1);
    if (!sign.IsLeaf()) return true;  // `is not`, `not in`
    switch (sign.symbol) {
        case kTokenId_LESS:
        case kTokenId_GREATER:
        case kTokenId_EQEQUAL:
        case kTokenId_NOTEQUAL:
        case kTokenId_LESSEQUAL:
        case kTokenId_GREATEREQUAL:
            return true;
        default:
            return IsWord(sign, EWord::kIn) || IsWord(sign, EWord::kIs);
    }
}

EExpression KindOfKeyword(EWord word) {
    switch (word) {
        case EWord::kNoneValue:
            return EExpression::kNoneValue;
        case EWord::kTrue:
            return EExpression::kTrue;
        case EWord::kFalse:
            return EExpression::kFalse;
        default:
            return EExpression::kYield;
    }
}

}  // namespace

std::string_view TextOfKind(EExpression kind) {
    return kTexts[static_cast<size_t>(kind)];
}

bool HasPrefixLetter(std::string_view literal, char lower_letter) {
    for (const char c : literal) {
        if (c == '"' || c == '\'') return false;
        if (AsLower(c) == lower_letter) return true;
    }
    return false;
}

EExpression KindOfExpression(const CTree& tree, const CTreeNode& node) {
    const CTreeNode& shown = DropParentheses(tree, node);
    switch (shown.kind) {
        case ENodeKind::kNameLiteral:
            return EExpression::kName;
        case ENodeKind::kKeywordLiteral:
            return KindOfKeyword(shown.word);
        case ENodeKind::kStringLiteral:
            return KindOfString(tree.Text(shown));
        case ENodeKind::kNumberLiteral:
            return EExpression::kLiteral;
        case ENodeKind::kAtom:
            return KindOfAtom(tree, shown);
        case ENodeKind::kAtomExpr:
        case ENodeKind::kPower:
            return KindOfChain(tree, shown);
        case ENodeKind::kTestList:
            return EExpression::kTuple;
        case ENodeKind::kStar:
            return EExpression::kStarred;
        case ENodeKind::kLambda:
            return EExpression::kLambda;
        case ENodeKind::kIfElse:
            return EExpression::kConditional;
        case ENodeKind::kNamedExpr:
            return EExpression::kNamed;
        case ENodeKind::kYield:
            return EExpression::kYield;
        case ENodeKind::kOperators:
            return IsComparison(tree, shown) ? EExpression::kComparison : EExpression::kOperation;
        default:
            return shown.IsLeaf() ? EExpression::kEllipsis : EExpression::kOperation;
    }
}

}  // namespace codeloom
