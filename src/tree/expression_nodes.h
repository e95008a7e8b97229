// Expressions: operators, chains of trailers, comprehensions, yields. Each class shows the source that it
// stands for, and its children in source order. A node of a class is proof that the optional part of its rule
// was there: a lone child takes its parent's place.
#pragma once

#include "tree/node_range.h"

namespace codeloom {

class CExpression;
using CExpressionRef = CRef<CExpression>;

// Base of all expressions, and the class of a state whose class isn't known. It stands for a list of
// sub-expressions, which has none in a plain expression.
class CExpression : public CNode {
  public:
    OPERATIONS_OF(CExpression, CNode)
    OPERATION(CExpressionRef, GetSubExpr, (int i),
              "The sub-expression at index `i`: None in a plain expression and in a comprehension. "
              "ValueError past the end of a comma list, and where an item isn't a CExpression.",
              "i"_a);
    OPERATION(int, GetSubExprCount, (),
              "The number of sub-expressions of a comma list: 0 for a plain expression, 1 for a "
              "comprehension that is without its brackets.");
    END_OPERATIONS
};

// `a if condition else b`
class CIfElseExpression : public CExpression {};

// `not a`, `a or b`, `a + b - c`, `a < b`
//   child    term  operator  term  operator  term ...
//   child    'not'  term
// An operator of two words is a node of two leaves.
class COperatorExpression : public CExpression {
  public:
    OPERATIONS_OF(COperatorExpression, CExpression)
    OPERATION(CTextOrNone, GetOperatorStr, (int operator_i),
              "The text of the operator at `operator_i`, two words with one blank between them; None below "
              "the first and past the last.",
              "operator_i"_a);
    OPERATION(int, GetTermCount, (), "The number of operands; 1 for `not a`, 0 for a leaf.");
    OPERATION(CNodeRef, GetTerm, (int term_index),
              "The operand at `term_index`; None past the end. For `not a` it is `a`, whatever the index.",
              "term_index"_a);
    END_OPERATIONS

  private:
    static CTextOrNone _TextOfTwoWords(const CNodeRef& node);
};

// `*a` as an expression, not in a declaration of arguments
//   child    '*'  expression
class CStarExpression : public CExpression {
  public:
    OPERATIONS_OF(CStarExpression, CExpression)
    OPERATION(CExpressionRef, GetStarredExpression, (), "The expression after the star.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kExpressionIndex = 1;
};

// `a.b.c` in decorators and imports
class CDottedName : public CExpression {};

// `lambda x: y`
//   child    'lambda'  [arguments]  ':'  body
//   index       0           1             last
class CLambdaExpr : public CExpression {
  public:
    OPERATIONS_OF(CLambdaExpr, CExpression)
    OPERATION(CNodeRef, GetArgumentsNode, (),
              "The one parameter, or the list of parameters; None without parameters.");
    OPERATION(CNodeRef, GetBodyExpr, (), "The expression after the colon.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kArgumentsIndex = 1;
};

// Declared for hosts; no rule makes one.
class CTestExpr : public CExpression {};

// `yield a`, `yield from a`; a `yield` alone is a keyword leaf
//   child    'yield'  argument
class CYieldExpr : public CExpression {
  public:
    OPERATIONS_OF(CYieldExpr, CExpression)
    OPERATION(CNodeRef, GetValue, (), "What is yielded; None for a bare `yield`.");
    OPERATION(bool, IsYieldFrom, (), "True for `yield from`.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kArgumentIndex = 1;
};

// `a, b` and `a,`: comma lists of expressions; `a for b in c` within parentheses
//   child    item  ','  item  ',' ...
//   child    item  comprehension
class CTestListStarExpr : public CExpression {
  public:
    CExpressionRef GetSubExpr(int i) override;
    int GetSubExprCount() override;
    OPERATIONS_OF(CTestListStarExpr, CExpression)
    OPERATION(bool, IsTuple, (), "True for a comma list; False for a comprehension.");
    OPERATION(bool, IsGenExpr, (), "True for a comprehension, which is here without its parentheses.");
    END_OPERATIONS
};

// `await a`, `a.b`, `a(1)[2]`: an atom and its trailers
//   child    ['await']  atom  trailer  trailer ...
class CAtomExpr : public CExpression {
  public:
    OPERATIONS_OF(CAtomExpr, CExpression)
    OPERATION(CNodeRef, GetPrefix, (),
              "The leaf of `await` before the atom; None without one, and where `await` is itself the name "
              "that the trailers belong to.");
    OPERATION(CNodeRef, GetAtom, (), "The atom before the trailers; None for a leaf.");
    OPERATION(CNodeRange, GetTrailers, (), "The trailers after the atom, as a new list.");
    END_OPERATIONS

