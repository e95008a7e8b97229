// Where a logical line ends whose brackets are proven not to be closed.
#pragma once

#include <cstddef>

#include "neighbours/tokenizer/lexer.h"
#include "neighbours/tokenizer/place.h"

namespace codeloom {

// The beginning of the row before which the logical line ends that begins at `place`.
//
// The rows of a simple statement are those indented deeper than its first one, and those that begin with a
// closing bracket. A compound header ends with its first row that ends in ":".
size_t FindRecoveredEnd(CLexer& lexer, const CPlace& place);

// The place behind the closing bracket without an opening one to which a logical line reaches that seemed to
// end before `place`, the beginning of a row; zero when there is none. `indent` is the line's indentation.
// `looked_at` is where the search ended.
size_t FindStrayCloser(CLexer& lexer, const CPlace& place, int32_t indent, size_t& looked_at);

}  // namespace codeloom
