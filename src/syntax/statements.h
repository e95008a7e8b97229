// What statements other than definitions and imports answer.
#pragma once

#include "syntax/expressions.h"

namespace codeloom {

// Simple statements

// `a = b = c`, `a += b`, `a: b = c`; an expression alone isn't a statement node
//   child    target  '='  target or value  '='  target or value ...
//   child    target  operator  value
//   child    target  annotated assignment
// The last form has a kAnnotatedAssign; null for the others.
inline const CTreeNode* AnnotatedAssignOf(const CTree& tree, const CTreeNode& statement) {
    return TryChild(tree, statement, 1, ENodeKind::kAnnotatedAssign);
}

// The number of `=` of the statement itself, and so of its targets; those of an annotated assignment don't
// count.
inline uint32_t EqualCountOf(const CTree& tree, const CTreeNode& statement) {
    uint32_t count = 0;
    for (const CTreeNode& child : tree.Children(statement)) count += IsToken(child, kTokenId_EQUAL);
    return count;
}

// Requires: i < EqualCountOf(statement).
inline const CTreeNode& TargetOf(const CTree& tree, const CTreeNode& statement, uint32_t i) {
    return tree.Child(statement, i * 2);
}

// What is after the last `=` of an assignment, or after the operator of an augmented one.
inline const CTreeNode& ValueOfAssignment(const CTree& tree, const CTreeNode& statement) {
    return LastChild(tree, statement);
}

// `: annotation = value` after the target of an assignment
//   child    ':'  annotation  ['='  value]
inline const CTreeNode& HintOfAnnotatedAssign(const CTree& tree, const CTreeNode& annotated) {
    return tree.Child(annotated, 1);
}

// Null for a bare annotation.
inline const CTreeNode* ValueOfAnnotatedAssign(const CTree& tree, const CTreeNode& annotated) {
    return TryChild(tree, annotated, 3);
}

// `return a`, `del a, b`
//   child    keyword  expression
// A `return` alone is a keyword leaf. The expressions of a `del` are a kTestList or one expression.
inline const CTreeNode* ExpressionAfterKeyword(const CTree& tree, const CTreeNode& statement) {
    return TryChild(tree, statement, 1);
}

// `global a, b`, `nonlocal a, b`
//   child    keyword  name  ','  name ...
template <class Visit>
void ForEachDeclaredName(const CTree& tree, const CTreeNode& statement, Visit visit) {
    for (const CTreeNode& child : tree.Children(statement).subspan(1))
        if (child.Is(ENodeKind::kNameLiteral)) visit(child);
}

// Compound statements

// `if test: suite`; an `elif` is read as `if`, and an `else` is after an invented `if 0: pass`
//   child    'if'  test  ':'  suite  ['elif'  test  ':'  suite] ...  ['else'  ':'  suite]
inline const CTreeNode& TestOfIf(const CTree& tree, const CTreeNode& statement) {
    return tree.Child(statement, 1);
}

// `for target in iterable: suite`
//   child    'for'  target  'in'  iterable  ':'  suite  ['else'  ':'  suite]
//   index      0      1       2      3       4     5                   7
struct CForParts {
    const CTreeNode* target = nullptr;
    const CTreeNode* iterable = nullptr;
    const CTreeNode* body = nullptr;
    const CTreeNode* else_body = nullptr;  // null without one
};

inline CForParts PartsOfFor(const CTree& tree, const CTreeNode& statement) {
    return {&tree.Child(statement, 1), &tree.Child(statement, 3), &tree.Child(statement, 5),
            TryChild(tree, statement, 7)};
}

// `a as b` in a `with`; an item without `as` is the expression itself
//   child    expression  'as'  target
inline const CTreeNode& ExpressionOfWithItem(const CTree& tree, const CTreeNode& item) {
    return tree.Child(item, 0);
}

inline const CTreeNode& TargetOfWithItem(const CTree& tree, const CTreeNode& item) {
    return tree.Child(item, 2);
}

// `with item, item: suite`
//   child    'with'  item  ','  item ...  ':'  suite
// Visits the items with `as`.
template <class Visit>
void ForEachWithItem(const CTree& tree, const CTreeNode& statement, Visit visit) {
    for (const CTreeNode& child : tree.Children(statement))
        if (child.Is(ENodeKind::kWithItem)) visit(child);
}

// `except a as b`, and in the 2.7 grammar `except a, b`; an `except` alone is a keyword leaf
//   child    'except'  type  ['as' or ','  target]
inline const CTreeNode* TypeOfExcept(const CTree& tree, const CTreeNode& clause) {
    return TryChild(tree, clause, 1);
}

// Null when the exception isn't bound.
inline const CTreeNode* TargetOfExcept(const CTree& tree, const CTreeNode& clause) {
    if (clause.child_count < 3) return nullptr;
    const CTreeNode& separator = tree.Child(clause, clause.child_count - 2);
    const bool has_target = IsToken(separator, kTokenId_COMMA) || IsWord(separator, EWord::kAs);
    return has_target ? &LastChild(tree, clause) : nullptr;
}

// `match subject:`
//   child    'match'  subject  ':'
inline const CTreeNode& SubjectOfMatch(const CTree& tree, const CTreeNode& statement) {
    return tree.Child(statement, 1);
}

// `case pattern if guard: body`
//   child    'case'  pattern  [guard]  ':'  [body]
//   index       0       1        2            last
// The guard is the `if` statement of its condition.
inline const CTreeNode& PatternOfCase(const CTree& tree, const CTreeNode& statement) {
    return tree.Child(statement, 1);
}

// Null with fewer than four children. A case without a guard but with a body answers its `:`.
inline const CTreeNode* GuardOfCase(const CTree& tree, const CTreeNode& statement) {
    return statement.child_count >= 4 ? &tree.Child(statement, 2) : nullptr;
}

// The body on the same logical line; null when there is none.
inline const CTreeNode* BodyOfCase(const CTree& tree, const CTreeNode& statement) {
    const CTreeNode& last = LastChild(tree, statement);
    return IsToken(last, kTokenId_COLON) ? nullptr : &last;
}

// `name=a` within a class pattern
//   child    name  '='  pattern
inline bool IsNamedPattern(const CTree& tree, const CTreeNode& pattern) {
    return pattern.Is(ENodeKind::kClassArgumentPattern) && HasTokenAt(tree, pattern, 1, kTokenId_EQUAL);
}

}  // namespace codeloom
