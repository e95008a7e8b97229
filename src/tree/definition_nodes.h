// Definitions: `def`, `class`, decorators, type parameters.
#pragma once

#include "tree/argument_info.h"
#include "tree/argument_nodes.h"
#include "tree/expression_nodes.h"
#include "tree/statement.h"

namespace codeloom {

// `class name(arguments): suite`
//   child    'class'  name  ['('  [arguments]  ')']  ':'  suite
//   index       0      1      2        3
class CClassdefStmt : public CStmt {
  public:
    OPERATIONS_OF(CClassdefStmt, CStmt)
    OPERATION(CTextOrNone, GetClassName, (), "The name after `class`.");
    OPERATION(CArgumentList, GetBaseClassList, (),
              "A new list of CArgInfo, one for each base and keyword argument; empty without any.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kNameIndex = 1, kOpenIndex = 2, kArgumentsIndex = 3;
};

// `def name(parameters) -> result: suite`; an `async def` is a node of a rule of its own around it
//   child    'def'  name  parameters  ['->'  result]  ':'  suite
//   index      0      1       2         3      4           last
class CFuncdefStmt : public CStmt {
  public:
    OPERATIONS_OF(CFuncdefStmt, CStmt)
    OPERATION(CTextOrNone, GetFunctionName, (), "The name after `def`.");
    OPERATION(CRef<CParametersNode>, GetParameters, (), "The parameters with their parentheses.");
    OPERATION(CExpressionRef, GetReturnType, (),
              "The expression after `->`; None when the header has no arrow.");
    OPERATION(CNodeRef, GetSuite, (), "The body; None for a node without children.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kNameIndex = 1, kParametersIndex = 2, kArrowIndex = 3, kReturnTypeIndex = 4;
};

// `@name(arguments)`, with the end of its row
//   child    '@'  name  ['('  [arguments]  ')']  newline
//   index     0    1      2       3         4
class CSingleDecorator : public CNode {
  public:
    OPERATIONS_OF(CSingleDecorator, CNode)
    OPERATION(CNodeRef, GetDottedName, (), "The name after `@`: a CDottedName, or a CNameLiteral.");
    OPERATION(CArgumentList, GetUsedArgList, (),
              "A new list of CArgInfo, one for each argument; empty without any.");
    END_OPERATIONS

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
    OPERATIONS_OF(CTypeParameter, CNode)
    OPERATION(CTextOrNone, GetName, (), "The name of the type parameter.");
    OPERATION(CTextOrNone, GetPrefix, (), "\"*\" or \"**\"; None for a plain type parameter.");
    OPERATION(CNodeRef, GetSpecNode, (), "The bound after the colon; None when there is none.");
    END_OPERATIONS
};

// Type parameters, then the statement that they belong to (PEP 695). Made by hand, by no grammar state. The
// statement is None when nothing was left of it.
//   child    type parameter  type parameter ...  statement
class CWithTypeParameters : public CStmt {
  public:
    OPERATIONS_OF(CWithTypeParameters, CStmt)
    OPERATION(CNodeList, GetTypeParameters, (), "A new list of the CTypeParameter nodes.");
    OPERATION(CNodeRef, GetTypeParameterScopedStatement, (),
              "The assignment, class or function that the type parameters belong to.");
    END_OPERATIONS
};

}  // namespace codeloom
