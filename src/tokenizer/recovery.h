// Where a logical line ends whose brackets are proven not to be closed.
#pragma once

#include <cstddef>

#include "text/place.h"
#include "tokenizer/lexer.h"

namespace codeloom {

// The beginning of the row before which the logical line ends that begins at `place`.
//
// The rows of a simple statement are those indented deeper than its first one, and those that begin with a
// closing bracket. A compound header ends with its first row that ends in ":".
size_t FindRecoveredEnd(CLexer& lexer, const CPlace& place);

// The header at `pos` ends with the row that closes its brackets, whatever is wrong within them.
bool ClosesBrackets(CLexer& lexer, size_t pos);

}  // namespace codeloom
