// What a byte can begin or continue in Python source, from one table of 256 entries.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace codeloom {

// What a token that starts with this byte is.
enum class EByteKind : uint8_t {
    kInvalid,  // no token of the language starts with it
    kBlank,
    kRowEnd,
    kNameStart,  // a letter, an underscore or a byte of a longer character
    kDigit,
    kQuote,
    kComment,
    kBackslash,
    kOpener,
    kCloser,
    kDot,  // an operator or a number
    kOperator,
};

inline constexpr std::array<EByteKind, 256> kByteKinds = [] {
    std::array<EByteKind, 256> kinds{};
    const auto set = [&kinds](std::string_view bytes, EByteKind kind) {
        for (const char c : bytes) kinds[static_cast<unsigned char>(c)] = kind;
    };
    set(" \t\f", EByteKind::kBlank);
    set("\r\n", EByteKind::kRowEnd);
    set("abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ_", EByteKind::kNameStart);
    for (int byte = 0x80; byte < 0x100; ++byte) kinds[byte] = EByteKind::kNameStart;
    set("0123456789", EByteKind::kDigit);
    set("'\"", EByteKind::kQuote);
    set("#", EByteKind::kComment);
    set("\\", EByteKind::kBackslash);
    set("([{", EByteKind::kOpener);
    set(")]}", EByteKind::kCloser);
    set(".", EByteKind::kDot);
    set("+-*/%@<>=&|^~,:;`!", EByteKind::kOperator);
    return kinds;
}();

// Continues an ASCII name.
inline constexpr std::array<bool, 256> kIsNameByte = [] {
    std::array<bool, 256> is_name{};
    for (int byte = 0; byte < 0x80; ++byte) {
        is_name[byte] = kByteKinds[byte] == EByteKind::kNameStart || kByteKinds[byte] == EByteKind::kDigit;
    }
    return is_name;
}();

inline constexpr EByteKind ByteKind(char c) {
    return kByteKinds[static_cast<unsigned char>(c)];
}
inline constexpr bool IsNameByte(char c) {
    return kIsNameByte[static_cast<unsigned char>(c)];
}
inline constexpr bool IsBlank(char c) {
    return ByteKind(c) == EByteKind::kBlank;
}
inline constexpr bool IsRowEnd(char c) {
    return c == '\n' || c == '\r';
}
inline constexpr bool IsDigit(char c) {
    return c >= '0' && c <= '9';
}
inline constexpr bool IsAscii(char c) {
    return static_cast<signed char>(c) >= 0;
}
inline constexpr char AsLower(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c | 0x20) : c;
}

// The byte at `pos`, NUL behind the end of the text.
inline constexpr char ByteAt(std::string_view text, size_t pos) {
    return pos < text.size() ? text[pos] : '\0';
}

// The first position from `pos` on that is no blank.
inline constexpr size_t SkipBlanks(std::string_view text, size_t pos) {
    while (pos < text.size() && IsBlank(text[pos])) ++pos;
    return pos;
}

// The length of the row end at `pos`: 2 for CRLF, 1 for CR or LF, 0 for anything else.
inline constexpr size_t RowEndLength(std::string_view text, size_t pos) {
    const char c = ByteAt(text, pos);
    if (c == '\r') return ByteAt(text, pos + 1) == '\n' ? 2 : 1;
    return c == '\n' && pos < text.size() ? 1 : 0;
}

// The end of the row that holds `pos`, its row end left out.
inline constexpr size_t FindRowEnd(std::string_view text, size_t pos) {
    while (pos < text.size() && !IsRowEnd(text[pos])) ++pos;
    return pos;
}

}  // namespace codeloom
