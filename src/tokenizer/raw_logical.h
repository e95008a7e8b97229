// One logical line as the tokenizer hands it out.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

#include "text/token_type.h"
#include "text/words.h"
#include "tokenizer/logical_types.h"

namespace codeloom {

// Rows count from zero, from the logical's first row in a logical and from the text's first row elsewhere.
// Columns count UTF-8 bytes from zero.
struct CPosition {
    int32_t row = 0;
    int32_t col = 0;
};

// No longer text is read, so that offsets, rows and columns fit into 32 bits.
inline constexpr size_t kMaxTextSize = INT32_MAX;

// A token as a plain record; its text lies in the text of the file, and a separator isn't a token.
struct CRawToken {
    uint32_t start = 0;  // in the text of the file
    uint32_t length = 0;
    CPosition position;         // from the logical's first row
    int16_t type = 0;           // as GetTokenType gives it
    EWord word = EWord::kNone;  // of a name, and of operators that share their type
};

static_assert(sizeof(CRawToken) == 20);

constexpr std::string_view TextOf(const CRawToken& token, std::string_view file_text) {
    return {file_text.data() + token.start, token.length};
}

// A token of the text `text`, which begins at `start`.
inline CRawToken MakeToken(std::string_view text, uint32_t start) {
    const auto type = static_cast<int16_t>(GetTokenType(text));
    const bool is_shared = type == kTokenId_RARROW || type == kTokenId_NOTEQUAL;
    const bool has_word = type == kTokenId_NAME || is_shared;
    return {start, static_cast<uint32_t>(text.size()), {}, type, has_word ? WordOf(text) : EWord::kNone};
}

// Comments and backslashes, which no grammar knows.
constexpr bool IsPassedOver(const CRawToken& token) {
    return token.type == kTokenId_COMMENT || token.type == kTokenId_BACKSLASH;
}

// What is known of a logical line or of an embedded expression beside its tokens.
struct CLogicalFacts {
    std::string_view file_text;
    ELogicalType type = ELogicalType::kUnknown;
    int32_t first_row = 0;  // in the text of the file, for an embedded logical too
    // Where position (0, 0) of this logical is in the file: {first_row, 0} for a top-level logical; the
    // place of its first character for an embedded one, whose columns in row 0 are relative to the embedded
    // text.
    CPosition origin;
    bool in_async_def = false;  // lies in the body or the header of an `async def`
    bool first_in_def = false;  // is the first logical of a def's body
    bool is_method = false;     // is the header of a def right in the body of a class
    // Begins its row, with nothing but spaces before it. Not known of an embedded logical.
    bool is_indented_by_spaces = false;
    // What its tokens may be, so that most lines need no look at them. An embedded logical may have all.
    bool may_have_strings = true;
    bool may_have_special_strings = true;  // with a prefix, a backslash or triple quotes
    bool may_have_comments = true;
    uint64_t words = ~uint64_t{0};  // a bit for each, and one for __debug__
};

// One logical line, or one expression embedded in a logical line.
struct CRawLogical : CLogicalFacts {
    std::vector<CRawToken> tokens;
    std::vector<CRawLogical> embedded;  // in source order

    std::string_view Text(const CRawToken& token) const { return TextOf(token, file_text); }

    // False when no token is one of these words, which WordBits gives.
    bool MayHaveWords(uint64_t some_words) const { return (words & some_words) != 0; }

    // The bytes of the file that a token covers.
    uint32_t StartOf(const CRawToken& token) const { return token.start; }
    uint32_t EndOf(const CRawToken& token) const { return token.start + token.length; }
};

}  // namespace codeloom
