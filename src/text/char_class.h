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

// What else is asked of a byte.
enum EByteTrait : uint8_t {
    kContinuesName = 0x80,      // an ASCII name
    kEndsPlainString = 0x40,    // begins an escape in a string, or ends it, or its row
    kContinuesOperator = 0x20,  // is the second byte of an operator
    kMayContinueName = 0x10,    // after an ASCII name, which is then perhaps no name, or not all of it
};

// The kind of a byte in the lower half, its traits in the upper one.
inline constexpr uint8_t kKindMask = 0x0F;

inline constexpr std::array<uint8_t, 256> kBytes = [] {
    std::array<uint8_t, 256> table{};
    const auto set = [&table](std::string_view bytes, EByteKind kind, int traits = 0) {
        for (const char c : bytes) table[static_cast<unsigned char>(c)] = static_cast<uint8_t>(kind) | traits;
    };
    set(" \t\f", EByteKind::kBlank);
    set("\r\n", EByteKind::kRowEnd, kEndsPlainString);
    set("abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ_", EByteKind::kNameStart, kContinuesName);
    for (size_t byte = 0x80; byte < table.size(); ++byte)
        table[byte] = static_cast<uint8_t>(EByteKind::kNameStart) | kMayContinueName;
    set("0123456789", EByteKind::kDigit, kContinuesName);
    set("'\"", EByteKind::kQuote, kEndsPlainString | kMayContinueName);
    set("#", EByteKind::kComment);
    set("\\", EByteKind::kBackslash, kEndsPlainString);
    set("([{", EByteKind::kOpener);
    set(")]}", EByteKind::kCloser);
    set(".", EByteKind::kDot, kContinuesOperator);
    set("=<>*/", EByteKind::kOperator, kContinuesOperator);
    set("+-%@&|^~,:;`!", EByteKind::kOperator);
    return table;
}();

inline constexpr EByteKind ByteKind(char c) {
    return static_cast<EByteKind>(kBytes[static_cast<unsigned char>(c)] & kKindMask);
}
inline constexpr bool HasTrait(char c, EByteTrait trait) {
    return (kBytes[static_cast<unsigned char>(c)] & trait) != 0;
}
inline constexpr bool IsNameByte(char c) {
    return HasTrait(c, kContinuesName);
}
inline constexpr bool IsBlank(char c) {
    return kBytes[static_cast<unsigned char>(c)] == static_cast<uint8_t>(EByteKind::kBlank);
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

// The byte at `pos`, NUL after the end of the text.
inline constexpr char ByteAt(std::string_view text, size_t pos) {
    return pos < text.size() ? text[pos] : '\0';
}

// The first position from `pos` on that isn't a blank.
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

}  // namespace codeloom
