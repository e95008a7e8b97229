// Expressions: operators, chains of trailers, comprehensions, yields. Each class shows the source that it
// stands for, and its children in source order. A node of a class is proof that the optional part of its rule
// was there: a lone child takes its parent's place.
#pragma once

#include "tree/node_range.h"

namespace codeloom {

template <class Class>
class TExpressionOperations;
template <class Class>
class TOperatorExpressionOperations;
template <class Class>
class TStarExpressionOperations;
template <class Class>
class TLambdaExprOperations;
template <class Class, class Base>
class TYieldOperations;
template <class Class>
class TTestListStarExprOperations;
template <class Class>
class TAtomExprOperations;
template <class Class>
class TPowerOperations;
template <class Class>
class TFactorExprOperations;
template <class Class>
class TNamedExprOperations;
template <class Class>
class TCompForOperations;
template <class Class>
class TListmakerOperations;
template <class Class>
class TTrailerOperations;

class CExpression;
using CExpressionRef = CRef<CExpression>;

// Base of all expressions, and the class of a state whose class isn't known. It stands for a list of
// sub-expressions, which has none in a plain expression.
class CExpression : public CNode {
  public:
    template <class Class>
    using TOperations = TExpressionOperations<Class>;

    virtual CExpressionRef GetSubExpr(int i);
    virtual int GetSubExprCount();
};

// `a if condition else b`
class CIfElseExpression : public CExpression {};

// `not a`, `a or b`, `a + b - c`, `a < b`
//   child    term  operator  term  operator  term ...
//   child    'not'  term
// An operator of two words is a node of two leaves.
class COperatorExpression : public CExpression {
  public:
    template <class Class>
    using TOperations = TOperatorExpressionOperations<Class>;

    virtual CTextOrNone GetOperatorStr(int operator_i);
    virtual int GetTermCount();
    virtual CNodeRef GetTerm(int term_index);

  private:
    static CTextOrNone _TextOfTwoWords(const CNodeRef& node);
};

// `*a` as an expression, not in a declaration of arguments
//   child    '*'  expression
class CStarExpression : public CExpression {
  public:
    template <class Class>
    using TOperations = TStarExpressionOperations<Class>;

    virtual CExpressionRef GetStarredExpression();

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
    template <class Class>
    using TOperations = TLambdaExprOperations<Class>;

    virtual CNodeRef GetArgumentsNode();
    virtual CNodeRef GetBodyExpr();

  private:
    static constexpr Py_ssize_t kArgumentsIndex = 1;
};

// Declared for hosts; no rule makes one.
class CTestExpr : public CExpression {};

// `yield a`, `yield from a`; a `yield` alone is a keyword leaf
//   child    'yield'  argument
class CYieldExpr : public CExpression {
  public:
    template <class Class>
    using TOperations = TYieldOperations<Class, CExpression::TOperations<Class>>;

    virtual CNodeRef GetValue();
    virtual bool IsYieldFrom();

  private:
    static constexpr Py_ssize_t kArgumentIndex = 1;
};

// `a, b` and `a,`: comma lists of expressions; `a for b in c` within brackets
//   child    item  ','  item  ',' ...
//   child    item  comprehension
class CTestListStarExpr : public CExpression {
  public:
    template <class Class>
    using TOperations = TTestListStarExprOperations<Class>;

    CExpressionRef GetSubExpr(int i) override;
    int GetSubExprCount() override;
    virtual bool IsTuple();
    virtual bool IsGenExpr();
};

// `await a`, `a.b`, `a(1)[2]`: an atom and its trailers
//   child    ['await']  atom  trailer  trailer ...
class CAtomExpr : public CExpression {
  public:
    template <class Class>
    using TOperations = TAtomExprOperations<Class>;

    virtual CNodeRef GetPrefix();
    virtual CNodeRef GetAtom();
    virtual CNodeRange GetTrailers();

  private:
    Py_ssize_t _AtomIndex();
};

// `a ** b`, and in the 2.7 grammar an atom with its trailers
//   child    atom with its trailers  '**'  exponent
//   child    atom  trailer  trailer ...  ['**'  exponent]
class CPower : public CExpression {
  public:
    template <class Class>
    using TOperations = TPowerOperations<Class>;

    virtual CNodeRef GetAtom();
    virtual CNodeRange GetTrailers();
    virtual CNodeRef GetExponentNode();
};

// What a chain is made of: a CAtomExpr or a CPower, whose exponent is no part of it.
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
    template <class Class>
    using TOperations = TFactorExprOperations<Class>;

    virtual CTextOrNone GetUnaryOperator();
};

// `a := b`
//   child    name  ':='  expression
//   index     0            2
class CNamedExpr : public CExpression {
  public:
    template <class Class>
    using TOperations = TNamedExprOperations<Class>;

    virtual CNodeRef GetAssignedName();
    virtual CNodeRef GetRightHandExpression();

  private:
    static constexpr Py_ssize_t kNameIndex = 0, kExpressionIndex = 2;
};

// Declared for hosts; no rule makes one.
class CBinaryOp : public CNode {};

// `from a` behind `yield`
//   child    ['from']  value
class CYieldArg : public CNode {
  public:
    template <class Class>
    using TOperations = TYieldOperations<Class, CNode::TOperations<Class>>;

    virtual CNodeRef GetValue();
    virtual bool IsYieldFrom();
};

