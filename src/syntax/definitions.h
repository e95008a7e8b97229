// What definitions answer: `def`, `class`, decorators, type parameters.
#pragma once

#include "syntax/arguments.h"

namespace codeloom {

// `def name(parameters) -> result: suite`; an `async def` is a node of a rule of its own around it
//   child    'def'  name  parameters  ['->'  result]  ':'  suite
//   index      0      1       2         3      4           last
inline const CTreeNode& NameOfFuncdef(const CTree& tree, const CTreeNode& funcdef) {
    return tree.Child(funcdef, 1);
}

inline const CTreeNode& ParametersOfFuncdef(const CTree& tree, const CTreeNode& funcdef) {
    return tree.Child(funcdef, 2);
}

// Null when the header has no arrow.
inline const CTreeNode* ArrowOfFuncdef(const CTree& tree, const CTreeNode& funcdef) {
    return HasTokenAt(tree, funcdef, 3, kTokenId_RARROW) ? &tree.Child(funcdef, 3) : nullptr;
}

inline const CTreeNode* ReturnTypeOfFuncdef(const CTree& tree, const CTreeNode& funcdef) {
    return ArrowOfFuncdef(tree, funcdef) != nullptr ? TryChild(tree, funcdef, 4) : nullptr;
}

inline const CTreeNode& SuiteOfDefinition(const CTree& tree, const CTreeNode& definition) {
    return LastChild(tree, definition);
}

// `class name(arguments): suite`
//   child    'class'  name  ['('  [arguments]  ')']  ':'  suite
//   index       0      1      2        3
inline const CTreeNode& NameOfClassdef(const CTree& tree, const CTreeNode& classdef) {
    return tree.Child(classdef, 1);
}

// The bases and keyword arguments, for ForEachArgument; null without any.
inline const CTreeNode* BasesOfClassdef(const CTree& tree, const CTreeNode& classdef) {
    const bool has_bases =
        HasTokenAt(tree, classdef, 2, kTokenId_LPAR) && !HasTokenAt(tree, classdef, 3, kTokenId_RPAR);
    return has_bases ? TryChild(tree, classdef, 3) : nullptr;
}

// `@name(arguments)`, with the end of its row
//   child    '@'  name  ['('  [arguments]  ')']  newline
//   index     0    1      2       3         4
// The name is a kDottedName, a kNameLiteral, or any expression.
inline const CTreeNode& NameOfDecorator(const CTree& tree, const CTreeNode& decorator) {
    return tree.Child(decorator, 1);
}

// For ForEachArgument; null without any.
inline const CTreeNode* ArgumentsOfDecorator(const CTree& tree, const CTreeNode& decorator) {
    const bool has_arguments =
        HasTokenAt(tree, decorator, 2, kTokenId_LPAR) && HasTokenAt(tree, decorator, 4, kTokenId_RPAR);
    return has_arguments ? &tree.Child(decorator, 3) : nullptr;
}

// `name`, `*name`, `**name`, `name: bound`, `name = default` in a list of type parameters
//   child    ['*' or '**']  name  [':' or '='  bound or default]
inline const CTreeNode& NameOfTypeParameter(const CTree& tree, const CTreeNode& parameter) {
    const uint32_t count = parameter.child_count;
    return tree.Child(parameter, count < 3 ? count - 1 : count - 3);
}

inline EStars StarsOfTypeParameter(const CTree& tree, const CTreeNode& parameter) {
    return StarsOf(tree.Child(parameter, 0));
}

// The bound or the default; null without any.
inline const CTreeNode* SpecOfTypeParameter(const CTree& tree, const CTreeNode& parameter) {
    return parameter.child_count >= 3 ? &LastChild(tree, parameter) : nullptr;
}

// Type parameters, then the assignment, class or function that they belong to
//   child    type parameter  type parameter ...  statement
inline std::span<const CTreeNode> TypeParametersOf(const CTree& tree, const CTreeNode& statement) {
    return tree.Children(statement).first(statement.child_count - 1);
}

inline const CTreeNode& TypeParameterScopedStatementOf(const CTree& tree, const CTreeNode& statement) {
    return LastChild(tree, statement);
}

}  // namespace codeloom
