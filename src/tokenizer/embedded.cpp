#include "tokenizer/embedded.h"

#include <algorithm>

#include "text/place.h"
#include "text/token_type.h"
#include "text/white_space.h"
#include "tokenizer/annotations.h"
#include "tokenizer/comment_hint.h"
#include "tokenizer/field_recorder.h"
#include "tokenizer/lexer.h"

namespace codeloom {

namespace {

// The hint of a comment that says something of types; empty for any other comment.
std::string_view MeaningfulHint(std::string_view comment) {
    const std::string_view hint = WithoutSpaceAround(HintInComment(comment).value_or(std::string_view()));
    return IsIgnoreWithMore(hint) ? std::string_view() : hint;
}

bool IsBefore(const CRawLogical& one, const CRawLogical& other) {
    if (one.origin.row != other.origin.row) return one.origin.row < other.origin.row;
    return one.origin.col < other.origin.col;
}

}  // namespace

void CEmbeddedFinder::Find(CRawLogical& logical, const CEmbeddingTokens& what) {
    if (what.has_fields) {
        for (const CRawToken& token : logical.tokens) {
            if (token.type == kTokenId_STRING) _AddFields(logical, token);
        }
    }
    const size_t field_count = logical.embedded.size();
    if (what.has_strings) _AddStringHints(logical);
    if (what.has_comments) {
        for (const CRawToken& token : logical.tokens) {
            if (token.type == kTokenId_COMMENT) _AddCommentHint(logical, token);
        }
    }
    if (logical.embedded.size() > field_count) {
        std::stable_sort(logical.embedded.begin(), logical.embedded.end(), IsBefore);
    }
}

void CEmbeddedFinder::_AddFields(CRawLogical& logical, const CRawToken& token) {
    const size_t pos = token.start;
    const CStringStart start = ReadStringStart(_fText, pos);
    if (!start.has_fields) return;
    const size_t first_i = logical.embedded.size();
    // The text ends with the token, so that a broken field can't reach further.
    CLexer lexer(_fText.substr(0, pos + token.length));
    CFieldRecorder recorder(_fText, logical.embedded, _fSpare);
    CFstringScanner scanner(lexer, &recorder, 0);
    if (!scanner.Scan(pos + start.ContentOffset(), start).is_closed) recorder.GiveUp();

    if (logical.embedded.size() == first_i) return;
    _ReadRows(logical, token);
    for (size_t i = first_i; i < logical.embedded.size(); ++i) {
        _SetPlaces(logical.embedded[i], logical.embedded[i].tokens[0].start);
    }
}

void CEmbeddedFinder::_AddStringHints(CRawLogical& logical) {
    _fHints.clear();
    FindHintStrings(logical, _fHints);
    for (const size_t token_i : _fHints) {
        _ReadRows(logical, logical.tokens[token_i]);
        _AddStringHint(logical, logical.tokens[token_i]);
    }
}

// Hints nest as deep as there are different quotes, which is four at most.
void CEmbeddedFinder::_AddStringHint(CRawLogical& logical, const CRawToken& token) {
    const CStringStart start = ReadStringStart(_fText, token.start);
    const size_t content = token.start + start.ContentOffset();
    const size_t content_end = token.start + token.length - start.quote_length;
    CRawLogical& hint = _fSpare.AddTo(logical.embedded);
    _CollectTokens(hint.tokens, content, content_end);
    if (hint.tokens.empty()) return logical.embedded.pop_back();
    hint.type = ELogicalType::kStringifiedTypeHint;
    _SetPlaces(hint, content);

    std::vector<size_t> nested;
    FindNestedHintStrings(hint, nested);
    const std::vector<CRawToken> tokens = nested.empty() ? std::vector<CRawToken>() : hint.tokens;
    for (const size_t token_i : nested) _AddStringHint(logical, tokens[token_i]);
}

void CEmbeddedFinder::_AddCommentHint(CRawLogical& logical, const CRawToken& token) {
    const std::string_view text = MeaningfulHint(logical.Text(token));
    if (text.empty()) return;
    CRawLogical& hint = _fSpare.AddTo(logical.embedded);
    _CollectTokens(hint.tokens, _PosOf(text), _PosOf(text) + text.size());
    hint.type = ELogicalType::kCommentedTypeHint;
    _ReadRows(logical, token);
    _SetPlaces(hint, _PosOf(text));
}

void CEmbeddedFinder::_CollectTokens(std::vector<CRawToken>& tokens, size_t pos, size_t end) const {
    CLexer lexer(_fText.substr(0, end));
    for (;;) {
        while (pos < end && (IsBlank(_fText[pos]) || IsRowEnd(_fText[pos]))) ++pos;
        if (pos >= end) return;
        const CLexedToken token = lexer.Lex(pos);
        tokens.push_back(MakeToken(pos, token));
        pos = token.end;
    }
}

void CEmbeddedFinder::_ReadRows(const CRawLogical& logical, const CRawToken& token) {
    const size_t pos = token.start;
    CPlace place{pos, pos - static_cast<size_t>(token.position.col), 0, 0};
    _fRows.first_row = logical.first_row + token.position.row;
    _fRows.starts.assign(1, place.row_start);
    while (place.pos < pos + token.length) {
        if (SkipRowEnd(_fText, place)) {
            _fRows.starts.push_back(place.row_start);
        } else {
            ++place.pos;
        }
    }
}

CPosition CEmbeddedFinder::_PositionOf(size_t pos) const {
    const auto after = std::upper_bound(_fRows.starts.begin(), _fRows.starts.end(), pos);
    const auto row_i = static_cast<int32_t>(after - _fRows.starts.begin()) - 1;
    return {_fRows.first_row + row_i, static_cast<int32_t>(pos - *(after - 1))};
}

// Sets the origin and, relative to it, the positions of the tokens.
void CEmbeddedFinder::_SetPlaces(CRawLogical& embedded, size_t origin) {
    embedded.file_text = _fText;
    embedded.origin = _PositionOf(origin);
    embedded.first_row = embedded.origin.row;
    for (CRawToken& token : embedded.tokens) {
        CPosition position = _PositionOf(token.start);
        position.row -= embedded.origin.row;
        if (position.row == 0) position.col -= embedded.origin.col;
        token.position = position;
    }
}

}  // namespace codeloom