// `for x in y` within a comprehension, with the next `for` or `if`
//   child    ['async']  'for'  target  'in'  iterable  [next]
//   index                 0      1       2      3        4     one more behind `async`
//   child    'async'  the clause, a node of this class
class CCompForNode : public CNode {
  public:
    template <class Class>
    using TOperations = TCompForOperations<Class>;

    virtual bool IsAsync();
    virtual CNodeRef GetTargetNode();
    virtual CNodeRef GetInNode();
    virtual CNodeRef GetCompIterNode();

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
    template <class Class>
    using TOperations = TListmakerOperations<Class>;

    virtual int GetSubExprCount();
    virtual CExpressionRef GetSubExpr(nb::object i);

  private:
    bool _IsComprehension();
};

// `(...)`, `[...]` or `.name` behind an atom
//   child    '.'  name
//   child    '(' or '['  [contents]  ')' or ']'
class CTrailer : public CNode {
  public:
    template <class Class>
    using TOperations = TTrailerOperations<Class>;

    virtual CTextOrNone GetDotName();
    virtual CNodeRef GetNestedNode();
    virtual CTextOrNone GetInitialToken();

  private:
    static constexpr Py_ssize_t kNameIndex = 1, kContentsIndex = 1;
};

template <class Class>
class TExpressionOperations : public CNode::TOperations<Class> {
    OPERATIONS_BEYOND(CNode::TOperations<Class>)
    OPERATION(GetSubExpr,
              "The sub-expression at index `i`: None in a plain expression and in a comprehension. "
              "ValueError past the end of a comma list, and where an item isn't a CExpression.",
              "i"_a)
    OPERATION(GetSubExprCount,
              "The number of sub-expressions of a comma list: 0 for a plain expression, 1 for a "
              "comprehension that stands without its brackets.")
    END_OPERATIONS
};

template <class Class>
class TOperatorExpressionOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(GetOperatorStr,
              "The text of the operator at `operator_i`, two words with one blank between them; None below "
              "the first and past the last.",
              "operator_i"_a)
    OPERATION(GetTermCount, "The number of operands; 1 for `not a`, 0 for a leaf.")
    OPERATION(GetTerm,
              "The operand at `term_index`; None past the end. For `not a` it is `a`, whatever the index.",
              "term_index"_a)
    END_OPERATIONS
};

template <class Class>
class TStarExpressionOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(GetStarredExpression, "The expression behind the star.")
    END_OPERATIONS
};

template <class Class>
class TLambdaExprOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(GetArgumentsNode, "The one parameter, or the list of parameters; None without parameters.")
    OPERATION(GetBodyExpr, "The expression behind the colon.")
    END_OPERATIONS
};

template <class Class>
class TTestListStarExprOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(IsTuple, "True for a comma list; False for a comprehension.")
    OPERATION(IsGenExpr, "True for a comprehension, which stands here without its brackets.")
    END_OPERATIONS
};

template <class Class>
class TAtomExprOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(GetPrefix,
              "The leaf of `await` before the atom; None without one, and where `await` is itself the name "
              "that the trailers belong to.")
    OPERATION(GetAtom, "The atom in front of the trailers; None for a leaf.")
    OPERATION(GetTrailers, "The trailers behind the atom, as a new list.")
    END_OPERATIONS
};

template <class Class>
class TPowerOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(GetAtom, "The atom in front of the trailers, under either grammar.")
    OPERATION(GetTrailers, "The trailers between the atom and `**`, as a new list.")
    OPERATION(GetExponentNode, "The exponent; None without `**`.")
    END_OPERATIONS
};

template <class Class>
class TFactorExprOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(GetUnaryOperator, "\"+\", \"-\" or \"~\"; None for any other text.")
    END_OPERATIONS
};

template <class Class>
class TNamedExprOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(GetAssignedName, "The name in front of `:=`.")
    OPERATION(GetRightHandExpression, "The expression behind `:=`.")
    END_OPERATIONS
};

// Of a `yield`, and of what stands behind it.
template <class Class, class Base>
class TYieldOperations : public Base {
    OPERATIONS_BEYOND(Base)
    OPERATION(GetValue, "What is yielded; None for a bare `yield`.")
    OPERATION(IsYieldFrom, "True for `yield from`.")
    END_OPERATIONS
};

template <class Class>
class TCompForOperations : public CNode::TOperations<Class> {
    OPERATIONS_BEYOND(CNode::TOperations<Class>)
    OPERATION(IsAsync, "True for `async for`.")
    OPERATION(GetTargetNode, "The target between `for` and `in`.")
    OPERATION(GetInNode, "The iterable behind `in`.")
    OPERATION(GetCompIterNode, "The `for` or `if` that follows; None for the last one.")
    END_OPERATIONS
};

template <class Class>
class TListmakerOperations : public CNode::TOperations<Class> {
    OPERATIONS_BEYOND(CNode::TOperations<Class>)
    OPERATION(GetSubExprCount, "The number of items; 1 for a comprehension.")
    OPERATION(GetSubExpr,
              "The item at index `i`; None past the end, and for a comprehension. TypeError when it isn't a "
              "CExpression.",
              "i"_a)
    END_OPERATIONS
};

template <class Class>
class TTrailerOperations : public CNode::TOperations<Class> {
    OPERATIONS_BEYOND(CNode::TOperations<Class>)
    OPERATION(GetDotName, "The name of `.name`; None for other trailers.")
    OPERATION(GetNestedNode, "The contents of `(...)` or `[...]`; None for empty brackets and for `.name`.")
    OPERATION(GetInitialToken, "The text of the first token. ValueError for a trailer without children.")
    END_OPERATIONS
};

}  // namespace codeloom
