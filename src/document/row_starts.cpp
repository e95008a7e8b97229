#include "document/row_starts.h"

#include <algorithm>

#include "text/scan.h"

namespace codeloom {

namespace {

void AddStarts(std::string_view text, size_t pos, size_t end, std::vector<uint32_t>& starts) {
    for (pos = FindRowEnd(text, pos); pos < text.size(); pos = FindRowEnd(text, pos)) {
        pos += RowEndLength(text, pos);
        if (pos >= end) return;
        starts.push_back(static_cast<uint32_t>(pos));
    }
}

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

}  // namespace

CRowStarts::CRowStarts(std::string_view text) : _fStarts{0} {
    AddStarts(text, 0, SIZE_MAX, _fStarts);
}

// A row end of two characters may come together, or come apart, at either end of the edit.
void CRowStarts::Edit(std::string_view text, const CTextEdit& edit) {
    const uint32_t before = edit.start == 0 ? 0 : edit.start - 1;
    const auto first = std::upper_bound(_fStarts.begin(), _fStarts.end(), before);
    auto after = std::upper_bound(first, _fStarts.end(), edit.end);
    const uint32_t shift = edit.NewEnd() - edit.end;
    std::vector<uint32_t> made;
    AddStarts(text, *(first - 1), after == _fStarts.end() ? SIZE_MAX : *after + shift, made);
    for (auto start = after; start != _fStarts.end(); ++start) *start += shift;
    const auto kept = std::min<ptrdiff_t>(after - first, static_cast<ptrdiff_t>(made.size()));
    std::copy_n(made.begin(), kept, first);
    if (kept < after - first) {
        _fStarts.erase(first + kept, after);
    } else {
        _fStarts.insert(after, made.begin() + kept, made.end());
    }
}

std::string_view CRowStarts::Row(std::string_view text, int64_t row) const {
    const auto row_i = static_cast<size_t>(row) - 1;
    const uint32_t start = _fStarts[row_i];
    const size_t end = row_i + 1 < _fStarts.size() ? _fStarts[row_i + 1] : text.size();
    std::string_view found = text.substr(start, end - start);
    while (!found.empty() && IsRowEnd(found.back())) found.remove_suffix(1);
    return found;
}

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
        left -= unit == EUnit::kByte ? static_cast<int64_t>(end - pos) : UnitsOf(row[pos], unit);
        pos = end;
    }
    if (left < 0) return {};
    return pos + static_cast<size_t>(left);
}

}  // namespace codeloom
