#include "syntax/match_case_parser.h"

#include <array>

#include "syntax/span_parser.h"
#include "tokenizer/match_case.h"

namespace codeloom {

namespace {

// An expression that is valid without the invented parentheses: no comprehension, `yield` or lone star.
bool IsSubject(const CTree& tree, const CTreeNode& node) {
    if (node.Is(ENodeKind::kStar) || node.Is(ENodeKind::kYield) || node.word == EWord::kYield) return false;
    return !node.Is(ENodeKind::kTestList) || !tree.Child(node, 1).Is(ENodeKind::kCompFor);
}

}  // namespace

//   match a, b:
//         ^^^^    parsed as `(a, b)`
//   a kMatch: `match`, the expression, `:`
CParsed CMatchCaseParser::ParseMatch(const CTokenSpan& span) {
    _SetSpan(span);
    if (!_IsStatementOfType(ELogicalType::kMatch)) return {};
    const uint32_t colon_i = _Find(kTokenId_COLON, kFirstAfterWord, _Count());
    if (colon_i == kNone) return {};
    const std::array children = {_Leaf(0), _ParseSubject(), _Leaf(colon_i)};
    return _fParser.Tree().AddParent(ENodeKind::kMatch, 0, _fTokens[0], children);
}

CTreeNode CMatchCaseParser::_ParseSubject() {
    const uint32_t open_i = _fTokens.front(), close_i = _fTokens.back();
    const CTreeNode node = _fParser.ParseInParentheses(_fSpan.Within(open_i + 1, close_i), open_i, close_i);
    const CTree& tree = _fParser.Tree();
    const bool is_checked = _fParser.Language().has_newer_statements;
    if (is_checked && !IsSubject(tree, tree.Child(node, 1))) _FailAt(kFirstAfterWord);
    return _fParser.WithoutParentheses(node);
}

//   case [a, b] if a > b: print(a)
//        ^^^^^^                       a pattern
//               ^^^^^^^^^             an `if` statement without a body
//                         ^^^^^^^^    a statement of its own
//   a kCase: `case`, the pattern, the guard if any, `:`, the body if any
CParsed CMatchCaseParser::ParseCase(const CTokenSpan& span) {
    _SetSpan(span);
    if (!_IsStatementOfType(ELogicalType::kCase)) return {};
    const uint32_t colon_i = _FindCaseColon();
    if (colon_i == kNone) return {};
    const uint32_t if_i = _FindWord(EWord::kIf, kFirstAfterWord, colon_i);
    std::array<CTreeNode, 5> children;
    size_t count = 0;
    children[count++] = _Leaf(0);
    children[count++] = _ParsePattern(kFirstAfterWord, std::min(if_i, colon_i));
    if (if_i != kNone)
        if (const auto guard = _ParseStatement(if_i, colon_i + 1)) children[count++] = *guard;
    children[count++] = _Leaf(colon_i);
    const uint32_t word_i = _fTokens[0];
    if (colon_i + 1 < _Count())  // from here on another statement may be under way in this parser
        if (const auto body = _ParseStatement(colon_i + 1, _Count())) children[count++] = *body;
    return _fParser.Tree().AddParent(ENodeKind::kCase, 0, word_i, std::span(children).first(count));
}

// A part of the line as a statement of its own.
CParsed CMatchCaseParser::_ParseStatement(uint32_t start_i, uint32_t end_i) {
    const uint32_t end = end_i < _Count() ? _fTokens[end_i] : _fSpan.end;
    return _fParser.ParseByGrammar(_fSpan.Within(_fTokens[start_i], end));
}

// `case x if lambda: 1:`, each lambda of a guard has a colon of its own.
uint32_t CMatchCaseParser::_FindCaseColon() const {
    if (!_fParser.Language().has_newer_statements) return _Find(kTokenId_COLON, kFirstAfterWord, _Count());
    int lambda_count = 0;
    uint32_t start_i = kFirstAfterWord;
    for (;;) {
        const uint32_t colon_i = _Find(kTokenId_COLON, start_i, _Count());
        if (colon_i == kNone) return kNone;
        for (uint32_t i = _FindWord(EWord::kLambda, start_i, colon_i); i != kNone;
             i = _FindWord(EWord::kLambda, i + 1, colon_i))
            ++lambda_count;
        if (lambda_count-- == 0) return colon_i;
        start_i = colon_i + 1;
    }
}

// Removed tokens aren't among those of a statement that is read by hand.
void CMatchCaseParser::_SetSpan(const CTokenSpan& span) {
    assert(span.removed.empty());
    _fSpan = span;
    _fSpan.in_async_def = true;  // nothing is refused for where it is
    _fTokens.clear();
    for (uint32_t i = span.start; i < span.end; ++i) {
        const bool is_skipped = span.Token(i).type == kTokenId_COMMENT ||
                                (span.IsPassedOver(i) && i + 1 < span.end && span.ContinuesRow(i));
        if (!is_skipped) _fTokens.push_back(i);
    }
    _FindBracketSteps();
}

void CMatchCaseParser::_FindBracketSteps() {
    _fNext.assign(_Count(), _Count());
    _fOpen.clear();
    for (uint32_t i = 0; i < _Count(); ++i) {
        const int step = DepthStep(_Token(i));
        if (step < 0 && !_fOpen.empty()) {
            _fNext[_fOpen.back()] = i + 1;
            _fOpen.pop_back();
        }
        if (step > 0) _fOpen.push_back(i);
        if (step <= 0) _fNext[i] = i + 1;
    }
}

bool CMatchCaseParser::_IsStatementOfType(ELogicalType type) const {
    const CRawLogical& line = *_fSpan.line;
    const auto tokens = std::span(line.tokens).subspan(_fSpan.start, _fSpan.end - _fSpan.start);
    return FindMatchOrCaseType(tokens, line.file_text) == type;
}

CTreeNode CMatchCaseParser::_Leaf(uint32_t i) const {
    return _fParser.LeafOf(_fSpan, _fTokens[i]);
}

void CMatchCaseParser::_FailAt(uint32_t i) const {
    throw CRefusal{i < _Count() ? _fTokens[i] : _fSpan.tail};
}

template <class IsWanted>
uint32_t CMatchCaseParser::_FindIf(uint32_t from, uint32_t to, IsWanted is_wanted) const {
    uint32_t i = from;
    for (; i < to; i = _fNext[i]) {
        if (is_wanted(_Token(i))) return i;
        if (DepthStep(_Token(i)) < 0) break;
    }
    // After a bracket that the range doesn't open, only what further brackets open is on its level.
    int depth = -1;
    for (++i; i < to; ++i) {
        if (depth == 0 && is_wanted(_Token(i))) return i;
        depth += DepthStep(_Token(i));
    }
    return kNone;
}

uint32_t CMatchCaseParser::_Find(int type, uint32_t from, uint32_t to) const {
    return _FindIf(from, to, [type](const CRawToken& token) { return token.type == type; });
}

uint32_t CMatchCaseParser::_FindWord(EWord word, uint32_t from, uint32_t to) const {
    return _FindIf(from, to, [word](const CRawToken& token) { return token.word == word; });
}

}  // namespace codeloom
