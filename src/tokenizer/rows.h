// Rows of tokens, for looking ahead where brackets and quotes can't be trusted.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

#include "text/place.h"
#include "tokenizer/lexer.h"
#include "tokenizer/operands.h"

namespace codeloom {

// A row that isn't blank. Rows that a string or a backslash joins are one.
struct CTokenRow {
    size_t start = 0;
    size_t end = 0;  // after its row end
    int32_t indent = 0;
    std::string_view text;  // from its first token up to its row end
    std::vector<CRowToken> tokens;
    CRowToken before;             // the last token of the rows before; an empty one before the first row
    bool is_in_brackets = false;  // begins within brackets that the rows before have opened
    size_t stray_closer_end = 0;  // after the first closer where no bracket is open; or zero

    // The row was read from its beginning.
    bool IsWhole() const { return start != SIZE_MAX; }
};

// The indentation of the row that `pos` lies in.
inline int32_t RowIndent(std::string_view text, size_t pos) {
    CPlace place{RowStart(text, pos), 0, 0, 0};
    SkipIndent(text, place);
    return place.indent;
}

// A place from which rows are read although a row doesn't begin there.
inline CPlace PlaceWithinRow(size_t pos) {
    return {pos, SIZE_MAX, 0, 0};
}

class CRowReader {
  public:
    // Begins at `place`, on a token or before blank rows.
    CRowReader(CLexer& lexer, const CPlace& place) : _fLexer(lexer), _fPlace(place) {}

    // The next row, into `row`, whose storage is reused; false at the end of the text.
    bool Next(CTokenRow& row);

    // Treats the brackets that are open as if they weren't.
    void ForgetBrackets() { _fBrackets.clear(); }
    // Likewise, but for those that the last row has opened.
    void ForgetOuterBrackets() { _fBrackets.erase(_fBrackets.begin(), _fBrackets.begin() + _fOuterCount); }

    // The brackets open after the row, a closer for each; a closer that matches none is passed over.
    const std::vector<char>& OpenBrackets() const { return _fBrackets; }

  private:
    void _ReadToken(CTokenRow& row);
    void _TrackBracket(CTokenRow& row, char c);

    CLexer& _fLexer;
    CPlace _fPlace;
    CRowToken _fLast;
    std::vector<char> _fBrackets;
    ptrdiff_t _fOuterCount = 0;  // of them, those that rows before the last one have opened
};

}  // namespace codeloom
