// Compound statements other than definitions: `if`, `for`, `with`, `except`, `match`, `case`.
#pragma once

#include "tree/expression_nodes.h"
#include "tree/statement.h"

namespace codeloom {

// `if test: suite`; an `elif` is read as `if`, and an `else` follows an invented `if 0: pass`
//   child    'if'  test  ':'  suite  ['elif'  test  ':'  suite] ...  ['else'  ':'  suite]
//   index      0     1    2     3
class CIfStmt : public CStmt {
  public:
    OPERATIONS_OF(CIfStmt, CStmt)
    OPERATION(CExpressionRef, GetTestExpression, (), "The condition of the first branch.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kTestIndex = 1;
};

// `for target in iterable: suite`
//   child    'for'  target  'in'  iterable  ':'  suite  ['else'  ':'  suite]
//   index      0      1       2      3       4     5                   last
class CForStmt : public CStmt {
  public:
    OPERATIONS_OF(CForStmt, CStmt)
    OPERATION(CNodeRef, GetTarget, (), "What is bound in each round.");
    OPERATION(CNodeRef, GetInExpression, (), "What is iterated over.");
    OPERATION(CNodeRef, GetBody, (), "The body.");
    OPERATION(CNodeRef, GetElseBody, (), "The body after `else`; None when there is none.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kTargetIndex = 1, kIterableIndex = 3, kBodyIndex = 5;
    static constexpr Py_ssize_t kCountWithElse = 8;
};

// `a as b` in a `with`; an item without `as` is the expression itself
//   child    expression  'as'  target
//   index        0         1     2
class CWithItem : public CNode {
  public:
    OPERATIONS_OF(CWithItem, CNode)
    OPERATION(CNodeRef, GetExpression, (), "The expression before `as`.");
    OPERATION(CNodeRef, GetTarget, (), "The target after `as`.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kExpressionIndex = 0, kTargetIndex = 2;
};

using CWithItemList = nb::typed<nb::list, CWithItem>;

// `with item, item: suite`
//   child    'with'  item  ','  item ...  ':'  suite
class CWithStmt : public CStmt {
  public:
    OPERATIONS_OF(CWithStmt, CStmt)
    OPERATION(CWithItemList, GetWithItems, (),
              "A new list of the items with `as`; those without one aren't CWithItems.");
    END_OPERATIONS
};

// `except a as b`, and in the 2.7 grammar `except a, b`; an `except` alone is a keyword leaf
//   child    'except'  type  ['as' or ','  target]
//   index       0       1
class CExceptClause : public CNode {
  public:
    OPERATIONS_OF(CExceptClause, CNode)
    OPERATION(CNodeRef, GetExceptionType, (), "The expression after `except`.");
    OPERATION(CNodeRef, GetTarget, (), "What the exception is bound to; None when it isn't.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kTypeIndex = 1;
};

// `match subject:`. Made by hand, by no grammar state.
//   child    'match'  subject  ':'
//   index       0        1      2
class CMatchStmt : public CStmt {
  public:
    OPERATIONS_OF(CMatchStmt, CStmt)
    OPERATION(CExpressionRef, GetTestExpression, (), "The subject.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kSubjectIndex = 1;
};

// `case pattern if guard: body`. Made by hand, by no grammar state.
//   child    'case'  pattern  [guard]  ':'  [body]
//   index       0       1        2            last
// The guard is the `if` statement of its condition.
class CCaseStmt : public CStmt {
  public:
    OPERATIONS_OF(CCaseStmt, CStmt)
    OPERATION(CNodeRef, GetPattern, (), "The pattern.");
    OPERATION(
        CNodeRef, GetGuard, (),
        "The guard; None with fewer than four children. A case without a guard but with a body has four "
        "as well, and answers its `:`.");
    OPERATION(CNodeRef, GetBody, (), "The body on the same logical line; None when there is none.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kPatternIndex = 1, kGuardIndex = 2;
    static constexpr Py_ssize_t kLeastCountWithGuard = 4;
};

}  // namespace codeloom
