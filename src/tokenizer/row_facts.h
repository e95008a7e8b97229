// What a row of tokens shows by itself.
#pragma once

#include "tokenizer/rows.h"

namespace codeloom {

// The row holds a comment only.
bool IsComment(const CTokenRow& row);

// The row begins with a closing bracket.
bool BeginsWithCloser(const CTokenRow& row);

// The row surely begins a statement, brackets or not.
bool BeginsStatement(const CTokenRow& row);

// The row begins with `if`, `for`, `async` or `else` and is a header nevertheless: no conditional, loop or
// lambda of an expression explains its ":".
bool BeginsHeader(const CTokenRow& row);

// The row begins like a compound statement and ends in ":".
bool IsHeader(const CTokenRow& row);

// The row begins with `def`, `class` or `async def`.
bool BeginsDefinition(const CTokenRow& row);

// The row begins with what must follow an operand: a closer, a dot, `and`.
bool ContinuesExpression(const CTokenRow& row);

// The row begins with an operand although the row before ends with one.
bool FollowsOperand(const CTokenRow& row);

// A second operand comes directly after the one that the row begins with.
bool BeginsWithTwoOperands(const CTokenRow& row);

// The row holds a closer for which it has no opener.
bool ClosesOuterBracket(const CTokenRow& row);

// A "=" is outside the row's own brackets.
bool HasAssignment(const CTokenRow& row);

// A "=" after an attribute is outside the row's own brackets: it isn't a keyword argument.
bool AssignsToPart(const CTokenRow& row);

bool EndsInColon(const CTokenRow& row);

// A ":" is outside the row's own brackets.
bool HasOuterColon(const CTokenRow& row);

// The row ends in a ":" outside its own brackets.
bool EndsInOuterColon(const CTokenRow& row);

// The row is a header and, after its ":", a body.
bool HasBody(const CTokenRow& row);

// The row ends in an opener directly after a ":".
bool EndsAfterColon(const CTokenRow& row);

// The row ends in an opener, a comma or an operator, so that an operand must follow.
bool EndsOpen(const CTokenRow& row);

// The row ends open, but outside its own brackets.
bool EndsOpenByItself(const CTokenRow& row);

// The row holds a string without closing quotes.
bool HasOpenQuote(const CTokenRow& row);

// The row ends with a string that begins with triple quotes and isn't closed.
bool EndsInOpenTriple(const CTokenRow& row);

// The row begins a string with triple quotes.
bool HasTripleQuotes(const CTokenRow& row);

// The row, as far as the first triple quotes, surely isn't a row of sound code.
bool IsBroken(const CTokenRow& row);

// The row is unlikely to be code, but may be.
bool LooksLikeProse(const CTokenRow& row);

}  // namespace codeloom
