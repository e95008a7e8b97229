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

// A subject or a pattern can begin with `token`, `next` being the token behind it. Brackets, stars and signs
// can also go on with an expression that begins with a name; the header's end tells.
bool CanBeginSubject(std::string_view token, std::string_view next) {
    if (token.empty()) return false;
    switch (ByteKind(token[0])) {
        case EByteKind::kNameStart:
            if (token == "not") return next != "in";
            return !keywords::IsOneOf(token, keywords::kBinary);
        case EByteKind::kDigit:
        case EByteKind::kQuote:
        case EByteKind::kOpener:
            return true;
        case EByteKind::kDot:
            return token != ".";
        default:
            return token == "-" || token == "+" || token == "~" || token == "*";
    }
}

// Reads the header as if the word were a name, to tell whether the ":" could begin an annotation of it:
//   match(a).b: int      match[a][b]: int     two trailers each, and the last is no call
//   match (a): ...       match [a], b: ...    no target of an annotation
class CTargetReader {
  public:
    // Takes a token outside brackets.
    void Read(std::string_view token) {
        _fEnd = _EndWith(token);
        if (_fEnd != EEnd::kDot) ++_fTrailerCount;
    }

    bool IsTarget() const { return _fEnd == EEnd::kAttribute || _fEnd == EEnd::kSubscript; }
    int GetTrailerCount() const { return _fTrailerCount; }

  private:
    enum class EEnd { kName, kDot, kAttribute, kSubscript, kCall, kNoTarget };

    EEnd _EndWith(std::string_view token) const {
        if (_fEnd == EEnd::kNoTarget) return EEnd::kNoTarget;
        if (_fEnd == EEnd::kDot)
            return ByteKind(token[0]) == EByteKind::kNameStart ? EEnd::kAttribute : EEnd::kNoTarget;
        if (token == ".") return EEnd::kDot;
        if (token == "[") return EEnd::kSubscript;
        return token == "(" ? EEnd::kCall : EEnd::kNoTarget;
    }

    EEnd _fEnd = EEnd::kName;
    int _fTrailerCount = 0;
};

// Goes on to the ":" of the header, from its first token on; false when an assignment or the last token comes
// first.
bool SkipToHeaderEnd(CTokenReader& reader, std::string_view token, CTargetReader& target) {
    int depth = 0;
    int open_lambdas = 0;
    for (; !token.empty(); token = reader.Next()) {
        const EByteKind kind = ByteKind(token[0]);
        if (kind == EByteKind::kCloser) --depth;
        const bool is_outside = depth == 0 && kind != EByteKind::kCloser;
        if (kind == EByteKind::kOpener) ++depth;
        if (!is_outside) continue;
        if (token == "lambda") ++open_lambdas;
        if (open_lambdas == 0 && token == ":") return true;
        if (open_lambdas == 0 && (token == "=" || token == ";")) return false;
        if (token == ":") --open_lambdas;
        target.Read(token);
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
    CTargetReader target;
    if (!SkipToHeaderEnd(reader, subject, target)) return ELogicalType::kUnknown;

    const bool has_body = !reader.Next().empty();
    const bool may_be_annotated = has_body && target.IsTarget();
    if (is_match) return may_be_annotated ? ELogicalType::kUnknown : ELogicalType::kMatch;
    return may_be_annotated && target.GetTrailerCount() > 1 ? ELogicalType::kUnknown : ELogicalType::kCase;
}

}  // namespace codeloom
