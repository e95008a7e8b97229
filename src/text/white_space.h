// White space as the host's strings know it, and words as its patterns do.
#pragma once

#include <cstddef>
#include <string_view>

#include "text/unicode_names.h"

namespace codeloom {

constexpr bool IsSpaceCode(uint32_t code) {
    if (code < 0x80) return code == ' ' || (code >= '\t' && code <= '\r') || (code >= 0x1C && code <= 0x1F);
    return code == 0x85 || code == 0xA0 || code == 0x1680 || (code >= 0x2000 && code <= 0x200A) ||
           code == 0x2028 || code == 0x2029 || code == 0x202F || code == 0x205F || code == 0x3000;
}

// The length of the white-space character at `pos`; zero where there is none.
inline size_t SpaceLength(std::string_view text, size_t pos) {
    if (pos >= text.size()) return 0;
    if (IsAscii(text[pos])) return IsSpaceCode(static_cast<unsigned char>(text[pos])) ? 1 : 0;
    const CDecodedChar decoded = DecodeChar(text, pos);
    return IsSpaceCode(decoded.code) ? decoded.length : 0;
}

inline size_t SkipSpace(std::string_view text, size_t pos) {
    while (const size_t length = SpaceLength(text, pos)) pos += length;
    return pos;
}

// The end of the text before `end` without the white space there.
inline size_t EndBeforeSpace(std::string_view text, size_t end) {
    while (end > 0) {
        size_t start = end - 1;
        while (start > 0 && end - start < 4 && (static_cast<unsigned char>(text[start]) & 0xC0) == 0x80)
            --start;
        if (SpaceLength(text, start) != end - start) break;
        end = start;
    }
    return end;
}

inline std::string_view WithoutSpaceAtEnd(std::string_view text) {
    return text.substr(0, EndBeforeSpace(text, text.size()));
}

inline std::string_view WithoutSpaceAround(std::string_view text) {
    return WithoutSpaceAtEnd(text.substr(SkipSpace(text, 0)));
}

// The length of the letter, digit or underscore at `pos`; zero where there is none.
inline size_t WordCharLength(std::string_view text, size_t pos) {
    if (pos >= text.size()) return 0;
    if (IsAscii(text[pos])) return IsNameByte(text[pos]) ? 1 : 0;
    const CDecodedChar decoded = DecodeChar(text, pos);
    return decoded.length != 0 && IsUnicodeAlnum(decoded.code) ? decoded.length : 0;
}

// The last character of the text is part of a word.
inline bool EndsInWord(std::string_view text) {
    size_t start = text.size();
    while (start > 0 && text.size() - start < 4) {
        --start;
        if ((static_cast<unsigned char>(text[start]) & 0xC0) != 0x80) break;
    }
    return start < text.size() && WordCharLength(text, start) == text.size() - start;
}

// The end of the word that `pos` is in; `pos` itself outside words.
inline size_t WordEnd(std::string_view text, size_t pos) {
    while (const size_t length = WordCharLength(text, pos)) pos += length;
    return pos;
}

}  // namespace codeloom
