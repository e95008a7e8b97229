// Columns, which count what the host counts.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace codeloom {

// What a column counts.
enum class EUnit : uint8_t { kByte, kUtf16, kCharacter };

// From 1.
struct CRowColumn {
    int64_t row = 1;
    int64_t column = 1;
};

// Rows are UTF-8 in which lone surrogates may stand, in three bytes each.

// The column after all of a row's text.
int64_t EndColumn(std::string_view row, EUnit unit);

// The bytes before a column of a row; more than the row has for a column after its end, none for one within a
// character. Requires: column >= 1.
std::optional<size_t> BytesBefore(std::string_view row, int64_t column, EUnit unit);

// How many characters of a row begin before a column: all of them for one after its end. Requires: column
// >= 1.
int64_t CharactersBefore(std::string_view row, int64_t column, EUnit unit);

}  // namespace codeloom
