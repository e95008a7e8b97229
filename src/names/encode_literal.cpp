#include "names/encode_literal.h"

#include <array>

#include "text/char_class.h"
#include "text/unicode_names.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

namespace {

// A character that ends rows, in one of the senses that the host's texts know.
struct CRowEnder {
    size_t length = 0;  // in bytes; zero where there is no such character
    std::string_view escape;
};

CRowEnder RowEnderAt(std::string_view text, size_t pos) {
    switch (text[pos]) {
        case '\n':
        case '\r':
            return {RowEndLength(text, pos), "\\n"};
        case '\v':
            return {1, "\\v"};
        case '\f':
            return {1, "\\f"};
        case '\x1C':
            return {1, "\\x1c"};
        case '\x1D':
            return {1, "\\x1d"};
        case '\x1E':
            return {1, "\\x1e"};
        case '\xC2':
            return {text.substr(pos).starts_with("\xC2\x85") ? size_t{2} : 0, "\\x85"};
        case '\xE2':
            if (text.substr(pos).starts_with("\xE2\x80\xA8")) return {3, "\\u2028"};
            return {text.substr(pos).starts_with("\xE2\x80\xA9") ? size_t{3} : 0, "\\u2029"};
        default:
            return {};
    }
}

// Bytes with which a character may begin that ends rows.
constexpr std::array<bool, 256> kMayEndRow = [] {
    std::array<bool, 256> may_end{};
    for (const unsigned char byte : {'\n', '\r', '\v', '\f', '\x1C', '\x1D', '\x1E', '\xC2', '\xE2'})
        may_end[byte] = true;
    return may_end;
}();

bool HasRowEnder(std::string_view text) {
    for (size_t pos = 0; pos < text.size(); ++pos) {
        if (kMayEndRow[static_cast<unsigned char>(text[pos])] && RowEnderAt(text, pos).length != 0)
            return true;
    }
    return false;
}

constexpr std::array<bool, 128> kIsHarmless = [] {
    std::array<bool, 128> is_harmless{};
    for (size_t byte = 0; byte < is_harmless.size(); ++byte)
        is_harmless[byte] = IsNameByte(static_cast<char>(byte));
    for (const char c : std::string_view(" \"',.")) is_harmless[static_cast<size_t>(c)] = true;
    return is_harmless;
}();

// Writes the backslash at `pos` and what it escapes; returns the position after what was written.
size_t EncodeEscape(std::string_view text, size_t pos, std::string& out) {
    const size_t after_row_end = pos + 1 + RowEndLength(text, pos + 1);
    if (after_row_end > pos + 1) return after_row_end;  // a continued row: nothing of it is in the value
    out += '\\';
    if (pos + 1 == text.size()) return pos + 1;
    const bool is_plain = RowEnderAt(text, pos + 1).length == 0;
    out += is_plain ? text[pos + 1] : '\\';
    return is_plain ? pos + 2 : pos + 1;
}

}  // namespace

std::string_view EncodeStringLiteral(std::string_view text, std::string& storage) {
    if (!HasRowEnder(text)) return text;
    const bool has_escapes = !ReadStringStart(text, 0).is_raw;
    storage.clear();
    for (size_t pos = 0; pos < text.size();) {
        if (text[pos] == '\\' && has_escapes) {
            pos = EncodeEscape(text, pos, storage);
            continue;
        }
        const CRowEnder row_ender = RowEnderAt(text, pos);
        if (row_ender.length == 0) {
            storage += text[pos++];
        } else {
            storage += row_ender.escape;
            pos += row_ender.length;
        }
    }
    return storage;
}

bool IsHarmlessLiteral(std::string_view literal) {
    for (size_t pos = 0; pos < literal.size();) {
        if (IsAscii(literal[pos])) {
            if (!kIsHarmless[static_cast<size_t>(literal[pos])]) return false;
            ++pos;
            continue;
        }
        const CDecodedChar decoded = DecodeChar(literal, pos);
        if (decoded.length == 0 || !IsUnicodeAlnum(decoded.code)) return false;
        pos += decoded.length;
    }
    return true;
}

}  // namespace codeloom
