// The forms that the nodes of a grammar rule show: one table for plain and hosted trees.
#pragma once

#include <array>
#include <cstdint>
#include <string_view>

#include "syntax/forms.h"
#include "text/token_type.h"

namespace codeloom {

// The nodes that a form is known by: `a := b`, `*a`, and `a, b` without parentheses.
enum class EFormPart { kNamed, kStar, kList };

struct CFormSign {
    int16_t type;
    std::string_view text;
};

// A Node is what the finders ask of a node of either kind, children given by their index:
//   Count()           how many there are
//   HasSign(i, sign)  there is a child, and it is this token
//   Has<part>(i)      there is a child, and it is such a node
//   Part<part>(i)     that child
template <class Node>
struct TRuleForm {
    static constexpr int32_t kNone = -1;

    const char* rule;
    const CForm* form;
    // The child at fault; kNone when the node doesn't have the form.
    int32_t (*find)(const Node& node);
};

namespace rule_forms {

inline constexpr CFormSign kSlash = {kTokenId_SLASH, "/"};
inline constexpr CFormSign kColonEqual = {kTokenId_COLONEQUAL, ":="};
inline constexpr CFormSign kBrace = {kTokenId_LBRACE, "{"};

template <class Node, class Predicate>
int32_t FindFirst(const Node& node, Predicate predicate) {
    for (int32_t i = 0; i < node.Count(); ++i)
        if (predicate(i)) return i;
    return TRuleForm<Node>::kNone;
}

template <class Node, int32_t child_i>
int32_t Always(const Node&) {
    return child_i;
}

template <class Node, EFormPart part>
int32_t First(const Node& node) {
    return FindFirst(node, [&](int32_t i) { return node.template Has<part>(i); });
}

template <class Node, int32_t child_i, EFormPart part>
int32_t At(const Node& node) {
    return node.template Has<part>(child_i) ? child_i : TRuleForm<Node>::kNone;
}

template <class Node>
int32_t Slash(const Node& node) {
    return FindFirst(node, [&](int32_t i) { return node.HasSign(i, kSlash); });
}

template <class Node>
int32_t NamedArgument(const Node& node) {
    return node.HasSign(1, kColonEqual) ? 1 : TRuleForm<Node>::kNone;
}

// In a set of one; the `:=` of `(x := 1)` is in parentheses.
template <class Node>
int32_t InBraces(const Node& node) {
    return node.HasSign(0, kBrace) ? At<Node, 1, EFormPart::kNamed>(node) : TRuleForm<Node>::kNone;
}

// A comma list that holds a starred expression.
template <class Node, int32_t child_i>
int32_t StarInList(const Node& node) {
    const bool is_list = node.template Has<EFormPart::kList>(child_i);
    const bool has_star =
        is_list && First<Node, EFormPart::kStar>(node.template Part<EFormPart::kList>(child_i)) >= 0;
    return has_star ? child_i : TRuleForm<Node>::kNone;
}

}  // namespace rule_forms

template <class Node>
inline constexpr auto kRuleForms = std::to_array<TRuleForm<Node>>({
    {"annassign", &forms::kVariableAnnotation, rule_forms::Always<Node, 0>},
    {"namedexpr_test", &forms::kWalrus, rule_forms::Always<Node, 1>},
    {"argument", &forms::kWalrus, rule_forms::NamedArgument<Node>},
    {"typedargslist", &forms::kPositionalOnly, rule_forms::Slash<Node>},
    {"varargslist", &forms::kPositionalOnly, rule_forms::Slash<Node>},
    {"return_stmt", &forms::kStarInResult, rule_forms::StarInList<Node, 1>},
    {"yield_expr", &forms::kStarInResult, rule_forms::StarInList<Node, 1>},
    {"for_stmt", &forms::kStarInFor, rule_forms::StarInList<Node, 3>},
    {"trailer", &forms::kWalrusInSubscript, rule_forms::At<Node, 1, EFormPart::kNamed>},
    {"subscriptlist", &forms::kWalrusInSubscript, rule_forms::First<Node, EFormPart::kNamed>},
    {"atom", &forms::kWalrusInSet, rule_forms::InBraces<Node>},
    {"dictorsetmaker", &forms::kWalrusInSet, rule_forms::First<Node, EFormPart::kNamed>},
    {"star_test", &forms::kStarInSubscript, rule_forms::Always<Node, 0>},
    {"fpdef", &forms::kStarredAnnotation, rule_forms::At<Node, 2, EFormPart::kStar>},
    {"except_clause", &forms::kBareExcept, rule_forms::At<Node, 1, EFormPart::kList>},
});

}  // namespace codeloom
