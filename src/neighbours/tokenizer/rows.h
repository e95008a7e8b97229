// Rows of tokens, for looking ahead where brackets can't be trusted.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "neighbours/tokenizer/lexer.h"
#include "neighbours/tokenizer/place.h"
#include "neighbours/tokenizer/raw_logical.h"

namespace codeloom {

// What one row says about itself. Rows that a string or a backslash joins are one.
struct CTokenRow {
    size_t start = 0;
    size_t text_end = 0;
    size_t end = 0;  // behind its row end
    int32_t indent = 0;
    bool is_comment = false;
    bool begins_with_closer = false;
    bool begins_statement = false;      // surely, in brackets too
    bool begins_compound = false;       // perhaps: with a word that can also stand in expressions
    bool goes_on_with_operand = false;  // behind its first token
    bool begins_with_word = false;
    bool follows_operand = false;  // begins with an operand although the row before ends with one
    bool continues = false;        // begins with what must follow an operand: a closer, a dot, `and`
    bool has_assignment = false;   // a "=" outside the row's own brackets
    bool closes_outer = false;     // holds a closer for which it has no opener
    bool ends_in_colon = false;
    bool ends_open = false;  // in an opener, a comma or an operator, so that an operand must follow
    bool ends_in_opener = false;
    bool is_broken = false;          // surely no row of sound code, as far as the first triple quotes
    bool is_prose = false;           // hardly a row of code, but perhaps
    bool has_triple_quotes = false;  // begins a string with them
    bool has_open_quote = false;     // holds a one-line string that isn't closed
    bool is_entry = false;           // ends open, but outside the row's own brackets
    size_t stray_closer_end = 0;     // behind the first closer that stands where no bracket is open; or zero
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
    void _BeginRow(CTokenRow& row);
    bool _LooksLikeProse(const CTokenRow& row) const;
    void _ReadToken(CTokenRow& row);
    void _NoteFaults(CTokenRow& row, const CLexedToken& token) const;
    void _NoteEnd(CTokenRow& row) const;
    void _TrackBracket(CTokenRow& row, char c);

    CLexer& _fLexer;
    CPlace _fPlace;
    std::vector<char> _fBrackets;
    size_t _fOuterBrackets = 0;  // open before the row
    bool _fIsBehindOpener = false;
    CRawToken _fLast;         // neither comment nor backslash
    size_t _fTokenCount = 0;  // of the row, likewise
};

}  // namespace codeloom
