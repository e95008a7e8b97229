#include "file/row_index.h"

#include <algorithm>
#include <cassert>

#include "text/place.h"
#include "text/scan.h"

namespace codeloom {

namespace {

constexpr uint32_t kBlock = 256;

uint32_t CountCharacters(std::string_view utf8) {
    uint32_t count = 0;
    for (const char c : utf8) count += (static_cast<unsigned char>(c) & 0xC0) != 0x80;
    return count;
}

bool IsAscii(std::string_view text) {
    unsigned char bits = 0;
    for (const char c : text) bits |= static_cast<unsigned char>(c);
    return bits < 0x80;
}

}  // namespace

CRowIndex::CRowIndex(std::string_view text) : _fText(text) {
    _fStarts.push_back(0);
    const bool has_returns = text.find('\r') != std::string_view::npos;
    const auto row_end = [&](size_t pos) {  // most texts have line feeds alone, which are found faster
        return has_returns ? FindRowEnd(text, pos) : std::min(text.find('\n', pos), text.size());
    };
    for (size_t pos = row_end(0); pos < text.size(); pos = row_end(pos)) {
        pos += RowEndLength(text, pos);
        _fStarts.push_back(static_cast<uint32_t>(pos));
    }
    _fStarts.shrink_to_fit();
    _CountBlocks();
}

void CRowIndex::_CountBlocks() {
    if (IsAscii(_fText)) return;
    uint32_t before = 0;
    for (size_t pos = 0; pos < _fText.size(); pos += kBlock) {
        _fBeforeBlocks.push_back(before);
        before += CountCharacters(_fText.substr(pos, kBlock));
    }
    _fBeforeBlocks.push_back(before);
}

CCharPlace CRowIndex::PlaceOf(uint32_t offset) const {
    assert(offset <= _fText.size());
    const uint32_t row = _RowOf(offset);
    const uint32_t start = _fStarts[row];
    if (_fBeforeBlocks.empty()) return {row, offset - start};
    if (offset - start <= kBlock) return {row, CountCharacters(_fText.substr(start, offset - start))};
    return {row, _CharactersBefore(offset) - _CharactersBefore(start)};
}

CRange CRowIndex::RangeOf(uint32_t start, uint32_t end) const {
    const CCharPlace first = PlaceOf(start);
    const bool ends_on_row = first.row + 1 == Count() || end < _fStarts[first.row + 1];
    const CCharPlace last = ends_on_row && _fBeforeBlocks.empty()
                                ? CCharPlace{first.row, first.column + end - start}
                                : PlaceOf(end);
    return {first.row + 1, first.column + 1, last.row + 1, last.column + 1};
}

int CRowIndex::IndentOf(uint32_t offset) const {
    CPlace place;
    place.pos = _fStarts[_RowOf(offset)];
    SkipIndent(_fText, place);
    return place.pos == offset ? place.indent : -1;
}

std::string_view CRowIndex::Text(uint32_t row) const {
    const uint32_t start = _fStarts[row];
    const size_t end = row + 1 < Count() ? _fStarts[row + 1] : _fText.size();
    std::string_view text = _fText.substr(start, end - start);
    while (!text.empty() && IsRowEnd(text.back())) text.remove_suffix(1);
    return text;
}

uint32_t CRowIndex::_RowOf(uint32_t offset) const {
    const auto is_in = [&](uint32_t row) {
        return row < Count() && _fStarts[row] <= offset && (row + 1 == Count() || offset < _fStarts[row + 1]);
    };
    if (!is_in(_fLastRow)) {
        if (is_in(_fLastRow + 1)) {
            ++_fLastRow;
        } else if (is_in(_fLastRow + 2)) {  // after an empty row
            _fLastRow += 2;
        } else {
            const auto next = std::upper_bound(_fStarts.begin(), _fStarts.end(), offset);
            _fLastRow = static_cast<uint32_t>(next - _fStarts.begin()) - 1;
        }
    }
    return _fLastRow;
}

uint32_t CRowIndex::_CharactersBefore(uint32_t offset) const {
    const uint32_t block = offset / kBlock;
    return _fBeforeBlocks[block] + CountCharacters(_fText.substr(block * kBlock, offset % kBlock));
}

}  // namespace codeloom
