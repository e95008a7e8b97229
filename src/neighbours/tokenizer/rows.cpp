#include "neighbours/tokenizer/rows.h"

#include "neighbours/token_type.h"
#include "neighbours/tokenizer/brackets.h"
#include "neighbours/tokenizer/keywords.h"

namespace codeloom {

bool CRowReader::Next(CTokenRow& row) {
    const std::string_view text = _fLexer.Text();
    if (_fPlace.pos == _fPlace.row_start && !SkipBlankRows(text, _fPlace)) return false;
    if (_fPlace.pos >= text.size()) return false;
    row = CTokenRow();
    row.start = _fPlace.row_start;
    row.indent = _fPlace.indent;
    row.is_comment = text[_fPlace.pos] == '#';
    row.begins_with_closer = ByteKind(text[_fPlace.pos]) == EByteKind::kCloser;
    row.begins_statement = StartsStatement(text, _fPlace.pos);
    while (_fPlace.pos < text.size() && !SkipRowEnd(text, _fPlace)) _ReadToken(row);
    row.end = _fPlace.pos;
    return true;
}

void CRowReader::_ReadToken(CTokenRow& row) {
    const std::string_view text = _fLexer.Text();
    const CLexedToken token = _fLexer.Lex(_fPlace.pos);
    _TrackBracket(row, text[_fPlace.pos]);
    if (token.type != kTokenId_COMMENT) row.ends_in_colon = text[token.end - 1] == ':';
    if (token.may_span_rows) SkipRows(text, token.end, _fPlace);
    _fPlace.pos = token.end;
    if (token.type == kTokenId_BACKSLASH) SkipRowEnd(text, _fPlace);
    _fPlace.pos = SkipBlanks(text, _fPlace.pos);
}

void CRowReader::_TrackBracket(CTokenRow& row, char c) {
    if (ByteKind(c) == EByteKind::kOpener) {
        _fBrackets.push_back(CloserOf(c));
    } else if (ByteKind(c) == EByteKind::kCloser) {
        if (_fBrackets.empty()) {
            if (row.stray_closer_end == 0) row.stray_closer_end = _fPlace.pos + 1;
        } else if (_fBrackets.back() == c) {
            _fBrackets.pop_back();
        }
    }
}

}  // namespace codeloom
