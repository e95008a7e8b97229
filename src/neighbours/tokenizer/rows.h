// Rows of tokens, for looking ahead where brackets can't be trusted.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "neighbours/tokenizer/lexer.h"
#include "neighbours/tokenizer/place.h"

namespace codeloom {

// What one row says about itself. Rows that a string or a backslash joins are one.
struct CTokenRow {
    size_t start = 0;
    size_t end = 0;  // behind its row end
    int32_t indent = 0;
    size_t stray_closer_end = 0;  // behind the first closer that stands where no bracket is open; or zero
    bool is_comment = false;
    bool begins_with_closer = false;
    bool begins_statement = false;
    bool ends_in_colon = false;
};

class CRowReader {
  public:
    // Begins at `place`, on a token or before blank rows.
    CRowReader(CLexer& lexer, const CPlace& place) : _fLexer(lexer), _fPlace(place) {}

    // The next row that isn't blank; false at the end of the text.
    bool Next(CTokenRow& row);

    // The brackets open behind the row, a closer for each; a closer that matches none is passed over.
    const std::vector<char>& OpenBrackets() const { return _fBrackets; }

  private:
    void _ReadToken(CTokenRow& row);
    void _TrackBracket(CTokenRow& row, char c);

    CLexer& _fLexer;
    CPlace _fPlace;
    std::vector<char> _fBrackets;
};

}  // namespace codeloom
