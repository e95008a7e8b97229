#include "neighbours/match_case.h"

#include <algorithm>
#include <array>
#include <cstddef>

#include "neighbours/tokenizer/char_class.h"
#include "neighbours/tokenizer/keywords.h"

namespace codeloom {

namespace {

// The tokens without comments and backslashes, one after the other.
class CTokenReader {
  public:
    explicit CTokenReader(std::span<const std::string_view> tokens) : _fTokens(tokens) {}

    // The next token, empty behind the last one.
    std::string_view Next() {
        while (_fToken_i < _fTokens.size()) {
            const std::string_view token = _fTokens[_fToken_i++];
            if (!token.empty() && token[0] != '#' && token[0] != '\\') return token;
        }
        return {};
    }

  private:
    std::span<const std::string_view> _fTokens;
    size_t _fToken_i = 0;
};

bool IsLong(std::string_view token) {
    return token.size() > 1;
}

// A subject or a pattern can begin with `token`, `next` being the token behind it. Brackets, stars and signs
// can also go on with an expression that begins with a name; the header's end tells.
bool CanBeginSubject(std::string_view token, std::string_view next) {
    if (token.empty()) return false;
    switch (ByteKind(token[0])) {
        case EByteKind::kNameStart:
            if (token == "not") return next != "in";
            return !keywords::IsOneOf(token, keywords::kBinary) ||
                   string_lexer::IsQuoteAt(token, token.size() - 1);
        case EByteKind::kDigit:
        case EByteKind::kQuote:
        case EByteKind::kOpener:
            return true;
        case EByteKind::kDot:
            return IsLong(token);
        default:
            return token == "-" || token == "+" || token == "~" || token == "*" || token == "`";
    }
}

// Goes on to the ":" of the header; false when an assignment or the last token comes first.
bool SkipToHeaderEnd(CTokenReader& reader, std::string_view token) {
    int depth = 0;
    int open_lambdas = 0;
    for (; !token.empty(); token = reader.Next()) {
        if (token == "lambda" && depth == 0) ++open_lambdas;
        const EByteKind kind = ByteKind(token[0]);
        if (kind == EByteKind::kOpener) ++depth;
        if (kind == EByteKind::kCloser) --depth;
        if (depth != 0 || open_lambdas > 0) {
            if (token == ":" && depth == 0) --open_lambdas;
            continue;
        }
        if (token == ":") return true;
        if (token == "=" || token == ";") return false;
    }
    return false;
}

}  // namespace

ELogicalType FindMatchOrCaseType(std::span<const std::string_view> tokens, size_t first, size_t end) {
    end = std::min(end, tokens.size());
    if (first >= end) return ELogicalType::kUnknown;
    CTokenReader reader(tokens.subspan(first, end - first));
    const std::string_view keyword = reader.Next();
    const bool is_match = keyword == "match";
    if (!is_match && keyword != "case") return ELogicalType::kUnknown;

    const std::string_view subject = reader.Next();
    CTokenReader behind_subject = reader;
    if (!CanBeginSubject(subject, behind_subject.Next())) return ELogicalType::kUnknown;
    if (!SkipToHeaderEnd(reader, subject)) return ELogicalType::kUnknown;

    const bool may_be_target = subject[0] == '(' || subject[0] == '[';
    const bool has_body = !reader.Next().empty();
    if (is_match && may_be_target && has_body) return ELogicalType::kUnknown;
    return is_match ? ELogicalType::kMatch : ELogicalType::kCase;
}

}  // namespace codeloom
