// One logical line as the tokenizer hands it out.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "neighbours/logical_types.h"

namespace codeloom {

// Rows count from zero, from the logical's first row in a logical and from the text's first row elsewhere.
// Columns count UTF-8 bytes from zero.
struct CPosition {
    int32_t row = 0;
    int32_t col = 0;
};

struct CRawToken {
    std::string_view text;  // into the text of the file; a separator is no token
    CPosition position;     // from the logical's first row
    int16_t type = 0;       // as GetTokenType gives it
};

// One logical line, or one expression embedded in a logical line.
struct CRawLogical {
    ELogicalType type = ELogicalType::kUnknown;
    int32_t first_row = 0;  // in the text of the file, for an embedded logical too
    // Where position (0, 0) of this logical stands in the file: {first_row, 0} for a top-level logical; the
    // place of its first character for an embedded one, whose columns in row 0 are relative to the embedded
    // text.
    CPosition origin;
    bool in_async_def = false;  // lies in the body or the header of an `async def`
    bool first_in_def = false;  // is the first logical of a def's body
    std::vector<CRawToken> tokens;
    std::vector<CRawLogical> embedded;  // in source order
};

}  // namespace codeloom
