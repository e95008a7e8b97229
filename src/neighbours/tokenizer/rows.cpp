#include "neighbours/tokenizer/rows.h"

#include "neighbours/token_type.h"
#include "neighbours/tokenizer/brackets.h"
#include "neighbours/tokenizer/keywords.h"
#include "neighbours/tokenizer/operands.h"

namespace codeloom {

bool CRowReader::Next(CTokenRow& row) {
    const std::string_view text = _fLexer.Text();
    if (_fPlace.pos != _fPlace.row_start) {
        _fPlace.pos = SkipBlanks(text, _fPlace.pos);
        SkipRowEnd(text, _fPlace);
    }
    if (_fPlace.pos == _fPlace.row_start) SkipBlankRows(text, _fPlace);
    if (_fPlace.pos >= text.size()) return false;

    _BeginRow(row);
    _ReadToken(row);
    row.goes_on_with_operand = _fPlace.pos < text.size() && BeginsOperand(text, _fPlace.pos);
    while (_fPlace.pos < text.size() && !IsRowEnd(text[_fPlace.pos])) _ReadToken(row);
    row.text_end = _fPlace.pos;
    SkipRowEnd(text, _fPlace);
    row.end = _fPlace.pos;
    row.is_prose |= !row.is_comment && _LooksLikeProse(row);
    row.begins_statement |= _fIsBehindOpener && row.begins_compound && !row.closes_outer;
    if (!row.is_comment) _fIsBehindOpener = row.ends_in_opener;
    return true;
}

bool CRowReader::_LooksLikeProse(const CTokenRow& row) const {
    // An empty string alone is what is left of triple quotes.
    const bool is_half_quotes = _fTokenCount == 1 && (_fLast.text == "\"\"" || _fLast.text == "''");
    if (is_half_quotes || row.stray_closer_end || _fLast.text == ".") return true;
    const bool is_label = row.ends_in_colon && !row.begins_compound;
    const bool is_dangling = row.is_entry && _fLast.text != "," && _fLast.text != "*";
    return _fOuterBrackets == 0 && (row.continues || is_label || is_dangling);
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
    _fTokenCount = 0;
}

void CRowReader::_ReadToken(CTokenRow& row) {
    const std::string_view text = _fLexer.Text();
    const CLexedToken token = _fLexer.Lex(_fPlace.pos);
    _TrackBracket(row, text[_fPlace.pos]);
    if (token.type != kTokenId_COMMENT && token.type != kTokenId_BACKSLASH) {
        if (!row.has_triple_quotes) _NoteFaults(row, token);
        _fLast = {text.substr(_fPlace.pos, token.end - _fPlace.pos), {}, token.type};
        _NoteEnd(row);
        ++_fTokenCount;
    }
    row.has_open_quote |= token.type == kTokenId_ERRORTOKEN && BeginsString(text, _fPlace.pos);
    row.has_assignment |= token.type == kTokenId_EQUAL && _fBrackets.size() <= _fOuterBrackets;
    if (token.may_span_rows) SkipRows(text, token.end, _fPlace);
    _fPlace.pos = token.end;
    if (token.type == kTokenId_BACKSLASH) SkipRowEnd(text, _fPlace);
    _fPlace.pos = SkipBlanks(text, _fPlace.pos);
}

// `token` is about to become the last one.
void CRowReader::_NoteFaults(CTokenRow& row, const CLexedToken& token) const {
    const std::string_view text = _fLexer.Text();
    if (CanBeginString(text[_fPlace.pos]))
        row.has_triple_quotes = ReadStringStart(text, _fPlace.pos).IsTriple();
    const bool is_behind_soft_keyword = _fTokenCount == 1 && IsSoftKeyword(_fLast.text);
    const bool is_side_by_side = _fTokenCount > 0 && AreOperandsSideBySide(_fLast, text, _fPlace.pos);
    row.is_prose |= _fLast.text == "." && ByteKind(text[_fPlace.pos]) != EByteKind::kNameStart;
    row.is_broken |= (is_side_by_side && !is_behind_soft_keyword) || token.type == kTokenId_ERRORTOKEN;
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
