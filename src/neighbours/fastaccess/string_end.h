// Where a string literal ends, for searches that step over strings.
#pragma once

#include <cstddef>
#include <string_view>

#include "_fastaccess/non_nested_struct.h"

namespace codeloom {

// The position after the string literal whose opening quote is at `quote_pos`. A prefix before the quote
// counts, so that the fields of an f-string may hold its own quotes. Without closing quotes the string ends
// with its row or, opened by triple quotes, with the text.
size_t FindStringLiteralEnd(std::string_view text, size_t quote_pos);

// The same for a search, whose end is the end of the text; -2 with a host exception pending when `quote_i`
// lies outside what is searched.
Py_ssize_t _FindStringEndNonNested(const tNonNestedStruct& search, Py_ssize_t quote_i);

}  // namespace codeloom
