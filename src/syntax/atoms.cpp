#include "syntax/atoms.h"

#include <algorithm>

#include "text/char_class.h"

namespace codeloom {

namespace {

constexpr uint32_t kFilledCount = 3;  // of brackets with contents

// What `(...)` holds when it isn't empty; null for any other node.
const CTreeNode* InnerOfParentheses(const CTree& tree, const CTreeNode& node) {
    const bool is_filled = node.Is(ENodeKind::kAtom) && node.child_count == kFilledCount &&
                           HasTokenAt(tree, node, 0, kTokenId_LPAR);
    return is_filled ? &tree.Child(node, 1) : nullptr;
}

// What brackets hold that may be taken apart; null for any other node.
const CTreeNode* SequenceContents(const CTree& tree, const CTreeNode& node) {
    if (!node.Is(ENodeKind::kAtom) || node.child_count != kFilledCount) return nullptr;
    const EBracket bracket = BracketOf(tree, node);
    const bool may_hold_list = bracket == EBracket::kParenthesis || bracket == EBracket::kSquare;
    return may_hold_list && !IsComprehension(tree, node) ? &tree.Child(node, 1) : nullptr;
}

CItems ItemsOfList(const CTree& tree, const CTreeNode& list) {
    if (IsComprehensionList(tree, list)) return {nullptr, nullptr, 1};
    return {&list, nullptr, (list.child_count + 1) / 2};
}

}  // namespace

EBracket BracketOf(const CTree& tree, const CTreeNode& atom) {
    switch (tree.Child(atom, 0).symbol) {
        case kTokenId_LPAR:
            return EBracket::kParenthesis;
        case kTokenId_LSQB:
            return EBracket::kSquare;
        case kTokenId_LBRACE:
            return EBracket::kCurly;
        default:
            return EBracket::kNone;
    }
}

bool IsComprehension(const CTree& tree, const CTreeNode& atom) {
    if (atom.child_count != kFilledCount) return false;
    const CTreeNode& contents = tree.Child(atom, 1);
    // `a for b in c`, `a: b for c in d`
    return TryChild(tree, contents, 1, ENodeKind::kCompFor) != nullptr ||
           TryChild(tree, contents, 3, ENodeKind::kCompFor) != nullptr;
}

bool IsSetDisplay(const CTree& tree, const CTreeNode& atom) {
    const bool is_filled_brace =
        atom.child_count == kFilledCount && BracketOf(tree, atom) == EBracket::kCurly;
    return is_filled_brace && !HasToken(tree, tree.Child(atom, 1), kTokenId_COLON);
}

bool AreAllStrings(const CTree& tree, const CTreeNode& atom) {
    const auto is_string = [](const CTreeNode& child) { return child.Is(ENodeKind::kStringLiteral); };
    const std::span<const CTreeNode> children = tree.Children(atom);
    return std::all_of(children.begin(), children.end(), is_string);
}

const CTreeNode& DropParentheses(const CTree& tree, const CTreeNode& node) {
    const CTreeNode* shown = &node;
    while (const CTreeNode* const inner = InnerOfParentheses(tree, *shown)) {
        if (inner->Is(ENodeKind::kTestList) || inner->Is(ENodeKind::kCompFor)) break;
        shown = inner;
    }
    return *shown;
}

bool IsTuple(const CTree& tree, const CTreeNode& node) {
    const CTreeNode* inner = &node;
    while (inner->Is(ENodeKind::kAtom)) {
        if (BracketOf(tree, *inner) != EBracket::kParenthesis) return false;
        if (inner->child_count < kFilledCount) return true;
        inner = &tree.Child(*inner, 1);
    }
    return inner->Is(ENodeKind::kTestList) && HasToken(tree, *inner, kTokenId_COMMA);
}

bool IsDottedName(const CTree& tree, const CTreeNode& node) {
    const CTreeNode& shown = DropParentheses(tree, node);
    if (shown.Is(ENodeKind::kNameLiteral)) return true;
    const bool is_chain =
        shown.Is(ENodeKind::kAtomExpr) || (shown.Is(ENodeKind::kPower) && ExponentOf(tree, shown) == nullptr);
    if (!is_chain) return false;
    const CChain chain = ChainOf(tree, shown);
    return !(shown.Is(ENodeKind::kAtomExpr) && chain.is_awaited) && IsDottedChain(tree, chain);
}

bool IsDottedChain(const CTree& tree, const CChain& chain) {
    for (const CTreeNode& trailer : chain.trailers)
        if (DotNameOf(tree, trailer) == nullptr) return false;
    // Parentheses before a trailer aren't simple.
    return chain.trailers.empty() ? IsDottedName(tree, *chain.atom) : chain.atom->Is(ENodeKind::kNameLiteral);
}

CItems ItemsOf(const CTree& tree, const CTreeNode& node) {
    CItems items;
    const CTreeNode* inner = &node;
    while (const CTreeNode* const contents = SequenceContents(tree, *inner)) {
        if (contents->Is(ENodeKind::kListmaker)) return ItemsOfList(tree, *contents);
        if (!contents->Is(ENodeKind::kExpression)) return items;
        // `[a]` is a list of one item, unless that can be taken apart.
        if (BracketOf(tree, *inner) == EBracket::kSquare) items = {nullptr, contents, 1};
        inner = contents;
    }
    return inner->Is(ENodeKind::kTestList) ? ItemsOfList(tree, *inner) : items;
}

bool IsParenthesizedTuple(const CTree& tree, const CTreeNode& node, CItems& items) {
    const CTreeNode& sequence = DropParentheses(tree, node);
    if (!sequence.Is(ENodeKind::kAtom) || !HasTokenAt(tree, sequence, 0, kTokenId_LPAR)) return false;
    const CTreeNode* const contents = ContentsOfBrackets(tree, sequence);
    if (contents == nullptr) {
        items = {};
    } else if (contents->Is(ENodeKind::kTestList)) {
        items = ItemsOfList(tree, *contents);
    } else {
        items = {nullptr, contents, 1};
    }
    return true;
}

std::string_view ContentsOfString(std::string_view literal) {
    literal.remove_prefix(std::min(literal.find_first_not_of("BFRUbfru"), literal.size()));
    if (literal.empty() || (literal[0] != '"' && literal[0] != '\'')) return {};
    const char quote = literal[0];
    const bool is_triple = literal.size() >= 3 && literal[1] == quote && literal[2] == quote;
    const std::string_view quotes = literal.substr(0, is_triple ? 3 : 1);
    const size_t end = literal.ends_with(quotes) ? literal.size() - quotes.size() : literal.size();
    return end <= quotes.size() ? std::string_view() : literal.substr(quotes.size(), end - quotes.size());
}

}  // namespace codeloom
