// Where the tokenizer is in the text.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

#include "text/char_class.h"
#include "text/scan.h"

namespace codeloom {

struct CPlace {
    size_t pos = 0;
    size_t row_start = 0;
    int32_t row = 0;
    int32_t indent = 0;  // of the row, in columns; tabs go to the next multiple of eight
    bool is_indented_by_spaces = true;

    int32_t Column() const { return static_cast<int32_t>(pos - row_start); }
};

// Moves from the beginning of a row to its first character that isn't a blank, and measures the
// indentation. A form feed begins it anew.
inline void SkipIndent(std::string_view text, CPlace& place) {
    constexpr int32_t kTabSize = 8;
    const size_t start = place.pos;
    place.pos = SkipSpaces(text, start);
    auto indent = static_cast<int32_t>(place.pos - start);
    place.is_indented_by_spaces = true;
    for (; place.pos < text.size() && IsBlank(text[place.pos]); ++place.pos) {
        place.is_indented_by_spaces = false;
        switch (text[place.pos]) {
            case ' ':
                ++indent;
                break;
            case '\t':
                indent = (indent / kTabSize + 1) * kTabSize;
                break;
            default:
                indent = 0;
        }
    }
    place.indent = indent;
}

// Moves over the row end at the place to the beginning of the next row; false where there is no row end.
inline bool SkipRowEnd(std::string_view text, CPlace& place) {
    const size_t length = RowEndLength(text, place.pos);
    if (length == 0) return false;
    place.pos += length;
    place.row_start = place.pos;
    ++place.row;
    return true;
}

// Moves from the beginning of a row to the first token of it, or of the first later row that has one; false
// when there is none in the text.
inline bool SkipBlankRows(std::string_view text, CPlace& place) {
    do {
        SkipIndent(text, place);
    } while (SkipRowEnd(text, place));
    return place.pos < text.size();
}

// Moves to `end`, over a token that may hold rows.
inline void SkipRows(std::string_view text, size_t end, CPlace& place) {
    const std::string_view token = text.substr(0, end);
    while ((place.pos = FindRowEnd(token, place.pos)) < end) SkipRowEnd(text, place);
}

}  // namespace codeloom
