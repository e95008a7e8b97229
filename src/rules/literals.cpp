#include "rules/literals.h"

#include <algorithm>
#include <array>

#include "rules/escapes.h"
#include "rules/fields.h"
#include "syntax/atoms.h"
#include "text/words.h"

namespace codeloom {

namespace {

void CheckBytes(const CRawLogical& line, const CRawToken& token, CProblems& problems) {
    const std::string_view text = line.Text(token);
    const auto is_beyond_ascii = [](char c) { return static_cast<unsigned char>(c) >= 0x80; };
    const auto found = std::find_if(text.begin(), text.end(), is_beyond_ascii);
    if (found == text.end()) return;
    const auto is_next_character = [](char c) { return (static_cast<unsigned char>(c) & 0xC0) != 0x80; };
    const auto next = std::find_if(found + 1, text.end(), is_next_character);
    const auto start = static_cast<uint32_t>(token.start + (found - text.begin()));
    const auto end = static_cast<uint32_t>(token.start + (next - text.begin()));
    problems.push_back({ECode::kBytesNotAscii,
                        start,
                        end,
                        "bytes can only contain ASCII literal characters",
                        "escape it, as in b'\\xe9'",
                        {}});
}

void CheckFields(const CRawLogical& line, const CRawToken& token, const CLanguage& language,
                 CProblems& problems) {
    const int most_levels = language.version >= 312 ? 3 : 2;
    const std::string_view text = line.Text(token);
    if (std::count(text.begin(), text.end(), '{') <= most_levels) return;
    constexpr int kMostStrings = 149;
    const CStringFields fields = ReadFields(line, token);
    const char* const message = fields.levels > most_levels ? "f-string: expressions nested too deeply"
                                : fields.string_levels > kMostStrings ? "too many nested f-strings"
                                                                      : nullptr;
    if (message != nullptr)
        problems.push_back({ECode::kFieldsTooDeep, token.start, line.EndOf(token), message, {}, {}});
}

// A number that a keyword follows without a blank.
bool RunsOn(std::string_view number, const CRawToken& next, char letter, const CLanguage& language) {
    if (number == "0" && (letter == 'o' || letter == 'x' || letter == 'b')) return true;
    constexpr int kRefusesOtherWords = 310;
    constexpr auto kMayFollow = std::to_array<EWord>({EWord::kAnd, EWord::kElse, EWord::kFor, EWord::kIf,
                                                      EWord::kIn, EWord::kIs, EWord::kNot, EWord::kOr});
    return language.version >= kRefusesOtherWords &&
           std::find(kMayFollow.begin(), kMayFollow.end(), next.word) == kMayFollow.end();
}

void CheckNumber(const CRawLogical& line, const CRawToken& token, const CRawToken& next,
                 const CLanguage& language, CProblems& problems) {
    if (next.start != line.EndOf(token) || next.type != kTokenId_NAME) return;
    const char letter = AsLower(line.Text(next)[0]);
    if (!RunsOn(line.Text(token), next, letter, language)) return;
    const char* const message = letter == 'o'   ? "invalid octal literal"
                                : letter == 'x' ? "invalid hexadecimal literal"
                                : letter == 'b' ? "invalid binary literal"
                                                : "invalid decimal literal";
    problems.push_back({ECode::kNumberRunsOn, token.start, line.EndOf(next), message, {}, {}});
}

void CheckNumbers(const CRawLogical& line, const CLanguage& language, CProblems& problems) {
    for (size_t i = 0; i + 1 < line.tokens.size(); ++i)
        if (line.tokens[i].type == kTokenId_NUMBER)
            CheckNumber(line, line.tokens[i], line.tokens[i + 1], language, problems);
}

void CheckParentheses(const CRawLogical& line, CProblems& problems) {
    constexpr int kMostOpen = 200;
    int open_count = 0;
    for (const CRawToken& token : line.tokens) {
        open_count += IsOpenerType(token.type) - IsCloserType(token.type);
        if (open_count <= kMostOpen) continue;
        return problems.push_back({ECode::kTooManyParentheses,
                                   token.start,
                                   line.EndOf(token),
                                   "too many nested parentheses",
                                   {},
                                   {}});
    }
}

void CheckStrings(const CRawLogical& line, const CLanguage& language, CProblems& problems) {
    const CRawToken* before = nullptr;  // the string right before
    for (const CRawToken& token : line.tokens) {
        if (token.type != kTokenId_STRING) {
            if (before != nullptr && !IsPassedOver(token) && token.type != kTokenId_NEWLINE) before = nullptr;
            continue;
        }
        CheckEscapes(line, token, language, problems);
        if (!language.IsPython3()) continue;
        const std::string_view text = line.Text(token);
        const bool has_prefix = ByteKind(text.front()) != EByteKind::kQuote;
        if (has_prefix && HasFields(text)) CheckFields(line, token, language, problems);
        const bool is_bytes = has_prefix && IsBytesText(text);
        if (is_bytes) CheckBytes(line, token, problems);
        if (before != nullptr && is_bytes != IsBytesText(line.Text(*before)))
            problems.push_back({ECode::kMixedBytesAndText,
                                before->start,
                                line.EndOf(token),
                                "cannot mix bytes and nonbytes literals",
                                {},
                                {}});
        before = &token;
    }
}

constexpr size_t kMayNestDeeply = 400;

// Words that may follow a number: as part of it, or as what may not.
constexpr uint64_t kMayRunOn = WordBits(EWord::kOr, EWord::kAs, EWord::kAsync, EWord::kFrom);

}  // namespace

bool MayHaveBadLiteral(const CRawLogical& line) {
    return line.may_have_special_strings || line.MayHaveWords(kMayRunOn) ||
           line.tokens.size() > kMayNestDeeply;
}

void CheckEnd(const CRawLogical& line, const CLanguage& language, CProblems& problems) {
    constexpr int kRefusesBackslash = 308;
    const CRawToken& last = line.tokens.back();
    if (last.type != kTokenId_BACKSLASH || language.version < kRefusesBackslash) return;
    const uint32_t end = line.EndOf(last);
    if (end + RowEndLength(line.file_text, end) < line.file_text.size()) return;
    problems.push_back(
        {ECode::kBackslashAtEnd, last.start, end, "unexpected end of file after a backslash", {}, {}});
}

void CheckLiterals(const CRawLogical& line, const CLanguage& language, CProblems& problems) {
    constexpr int kLimitsParentheses = 309;
    if (line.tokens.size() > kMayNestDeeply && language.version >= kLimitsParentheses)
        CheckParentheses(line, problems);
    if (line.may_have_special_strings) CheckStrings(line, language, problems);
    if (line.MayHaveWords(kMayRunOn)) CheckNumbers(line, language, problems);
}

}  // namespace codeloom
