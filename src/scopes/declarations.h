// What is wrong with `global` and `nonlocal`.
#pragma once

#include "rules/problem.h"
#include "scopes/text_names.h"

namespace codeloom {

// True when the module itself declares a name: all of its names count then.
bool DeclaresInModule(const CTextNames& names);

// Nothing is said where a fault may have moved what is around a line. The version is 312 for 3.12.
void CheckDeclarations(const CTextNames& names, int version, CProblems& problems);

}  // namespace codeloom
