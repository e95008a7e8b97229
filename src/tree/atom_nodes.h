// Atoms and literals: the leaves that carry text, and what is in brackets.
#pragma once

#include "tree/expression_nodes.h"

namespace codeloom {

// A name
class CNameLiteral : public CExpression {};

// A keyword, also `await` and `async`; which one its text says
class CKeywordLiteral : public CExpression {};

// A number
class CNumberLiteral : public CExpression {
  public:
    OPERATIONS_OF(CNumberLiteral, CExpression)
    OPERATION(bool, IsFloat, (),
              "True when the text holds a point or an `e`, be it the digit of a hexadecimal number.");
    OPERATION(nb::object, GetNumericValue, (),
              "The value of a decimal number; None for other bases, and whatever else the host's int() and "
              "float() refuse.");
    END_OPERATIONS
};

// One string literal, with its prefix and quotes
class CStringLiteral : public CExpression {
  public:
    OPERATIONS_OF(CStringLiteral, CExpression)
    OPERATION(bool, IsUnicode, (), "True with the prefix `u`, a raw marker before it allowed.");
    OPERATION(bool, IsBytes, (), "True with the prefix `b`, a raw marker before it allowed.");
    OPERATION(CTextOrNone, GetStringContents, (),
              "The source between the quotes, escapes as written; up to the end of an unterminated "
              "literal.");
    OPERATION(nb::object, GetStringValue, (), "The value of the literal; None for an f-string.");
    END_OPERATIONS

  private:
    bool _IsMarked(char lower, char upper) const;
};

// `(a)`, `[a, b]`, `{a: b}`, adjacent strings, and in the 2.7 grammar backquotes
//   child    bracket  [contents]  bracket
//   child    string  string ...
class CAtom : public CExpression {
  public:
    CExpressionRef GetSubExpr(int i) override;
    int GetSubExprCount() override;
    OPERATIONS_OF(CAtom, CExpression)
    OPERATION(CTextOrNone, GetInitialBracket, (),
              "\"(\", \"[\" or \"{\"; None for other atoms. ValueError for an atom without children.");
    OPERATION(bool, IsLiteral, (), "True unless the brackets hold a comprehension.");
    OPERATION(bool, IsComprehension, (), "True when the brackets hold a comprehension.");
    OPERATION(bool, IsTwoPlusStringLiterals, (),
              "False, for adjacent strings too; kept for hosts that override it.");
    END_OPERATIONS

    static constexpr Py_ssize_t kContentsIndex = 1;
    static constexpr Py_ssize_t kFilledChildCount = 3;  // of brackets with contents
};

}  // namespace codeloom
