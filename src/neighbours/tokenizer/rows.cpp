#include "neighbours/tokenizer/rows.h"

#include "neighbours/token_type.h"
#include "neighbours/tokenizer/brackets.h"
#include "neighbours/tokenizer/keywords.h"
#include "neighbours/tokenizer/operands.h"

namespace codeloom {

bool CRowReader::Next(CTokenRow& row) {
    const std::string_view text = _fLexer.Text();
    if (_fPlace.pos == _fPlace.row_start && !SkipBlankRows(text, _fPlace)) return false;
    if (_fPlace.pos >= text.size()) return false;

    _BeginRow(row);
    _ReadToken(row);
    row.goes_on_with_operand = _fPlace.pos < text.size() && BeginsOperand(text, _fPlace.pos);
    while (_fPlace.pos < text.size() && !SkipRowEnd(text, _fPlace)) _ReadToken(row);
    row.end = _fPlace.pos;
    row.begins_statement |= _fIsBehindOpener && row.begins_compound && !row.closes_outer;
    if (!row.is_comment) _fIsBehindOpener = row.ends_in_opener;
    return true;
}

void CRowReader::_BeginRow(CTokenRow& row) {
    const std::string_view text = _fLexer.Text();
    row = CTokenRow();
    row.start = _fPlace.row_start;
    row.indent = _fPlace.indent;
    row.is_comment = text[_fPlace.pos] == '#';
    row.begins_with_closer = ByteKind(text[_fPlace.pos]) == EByteKind::kCloser;
    row.begins_statement = StartsStatement(text, _fPlace.pos);
    row.follows_operand = !_fLast.text.empty() && AreOperandsSideBySide(_fLast, text, _fPlace.pos);
    row.begins_compound = IsCompoundWord(WordAt(text, _fPlace.pos));
    row.begins_with_word =
        ByteKind(text[_fPlace.pos]) == EByteKind::kNameStart && !BeginsString(text, _fPlace.pos);
    row.continues = ContinuesExpression(text, _fPlace.pos);
    _fOuterBrackets = _fBrackets.size();
}

void CRowReader::_ReadToken(CTokenRow& row) {
    const std::string_view text = _fLexer.Text();
    const CLexedToken token = _fLexer.Lex(_fPlace.pos);
    _TrackBracket(row, text[_fPlace.pos]);
    if (token.type != kTokenId_COMMENT && token.type != kTokenId_BACKSLASH) {
        _fLast = {text.substr(_fPlace.pos, token.end - _fPlace.pos), {}, token.type};
        _NoteEnd(row);
    }
    row.has_open_quote |= token.type == kTokenId_ERRORTOKEN && BeginsString(text, _fPlace.pos);
    row.has_assignment |= token.type == kTokenId_EQUAL && _fBrackets.size() <= _fOuterBrackets;
    if (token.may_span_rows) SkipRows(text, token.end, _fPlace);
    _fPlace.pos = token.end;
    if (token.type == kTokenId_BACKSLASH) SkipRowEnd(text, _fPlace);
    _fPlace.pos = SkipBlanks(text, _fPlace.pos);
}

// The last token is perhaps the row's last one.
void CRowReader::_NoteEnd(CTokenRow& row) const {
    const char last = _fLast.text.back();
    row.ends_in_colon = last == ':';
    row.ends_in_opener = ByteKind(last) == EByteKind::kOpener;
    row.ends_open =
        row.ends_in_opener || (ByteKind(last) == EByteKind::kOperator && last != ':' && last != ';');
    row.is_entry = row.ends_open && _fBrackets.size() <= _fOuterBrackets;
}

void CRowReader::_TrackBracket(CTokenRow& row, char c) {
    if (ByteKind(c) == EByteKind::kOpener) _fBrackets.push_back(CloserOf(c));
    if (ByteKind(c) != EByteKind::kCloser) return;
    row.closes_outer |= _fBrackets.size() <= _fOuterBrackets;
    if (_fBrackets.empty() && row.stray_closer_end == 0) row.stray_closer_end = _fPlace.pos + 1;
    if (!_fBrackets.empty() && _fBrackets.back() == c) _fBrackets.pop_back();
}

}  // namespace codeloom
