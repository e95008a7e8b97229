// What kind of line a logical line is, from its tokens.
#pragma once

#include <vector>

#include "neighbours/logical_types.h"
#include "neighbours/tokenizer/raw_logical.h"

namespace codeloom {

// The first token that is neither a comment nor a backslash; none when there is none.
const CRawToken* FindFirstSignificant(const std::vector<CRawToken>& tokens);

// `=`, an augmented assignment, or the ":" of an annotation.
bool IsAssignmentOperator(const CRawToken& token);

ELogicalType FindLogicalType(const std::vector<CRawToken>& tokens);

// The line begins with the keyword of a compound statement, so that a ";" in it belongs to the body on its
// row.
bool IsCompound(const std::vector<CRawToken>& tokens);

}  // namespace codeloom
