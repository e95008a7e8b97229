// The rules over one line: what its tree shows, whatever is around the line.
#pragma once

#include "rules/rule_context.h"

namespace codeloom {

// `in_class` where the line is in the body of a class and holds a comprehension.
void CheckLine(const CTree& tree, const CLanguage& language, bool in_class, CProblems& problems);

}  // namespace codeloom
