// What expressions answer: chains, operators, comprehensions, `lambda`, `yield`, `:=`.
#pragma once

#include <span>

#include "syntax/nodes.h"

namespace codeloom {

// An atom and what follows it: `a.b(1)[2]`, `await a.b`.
struct CChain {
    const CTreeNode* atom = nullptr;
    std::span<const CTreeNode> trailers;
    bool is_awaited = false;
};

// `await a`, `a.b`, `a(1)[2]`
//   child    ['await']  atom  trailer  trailer ...
inline CChain ChainOfAtomExpr(const CTree& tree, const CTreeNode& node) {
    const std::span<const CTreeNode> children = tree.Children(node);
    const bool is_awaited =
        IsWord(children[0], EWord::kAwait) && children.size() >= 2 && !children[1].Is(ENodeKind::kTrailer);
    const size_t atom_i = is_awaited ? 1 : 0;
    return {&children[atom_i], children.subspan(atom_i + 1), is_awaited};
}

// `a.b ** c`, and in the 2.7 grammar `a.b` too
//   child    chain  '**'  exponent
//   child    atom  trailer  trailer ...  ['**'  exponent]
inline CChain ChainOfPower(const CTree& tree, const CTreeNode& node) {
    const std::span<const CTreeNode> children = tree.Children(node);
    if (children[0].Is(ENodeKind::kAtomExpr)) return ChainOfAtomExpr(tree, children[0]);
    size_t end = 1;
    while (end < children.size() && !IsToken(children[end], kTokenId_DOUBLESTAR)) ++end;
    return {&children[0], children.subspan(1, end - 1), false};
}

// What is after `**` in a power; null without it.
inline const CTreeNode* ExponentOf(const CTree& tree, const CTreeNode& power) {
    return HasToken(tree, power, kTokenId_DOUBLESTAR) ? &LastChild(tree, power) : nullptr;
}

// The chain of a kAtomExpr or a kPower. Any other node is its own atom, without trailers.
inline CChain ChainOf(const CTree& tree, const CTreeNode& node) {
    if (node.Is(ENodeKind::kAtomExpr)) return ChainOfAtomExpr(tree, node);
    if (node.Is(ENodeKind::kPower)) return ChainOfPower(tree, node);
    return {&node, {}, false};
}

// `.name`
//   child    '.'  name
// The name; null for a call and a subscript.
inline const CTreeNode* DotNameOf(const CTree& tree, const CTreeNode& trailer) {
    const bool is_dot = trailer.child_count == 2 && HasTokenAt(tree, trailer, 0, kTokenId_DOT);
    return is_dot ? TryChild(tree, trailer, 1, ENodeKind::kNameLiteral) : nullptr;
}

// `(a, b)`, `[a]`
//   child    '(' or '['  [contents]  ')' or ']'
// The contents; null without any, and for `.name`.
inline const CTreeNode* ContentsOfTrailer(const CTree& tree, const CTreeNode& trailer) {
    return trailer.child_count == 3 ? &tree.Child(trailer, 1) : nullptr;
}

// `a + b - c`, `a < b`, `a or b`, `not a`
//   child    term  operator  term  operator  term ...
//   child    'not'  term
// An operator of two words is a node of two leaves.
inline uint32_t TermCountOf(const CTreeNode& operators) {
    if (operators.child_count < 2) return 0;
    return operators.child_count == 2 ? 1 : operators.child_count / 2 + 1;
}

// Requires: i < TermCountOf(operators).
inline const CTreeNode& TermOf(const CTree& tree, const CTreeNode& operators, uint32_t i) {
    return tree.Child(operators, operators.child_count == 2 ? 1 : i * 2);
}

// The operator after the term at `i`, or `not`; null after the last term.
inline const CTreeNode* OperatorAfterTerm(const CTree& tree, const CTreeNode& operators, uint32_t i) {
    return TryChild(tree, operators, operators.child_count == 2 ? i * 2 : i * 2 + 1);
}

// `*a` as an expression
//   child    '*'  expression
inline const CTreeNode& StarredExpressionOf(const CTree& tree, const CTreeNode& star) {
    return tree.Child(star, 1);
}

// `-a`, `+a`, `~a`
//   child    operator  operand
// The operand when it is a number after a plus or a minus; null otherwise.
inline const CTreeNode* SignedNumberOf(const CTree& tree, const CTreeNode& factor) {
    if (!factor.Is(ENodeKind::kFactor)) return nullptr;
    const CTreeNode& sign = tree.Child(factor, 0);
    if (!IsToken(sign, kTokenId_PLUS) && !IsToken(sign, kTokenId_MINUS)) return nullptr;
    return TryChild(tree, factor, 1, ENodeKind::kNumberLiteral);
}

// `a if condition else b`
//   child    value  'if'  condition  'else'  value
inline const CTreeNode& ConditionOfIfElse(const CTree& tree, const CTreeNode& if_else) {
    return tree.Child(if_else, 2);
}

// `lambda x: y`
//   child    'lambda'  [parameters]  ':'  body
// The parameters, a list or a lone one; null without any.
inline const CTreeNode* ParametersOfLambda(const CTree& tree, const CTreeNode& lambda) {
    return HasTokenAt(tree, lambda, 1, kTokenId_COLON) ? nullptr : TryChild(tree, lambda, 1);
}

inline const CTreeNode& BodyOfLambda(const CTree& tree, const CTreeNode& lambda) {
    return LastChild(tree, lambda);
}

// `yield a`, `yield from a`; a `yield` alone is a keyword leaf
//   child    'yield'  value
//   child    'yield'  argument: 'from'  value
inline bool IsYieldFrom(const CTree& tree, const CTreeNode& yield) {
    const CTreeNode* const argument = TryChild(tree, yield, 1, ENodeKind::kYieldArg);
    return argument != nullptr && argument->child_count >= 2 && HasWordAt(tree, *argument, 0, EWord::kFrom);
}

// Null without a value.
inline const CTreeNode* ValueOfYield(const CTree& tree, const CTreeNode& yield) {
    const CTreeNode* const value = TryChild(tree, yield, 1);
    if (value == nullptr || !value->Is(ENodeKind::kYieldArg)) return value;
    return &tree.Child(*value, value->child_count < 2 ? 0 : 1);
}

// `a := b`, as an expression and as an argument
//   child    name  ':='  value
inline const CTreeNode& AssignedNameOf(const CTree& tree, const CTreeNode& named) {
    return tree.Child(named, 0);
}

inline const CTreeNode& ValueOfNamed(const CTree& tree, const CTreeNode& named) {
    return tree.Child(named, 2);
}

// `a, b` and `a,`; `a for b in c` without parentheses of its own
//   child    item  ','  item  ',' ...
//   child    item  comprehension
// The lists of these forms are kTestList, and kListmaker within the brackets of the 2.7 grammar.
inline bool IsComprehensionList(const CTree& tree, const CTreeNode& list) {
    return TryChild(tree, list, 1, ENodeKind::kCompFor) != nullptr;
}

inline bool IsTupleList(const CTree& tree, const CTreeNode& list) {
    return list.Is(ENodeKind::kTestList) && !IsComprehensionList(tree, list) &&
           HasToken(tree, list, kTokenId_COMMA);
}

// `for x in y` within a comprehension, with the next `for` or `if`
//   child    ['async']  'for'  target  'in'  iterable  [next]
//   child    'async'  the clause, a node of this kind
struct CCompClause {
    const CTreeNode* target = nullptr;
    const CTreeNode* iterable = nullptr;
    const CTreeNode* next = nullptr;  // null after the last clause
    bool is_async = false;
};

inline CCompClause CompClauseOf(const CTree& tree, const CTreeNode& node) {
    const bool is_async = HasWordAt(tree, node, 0, EWord::kAsync);
    const bool is_wrapped = is_async && node.child_count == 2;
    const CTreeNode& clause = is_wrapped ? tree.Child(node, 1) : node;
    const uint32_t first = !is_wrapped && is_async ? 1 : 0;
    return {&tree.Child(clause, first + 1), &tree.Child(clause, first + 3), TryChild(tree, clause, first + 4),
            is_async};
}

}  // namespace codeloom
