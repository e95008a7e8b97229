// Prose distinguished from type hints. Every test takes time in proportion to the text.
#pragma once

#include <string_view>

namespace codeloom {

// What is in a comment where a hint would be can't be one: it holds two words that no operator joins, a
// sign that no hint has, or it begins as no expression does.
bool IsProseInComment(std::string_view hint);

// What is in quotes where a hint would be is a sentence: of three words, two of them in front of any
// bracket, or with the mark at its end. What is shorter is taken for a hint with a fault.
bool IsProseInQuotes(std::string_view text);

}  // namespace codeloom
