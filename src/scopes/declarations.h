// What is wrong with `global` and `nonlocal`.
#pragma once

#include <string_view>

#include "rules/problem.h"
#include "scopes/text_names.h"

namespace codeloom {

// False when neither of the words begins a statement, so that most texts need no names for these rules. It
// may be true where one stands in a string.
bool MayDeclareNames(std::string_view text);

// Nothing is said where a fault may have moved what is around a line. The version is 312 for 3.12.
void CheckDeclarations(const CTextNames& names, int version, CProblems& problems);

}  // namespace codeloom
