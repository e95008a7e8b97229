// Triple quotes that aren't closed, so that the next string's opening quotes seem to close them and
// everything after is turned inside out: text is taken for code and code for text.
#pragma once

#include <cstddef>

#include "tokenizer/lexer.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

// Where the string at `pos` that begins with triple quotes and seems to end at `found` really ends, when the
// rows show that its closing quotes are missing: after the last row that can't be code. Zero when the string
// is sound. `looked_at` is how far the search went.
//
// A string is doubted when what is around its closing quotes is odd for closing quotes. It is given up
// when the rows after it can't be code, and fit much worse than those that are code if it isn't closed. Both
// only happen in broken text.
size_t FindUnclosedTripleEnd(CLexer& lexer, size_t pos, const CStringStart& start, const CStringEnd& found,
                             size_t& looked_at);

}  // namespace codeloom
