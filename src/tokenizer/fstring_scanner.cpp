#include "tokenizer/fstring_scanner.h"

#include "text/token_type.h"
#include "text/unicode_names.h"
#include "tokenizer/brackets.h"
#include "tokenizer/keywords.h"
#include "tokenizer/lexer.h"

namespace codeloom {

namespace {

// As deep as strings and fields may nest; CPython gives up at 150 strings, and at 2 format specs.
constexpr int kMaxDepth = 160;

constexpr size_t kUsualPartCount = 4;

// The end of the comment that begins at `pos`; `pos` when none does.
size_t CommentEnd(std::string_view text, size_t pos) {
    return ByteAt(text, pos) == '#' ? FindRowEnd(text, pos) : pos;
}

bool IsClosingQuoteAt(std::string_view text, size_t pos, const CStringStart& string) {
    return text[pos] == string.quote &&
           (!string.IsTriple() || string_lexer::IsTripleAt(text, pos, string.quote));
}

}  // namespace

CStringEnd CFstringScanner::Scan(size_t pos, const CStringStart& start) {
    _fParts.reserve(kUsualPartCount);
    _fParts.push_back({EPart::kString, start});
    while (!_fParts.empty() && pos != kFailed)
        pos = _fParts.back().kind == EPart::kExpression ? _ScanExpression(pos) : _ScanLiteral(pos);
    if (pos == kFailed) return {_fFailedAt, false, true};
    return {pos, true, true};
}

// The literal text of a string, or of a format spec up to the "}" that closes its field.
size_t CFstringScanner::_ScanLiteral(size_t pos) {
    const std::string_view text = _fLexer.Text();
    const CStringStart string = _fParts.back().string;
    const bool in_format_spec = _fParts.back().kind == EPart::kFormatSpec;
    while (pos < text.size()) {
        const char c = text[pos];
        if (c == '\\') {
            pos = _SkipLiteralEscape(pos, string);
        } else if (IsClosingQuoteAt(text, pos, string)) {
            return in_format_spec ? _FailAt(pos) : _EndString(pos + string.quote_length);
        } else if (IsRowEnd(c) && !string.IsTriple()) {
            return in_format_spec ? _EndField(_SkipToToken(pos)) : _FailAt(pos);
        } else if (c == '}' && in_format_spec) {
            return _EndField(pos);
        } else if ((c == '{' || c == '}') && !in_format_spec && ByteAt(text, pos + 1) == c) {
            pos += 2;
        } else if (c == '{') {
            return _BeginField(pos);
        } else {
            if (c == '}' && _fListener) _fListener->AddLoneBrace(pos);
            ++pos;
        }
    }
    return _FailAt(pos);
}

// A string in a field is one of its tokens.
size_t CFstringScanner::_EndString(size_t end) {
    const size_t start = _fParts.back().start;
    _fParts.pop_back();
    if (_fListener && !_fParts.empty())
        _fListener->AddFieldToken(start, {end, kTokenId_STRING, EWord::kNone, true});
    return end;
}

// A backslash escapes neither brace. `\N{DASH}` holds no field.
size_t CFstringScanner::_SkipLiteralEscape(size_t pos, const CStringStart& string) const {
    const std::string_view text = _fLexer.Text();
    const char escaped = ByteAt(text, pos + 1);
    if (escaped == '{' || escaped == '}') return pos + 1;
    if (escaped == 'N' && ByteAt(text, pos + 2) == '{' && !string.is_raw) {
        size_t end = pos + 3;
        while (IsNameByte(ByteAt(text, end)) || ByteAt(text, end) == ' ' || ByteAt(text, end) == '-') ++end;
        return ByteAt(text, end) == '}' ? end + 1 : end;
    }
    return SkipEscape(text, pos);
}

size_t CFstringScanner::_BeginField(size_t brace_pos) {
    if (_fDepth >= kMaxDepth) return _FailAt(brace_pos);
    ++_fDepth;
    if (_fListener) _fListener->BeginField(brace_pos);
    _fParts.push_back({EPart::kExpression, _fParts.back().string, 0, _fBrackets.size()});
    return brace_pos + 1;
}

size_t CFstringScanner::_ScanExpression(size_t pos) {
    const size_t outer_brackets = _fParts.back().outer_brackets;
    const size_t part_count = _fParts.size();
    while (_fParts.size() == part_count) {
        pos = _SkipToToken(pos);
        if (pos == kFailed) return kFailed;
        if (_fBrackets.size() == outer_brackets) {
            if (_IsExpressionEndAt(pos)) return _EndExpression(pos);
            const size_t after_debug_sign = _ScanDebugSign(pos);
            if (after_debug_sign != pos) return _EndExpression(after_debug_sign);
        }
        const char c = _fLexer.Text()[pos];
        const EByteKind kind = ByteKind(c);
        if (kind == EByteKind::kOpener) _fBrackets.push_back(CloserOf(c));
        if (kind == EByteKind::kCloser) {
            if (_fBrackets.size() == outer_brackets || _fBrackets.back() != c) return _FailAt(pos);
            _fBrackets.pop_back();
        }
        pos = _ScanFieldToken(pos);
        if (pos == kFailed) return kFailed;
    }
    return pos;
}

// The token at `pos`, or the beginning of one that is a string with fields of its own. A string that can't be
// scanned to its end lets the outer one fail too, so that nothing is tried twice.
size_t CFstringScanner::_ScanFieldToken(size_t pos) {
    const std::string_view text = _fLexer.Text();
    const CStringStart start = CanBeginString(text[pos]) ? ReadStringStart(text, pos) : CStringStart();
    if (start.has_fields) {
        _fParts.push_back({EPart::kString, start, pos});
        return pos + start.ContentOffset();
    }
    const CLexedToken token = _fLexer.Lex(pos, _fDepth);
    if (start.quote_length && token.type != kTokenId_STRING) return _FailAt(token.end);
    if (_fListener) _fListener->AddFieldToken(pos, token);
    return token.end;
}

// The sign at `pos` ends the expression. A conversion may follow, and a format spec or the end of the field.
size_t CFstringScanner::_EndExpression(size_t pos) {
    const std::string_view text = _fLexer.Text();
    const size_t expression_end = pos;
    bool is_sound = true;
    if (text[pos] == '!') {
        pos = _ScanConversion(pos, is_sound);
        if (pos == kFailed) return kFailed;
    }
    if (_fListener) _fListener->EndExpression(expression_end, is_sound);
    if (text[pos] != ':') return _EndField(pos);
    _fParts.back().kind = EPart::kFormatSpec;
    return pos + 1;
}

size_t CFstringScanner::_EndField(size_t brace_pos) {
    if (brace_pos == kFailed) return kFailed;
    if (_fLexer.Text()[brace_pos] != '}') return _FailAt(brace_pos);
    _fParts.pop_back();
    --_fDepth;
    if (_fListener) _fListener->EndField();
    return brace_pos + 1;
}

// `!r` and the blanks after it. The letter must follow directly.
size_t CFstringScanner::_ScanConversion(size_t pos, bool& is_sound) {
    const std::string_view text = _fLexer.Text();
    const size_t name_start = SkipBlanks(text, pos + 1);
    const size_t name_end = NameEnd(text, name_start);
    const std::string_view name = text.substr(pos + 1, name_end - pos - 1);
    is_sound = name == "r" || name == "s" || name == "a";
    pos = _SkipToToken(name_end);
    while (pos != kFailed && text[pos] == '#') pos = _SkipToToken(CommentEnd(text, pos));
    return pos;
}

// The sign that ends the expression, where the "=" at `pos` comes before one as in `{x = !r}`; `pos`
// otherwise.
size_t CFstringScanner::_ScanDebugSign(size_t pos) {
    const std::string_view text = _fLexer.Text();
    if (text[pos] != '=' || ByteAt(text, pos + 1) == '=') return pos;
    size_t after = CommentEnd(text, SkipBlanks(text, pos + 1));
    while (after < text.size() && (IsBlank(text[after]) || IsRowEnd(text[after])))
        after = CommentEnd(text, after + 1);
    return after < text.size() && _IsExpressionEndAt(after) ? after : pos;
}

// The next token in a field, over blanks and row ends.
size_t CFstringScanner::_SkipToToken(size_t pos) {
    const std::string_view text = _fLexer.Text();
    bool is_row_start = false;
    for (;; ++pos) {
        pos = SkipBlanks(text, pos);
        if (pos >= text.size()) return _FailAt(pos);
        if (!IsRowEnd(text[pos])) break;
        is_row_start = true;
    }
    if (is_row_start && StartsStatement(text, pos)) return _FailAt(pos);
    return pos;
}

// At the depth of the field itself, ":=" is a format spec that begins with "=".
bool CFstringScanner::_IsExpressionEndAt(size_t pos) const {
    const std::string_view text = _fLexer.Text();
    const char c = text[pos];
    return c == '}' || c == ':' || (c == '!' && ByteAt(text, pos + 1) != '=');
}

size_t CFstringScanner::_FailAt(size_t pos) {
    _fFailedAt = pos;
    return kFailed;
}

}  // namespace codeloom
