// What kind of line a logical line is, from its tokens.
#pragma once

#include <vector>

#include "tokenizer/logical_types.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

// The last token that is neither a comment nor a backslash; an empty one when there is none.
CRawToken FindLastSignificant(const std::vector<CRawToken>& tokens);

// The first token that is neither a comment nor a backslash; none when there is none.
const CRawToken* FindFirstSignificant(const std::vector<CRawToken>& tokens);

// `=`, an augmented assignment, or the ":" of an annotation. "->" has the number of "@=".
constexpr bool IsAssignmentOperator(int16_t type, EWord word) {
    return type == kTokenId_EQUAL || type == kTokenId_COLON ||
           (type == kTokenId_ATEQUAL && word != EWord::kArrow) ||
           (type >= kTokenId_PLUSEQUAL && type <= kTokenId_DOUBLESTAREQUAL) ||
           type == kTokenId_DOUBLESLASHEQUAL;
}

// The type of the line as far as its first tokens show; kUnknown for an expression or an assignment.
ELogicalType TypeOfBeginning(const CRawLogical& logical);

// The line begins with the keyword of a compound statement, so that a ";" in it belongs to the body on its
// row.
bool IsCompound(const CRawLogical& logical);

}  // namespace codeloom
