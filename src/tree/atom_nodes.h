// Atoms and literals: the leaves that carry text, and what stands in brackets.
#pragma once

#include "tree/expression_nodes.h"

namespace codeloom {

template <class Class>
class TNumberLiteralOperations;
template <class Class>
class TStringLiteralOperations;
template <class Class>
class TAtomOperations;

// A name
class CNameLiteral : public CExpression {};

// A keyword, also `await` and `async`; which one its text says
class CKeywordLiteral : public CExpression {};

// A number
class CNumberLiteral : public CExpression {
  public:
    template <class Class>
    using TOperations = TNumberLiteralOperations<Class>;

    virtual bool IsFloat();
    virtual nb::object GetNumericValue();
};

// One string literal, with its prefix and quotes
class CStringLiteral : public CExpression {
  public:
    template <class Class>
    using TOperations = TStringLiteralOperations<Class>;

    virtual bool IsUnicode();
    virtual bool IsBytes();
    virtual CTextOrNone GetStringContents();
    virtual nb::object GetStringValue();

  private:
    bool _IsMarked(char lower, char upper) const;
};

// `(a)`, `[a, b]`, `{a: b}`, adjacent strings, and in the 2.7 grammar backquotes
//   child    bracket  [contents]  bracket
//   child    string  string ...
class CAtom : public CExpression {
  public:
    template <class Class>
    using TOperations = TAtomOperations<Class>;

    CExpressionRef GetSubExpr(int i) override;
    int GetSubExprCount() override;
    virtual CTextOrNone GetInitialBracket();
    virtual bool IsLiteral();
    virtual bool IsComprehension();
    virtual bool IsTwoPlusStringLiterals();

    static constexpr Py_ssize_t kContentsIndex = 1;
    static constexpr Py_ssize_t kFilledChildCount = 3;  // of brackets with contents
};

template <class Class>
class TNumberLiteralOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(IsFloat, "True when the text holds a point or an `e`, be it the digit of a hexadecimal number.")
    OPERATION(GetNumericValue,
              "The value of a decimal number; None for other bases, and whatever else the host's int() and "
              "float() refuse.")
    END_OPERATIONS
};

template <class Class>
class TStringLiteralOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(IsUnicode, "True with the prefix `u`, a raw marker before it allowed.")
    OPERATION(IsBytes, "True with the prefix `b`, a raw marker before it allowed.")
    OPERATION(GetStringContents,
              "The source between the quotes, escapes as they stand; up to the end of an unterminated "
              "literal.")
    OPERATION(GetStringValue, "The value of the literal; None for an f-string.")
    END_OPERATIONS
};

template <class Class>
class TAtomOperations : public CExpression::TOperations<Class> {
    OPERATIONS_BEYOND(CExpression::TOperations<Class>)
    OPERATION(GetInitialBracket,
              "\"(\", \"[\" or \"{\"; None for other atoms. ValueError for an atom without children.")
    OPERATION(IsLiteral, "True unless the brackets hold a comprehension.")
    OPERATION(IsComprehension, "True when the brackets hold a comprehension.")
    OPERATION(IsTwoPlusStringLiterals, "False, for adjacent strings too; kept for hosts that override it.")
    END_OPERATIONS
};

}  // namespace codeloom
