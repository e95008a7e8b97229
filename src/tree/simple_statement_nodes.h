// Simple statements: assignments, `return`, `del`, `global`, `nonlocal`, `pass`. A keyword alone, as in
// `return` and `pass`, is a leaf and no statement node.
#pragma once

#include "tree/expression_nodes.h"
#include "tree/statement.h"

namespace codeloom {

template <class Class>
class TExprStmtOperations;
template <class Class>
class TAnnotatedAssignOperations;
template <class Class>
class TReturnStmtOperations;
template <class Class>
class TDelStmtOperations;
template <class Class>
class TNameListOperations;

// Names as text strings.
using CNameList = nb::typed<nb::list, nb::str>;

// `: annotation = value` behind the target of an assignment
//   child    ':'  annotation  ['='  value]
//   index     0       1         2     3
class CAnnotatedAssignNode : public CNode {
  public:
    template <class Class>
    using TOperations = TAnnotatedAssignOperations<Class>;

    virtual CNodeRef GetTypeHintNode();
    virtual CNodeRef GetPostEqualsTestExpr();

  private:
    static constexpr Py_ssize_t kHintIndex = 1, kValueIndex = 3;
};

// `a = b = c`, `a += b`, `a: b = c`; an expression alone is no statement node
//   child    target  '='  target or value  '='  target or value ...
//   child    target  operator  value
//   child    target  annotated assignment
//   index      0         1
class CExprStmt : public CStmt {
  public:
    template <class Class>
    using TOperations = TExprStmtOperations<Class>;

    virtual Py_ssize_t GetEqualCount();
    virtual CRef<CAnnotatedAssignNode> GetAnnotatedAssignNode();
    virtual CNodeRef GetInitialTestExpr();
    virtual CNodeRef GetPostEqualsTestExpr(int equal_num);
    virtual CTextOrNone GetAugAssignOp();

  private:
    static constexpr Py_ssize_t kTargetIndex = 0, kOperatorIndex = 1, kFirstValueIndex = 2;
};

// `return a`
//   child    'return'  value
class CReturnStmt : public CStmt {
  public:
    template <class Class>
    using TOperations = TReturnStmtOperations<Class>;

    virtual CNodeRef GetValue();

  private:
    static constexpr Py_ssize_t kValueIndex = 1;
};

// `del a`, `del a, b`
//   child    'del'  expression or comma list
class CDelStmt : public CStmt {
  public:
    template <class Class>
    using TOperations = TDelStmtOperations<Class>;

    virtual CNodeList GetExpressions();

  private:
    static constexpr Py_ssize_t kExpressionIndex = 1;
};

// `global a, b`
//   child    'global'  name  ','  name ...
class CGlobalStmt : public CStmt {
  public:
    template <class Class>
    using TOperations = TNameListOperations<Class>;

    virtual CNameList GetUtf8NameList();
};

// `nonlocal a, b`
//   child    'nonlocal'  name  ','  name ...
class CNonlocalStmt : public CStmt {
  public:
    template <class Class>
    using TOperations = TNameListOperations<Class>;

    virtual CNameList GetUtf8NameList();
};

// Declared for hosts: `pass` is a keyword leaf.
class CPassStmt : public CStmt {};

template <class Class>
class TAnnotatedAssignOperations : public CNode::TOperations<Class> {
    OPERATIONS_BEYOND(CNode::TOperations<Class>)
    OPERATION(GetTypeHintNode, "The annotation behind the colon.")
    OPERATION(GetPostEqualsTestExpr, "The value behind `=`; None for a bare annotation.")
    END_OPERATIONS
};

template <class Class>
class TExprStmtOperations : public CStmt::TOperations<Class> {
    OPERATIONS_BEYOND(CStmt::TOperations<Class>)
    OPERATION(
        GetEqualCount,
        "The number of `=` of the statement itself; those of arguments, and of an annotated assignment, "
        "don't count.")
    OPERATION(GetAnnotatedAssignNode, "The annotation and its value; None when there is no annotation.")
    OPERATION(GetInitialTestExpr, "The first target, or the expression in front of an operator.")
    OPERATION(GetPostEqualsTestExpr,
              "The target or value behind the `=` numbered `equal_num`, from zero; ValueError when there are "
              "fewer.",
              "equal_num"_a)
    OPERATION(GetAugAssignOp,
              "The operator of an augmented assignment, such as \"+=\"; None when there is none. The "
              "operators \"|=\" and \"@=\" aren't told.")
    END_OPERATIONS
};

template <class Class>
class TReturnStmtOperations : public CStmt::TOperations<Class> {
    OPERATIONS_BEYOND(CStmt::TOperations<Class>)
    OPERATION(GetValue, "The expression that is returned; None when there is none.")
    END_OPERATIONS
};

template <class Class>
class TDelStmtOperations : public CStmt::TOperations<Class> {
    OPERATIONS_BEYOND(CStmt::TOperations<Class>)
    OPERATION(GetExpressions,
              "A new list of the expressions that are deleted. One in brackets is a single expression.")
    END_OPERATIONS
};

template <class Class>
class TNameListOperations : public CStmt::TOperations<Class> {
    OPERATIONS_BEYOND(CStmt::TOperations<Class>)
    OPERATION(GetUtf8NameList, "A new list of the names, as text strings.")
    END_OPERATIONS
};

}  // namespace codeloom
