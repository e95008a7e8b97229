// Definitions: `def`, `class`, decorators, type parameters.
#pragma once

#include "tree/argument_info.h"
#include "tree/argument_nodes.h"
#include "tree/expression_nodes.h"
#include "tree/statement.h"

namespace codeloom {

template <class Class>
class TClassdefOperations;
template <class Class>
class TFuncdefOperations;
template <class Class>
class TSingleDecoratorOperations;
template <class Class>
class TTypeParameterOperations;
template <class Class>
class TWithTypeParametersOperations;

// `class name(arguments): suite`
//   child    'class'  name  ['('  [arguments]  ')']  ':'  suite
//   index       0      1      2        3
class CClassdefStmt : public CStmt {
  public:
    template <class Class>
    using TOperations = TClassdefOperations<Class>;

    virtual CTextOrNone GetClassName();
    virtual CArgumentList GetBaseClassList();

  private:
    static constexpr Py_ssize_t kNameIndex = 1, kOpenIndex = 2, kArgumentsIndex = 3;
};

// `def name(parameters) -> result: suite`; an `async def` is a node of a rule of its own around it
//   child    'def'  name  parameters  ['->'  result]  ':'  suite
//   index      0      1       2         3      4           last
class CFuncdefStmt : public CStmt {
  public:
    template <class Class>
    using TOperations = TFuncdefOperations<Class>;

    virtual CTextOrNone GetFunctionName();
    virtual CRef<CParametersNode> GetParameters();
    virtual CExpressionRef GetReturnType();
    virtual CNodeRef GetSuite();

  private:
    static constexpr Py_ssize_t kNameIndex = 1, kParametersIndex = 2, kArrowIndex = 3, kReturnTypeIndex = 4;
};

// `@name(arguments)`, with the end of its row
//   child    '@'  name  ['('  [arguments]  ')']  newline
//   index     0    1      2       3         4
class CSingleDecorator : public CNode {
  public:
    template <class Class>
    using TOperations = TSingleDecoratorOperations<Class>;

    virtual CNodeRef GetDottedName();
    virtual CArgumentList GetUsedArgList();

  private:
    static constexpr Py_ssize_t kNameIndex = 1, kOpenIndex = 2, kArgumentsIndex = 3, kCloseIndex = 4;
};

// Decorators in a row
//   child    decorator  decorator ...
class CMultipleDecorators : public CNode {};

// `name`, `*name`, `**name`, `name: bound` in a list of type parameters. Made by hand, by no grammar state.
//   child    ['*' or '**']  name  [':'  bound]
class CTypeParameter : public CNode {
  public:
    template <class Class>
    using TOperations = TTypeParameterOperations<Class>;

    virtual CTextOrNone GetName();
    virtual CTextOrNone GetPrefix();
    virtual CNodeRef GetSpecNode();
};

// Type parameters, then the statement that they belong to (PEP 695). Made by hand, by no grammar state. The
// statement is none when nothing was left of it.
//   child    type parameter  type parameter ...  statement
class CWithTypeParameters : public CStmt {
  public:
    template <class Class>
    using TOperations = TWithTypeParametersOperations<Class>;

    virtual CNodeList GetTypeParameters();
    virtual CNodeRef GetTypeParameterScopedStatement();
};

template <class Class>
class TClassdefOperations : public CStmt::TOperations<Class> {
    OPERATIONS_BEYOND(CStmt::TOperations<Class>)
    OPERATION(GetClassName, "The name behind `class`.")
    OPERATION(GetBaseClassList,
              "A new list of CArgInfo, one for each base and keyword argument; empty without any.")
    END_OPERATIONS
};

template <class Class>
class TFuncdefOperations : public CStmt::TOperations<Class> {
    OPERATIONS_BEYOND(CStmt::TOperations<Class>)
    OPERATION(GetFunctionName, "The name behind `def`.")
    OPERATION(GetParameters, "The parameters with their brackets.")
    OPERATION(GetReturnType, "The expression behind `->`; None when the header has no arrow.")
    OPERATION(GetSuite, "The body; None for a node without children.")
    END_OPERATIONS
};

template <class Class>
class TSingleDecoratorOperations : public CNode::TOperations<Class> {
    OPERATIONS_BEYOND(CNode::TOperations<Class>)
    OPERATION(GetDottedName, "The name behind `@`: a CDottedName, or a CNameLiteral.")
    OPERATION(GetUsedArgList, "A new list of CArgInfo, one for each argument; empty without any.")
    END_OPERATIONS
};

template <class Class>
class TTypeParameterOperations : public CNode::TOperations<Class> {
    OPERATIONS_BEYOND(CNode::TOperations<Class>)
    OPERATION(GetName, "The name of the type parameter.")
    OPERATION(GetPrefix, "\"*\" or \"**\"; None for a plain type parameter.")
    OPERATION(GetSpecNode, "The bound behind the colon; None when there is none.")
    END_OPERATIONS
};

template <class Class>
class TWithTypeParametersOperations : public CStmt::TOperations<Class> {
    OPERATIONS_BEYOND(CStmt::TOperations<Class>)
    OPERATION(GetTypeParameters, "A new list of the CTypeParameter nodes.")
    OPERATION(GetTypeParameterScopedStatement,
              "The assignment, class or function that the type parameters belong to.")
    END_OPERATIONS
};

}  // namespace codeloom
