// Arguments of calls and of definitions. A lone argument is without its list, as a node of this file
// where it has parts, or else as the name or expression itself: argument_info.h describes all shapes alike.
#pragma once

#include "tree/node.h"

namespace codeloom {

// One argument of a call that isn't a plain expression
//   child    name  '='  value
//   child    name  ':='  value
//   child    '*' or '**'  value
//   child    value  comprehension
//   index      0      1        2
class CSingleUsedArgumentNode : public CNode {
  public:
    OPERATIONS_OF(CSingleUsedArgumentNode, CNode)
    OPERATION(CTextOrNone, GetPrefix, (), "\"*\" or \"**\"; None without such.");
    OPERATION(CNodeRef, GetName, (), "What is before `=`; None when there is no `=`.");
    OPERATION(CNodeRef, GetValue, (), "The value after `=`; the node itself when there is no `=`.");
    OPERATION(bool, IsUnparenthesizedGenExpr, (), "True for a comprehension without parentheses of its own.");
    OPERATION(CNodeRef, GetNameAssigned, (), "What is before `:=`; None when there is no `:=`.");
    OPERATION(CNodeRef, GetNamedRightHandExpression, (), "The value after `:=`; None when there is no `:=`.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kNameIndex = 0, kOperatorIndex = 1, kValueIndex = 2;
};

// `name: annotation`, and in the 2.7 grammar `(a, b)`
//   child    name  ':'  annotation
//   child    '('  parameters  ')'
//   index     0        1       2
class CFunctionParameterDef : public CNode {
  public:
    OPERATIONS_OF(CFunctionParameterDef, CNode)
    OPERATION(CNodeRef, GetNestedListNode, (),
              "The parameters in parentheses of the old tuple form; None for an ordinary parameter.");
    OPERATION(CNodeRef, GetName, (), "The name; None for the tuple form.");
    OPERATION(CNodeRef, GetTypeExpr, (), "The annotation; None when there is none.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kCount = 3;
    static constexpr Py_ssize_t kNameIndex = 0, kNestedIndex = 1, kAnnotationIndex = 2;
};

// `a, b=1, *c` in a definition or a lambda
//   child    ['*' or '**']  parameter  ['='  default]  ','  parameter ...
// The parameter is a name or a CFunctionParameterDef; a bare `*` and a `/` are without one.
class CDefiningArglistNode : public CNode {};

// `a, b=1, *c` in a call
//   child    argument  ','  argument ...
// In the 2.7 grammar `*` and `**` are children too, before their argument.
class CUsedArglistNode : public CNode {};

// `( ... )` after the name of a function
//   child    '('  [parameters]  ')'
//   index     0        1
class CParametersNode : public CNode {};

}  // namespace codeloom
