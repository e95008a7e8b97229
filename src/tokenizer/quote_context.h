// What is around the quotes of a string: whether it fits quotes that begin one, or that end one.
#pragma once

#include <cstddef>
#include <string_view>

namespace codeloom {

// The text before the quote that it ends with is like code that a string follows: ends in a sign, a header or
// a keyword.
bool EndsBeforeString(std::string_view text);

// What begins at `pos` can't follow a string on its row.
bool CannotFollowString(std::string_view text, size_t pos);

// What begins at `pos` hardly follows on its row a string that ends at `end`.
bool HardlyFollowsString(std::string_view text, size_t pos, size_t end);

// The row at `pos` begins with two words that are hardly side by side in code, or with what needs an
// operand before it.
bool HardlyBeginsCode(std::string_view text, size_t pos);

// The next row of code after the one that ends, but for a comment, at `pos`; the end of the text when more
// follows on the row.
size_t SkipToNextRow(std::string_view text, size_t pos);

// The string at `pos` is the first thing in brackets.
bool StandsInBrackets(std::string_view text, size_t pos);

// The string at `pos` isn't in brackets, as far as its row and the end of the row before show.
bool StandsOutsideBrackets(std::string_view text, size_t pos);

}  // namespace codeloom