  private:
    Py_ssize_t _AtomIndex();
};

// `a ** b`, and in the 2.7 grammar an atom with its trailers
//   child    atom with its trailers  '**'  exponent
//   child    atom  trailer  trailer ...  ['**'  exponent]
class CPower : public CExpression {
  public:
    OPERATIONS_OF(CPower, CExpression)
    OPERATION(CNodeRef, GetAtom, (), "The atom before the trailers, under either grammar.");
    OPERATION(CNodeRange, GetTrailers, (), "The trailers between the atom and `**`, as a new list.");
    OPERATION(CNodeRef, GetExponentNode, (), "The exponent; None without `**`.");
    END_OPERATIONS
};

// What a chain is made of: a CAtomExpr or a CPower, whose exponent isn't part of it.
struct CChainParts {
    CNodeRef atom;
    CNodeRange trailers;
};

template <class Chain>
CChainParts PartsOf(Chain& chain) {
    return {chain.GetAtom(), chain.GetTrailers()};  // asked in this order
}

// `-a`, `+a`, `~a`
//   child    operator  factor
class CFactorExpr : public CExpression {
  public:
    OPERATIONS_OF(CFactorExpr, CExpression)
    OPERATION(CTextOrNone, GetUnaryOperator, (), "\"+\", \"-\" or \"~\"; None for any other text.");
    END_OPERATIONS
};

// `a := b`
//   child    name  ':='  expression
//   index     0            2
class CNamedExpr : public CExpression {
  public:
    OPERATIONS_OF(CNamedExpr, CExpression)
    OPERATION(CNodeRef, GetAssignedName, (), "The name before `:=`.");
    OPERATION(CNodeRef, GetRightHandExpression, (), "The expression after `:=`.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kNameIndex = 0, kExpressionIndex = 2;
};

// Declared for hosts; no rule makes one.
class CBinaryOp : public CNode {};

// `from a` after `yield`
//   child    ['from']  value
class CYieldArg : public CNode {
  public:
    OPERATIONS_OF(CYieldArg, CNode)
    OPERATION(CNodeRef, GetValue, (), "What is yielded; None for a bare `yield`.");
    OPERATION(bool, IsYieldFrom, (), "True for `yield from`.");
    END_OPERATIONS
};

// `for x in y` within a comprehension, with the next `for` or `if`
//   child    ['async']  'for'  target  'in'  iterable  [next]
//   index                 0      1       2      3        4     one more after `async`
//   child    'async'  the clause, a node of this class
class CCompForNode : public CNode {
  public:
    OPERATIONS_OF(CCompForNode, CNode)
    OPERATION(bool, IsAsync, (), "True for `async for`.");
    OPERATION(CNodeRef, GetTargetNode, (), "The target between `for` and `in`.");
    OPERATION(CNodeRef, GetInNode, (), "The iterable after `in`.");
    OPERATION(CNodeRef, GetCompIterNode, (), "The `for` or `if` that follows; None for the last one.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kTargetIndex = 1, kIterableIndex = 3, kNextIndex = 4;
    static constexpr Py_ssize_t kWrappedIndex = 1;

    bool _IsWrapped();
    Py_ssize_t _IndexInClause(Py_ssize_t i);
    CNodeRef _Read(Py_ssize_t i, CNodeRef (CCompForNode::*accessor)());
};

// The contents of a list display in the 2.7 grammar
//   child    item  ','  item  ',' ...
//   child    item  comprehension
class CListmakerNode : public CNode {
  public:
    OPERATIONS_OF(CListmakerNode, CNode)
    OPERATION(int, GetSubExprCount, (), "The number of items; 1 for a comprehension.");
    OPERATION(CExpressionRef, GetSubExpr, (nb::object i),
              "The item at index `i`; None past the end, and for a comprehension. TypeError when it isn't a "
              "CExpression.",
              "i"_a);
    END_OPERATIONS

  private:
    bool _IsComprehension();
};

// `(...)`, `[...]` or `.name` after an atom
//   child    '.'  name
//   child    '(' or '['  [contents]  ')' or ']'
class CTrailer : public CNode {
  public:
    OPERATIONS_OF(CTrailer, CNode)
    OPERATION(CTextOrNone, GetDotName, (), "The name of `.name`; None for other trailers.");
    OPERATION(CNodeRef, GetNestedNode, (),
              "The contents of `(...)` or `[...]`; None for empty brackets and for `.name`.");
    OPERATION(CTextOrNone, GetInitialToken, (),
              "The text of the first token. ValueError for a trailer without children.");
    END_OPERATIONS

  private:
    static constexpr Py_ssize_t kNameIndex = 1, kContentsIndex = 1;
};

}  // namespace codeloom
