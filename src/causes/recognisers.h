// The causes. Each looks at a line with a fault and says what it recognises, or nothing.
#pragma once

#include "causes/faulty_line.h"

namespace codeloom {

// By single tokens; they may also come after the place where the parser stopped.
CCause UnterminatedString(const CFaultyLine& line, int i);  // strings.cpp
CCause QuoteInString(const CFaultyLine& line);
CCause UnknownPrefix(const CFaultyLine& line, int i);
CCause InvalidNumber(const CFaultyLine& line, int i);   // numbers.cpp
CCause AfterBackslash(const CFaultyLine& line, int i);  // characters.cpp
CCause InvalidCharacter(const CFaultyLine& line, int i);
CCause ForeignSign(const CFaultyLine& line, int i);  // signs.cpp

CCause ConflictMarker(const CFaultyLine& line);  // foreign_text.cpp
CCause ForeignText(const CFaultyLine& line);

CCause Declaration(const CFaultyLine& line);  // foreign_forms.cpp
CCause NewObject(const CFaultyLine& line);
CCause ThenForColon(const CFaultyLine& line);
CCause CountingLoop(const CFaultyLine& line);
CCause NotIs(const CFaultyLine& line);
CCause AfterStatement(const CFaultyLine& line);
CCause SemicolonForComma(const CFaultyLine& line);
CCause ElseOfCondition(const CFaultyLine& line);
CCause LongSlice(const CFaultyLine& line);
CCause DeclaresAndAssigns(const CFaultyLine& line);

// What is in braces in an f-string.
CCause UnfinishedField(const CFaultyLine& line);  // fields.cpp
CCause EmptyField(const CFaultyLine& line);
CCause Conversion(const CFaultyLine& line);
CCause FieldExpression(const CFaultyLine& line);
CCause EndOfField(const CFaultyLine& line);  // after the causes of any expression

CCause UnmatchedCloser(const CFaultyLine& line);  // brackets.cpp
CCause NeverClosed(const CFaultyLine& line);      // closing it mends the line
CCause StillOpen(const CFaultyLine& line);        // it is open at the line's end
CCause LaterUnmatchedCloser(const CFaultyLine& line);

CCause CallWithoutParentheses(const CFaultyLine& line);  // python2.cpp
CCause RaiseWithComma(const CFaultyLine& line);
CCause Backquotes(const CFaultyLine& line);

CCause Doubled(const CFaultyLine& line);  // doubled.cpp

CCause ParameterFault(const CFaultyLine& line);  // parameters.cpp

CCause ImportFault(const CFaultyLine& line);  // imports.cpp

CCause ExceptFault(const CFaultyLine& line);  // headers.cpp
CCause ElseIf(const CFaultyLine& line);
CCause AsyncAlone(const CFaultyLine& line);
CCause DefinitionHead(const CFaultyLine& line);
CCause MissingIn(const CFaultyLine& line);
CCause NestedHeader(const CFaultyLine& line);
CCause MissingColon(const CFaultyLine& line);

CCause ArgumentFault(const CFaultyLine& line);  // items.cpp
CCause DictionaryFault(const CFaultyLine& line);
CCause ComprehensionFault(const CFaultyLine& line);

CCause StarHere(const CFaultyLine& line);  // stars_and_yield.cpp
CCause YieldHere(const CFaultyLine& line);

CCause PatternFault(const CFaultyLine& line);  // case_patterns.cpp

CCause AssignmentForComparison(const CFaultyLine& line);  // assignments.cpp
CCause WalrusStatement(const CFaultyLine& line);

CCause NotAfterOperator(const CFaultyLine& line);  // operators.cpp
CCause Increment(const CFaultyLine& line);
CCause SplitOperator(const CFaultyLine& line);

CCause Misspelled(const CFaultyLine& line);     // misspellings.cpp
CCause KeywordAsName(const CFaultyLine& line);  // keywords.cpp
CCause StatementInExpression(const CFaultyLine& line);

CCause MissingElse(const CFaultyLine& line);  // expected.cpp
CCause LambdaFault(const CFaultyLine& line);
CCause MissingComma(const CFaultyLine& line);
CCause SideBySide(const CFaultyLine& line);
CCause MissingExpression(const CFaultyLine& line);
CCause MissingToken(const CFaultyLine& line);
CProblem Unexpected(const CFaultyLine& line);  // the last resort

}  // namespace codeloom
