#include "neighbours/tokenizer/fstring_scanner.h"

#include "neighbours/token_type.h"
#include "neighbours/tokenizer/brackets.h"
#include "neighbours/tokenizer/keywords.h"
#include "neighbours/tokenizer/lexer.h"
#include "neighbours/tokenizer/unicode_names.h"

namespace codeloom {

namespace {

// As deep as strings and fields may nest; CPython gives up at 150 strings, and at 2 format specs.
constexpr int kMaxDepth = 160;

// The end of the comment that begins at `pos`; `pos` when none does.
size_t CommentEnd(std::string_view text, size_t pos) {
    return ByteAt(text, pos) == '#' ? FindRowEnd(text, pos) : pos;
}

}  // namespace

CStringEnd CFstringScanner::Scan(size_t pos, const CStringStart& start) {
    _fStart = start;
    const size_t end = _ScanLiteral(pos, false);
    if (end == kFailed) return {_fFailedAt, false, true};
    return {end, true, true};
}

// The literal text between fields: of a string up to its closing quotes, these included, or of a format spec
// up to the "}" that closes its field, left out.
size_t CFstringScanner::_ScanLiteral(size_t pos, bool in_format_spec) {
    const std::string_view text = _fLexer.Text();
    while (pos < text.size()) {
        const char c = text[pos];
        if (c == '\\') {
            pos = _SkipLiteralEscape(pos);
        } else if (_IsClosingQuoteAt(pos)) {
            return in_format_spec ? _FailAt(pos) : pos + _fStart.quote_length;
        } else if (IsRowEnd(c) && !_fStart.IsTriple()) {
            return in_format_spec ? pos : _FailAt(pos);
        } else if (c == '}' && in_format_spec) {
            return pos;
        } else if ((c == '{' || c == '}') && !in_format_spec && ByteAt(text, pos + 1) == c) {
            pos += 2;
        } else if (c == '{') {
            pos = _ScanField(pos);
            if (pos == kFailed) return kFailed;
        } else {
            if (c == '}' && _fListener) _fListener->AddLoneBrace(pos);
            ++pos;
        }
    }
    return _FailAt(pos);
}

// A backslash escapes neither brace. `\N{DASH}` holds no field.
size_t CFstringScanner::_SkipLiteralEscape(size_t pos) {
    const std::string_view text = _fLexer.Text();
    const char escaped = ByteAt(text, pos + 1);
    if (escaped == '{' || escaped == '}') return pos + 1;
    if (escaped == 'N' && ByteAt(text, pos + 2) == '{' && !_fStart.is_raw) {
        size_t end = pos + 3;
        while (IsNameByte(ByteAt(text, end)) || ByteAt(text, end) == ' ' || ByteAt(text, end) == '-') ++end;
        return ByteAt(text, end) == '}' ? end + 1 : end;
    }
    return SkipEscape(text, pos);
}

// The field whose "{" stands at `pos`.
size_t CFstringScanner::_ScanField(size_t pos) {
    if (_fDepth >= kMaxDepth) return _FailAt(pos);
    ++_fDepth;
    if (_fListener) _fListener->BeginField(pos);
    pos = _ScanExpression(pos + 1);
    if (pos != kFailed) pos = _ScanTail(pos);
    if (pos != kFailed && _fListener) _fListener->EndField();
    --_fDepth;
    return pos;
}

// The expression up to the sign that ends it, left out.
size_t CFstringScanner::_ScanExpression(size_t pos) {
    const size_t outer_brackets = _fBrackets.size();
    for (;;) {
        pos = _SkipToToken(pos);
        if (pos == kFailed) return kFailed;
        if (_fBrackets.size() == outer_brackets) {
            if (_IsExpressionEndAt(pos)) return pos;
            const size_t behind_debug_sign = _ScanDebugSign(pos);
            if (behind_debug_sign != pos) return behind_debug_sign;
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
}

// A nested string that can't be scanned to its end lets the outer one fail too, so that nothing is tried
// twice.
size_t CFstringScanner::_ScanFieldToken(size_t pos) {
    const std::string_view text = _fLexer.Text();
    const CStringStart start = CanBeginString(text[pos]) ? ReadStringStart(text, pos) : CStringStart();
    CLexedToken token;
    if (_fListener && start.has_fields) {
        CFstringScanner nested(_fLexer, _fListener, _fDepth);
        const CStringEnd found = nested.Scan(pos + start.ContentOffset(), start);
        if (!found.is_closed) return _FailAt(found.end);
        token = {found.end, kTokenId_STRING, true};
    } else {
        token = _fLexer.Lex(pos, _fDepth);
        if (start.quote_length && token.type != kTokenId_STRING) return _FailAt(token.end);
    }
    if (_fListener) _fListener->AddFieldToken(pos, token.end, token.type);
    return token.end;
}

// What stands between the expression and the "}" behind the field, with that "}".
size_t CFstringScanner::_ScanTail(size_t pos) {
    const std::string_view text = _fLexer.Text();
    const size_t expression_end = pos;
    bool is_sound = true;
    if (text[pos] == '!') {
        pos = _ScanConversion(pos, is_sound);
        if (pos == kFailed) return kFailed;
    }
    if (_fListener) _fListener->EndExpression(expression_end, is_sound);
    if (text[pos] == ':') {
        pos = _ScanLiteral(pos + 1, true);
        if (pos != kFailed) pos = _SkipToToken(pos);
        if (pos == kFailed) return kFailed;
    }
    return text[pos] == '}' ? pos + 1 : _FailAt(pos);
}

// `!r` and the blanks behind it. The letter must follow directly.
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

// The sign that ends the expression, where the "=" at `pos` stands before one as in `{x = !r}`; `pos`
// otherwise.
size_t CFstringScanner::_ScanDebugSign(size_t pos) {
    const std::string_view text = _fLexer.Text();
    if (text[pos] != '=' || ByteAt(text, pos + 1) == '=') return pos;
    size_t behind = CommentEnd(text, SkipBlanks(text, pos + 1));
    while (behind < text.size() && (IsBlank(text[behind]) || IsRowEnd(text[behind])))
        behind = CommentEnd(text, behind + 1);
    return behind < text.size() && _IsExpressionEndAt(behind) ? behind : pos;
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

bool CFstringScanner::_IsClosingQuoteAt(size_t pos) const {
    const std::string_view text = _fLexer.Text();
    if (text[pos] != _fStart.quote) return false;
    return !_fStart.IsTriple() || string_lexer::IsTripleAt(text, pos, _fStart.quote);
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
