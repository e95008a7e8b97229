// String literals: prefix, quotes, and where they end when fields don't count.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

#include "text/char_class.h"
#include "text/scan.h"

namespace codeloom {

// How a string literal begins.
struct CStringStart {
    uint8_t prefix_length = 0;
    uint8_t quote_length = 0;  // 1 or 3; zero where no string begins
    char quote = '\0';
    bool is_raw = false;
    bool is_bytes = false;
    bool has_fields = false;  // an f-string or a t-string

    constexpr size_t ContentOffset() const { return prefix_length + quote_length; }
    constexpr bool IsTriple() const { return quote_length == 3; }
};

// The first byte of a string literal or its prefix, perhaps.
constexpr bool CanBeginString(char c) {
    return ByteKind(c) == EByteKind::kQuote || ByteKind(c) == EByteKind::kNameStart;
}

// Where a string literal ends.
struct CStringEnd {
    size_t end = 0;  // after the closing quotes; without closing quotes the end of the row, or of the text
    bool is_closed = false;
    bool may_span_rows = false;
    bool has_escapes = true;  // or may have
};

namespace string_lexer {

constexpr bool IsQuoteAt(std::string_view text, size_t pos) {
    return ByteKind(ByteAt(text, pos)) == EByteKind::kQuote;
}

constexpr bool IsTripleAt(std::string_view text, size_t pos, char quote) {
    return ByteAt(text, pos) == quote && ByteAt(text, pos + 1) == quote && ByteAt(text, pos + 2) == quote;
}

// The letters of a prefix are legal together. "ur" is Python 2's, in this order only.
constexpr bool IsLegalPrefix(std::string_view prefix) {
    if (prefix.empty()) return true;
    const char first = AsLower(prefix[0]);
    const auto is_letter = [](char c) { return c == 'b' || c == 'f' || c == 't'; };
    if (prefix.size() == 1) return first == 'r' || first == 'u' || is_letter(first);
    const char second = AsLower(prefix[1]);
    return (first == 'r' && is_letter(second)) || ((is_letter(first) || first == 'u') && second == 'r');
}

}  // namespace string_lexer

// The beginning of the string at `pos`, its quotes directly there or after a legal prefix of at most two
// letters.
constexpr CStringStart ReadStringStart(std::string_view text, size_t pos) {
    using namespace string_lexer;
    CStringStart start;
    while (start.prefix_length < 2 && !IsQuoteAt(text, pos + start.prefix_length)) ++start.prefix_length;
    if (!IsQuoteAt(text, pos + start.prefix_length)) return {};
    const std::string_view prefix = text.substr(pos, start.prefix_length);
    if (!IsLegalPrefix(prefix)) return {};

    start.quote = text[pos + start.prefix_length];
    start.quote_length = IsTripleAt(text, pos + start.prefix_length, start.quote) ? 3 : 1;
    for (const char letter : prefix) {
        const char lower = AsLower(letter);
        start.is_raw |= lower == 'r';
        start.is_bytes |= lower == 'b';
        start.has_fields |= lower == 'f' || lower == 't';
    }
    return start;
}

// The position after the backslash at `pos` and what it escapes.
constexpr size_t SkipEscape(std::string_view text, size_t pos) {
    const size_t row_end_length = RowEndLength(text, pos + 1);
    const size_t end = pos + 1 + (row_end_length ? row_end_length : 1);
    return end < text.size() ? end : text.size();
}

namespace string_lexer {

// The byte at `pos` is escaped by the backslashes before it in the content that begins at `start`.
inline bool IsEscaped(std::string_view text, size_t start, size_t pos) {
    size_t backslashes = pos;
    while (backslashes > start && text[backslashes - 1] == '\\') --backslashes;
    return (pos - backslashes) % 2 != 0;
}

inline CStringEnd FindTripleEnd(std::string_view text, size_t start, char quote) {
    for (size_t pos = text.find(quote, start); pos != std::string_view::npos;
         pos = text.find(quote, pos + 1)) {
        if (IsTripleAt(text, pos, quote) && !IsEscaped(text, start, pos)) return {pos + 3, true, true};
    }
    return {text.size(), false, true};
}

inline CStringEnd FindSingleEnd(std::string_view text, size_t pos, char quote) {
    bool may_span_rows = false, has_escapes = false;
    for (;;) {
        pos = FindByte<kEndsPlainString, true>(text, pos);
        if (pos >= text.size()) return {text.size(), false, may_span_rows, has_escapes};
        const char c = text[pos];
        if (c == quote) return {pos + 1, true, may_span_rows, has_escapes};
        if (IsRowEnd(c)) return {pos, false, may_span_rows, has_escapes};
        if (c == '\\') {
            has_escapes = true;
            may_span_rows |= RowEndLength(text, pos + 1) != 0;
            pos = SkipEscape(text, pos);
        } else {
            ++pos;
        }
    }
}

}  // namespace string_lexer

// The end of the string whose content begins at `pos`, whatever its fields are.
inline CStringEnd FindStringEnd(std::string_view text, size_t pos, char quote, bool is_triple) {
    return is_triple ? string_lexer::FindTripleEnd(text, pos, quote)
                     : string_lexer::FindSingleEnd(text, pos, quote);
}

// The token `text` ends with the quotes that it begins with.
constexpr bool IsClosedString(std::string_view text, const CStringStart& start) {
    if (text.size() < start.ContentOffset() + start.quote_length) return false;
    const size_t closing = text.size() - start.quote_length;
    for (size_t i = closing; i < text.size(); ++i) {
        if (text[i] != start.quote) return false;
    }
    size_t backslashes = closing;
    while (backslashes > start.ContentOffset() && text[backslashes - 1] == '\\') --backslashes;
    return (closing - backslashes) % 2 == 0;
}

}  // namespace codeloom
