// Strings, bytes, numbers and parentheses by their tokens.
#pragma once

#include "rules/problem.h"
#include "syntax/language.h"

namespace codeloom {

// False for most lines: their strings and numbers are plain, and their brackets few.
bool MayHaveBadLiteral(const CRawLogical& line);

// Requires: the line parses, so that neighbouring strings are one expression.
void CheckLiterals(const CRawLogical& line, const CLanguage& language, CProblems& problems);

// A backslash at the end of the file, which has no row to continue on.
void CheckEnd(const CRawLogical& line, const CLanguage& language, CProblems& problems);

}  // namespace codeloom
