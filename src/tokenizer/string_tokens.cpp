#include "tokenizer/string_tokens.h"

#include "text/token_type.h"

namespace codeloom {

namespace {

bool IsOfKind(std::string_view token, EByteKind kind) {
    return !token.empty() && ByteKind(token[0]) == kind;
}

bool IsToken(const CLexedToken& lexed) {
    return lexed.type != kTokenId_COMMENT && lexed.type != kTokenId_BACKSLASH;
}

}  // namespace

void CStringTokens::Next() {
    if (IsOfKind(Token(), EByteKind::kOpener)) ++_fNestCount;
    _Take(_fEnd);
}

// Takes the first token from `pos` on.
void CStringTokens::_Take(size_t pos) {
    const std::string_view text = _fLexer.Text();
    for (;;) {
        while (pos < text.size() && (IsBlank(text[pos]) || IsRowEnd(text[pos]))) ++pos;
        _fPos = _fEnd = pos;
        if (pos == text.size()) return;
        const CLexedToken lexed = _fLexer.Lex(pos);
        pos = _fEnd = lexed.end;
        if (IsToken(lexed)) break;
    }
    if (IsOfKind(Token(), EByteKind::kCloser) && _fNestCount > 0) --_fNestCount;
}

}  // namespace codeloom
