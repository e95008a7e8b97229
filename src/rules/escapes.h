// Escapes in strings and bytes (language reference, "Escape sequences").
#pragma once

#include "rules/problem.h"
#include "syntax/language.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// Finds the first escape of a string that the interpreter can't decode. That a name in `\N{...}` belongs to a
// character isn't looked into.
void CheckEscapes(const CRawLogical& line, const CRawToken& string, const CLanguage& language,
                  CProblems& problems);

}  // namespace codeloom
