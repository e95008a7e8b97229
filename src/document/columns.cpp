#include "document/columns.h"

namespace codeloom {

namespace {

// How many units the character has that begins with the byte; none for a byte that begins none.
int UnitsOf(char first, EUnit unit) {
    const auto byte = static_cast<unsigned char>(first);
    if (unit == EUnit::kByte) return 1;
    if ((byte & 0xC0) == 0x80) return 0;
    return unit == EUnit::kUtf16 && byte >= 0xF0 ? 2 : 1;
}

size_t CharacterEnd(std::string_view row, size_t pos) {
    do ++pos;
    while (pos < row.size() && (static_cast<unsigned char>(row[pos]) & 0xC0) == 0x80);
    return pos;
}

// How many units the character has that lies between two places of a row.
int64_t UnitsOf(std::string_view row, size_t pos, size_t end, EUnit unit) {
    return unit == EUnit::kByte ? static_cast<int64_t>(end - pos) : UnitsOf(row[pos], unit);
}

}  // namespace

int64_t EndColumn(std::string_view row, EUnit unit) {
    int64_t column = 1;
    for (const char byte : row) column += UnitsOf(byte, unit);
    return column;
}

std::optional<size_t> BytesBefore(std::string_view row, int64_t column, EUnit unit) {
    size_t pos = 0;
    int64_t left = column - 1;
    while (left > 0 && pos < row.size()) {
        const size_t end = CharacterEnd(row, pos);
        left -= UnitsOf(row, pos, end, unit);
        pos = end;
    }
    if (left < 0) return {};
    return pos + static_cast<size_t>(left);
}

int64_t CharactersBefore(std::string_view row, int64_t column, EUnit unit) {
    int64_t count = 0, left = column - 1;
    for (size_t pos = 0; left > 0 && pos < row.size(); ++count) {
        const size_t end = CharacterEnd(row, pos);
        left -= UnitsOf(row, pos, end, unit);
        pos = end;
    }
    return count;
}

}  // namespace codeloom
