// What kind of line a logical line is, from its tokens.
#pragma once

#include <vector>

#include "neighbours/logical_types.h"
#include "neighbours/tokenizer/tokenizer.h"

namespace codeloom {

ELogicalType FindLogicalType(const std::vector<CRawToken>& tokens);

// The line begins with the keyword of a compound statement, so that a ";" in it belongs to the body on its
// row.
bool IsCompound(const std::vector<CRawToken>& tokens);

}  // namespace codeloom
