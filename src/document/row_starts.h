// Where the rows of a text begin while it changes, and places by rows and columns, which count what the host
// counts.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "document/pieces.h"

namespace codeloom {

// What a column counts.
enum class EUnit : uint8_t { kByte, kUtf16, kCharacter };

// From 1.
struct CRowColumn {
    int64_t row = 1;
    int64_t column = 1;
};

// Of UTF-8 in which lone surrogates may stand, in three bytes each. Rows end as those of CRowIndex.
class CRowStarts {
  public:
    explicit CRowStarts(std::string_view text);

    // The text has become `text` by the edit.
    void Edit(std::string_view text, const CTextEdit& edit);

    uint32_t Count() const { return static_cast<uint32_t>(_fStarts.size()); }
    const std::vector<uint32_t>& Starts() const { return _fStarts; }
    // A row without its end, from 1. Requires: 1 <= row <= Count().
    std::string_view Row(std::string_view text, int64_t row) const;

  private:
    std::vector<uint32_t> _fStarts;
};

// The column after all of a row's text.
int64_t EndColumn(std::string_view row, EUnit unit);

// The bytes before a column of a row; more than the row has for a column after its end, none for one within a
// character. Requires: column >= 1.
std::optional<size_t> BytesBefore(std::string_view row, int64_t column, EUnit unit);

}  // namespace codeloom
