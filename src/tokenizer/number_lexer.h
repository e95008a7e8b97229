// Number literals of all language versions.
#pragma once

#include <cstddef>
#include <string_view>

#include "text/char_class.h"

namespace codeloom {

namespace number_lexer {

inline constexpr bool IsOctalDigit(char c) {
    return c >= '0' && c <= '7';
}
inline constexpr bool IsBinaryDigit(char c) {
    return c == '0' || c == '1';
}
inline constexpr bool IsHexDigit(char c) {
    return IsDigit(c) || (AsLower(c) >= 'a' && AsLower(c) <= 'f');
}

// The end of the digits from `pos` on, each of which may have one underscore before it when `may_begin` says
// so for the first one.
template <bool (*IsDigitOfBase)(char)>
constexpr size_t DigitsEnd(std::string_view text, size_t pos, bool underscore_may_begin = false) {
    size_t end = pos;
    for (;;) {
        size_t digit = end;
        if (ByteAt(text, digit) == '_' && (end > pos || underscore_may_begin)) ++digit;
        if (!IsDigitOfBase(ByteAt(text, digit))) return end;
        end = digit + 1;
    }
}

// Takes the "L" that Python 2 allows after a whole number.
constexpr size_t LongEnd(std::string_view text, size_t end) {
    return AsLower(ByteAt(text, end)) == 'l' ? end + 1 : end;
}

// `0x1F`, `0b1`, `0o17`; `pos` itself where there is no such number.
constexpr size_t BasedEnd(std::string_view text, size_t pos) {
    size_t end = pos + 2;
    switch (AsLower(ByteAt(text, pos + 1))) {
        case 'x':
            end = DigitsEnd<IsHexDigit>(text, pos + 2, true);
            break;
        case 'o':
            end = DigitsEnd<IsOctalDigit>(text, pos + 2, true);
            break;
        case 'b':
            end = DigitsEnd<IsBinaryDigit>(text, pos + 2, true);
            break;
        default:
            return pos;
    }
    return end == pos + 2 ? pos : LongEnd(text, end);
}

// The end of `e5`, `E-5`; `pos` itself where there is no exponent.
constexpr size_t ExponentEnd(std::string_view text, size_t pos) {
    if (AsLower(ByteAt(text, pos)) != 'e') return pos;
    const char sign = ByteAt(text, pos + 1);
    const size_t digits = sign == '+' || sign == '-' ? pos + 2 : pos + 1;
    const size_t end = DigitsEnd<IsDigit>(text, digits);
    return end == digits ? pos : end;
}

// The end of the whole number of the digits text[pos..end): a leading zero leaves zeros or, with Python 2,
// octal digits.
constexpr size_t WholeEnd(std::string_view text, size_t pos, size_t end) {
    const bool has_underscore = text.substr(pos, end - pos).find('_') != std::string_view::npos;
    if (text[pos] != '0') return has_underscore ? end : LongEnd(text, end);
    if (!has_underscore) {
        size_t octal = pos + 1;
        while (octal < end && IsOctalDigit(text[octal])) ++octal;
        if (octal == end) return LongEnd(text, end);
    }
    size_t zeros = pos + 1;
    for (size_t next = zeros; next < end && (text[next] == '0' || text[next] == '_'); ++next) {
        if (text[next] == '0') zeros = next + 1;
    }
    return zeros;
}

}  // namespace number_lexer

// The end of the longest number at `pos`, which is on a digit, or on a "." before a digit. What runs on
// after it (`1abc`, `0xg`, `1__0`) is a token of its own, which no grammar takes there unless it is a
// keyword as in `1if x else y`.
constexpr size_t NumberEnd(std::string_view text, size_t pos) {
    using namespace number_lexer;
    if (text[pos] == '0') {
        const size_t based_end = BasedEnd(text, pos);
        if (based_end > pos) return based_end;
    }
    const size_t digits_end = DigitsEnd<IsDigit>(text, pos);
    size_t end = digits_end;
    if (ByteAt(text, end) == '.') end = DigitsEnd<IsDigit>(text, end + 1);
    end = ExponentEnd(text, end);
    if (AsLower(ByteAt(text, end)) == 'j') return end + 1;
    return end > digits_end ? end : WholeEnd(text, pos, digits_end);
}

}  // namespace codeloom
