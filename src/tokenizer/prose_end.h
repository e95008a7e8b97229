// Where the prose in a string without closing quotes ends and code begins.
#pragma once

#include <cstddef>

#include "tokenizer/lexer.h"

namespace codeloom {

// The end of the prose in the string at `pos`, of which the rows after its first one begin before `end`. A
// statement that is indented less than the string's first row shows that the string is over. `looked_at` is
// how far the search went.
size_t FindProseEnd(CLexer& lexer, size_t pos, size_t end, size_t& looked_at);

}  // namespace codeloom
