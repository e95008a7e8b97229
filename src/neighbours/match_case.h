// The soft keywords `match` and `case`: statement or name.
#pragma once

#include <cstddef>
#include <span>
#include <string_view>

#include "neighbours/logical_types.h"

namespace codeloom {

// kMatch or kCase when the tokens from `first` up to `end` begin with the header of such a statement,
// kUnknown otherwise. An `end` behind the last token stands for all. Comments and backslashes may stand among
// the tokens; a body on the same row may follow the header.
//
// What decides is the token behind the word, and the ":" that ends the header: outside brackets and not that
// of a lambda. A few lines read both ways; `match [x]: y` is then an annotation, since a match has no body on
// its row, and `case [x]: y` a case.
ELogicalType FindMatchOrCaseType(std::span<const std::string_view> tokens, size_t first, size_t end);

}  // namespace codeloom
