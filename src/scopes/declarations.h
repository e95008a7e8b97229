// What is wrong with `global` and `nonlocal`.
#pragma once

#include "rules/problem.h"
#include "scopes/text_names.h"

namespace codeloom {

// True when a name is declared right in the scope, such as the module, zero: all names of that count then.
bool DeclaresIn(uint32_t scope, const CTextNames& names);

// Nothing is said where a fault may have moved what is around a line. The version is 312 for 3.12.
void CheckDeclarations(const CTextNames& names, int version, CProblems& problems);

}  // namespace codeloom
