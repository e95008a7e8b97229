// The rows of a text, and rows and columns in characters for places in bytes.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

namespace codeloom {

// Both count from zero; columns in characters.
struct CCharPlace {
    uint32_t row = 0;
    uint32_t column = 0;
};

// A range of a text, as hosts see it. Rows and columns count from 1, columns in characters; the end is after
// the last character.
struct CRange {
    uint32_t row = 0;
    uint32_t column = 0;
    uint32_t end_row = 0;
    uint32_t end_column = 0;

    bool operator==(const CRange&) const = default;
};

// Rows end at LF, CR LF and CR, and at nothing else. The text must outlive the index.
class CRowIndex {
  public:
    explicit CRowIndex(std::string_view text);

    size_t TextSize() const { return _fText.size(); }
    uint32_t Count() const { return static_cast<uint32_t>(_fStarts.size()); }

    // Requires: `offset` is at most the length of the text.
    CCharPlace PlaceOf(uint32_t offset) const;
    // Requires: start <= end, which is at most the length of the text.
    CRange RangeOf(uint32_t start, uint32_t end) const;
    // The width of the blanks before a place, tabs to the next multiple of eight; -1 after anything else on
    // the same row.
    int IndentOf(uint32_t offset) const;
    // A row without its end. Requires: row < Count().
    std::string_view Text(uint32_t row) const;
    uint32_t Start(uint32_t row) const { return _fStarts[row]; }

  private:
    void _CountBlocks();
    uint32_t _RowOf(uint32_t offset) const;
    uint32_t _CharactersBefore(uint32_t offset) const;

    std::string_view _fText;
    std::vector<uint32_t> _fStarts;
    // The characters before each block of the text, so that a long row costs no more than a short one; empty
    // for ASCII text.
    std::vector<uint32_t> _fBeforeBlocks;
    mutable uint32_t _fLastRow = 0;  // what is asked for next is most often near
};

}  // namespace codeloom
