// Triple quotes that aren't closed, so that the next string's opening quotes seem to close them and
// everything behind is turned inside out: text is taken for code and code for text.
#pragma once

#include <cstddef>

#include "neighbours/tokenizer/lexer.h"
#include "neighbours/tokenizer/string_lexer.h"

namespace codeloom {

// Where the string at `pos` that begins with triple quotes and seems to end at `found` really ends, when the
// rows show that its closing quotes are missing: behind the last row that can't be code. Zero when the string
// is sound. `looked_at` is how far the search went.
//
// The string is doubted when an operand stands directly behind it, or when its last row looks like code
// before a string. It is given up when in addition the rows behind it can't be code, and fit better if the
// quotes that close it open a string instead. Both only happen in broken text.
size_t FindUnclosedTripleEnd(CLexer& lexer, size_t pos, const CStringStart& start, const CStringEnd& found,
                             size_t& looked_at);

}  // namespace codeloom
