// Tokens, or texts made of several, into the text of an expression.
#pragma once

#include <span>
#include <string>
#include <string_view>

namespace codeloom {

// Joins the pieces with blanks as a formatter would: one around binary operators and words, one behind a
// comma and a colon, none within brackets, behind a sign, before a trailer and around `.`, `**` and `=`. A
// piece is a token or the text of an expression; empty ones are left out.
std::string JoinTokens(std::span<const std::string_view> pieces);

}  // namespace codeloom
