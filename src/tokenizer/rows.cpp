#include "tokenizer/rows.h"

#include <algorithm>
#include <iterator>

#include "text/token_type.h"
#include "tokenizer/brackets.h"

namespace codeloom {

bool CRowReader::Next(CTokenRow& row) {
    const std::string_view text = _fLexer.Text();
    _fPlace.pos = SkipBlanks(text, _fPlace.pos);
    if (SkipRowEnd(text, _fPlace)) SkipBlankRows(text, _fPlace);
    if (_fPlace.pos >= text.size()) {
        _fLexer.NoteLook(text.size());
        return false;
    }

    const size_t pos = _fPlace.pos;
    row.start = _fPlace.row_start;
    row.indent = _fPlace.indent;
    row.tokens.clear();
    row.before = _fLast;
    row.is_in_brackets = !_fBrackets.empty();
    _fOuterCount = std::ssize(_fBrackets);
    row.stray_closer_end = 0;
    while (_fPlace.pos < text.size() && !IsRowEnd(text[_fPlace.pos])) _ReadToken(row);
    row.text = text.substr(pos, _fPlace.pos - pos);
    row.end = _fPlace.pos + RowEndLength(text, _fPlace.pos);
    _fLexer.NoteLook(row.end);
    return true;
}

void CRowReader::_ReadToken(CTokenRow& row) {
    const std::string_view text = _fLexer.Text();
    const size_t pos = _fPlace.pos;
    const CLexedToken token = _fLexer.Lex(pos);
    _TrackBracket(row, text[pos]);
    if (token.type != kTokenId_COMMENT && token.type != kTokenId_BACKSLASH) {
        _fLast = {text.substr(pos, token.end - pos), token.type, token.word};
        row.tokens.push_back(_fLast);
    }
    if (token.may_span_rows) SkipRows(text, token.end, _fPlace);
    _fPlace.pos = token.end;
    if (token.type == kTokenId_BACKSLASH) SkipRowEnd(text, _fPlace);
    _fPlace.pos = SkipBlanks(text, _fPlace.pos);
}

void CRowReader::_TrackBracket(CTokenRow& row, char c) {
    if (ByteKind(c) == EByteKind::kOpener) _fBrackets.push_back(CloserOf(c));
    if (ByteKind(c) != EByteKind::kCloser) return;
    if (_fBrackets.empty() && row.stray_closer_end == 0) row.stray_closer_end = _fPlace.pos + 1;
    if (_fBrackets.empty() || _fBrackets.back() != c) return;
    _fBrackets.pop_back();
    _fOuterCount = std::min(_fOuterCount, std::ssize(_fBrackets));
}

}  // namespace codeloom
