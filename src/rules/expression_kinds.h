// What an expression is in the interpreter's words, which say what can't be assigned.
#pragma once

#include <string_view>

#include "syntax/nodes.h"

namespace codeloom {

#define CODELOOM_EXPRESSIONS(EXPRESSION)                 \
    EXPRESSION(kName, "name")                            \
    EXPRESSION(kAttribute, "attribute")                  \
    EXPRESSION(kSubscript, "subscript")                  \
    EXPRESSION(kList, "list")                            \
    EXPRESSION(kTuple, "tuple")                          \
    EXPRESSION(kStarred, "starred")                      \
    EXPRESSION(kNoneValue, "None")                       \
    EXPRESSION(kTrue, "True")                            \
    EXPRESSION(kFalse, "False")                          \
    EXPRESSION(kLambda, "lambda")                        \
    EXPRESSION(kConditional, "conditional expression")   \
    EXPRESSION(kNamed, "named expression")               \
    EXPRESSION(kGenerator, "generator expression")       \
    EXPRESSION(kListComprehension, "list comprehension") \
    EXPRESSION(kSetComprehension, "set comprehension")   \
    EXPRESSION(kDictComprehension, "dict comprehension") \
    EXPRESSION(kCall, "function call")                   \
    EXPRESSION(kOperation, "expression")                 \
    EXPRESSION(kComparison, "comparison")                \
    EXPRESSION(kYield, "yield expression")               \
    EXPRESSION(kAwait, "await expression")               \
    EXPRESSION(kDict, "dict literal")                    \
    EXPRESSION(kSet, "set display")                      \
    EXPRESSION(kFString, "f-string expression")          \
    EXPRESSION(kTString, "t-string expression")          \
    EXPRESSION(kEllipsis, "ellipsis")                    \
    EXPRESSION(kLiteral, "literal")

enum class EExpression : uint8_t {
#define CODELOOM_EXPRESSION_ENUM(name, text) name,
    CODELOOM_EXPRESSIONS(CODELOOM_EXPRESSION_ENUM)
#undef CODELOOM_EXPRESSION_ENUM
};

std::string_view TextOfKind(EExpression kind);

// What the node is; of parentheses, what is in them.
EExpression KindOfExpression(const CTree& tree, const CTreeNode& node);

// `yield` with or without a value.
inline bool IsYield(const CTreeNode& node) {
    return node.Is(ENodeKind::kYield) || IsWord(node, EWord::kYield);
}

// True for an f-string, by its prefix.
bool HasPrefixLetter(std::string_view literal, char lower_letter);

}  // namespace codeloom
