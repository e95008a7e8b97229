#include "tokenizer/lexer.h"

#include <algorithm>

#include "text/token_type.h"
#include "text/unicode_names.h"
#include "tokenizer/fstring_scanner.h"
#include "tokenizer/number_lexer.h"
#include "tokenizer/operators.h"
#include "tokenizer/quote_recovery.h"

namespace codeloom {

namespace {

// The share of the text that may be scanned in vain, and what a small text may waste at least.
constexpr size_t kWastePerByte = 4;
constexpr size_t kLeastWaste = 4096;

}  // namespace

CLexer::CLexer(std::string_view text)
    : _fText(text),
      _fWasteLeft(MostScannedInVain(text.size())),
      _fDoubtLeft(_fWasteLeft),
      _fNoTripleFrom{text.size(), text.size()} {}

size_t CLexer::MostScannedInVain(size_t text_size) {
    return text_size * kWastePerByte + kLeastWaste;
}

CLexedToken CLexer::Lex(size_t pos, int depth) {
    switch (ByteKind(_fText[pos])) {
        case EByteKind::kNameStart:
            return _LexNameOrString(pos, depth);
        case EByteKind::kDigit:
            return {NumberEnd(_fText, pos), kTokenId_NUMBER};
        case EByteKind::kQuote:
            return _LexString(pos, ReadStringStart(_fText, pos), depth);
        case EByteKind::kComment:
            return {FindRowEnd(_fText, pos), kTokenId_COMMENT};
        case EByteKind::kBackslash:
            return _LexBackslash(pos);
        case EByteKind::kDot:
            if (IsDigit(ByteAt(_fText, pos + 1))) return {NumberEnd(_fText, pos), kTokenId_NUMBER};
            return _LexOperator(pos);
        default:
            return _LexOperator(pos);
    }
}

CLexedToken CLexer::_LexNameOrString(size_t pos, int depth) {
    const size_t end = NameEnd(_fText, pos);
    if (end == pos) return {pos + CharLength(_fText, pos), kTokenId_ERRORTOKEN};
    if (end - pos <= 2 && string_lexer::IsQuoteAt(_fText, end)) {
        const CStringStart start = ReadStringStart(_fText, pos);
        if (start.quote_length) return _LexString(pos, start, depth);
    }
    return {end, kTokenId_NAME, WordOfPart(_fText, pos, end - pos)};
}

CLexedToken CLexer::_LexString(size_t pos, const CStringStart& start, int depth) {
    const size_t content = pos + start.ContentOffset();
    CStringEnd found;
    if (start.has_fields) found = _FindFieldStringEnd(content, start, depth);
    if (!found.is_closed && depth > 0 && start.has_fields)
        return {found.end, kTokenId_ERRORTOKEN, EWord::kNone, true};
    if (!found.is_closed) found = _FindPlainStringEnd(content, start);
    if (start.IsTriple() && depth == 0) found = _JudgeTriple(pos, start, found);
    const int16_t type = found.is_closed ? kTokenId_STRING : kTokenId_ERRORTOKEN;
    const bool is_special = start.prefix_length != 0 || found.has_escapes;
    return {found.end, type, EWord::kNone, found.may_span_rows, start.has_fields, is_special};
}

// Inside another f-string a failure isn't counted again: the outermost string fails with it and counts it.
CStringEnd CLexer::_FindFieldStringEnd(size_t pos, const CStringStart& start, int depth) {
    if (_fWasteLeft == 0) return {pos, false};
    CFstringScanner scanner(*this, nullptr, depth);
    const CStringEnd found = scanner.Scan(pos, start);
    NoteLook(found.end);
    if (!found.is_closed && depth == 0) _fWasteLeft -= std::min(_fWasteLeft, found.end - pos + 1);
    return found;
}

CStringEnd CLexer::_FindPlainStringEnd(size_t pos, const CStringStart& start) {
    if (!start.IsTriple()) return FindStringEnd(_fText, pos, start.quote, false);
    size_t& no_triple_from = _fNoTripleFrom[start.quote == '"'];
    if (pos >= no_triple_from) return {_fText.size(), false, true};
    const CStringEnd found = FindStringEnd(_fText, pos, start.quote, true);
    NoteLook(found.end);
    if (!found.is_closed) no_triple_from = pos;
    return found;
}

// What the rows say about the end of a string with triple quotes.
CStringEnd CLexer::_JudgeTriple(size_t pos, const CStringStart& start, const CStringEnd& found) {
    if (!_fDoubts) return found;
    if (_fDoubtLeft == 0) return found.is_closed ? found : CStringEnd{FindRowEnd(_fText, pos), false, false};
    _fDoubts = false;
    size_t looked_at = pos;
    const size_t spoilt_end = FindUnclosedTripleEnd(*this, pos, start, found, looked_at);
    _fDoubts = true;
    _fDoubtLeft -= std::min(_fDoubtLeft, looked_at - pos);
    return spoilt_end ? CStringEnd{spoilt_end, false, true} : found;
}

// A backslash continues a row only as its very last character. One with nothing but blanks after it takes
// the first of them into its token, so that it isn't mistaken for a continuation.
CLexedToken CLexer::_LexBackslash(size_t pos) const {
    const size_t after_blanks = SkipBlanks(_fText, pos + 1);
    const bool ends_row = after_blanks == _fText.size() || IsRowEnd(_fText[after_blanks]);
    if (ends_row && after_blanks > pos + 1) return {pos + 2, kTokenId_ERRORTOKEN};
    return {pos + 1, kTokenId_BACKSLASH};
}

CLexedToken CLexer::_LexOperator(size_t pos) const {
    const COperator op = OperatorAt(_fText, pos);
    if (op.length == 0) return {pos + 1, kTokenId_ERRORTOKEN};
    return {pos + op.length, op.type, op.word};
}

}  // namespace codeloom
