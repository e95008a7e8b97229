// Names with characters beyond ASCII.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <string_view>

#include "text/char_class.h"
#include "text/scan.h"
#include "text/unicode_ranges.h"

namespace codeloom {

struct CDecodedChar {
    uint32_t code = 0;
    uint8_t length = 0;  // in bytes; zero where the bytes aren't valid UTF-8
};

// The character at `pos`, which is in the text. Lone surrogates, which stand for undecodable bytes in the
// host's texts, pass as characters.
inline CDecodedChar DecodeChar(std::string_view text, size_t pos) {
    const auto byte_at = [&](size_t i) { return static_cast<unsigned char>(ByteAt(text, pos + i)); };
    const auto is_tail = [&](size_t i) { return (byte_at(i) & 0xC0) == 0x80; };
    const uint32_t lead = byte_at(0);
    if (lead < 0x80) return {lead, 1};
    if (lead >= 0xC2 && lead < 0xE0 && is_tail(1)) return {(lead & 0x1F) << 6 | (byte_at(1) & 0x3Fu), 2};
    if (lead >= 0xE0 && lead < 0xF0 && is_tail(1) && is_tail(2)) {
        const uint32_t code = (lead & 0x0F) << 12 | (byte_at(1) & 0x3Fu) << 6 | (byte_at(2) & 0x3Fu);
        if (code >= 0x800) return {code, 3};
    }
    if (lead >= 0xF0 && lead < 0xF5 && is_tail(1) && is_tail(2) && is_tail(3)) {
        const uint32_t code = (lead & 0x07) << 18 | (byte_at(1) & 0x3Fu) << 12 | (byte_at(2) & 0x3Fu) << 6 |
                              (byte_at(3) & 0x3Fu);
        if (code >= 0x10000 && code < 0x110000) return {code, 4};
    }
    return {};
}

// The role of a character beyond ASCII in names: 0 none, 1 continues one, 2 begins one too.
inline uint32_t NameRole(uint32_t code) {
    const uint32_t* after = std::upper_bound(std::begin(kNameRanges), std::end(kNameRanges), code << 2 | 3);
    return after == std::begin(kNameRanges) ? 0 : *(after - 1) & 3;
}

// True for letters and numbers of any script beyond ASCII.
inline bool IsUnicodeAlnum(uint32_t code) {
    const uint32_t* const after = std::upper_bound(std::begin(kAlnumRanges), std::end(kAlnumRanges), code);
    return (after - std::begin(kAlnumRanges)) % 2 != 0;
}

// The end of the name whose first part text[..pos) is known; `pos` itself when no further character belongs
// to it. `at_start` says that no character of it is known yet.
inline size_t UnicodeNameEnd(std::string_view text, size_t pos, bool at_start) {
    for (uint32_t wanted_role = at_start ? 2 : 1; pos < text.size(); wanted_role = 1) {
        if (IsAscii(text[pos])) {
            if (!IsNameByte(text[pos])) return pos;
            ++pos;
            continue;
        }
        const CDecodedChar decoded = DecodeChar(text, pos);
        if (decoded.length == 0 || NameRole(decoded.code) < wanted_role) return pos;
        pos += decoded.length;
    }
    return pos;
}

// The end of the name at `pos`, which is on a name byte; `pos` itself when there is no name.
inline size_t NameEnd(std::string_view text, size_t pos) {
    const size_t end = SkipNameBytes(text, pos);
    if (end == text.size() || IsAscii(text[end])) return end;
    return UnicodeNameEnd(text, end, end == pos);
}

// The length of the character at `pos`; one byte where the bytes aren't valid UTF-8.
inline size_t CharLength(std::string_view text, size_t pos) {
    return std::max<size_t>(DecodeChar(text, pos).length, 1);
}

}  // namespace codeloom
