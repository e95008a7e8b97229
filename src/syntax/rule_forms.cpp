#include "syntax/rule_forms.h"

#include <array>

namespace codeloom {

namespace {

using CFound = const CTreeNode*;

const CTreeNode* ChildOfKind(const CTree& tree, const CTreeNode& node, uint32_t i, ENodeKind kind) {
    if (i >= node.child_count) return nullptr;
    const CTreeNode& child = tree.Child(node, i);
    return child.Is(kind) ? &child : nullptr;
}

template <ENodeKind kind>
CFound FirstOfKind(const CTree& tree, const CTreeNode& node) {
    for (const CTreeNode& child : tree.Children(node))
        if (child.Is(kind)) return &child;
    return nullptr;
}

CFound FirstOfType(const CTree& tree, const CTreeNode& node, int type) {
    for (const CTreeNode& child : tree.Children(node))
        if (child.IsLeaf() && child.symbol == type) return &child;
    return nullptr;
}

template <uint32_t child_i>
CFound Always(const CTree& tree, const CTreeNode& node) {
    return &tree.Child(node, child_i);
}

template <uint32_t child_i, ENodeKind kind>
CFound IfOfKind(const CTree& tree, const CTreeNode& node) {
    return ChildOfKind(tree, node, child_i, kind);
}

CFound FindSlash(const CTree& tree, const CTreeNode& node) {
    return FirstOfType(tree, node, kTokenId_SLASH);
}

CFound FindNamedArgument(const CTree& tree, const CTreeNode& node) {
    const CTreeNode& mark = tree.Child(node, 1);
    return mark.IsLeaf() && mark.symbol == kTokenId_COLONEQUAL ? &mark : nullptr;
}

// In a set of one; the `:=` of `(x := 1)` has its brackets.
CFound FindInBraces(const CTree& tree, const CTreeNode& node) {
    const bool is_set = tree.Child(node, 0).symbol == kTokenId_LBRACE;
    return is_set ? ChildOfKind(tree, node, 1, ENodeKind::kNamedExpr) : nullptr;
}

// A comma list that holds a starred expression.
template <uint32_t child_i>
CFound FindStarInList(const CTree& tree, const CTreeNode& node) {
    const CTreeNode* const list = ChildOfKind(tree, node, child_i, ENodeKind::kTestList);
    return list != nullptr && FirstOfKind<ENodeKind::kStar>(tree, *list) != nullptr ? list : nullptr;
}

constexpr auto kRuleForms = std::to_array<CRuleForm>({
    {"annassign", &forms::kVariableAnnotation, Always<0>},
    {"namedexpr_test", &forms::kWalrus, Always<1>},
    {"argument", &forms::kWalrus, FindNamedArgument},
    {"typedargslist", &forms::kPositionalOnly, FindSlash},
    {"varargslist", &forms::kPositionalOnly, FindSlash},
    {"return_stmt", &forms::kStarInResult, FindStarInList<1>},
    {"yield_expr", &forms::kStarInResult, FindStarInList<1>},
    {"for_stmt", &forms::kStarInFor, FindStarInList<3>},
    {"trailer", &forms::kWalrusInSubscript, IfOfKind<1, ENodeKind::kNamedExpr>},
    {"subscriptlist", &forms::kWalrusInSubscript, FirstOfKind<ENodeKind::kNamedExpr>},
    {"atom", &forms::kWalrusInSet, FindInBraces},
    {"dictorsetmaker", &forms::kWalrusInSet, FirstOfKind<ENodeKind::kNamedExpr>},
    {"star_test", &forms::kStarInSubscript, Always<0>},
    {"fpdef", &forms::kStarredAnnotation, IfOfKind<2, ENodeKind::kStar>},
    {"except_clause", &forms::kBareExcept, IfOfKind<1, ENodeKind::kTestList>},
});

}  // namespace

const CRuleForm* RuleFormOf(std::string_view rule) {
    for (const CRuleForm& form : kRuleForms)
        if (form.rule == rule) return &form;
    return nullptr;
}

}  // namespace codeloom
