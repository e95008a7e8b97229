#include "rules/literals.h"

#include <algorithm>

#include "syntax/atoms.h"

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

}  // namespace

void CheckLiterals(const CRawLogical& line, const CLanguage& language, CProblems& problems) {
    if (!line.may_have_strings || !language.IsPython3()) return;
    const CRawToken* before = nullptr;  // the string right before
    for (const CRawToken& token : line.tokens) {
        if (token.type != kTokenId_STRING) {
            if (before != nullptr && !IsPassedOver(token) && token.type != kTokenId_NEWLINE) before = nullptr;
            continue;
        }
        const bool is_bytes = IsBytesText(line.Text(token));
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

}  // namespace codeloom
