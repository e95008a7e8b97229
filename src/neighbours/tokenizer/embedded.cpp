#include "neighbours/tokenizer/embedded.h"

#include <algorithm>

#include "neighbours/token_type.h"
#include "neighbours/tokenizer/annotations.h"
#include "neighbours/tokenizer/field_recorder.h"
#include "neighbours/tokenizer/lexer.h"
#include "neighbours/tokenizer/place.h"

namespace codeloom {

namespace {

constexpr std::string_view kTypeMark = "type:";
constexpr std::string_view kIgnore = "ignore";

std::string_view Strip(std::string_view text) {
    while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
    while (!text.empty() && IsBlank(text.back())) text.remove_suffix(1);
    return text;
}

// The hint in a comment: what follows "# type:" up to a further "#". Empty when there is none, and for
// `# type: ignore` and `# type: ignore[code]`, which say nothing of types.
std::string_view HintInComment(std::string_view comment) {
    const size_t mark = comment.find(kTypeMark);
    if (mark == std::string_view::npos || !Strip(comment.substr(0, mark)).ends_with('#')) return {};
    std::string_view hint = comment.substr(mark + kTypeMark.size());
    hint = Strip(hint.substr(0, hint.find('#')));
    if (!hint.starts_with(kIgnore)) return hint;
    const std::string_view behind = Strip(hint.substr(kIgnore.size()));
    return behind.empty() || behind[0] == '[' ? std::string_view() : hint;
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
    const CStringStart start = ReadStringStart(token.text, 0);
    if (!start.has_fields) return;
    const size_t first_i = logical.embedded.size();
    const size_t pos = _PosOf(token.text);
    // The text ends with the token, so that a broken field can't reach further.
    CLexer lexer(_fText.substr(0, pos + token.text.size()));
    CFieldRecorder recorder(_fText, logical.embedded, _fSpare);
    CFstringScanner scanner(lexer, &recorder, 0);
    if (!scanner.Scan(pos + start.ContentOffset(), start).is_closed) recorder.GiveUp();

    if (logical.embedded.size() == first_i) return;
    _ReadRows(logical, token);
    for (size_t i = first_i; i < logical.embedded.size(); ++i) {
        _SetPlaces(logical.embedded[i], _PosOf(logical.embedded[i].tokens[0].text));
    }
}

void CEmbeddedFinder::_AddStringHints(CRawLogical& logical) {
    _fHints.clear();
    FindHintStrings(logical.type, logical.tokens, _fHints);
    for (const size_t token_i : _fHints) {
        _ReadRows(logical, logical.tokens[token_i]);
        _AddStringHint(logical, logical.tokens[token_i]);
    }
}

// Hints nest as deep as there are different quotes, which is four at most.
void CEmbeddedFinder::_AddStringHint(CRawLogical& logical, const CRawToken& token) {
    const CStringStart start = ReadStringStart(token.text, 0);
    const size_t content = _PosOf(token.text) + start.ContentOffset();
    const size_t content_end = _PosOf(token.text) + token.text.size() - start.quote_length;
    CRawLogical& hint = _fSpare.AddTo(logical.embedded);
    _CollectTokens(hint.tokens, content, content_end);
    if (hint.tokens.empty()) return logical.embedded.pop_back();
    hint.type = ELogicalType::kStringifiedTypeHint;
    _SetPlaces(hint, content);

    std::vector<size_t> nested;
    FindNestedHintStrings(hint.tokens, nested);
    const std::vector<CRawToken> tokens = nested.empty() ? std::vector<CRawToken>() : hint.tokens;
    for (const size_t token_i : nested) _AddStringHint(logical, tokens[token_i]);
}

void CEmbeddedFinder::_AddCommentHint(CRawLogical& logical, const CRawToken& token) {
    const std::string_view text = HintInComment(token.text);
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
        tokens.push_back({_fText.substr(pos, token.end - pos), {}, token.type});
        pos = token.end;
    }
}

void CEmbeddedFinder::_ReadRows(const CRawLogical& logical, const CRawToken& token) {
    const size_t pos = _PosOf(token.text);
    CPlace place{pos, pos - static_cast<size_t>(token.position.col), 0, 0};
    _fRows.first_row = logical.first_row + token.position.row;
    _fRows.starts.assign(1, place.row_start);
    while (place.pos < pos + token.text.size()) {
        if (SkipRowEnd(_fText, place)) {
            _fRows.starts.push_back(place.row_start);
        } else {
            ++place.pos;
        }
    }
}

CPosition CEmbeddedFinder::_PositionOf(size_t pos) const {
    const auto behind = std::upper_bound(_fRows.starts.begin(), _fRows.starts.end(), pos);
    const auto row_i = static_cast<int32_t>(behind - _fRows.starts.begin()) - 1;
    return {_fRows.first_row + row_i, static_cast<int32_t>(pos - *(behind - 1))};
}

// Sets the origin and, relative to it, the positions of the tokens.
void CEmbeddedFinder::_SetPlaces(CRawLogical& embedded, size_t origin) {
    embedded.origin = _PositionOf(origin);
    embedded.first_row = embedded.origin.row;
    for (CRawToken& token : embedded.tokens) {
        CPosition position = _PositionOf(_PosOf(token.text));
        position.row -= embedded.origin.row;
        if (position.row == 0) position.col -= embedded.origin.col;
        token.position = position;
    }
}

}  // namespace codeloom
