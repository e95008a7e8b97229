// Simple statements: assignments, `return`, `del`, `global`, `nonlocal`, `pass`. A keyword alone, as in
// `return` and `pass`, is a leaf and no statement node.
#pragma once

#include "tree/expression_nodes.h"
#include "tree/statement.h"

namespace codeloom {

// Names as text strings.
using CNameList = nb::typed<nb::list, nb::str>;

// `: annotation = value` after the target of an assignment
//   child    ':'  annotation  ['='  value]
//   index     0       1         2     3
class CAnnotatedAssignNode : public CNode {
  public:
    OPERATIONS_OF(CAnnotatedAssignNode, CNode)
    OPERATION(CNodeRef, GetTypeHintNode, (), "The annotation after the colon.");
    OPERATION(CNodeRef, GetPostEqualsTestExpr, (), "The value after `=`; None for a bare annotation.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kHintIndex = 1, kValueIndex = 3;
};

// `a = b = c`, `a += b`, `a: b = c`; an expression alone isn't a statement node
//   child    target  '='  target or value  '='  target or value ...
//   child    target  operator  value
//   child    target  annotated assignment
//   index      0         1
class CExprStmt : public CStmt {
  public:
    OPERATIONS_OF(CExprStmt, CStmt)
    OPERATION(
        Py_ssize_t, GetEqualCount, (),
        "The number of `=` of the statement itself; those of arguments, and of an annotated assignment, "
        "don't count.");
    OPERATION(CRef<CAnnotatedAssignNode>, GetAnnotatedAssignNode, (),
              "The annotation and its value; None when there is no annotation.");
    OPERATION(CNodeRef, GetInitialTestExpr, (), "The first target, or the expression before an operator.");
    OPERATION(CNodeRef, GetPostEqualsTestExpr, (int equal_num),
              "The target or value after the `=` numbered `equal_num`, from zero; ValueError when there are "
              "fewer.",
              "equal_num"_a);
    OPERATION(CTextOrNone, GetAugAssignOp, (),
              "The operator of an augmented assignment, such as \"+=\"; None when there is none. The "
              "operators \"|=\" and \"@=\" give None.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kTargetIndex = 0, kOperatorIndex = 1, kFirstValueIndex = 2;
};

// `return a`
//   child    'return'  value
class CReturnStmt : public CStmt {
  public:
    OPERATIONS_OF(CReturnStmt, CStmt)
    OPERATION(CNodeRef, GetValue, (), "The expression that is returned; None when there is none.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kValueIndex = 1;
};

// `del a`, `del a, b`
//   child    'del'  expression or comma list
class CDelStmt : public CStmt {
  public:
    OPERATIONS_OF(CDelStmt, CStmt)
    OPERATION(CNodeList, GetExpressions, (),
              "A new list of the expressions that are deleted. One in parentheses is a single expression.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kExpressionIndex = 1;
};

// `global a, b`
//   child    'global'  name  ','  name ...
class CGlobalStmt : public CStmt {
  public:
    OPERATIONS_OF(CGlobalStmt, CStmt)
    OPERATION(CNameList, GetUtf8NameList, (), "A new list of the names, as text strings.");
    END_OPERATIONS
};

// `nonlocal a, b`
//   child    'nonlocal'  name  ','  name ...
class CNonlocalStmt : public CStmt {
  public:
    OPERATIONS_OF(CNonlocalStmt, CStmt)
    OPERATION(CNameList, GetUtf8NameList, (), "A new list of the names, as text strings.");
    END_OPERATIONS
};

// Declared for hosts: `pass` is a keyword leaf.
class CPassStmt : public CStmt {};

}  // namespace codeloom
