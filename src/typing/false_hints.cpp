#include "typing/false_hints.h"

#include <algorithm>

#include "text/token_type.h"
#include "text/white_space.h"
#include "tokenizer/comment_hint.h"
#include "typing/prose.h"

namespace codeloom {

namespace {

constexpr std::string_view kLiteral = "Literal";

// The name in ` as name` at `pos`; empty where there is none.
std::string_view NameAfterAs(std::string_view text, size_t pos) {
    const size_t as = SkipSpace(text, pos);
    if (as == pos || !text.substr(as).starts_with("as")) return {};
    const size_t name = SkipSpace(text, as + 2);
    return name == as + 2 ? std::string_view() : text.substr(name, WordEnd(text, name) - name);
}

// `(int) -> str` and not `() -> str` or `(...) -> str`.
bool HasArguments(std::string_view hint) {
    if (!hint.starts_with('(')) return false;
    const std::string_view first = hint.substr(SkipSpace(hint, 1));
    return !first.starts_with(')') && !first.starts_with("...");
}

// The stars of parameters, which are first within the parentheses or after a comma.
void BlankStars(std::string& hint) {
    int depth = 0;
    char last = '\0';
    for (char& c : hint) {
        depth += (ByteKind(c) == EByteKind::kOpener) - (ByteKind(c) == EByteKind::kCloser);
        if (c == '*' && depth == 1 && (last == '(' || last == ',')) {
            c = ' ';
        } else if (!IsSpaceCode(static_cast<unsigned char>(c))) {
            last = c;
        }
        if (depth == 0 && c == ')') return;
    }
}

bool EndsWithArrow(std::string_view text) {
    return WithoutSpaceAtEnd(text).ends_with("->");
}

// The parentheses of `-> (bool)`; a tuple needs its own.
void BlankBracketsOfResult(std::string& hint) {
    const size_t end = EndBeforeSpace(hint, hint.size());
    if (end == 0 || hint[end - 1] != ')') return;
    const size_t open = std::string_view(hint).substr(0, end - 1).find_last_of("(),");
    if (open == std::string::npos || hint[open] != '(' ||
        !EndsWithArrow(std::string_view(hint).substr(0, open)))
        return;
    hint[open] = hint[end - 1] = ' ';
}

// `-> ...` says nothing, and the trees of 2.7 have no place for it.
void BlankDotsAsResult(std::string& hint) {
    const std::string_view shown = WithoutSpaceAtEnd(hint);
    if (!shown.ends_with("...")) return;
    const std::string_view before = WithoutSpaceAtEnd(shown.substr(0, shown.size() - 3));
    if (before.ends_with("->"))
        std::fill(hint.begin() + static_cast<std::ptrdiff_t>(before.size()) - 2, hint.end(), ' ');
}

}  // namespace

void CFalseHints::BeginLine(const CRawLogical& line) {
    _fLine = &line;
    _fPassedCount = 0;
    _fOpenNames.clear();
}

bool CFalseHints::IsFalseInComment(std::string_view hint) const {
    if (IsIgnoreWithMore(hint) || IsProseInComment(hint)) return true;
    return HasArguments(WithoutSpaceAround(hint)) && _TakesNothing();
}

void CFalseHints::MakeReadable(std::string& hint) {
    if (ByteAt(hint, SkipSpace(hint, 0)) != '(') return;
    BlankStars(hint);
    BlankBracketsOfResult(hint);
    BlankDotsAsResult(hint);
}

// The line is a `def` with empty parentheses.
bool CFalseHints::_TakesNothing() const {
    if (_fLine->type != ELogicalType::kFunctionDef) return false;
    const auto& tokens = _fLine->tokens;
    const auto open = std::find_if(tokens.begin(), tokens.end(),
                                   [](const CRawToken& token) { return token.type == kTokenId_LPAR; });
    return open != tokens.end() && open + 1 != tokens.end() && open[1].type == kTokenId_RPAR;
}

bool CFalseHints::IsFalseInQuotes(const CRawLogical& quoted) {
    const uint32_t start = quoted.StartOf(quoted.tokens.front());
    const uint32_t end = quoted.EndOf(quoted.tokens.back());
    return IsProseInQuotes(_fText.substr(start, end - start)) || _IsInLiteral(start);
}

// The byte at `pos` is within a `Literal` under another name.
bool CFalseHints::_IsInLiteral(uint32_t pos) {
    _fHasAskedForLiterals = true;
    const std::unordered_set<std::string_view>& names = _fLiteralNames.Get();
    return !names.empty() && names.contains(_NameBeforeBracketAt(pos));
}

// The token before the innermost bracket around the byte at `pos`; empty where there is none.
std::string_view CFalseHints::_NameBeforeBracketAt(uint32_t pos) {
    const auto& tokens = _fLine->tokens;
    for (; _fPassedCount < tokens.size() && _fLine->StartOf(tokens[_fPassedCount]) < pos; ++_fPassedCount) {
        const EByteKind kind = ByteKind(_fLine->Text(tokens[_fPassedCount]).front());
        if (kind == EByteKind::kOpener) {
            _fOpenNames.push_back(_fPassedCount == 0 ? std::string_view()
                                                     : _fLine->Text(tokens[_fPassedCount - 1]));
        } else if (kind == EByteKind::kCloser && !_fOpenNames.empty()) {
            _fOpenNames.pop_back();
        }
    }
    return _fOpenNames.empty() ? std::string_view() : _fOpenNames.back();
}

// It is three words with white space between them, so three words on either side are looked at.
bool MayNameLiteral(std::string_view text, size_t start, size_t end) {
    const auto is_space = [&](size_t pos) {
        return IsAscii(text[pos]) && IsSpaceCode(static_cast<unsigned char>(text[pos]));
    };
    for (int word = 0; word < 3; ++word) {
        while (start > 0 && is_space(start - 1)) --start;
        while (start > 0 && !is_space(start - 1)) --start;
        while (end < text.size() && is_space(end)) ++end;
        while (end < text.size() && !is_space(end)) ++end;
    }
    return text.substr(start, end - start).find(kLiteral) != std::string_view::npos;
}

const std::unordered_set<std::string_view>& CLiteralNames::Get() {
    if (_fNames) return *_fNames;
    std::unordered_set<std::string_view>& names = _fNames.emplace();
    for (size_t pos = _fText.find(kLiteral); pos != std::string_view::npos;
         pos = _fText.find(kLiteral, pos)) {
        const bool is_word = !EndsInWord(_fText.substr(0, pos));
        pos += kLiteral.size();
        const std::string_view name = NameAfterAs(_fText, pos);
        if (is_word && !name.empty()) names.insert(name);
    }
    return names;
}

}  // namespace codeloom
