#include "tokenizer/match_case.h"

#include <cstddef>

#include "text/char_class.h"
#include "text/token_type.h"
#include "tokenizer/keywords.h"

namespace codeloom {

namespace {

// The end of the tokens for readers: no token of the language.
constexpr CRawToken kNoToken;

// The tokens without comments and backslashes, one after the other.
class CTokenReader {
  public:
    CTokenReader(std::span<const CRawToken> tokens, std::string_view text) : _fTokens(tokens), _fText(text) {}

    // The next token, kNoToken after the last one.
    const CRawToken& Next() {
        while (_fToken_i < _fTokens.size()) {
            const CRawToken& token = _fTokens[_fToken_i++];
            if (token.length > 0 && !_IsPassedOver(token)) return token;
        }
        return kNoToken;
    }

    EByteKind FirstKind(const CRawToken& token) const { return ByteKind(_fText[token.start]); }

  private:
    // A backslash before blanks is passed over too, although it is an error token.
    bool _IsPassedOver(const CRawToken& token) const {
        const EByteKind kind = FirstKind(token);
        return kind == EByteKind::kComment || kind == EByteKind::kBackslash;
    }

    std::span<const CRawToken> _fTokens;
    std::string_view _fText;
    size_t _fToken_i = 0;
};

// A subject or a pattern can begin with `token`, `next` being the token after it. Brackets, stars and signs
// can also go on with an expression that begins with a name; the header's end decides.
bool CanBeginSubject(const CTokenReader& reader, const CRawToken& token, const CRawToken& next) {
    if (token.length == 0) return false;
    switch (reader.FirstKind(token)) {
        case EByteKind::kNameStart:
            if (token.word == EWord::kNot) return next.word != EWord::kIn;
            return !IsBinaryWord(token.word);
        case EByteKind::kDigit:
        case EByteKind::kQuote:
        case EByteKind::kOpener:
            return true;
        case EByteKind::kDot:
            return token.type != kTokenId_DOT;
        default:
            return token.type == kTokenId_MINUS || token.type == kTokenId_PLUS ||
                   token.type == kTokenId_TILDE || token.type == kTokenId_STAR;
    }
}

// Reads the header as if the word were a name, to tell whether the ":" could begin an annotation of it:
//   match(a).b: int      match[a][b]: int     two trailers each, and the last isn't a call
//   match (a): ...       match [a], b: ...    no target of an annotation
class CTargetReader {
  public:
    // Takes a token outside brackets, which begins with a byte of `kind`.
    void Read(const CRawToken& token, EByteKind kind) {
        _fEnd = _EndWith(token, kind);
        if (_fEnd != EEnd::kDot) ++_fTrailerCount;
    }

    bool IsTarget() const { return _fEnd == EEnd::kAttribute || _fEnd == EEnd::kSubscript; }
    int GetTrailerCount() const { return _fTrailerCount; }

  private:
    enum class EEnd { kName, kDot, kAttribute, kSubscript, kCall, kNoTarget };

    EEnd _EndWith(const CRawToken& token, EByteKind kind) const {
        if (_fEnd == EEnd::kNoTarget) return EEnd::kNoTarget;
        if (_fEnd == EEnd::kDot) return kind == EByteKind::kNameStart ? EEnd::kAttribute : EEnd::kNoTarget;
        if (token.type == kTokenId_DOT) return EEnd::kDot;
        if (token.type == kTokenId_LSQB) return EEnd::kSubscript;
        return token.type == kTokenId_LPAR ? EEnd::kCall : EEnd::kNoTarget;
    }

    EEnd _fEnd = EEnd::kName;
    int _fTrailerCount = 0;
};

// Goes on to the ":" of the header, from its first token on; false when an assignment or the last token comes
// first.
bool SkipToHeaderEnd(CTokenReader& reader, const CRawToken* token, CTargetReader& target) {
    int depth = 0;
    int open_lambdas = 0;
    for (; token->length > 0; token = &reader.Next()) {
        const EByteKind kind = reader.FirstKind(*token);
        if (kind == EByteKind::kCloser) --depth;
        const bool is_outside = depth == 0 && kind != EByteKind::kCloser;
        if (kind == EByteKind::kOpener) ++depth;
        if (!is_outside) continue;
        const int16_t type = token->type;
        if (token->word == EWord::kLambda) ++open_lambdas;
        if (open_lambdas == 0 && type == kTokenId_COLON) return true;
        if (open_lambdas == 0 && (type == kTokenId_EQUAL || type == kTokenId_SEMI)) return false;
        if (type == kTokenId_COLON) --open_lambdas;
        target.Read(*token, kind);
    }
    return false;
}

}  // namespace

ELogicalType FindMatchOrCaseType(std::span<const CRawToken> tokens, std::string_view text) {
    CTokenReader reader(tokens, text);
    const EWord keyword = reader.Next().word;
    const bool is_match = keyword == EWord::kMatch;
    if (!is_match && keyword != EWord::kCase) return ELogicalType::kUnknown;

    const CRawToken& subject = reader.Next();
    CTokenReader after_subject = reader;
    if (!CanBeginSubject(reader, subject, after_subject.Next())) return ELogicalType::kUnknown;
    CTargetReader target;
    if (!SkipToHeaderEnd(reader, &subject, target)) return ELogicalType::kUnknown;

    const bool has_body = reader.Next().length > 0;
    const bool may_be_annotated = has_body && target.IsTarget();
    if (is_match) return may_be_annotated ? ELogicalType::kUnknown : ELogicalType::kMatch;
    return may_be_annotated && target.GetTrailerCount() > 1 ? ELogicalType::kUnknown : ELogicalType::kCase;
}

}  // namespace codeloom
