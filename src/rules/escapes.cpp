#include "rules/escapes.h"

#include <algorithm>
#include <optional>
#include <string>

#include "rules/fields.h"
#include "text/char_class.h"
#include "text/character_names.h"
#include "tokenizer/number_lexer.h"
#include "tokenizer/string_lexer.h"

namespace codeloom {

namespace {

struct CBadEscape {
    size_t length;
    const char* message;
};

size_t CountHexDigits(std::string_view text, size_t most) {
    size_t count = 0;
    while (count < most && number_lexer::IsHexDigit(ByteAt(text, count))) ++count;
    return count;
}

// `escape` begins with the backslash.
std::optional<CBadEscape> FindTruncated(std::string_view escape, size_t digit_count, const char* message) {
    const size_t found = CountHexDigits(escape.substr(2), digit_count);
    if (found == digit_count) return {};
    return CBadEscape{2 + found, message};
}

std::optional<CBadEscape> CheckCode(std::string_view escape) {
    if (const auto bad = FindTruncated(escape, 8, "truncated \\UXXXXXXXX escape")) return bad;
    constexpr size_t kLength = 10;
    const bool is_beyond_last = escape.substr(2, 2) != "00" || escape.substr(4, 2) > "10";
    if (is_beyond_last) return CBadEscape{kLength, "illegal Unicode character"};
    return {};
}

std::optional<CBadEscape> CheckName(std::string_view escape) {
    constexpr size_t kNameStart = 3;
    constexpr const char* kMalformed = "malformed \\N character escape";
    if (ByteAt(escape, 2) != '{') return CBadEscape{2, kMalformed};
    const size_t end = escape.find('}', kNameStart);
    if (end == std::string_view::npos || end == kNameStart)
        return CBadEscape{end == kNameStart ? end + 1 : kNameStart, kMalformed};
    const std::string_view name = escape.substr(kNameStart, end - kNameStart);
    if (!MayBeCharacterName(name)) return CBadEscape{end + 1, "unknown Unicode character name"};
    return {};
}

std::optional<CBadEscape> CheckEscape(std::string_view escape, bool is_bytes) {
    switch (ByteAt(escape, 1)) {
        case 'x':
            return FindTruncated(escape, 2, is_bytes ? "invalid \\x escape" : "truncated \\xXX escape");
        case 'u':
            if (!is_bytes) return FindTruncated(escape, 4, "truncated \\uXXXX escape");
            break;
        case 'U':
            if (!is_bytes) return CheckCode(escape);
            break;
        case 'N':
            if (!is_bytes) return CheckName(escape);
            break;
        default:
            break;
    }
    return {};
}

// In Python 2 a string holds bytes unless it says otherwise.
bool HoldsBytes(std::string_view prefix, const CLanguage& language) {
    const auto has = [&](const char* letters) { return prefix.find_first_of(letters) != prefix.npos; };
    return language.IsPython3() ? has("bB") : !has("uU");
}

}  // namespace

void CheckEscapes(const CRawLogical& line, const CRawToken& string, const CLanguage& language,
                  CProblems& problems) {
    const std::string_view text = line.Text(string);
    size_t pos = text.find('\\');
    if (pos == std::string_view::npos) return;
    const CStringStart start = ReadStringStart(text, 0);
    if (start.is_raw) return;
    const bool is_bytes = HoldsBytes(text.substr(0, start.prefix_length), language);
    const std::string_view content = text.substr(0, text.size() - start.quote_length);
    const CStringFields fields = start.has_fields ? ReadFields(line, string) : CStringFields();
    for (; pos != std::string_view::npos; pos = content.find('\\', pos)) {
        const auto offset = static_cast<uint32_t>(string.start + pos);
        if (!fields.IsInExpression(offset)) {
            if (const auto bad = CheckEscape(content.substr(pos), is_bytes)) {
                const auto end = static_cast<uint32_t>(offset + bad->length);
                return problems.emplace_back(
                           CProblem{ECode::kInvalidEscape, offset, end, bad->message, {}, {}}),
                       void();
            }
        }
        pos += 2;
    }
}

}  // namespace codeloom
