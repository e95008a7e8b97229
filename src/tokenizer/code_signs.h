// Signs by which rows of code are known from rows of prose.
#pragma once

#include "tokenizer/rows.h"

namespace codeloom {

// The row, not a broken one, has what prose hardly has: an assignment, a call, a header, a statement.
bool HasCodeShape(const CTokenRow& row);

// The row has at least as many signs of code as of prose: brackets and dots tied to names, assignments and
// comparisons, keywords, against plain words side by side. A fault leaves most of a row's signs.
bool HasSignsOfCode(const CTokenRow& row);

}  // namespace codeloom
