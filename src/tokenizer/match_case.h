// The soft keywords `match` and `case`: statement or name.
#pragma once

#include <span>
#include <string_view>

#include "tokenizer/raw_logical.h"

namespace codeloom {

// kMatch or kCase when the tokens, which lie in `text`, begin with the header of such a statement, kUnknown
// otherwise. Comments, backslashes and removed tokens, of length zero, may be among them; a body on the
// same row may follow the header.
//
// What decides is the token after the word, and the ":" that ends the header: outside brackets and not that
// of a lambda. Where more follows, the ":" may as well begin an annotation. A `match` has no body on its row,
// so `match [x]: y` is an annotation, `match x: y` a broken statement. A `case` may have one: `case [x]: y`
// is a case, and `case.x: y`, `case[x][0]: y`, which aren't patterns, are annotations.
ELogicalType FindMatchOrCaseType(std::span<const CRawToken> tokens, std::string_view text);

}  // namespace codeloom
