#include "syntax/statement_parser.h"

#include <cassert>

namespace codeloom {

namespace {

// How an invented token looks.
using CInvented = CStatementParser::CInvented;
constexpr CInvented kIf{kTokenId_NAME, EWord::kIf}, kTry{kTokenId_NAME, EWord::kTry};
constexpr CInvented kPass{kTokenId_NAME, EWord::kPass}, kFinally{kTokenId_NAME, EWord::kFinally};
constexpr CInvented kDef{kTokenId_NAME, EWord::kDef}, kFunction{kTokenId_NAME};

// True for a token that the grammar doesn't see.
bool IsUnfed(const CTokenSpan& span, uint32_t i) {
    const int type = span.Token(i).type;
    return type == kTokenId_COMMENT || (type == kTokenId_BACKSLASH && span.ContinuesRow(i));
}

// The first token that the grammar sees; `end` when there is none.
uint32_t FindFirst(const CTokenSpan& span) {
    uint32_t i = span.start;
    while (i < span.end && (span.IsRemoved(i) || IsUnfed(span, i))) ++i;
    return i;
}

}  // namespace

CStatementParser::CStatementParser(const CLanguage& language, CFormNotes& forms)
    : _fLanguage(language), _fTableParser(language, forms) {}

CParsed CStatementParser::Parse(const CTokenSpan& span, CTree& tree) {
    _Begin(span, tree);
    const uint32_t first_i = FindFirst(span);
    if (first_i >= span.end && span.tail == 0) return {};
    if (first_i < span.end && _fClasses->Of(span.Token(first_i)).BeginsUnusual())
        return _ParseUnusual(span, first_i, tree);
    _FeedSpan(span, first_i);
    if (_fEndsWithColon) _FeedInvented(kPass, span.tail);
    return _fTableParser.Finish(*_fClasses, span.tail);
}

CParsed CStatementParser::_ParseUnusual(const CTokenSpan& span, uint32_t first_i, CTree& tree) {
    _FeedHead(span, first_i);
    _FeedSpan(span, first_i + 1);
    const bool is_decorator = span.Token(first_i).type == kTokenId_AT;
    if (is_decorator) {
        _FeedInvented({{kTokenId_NEWLINE}, kDef, kFunction, {kTokenId_LPAR}, {kTokenId_RPAR}}, span.tail);
        _FeedInvented({{kTokenId_COLON}, kPass}, span.tail);
    } else {
        if (_fEndsWithColon) _FeedInvented(kPass, span.tail);
        if (span.Token(first_i).word == EWord::kTry)
            _FeedInvented({{kTokenId_NEWLINE}, kFinally, {kTokenId_COLON}, kPass}, span.tail);
    }
    const CParsed statement = _fTableParser.Finish(*_fClasses, span.tail);
    // A decorated statement holds the decorator and an invented function.
    return is_decorator && statement && statement->child_count == 2 ? tree.Child(*statement, 0) : statement;
}

CParsed CStatementParser::ParseInParentheses(const CTokenSpan& span, uint32_t open_i, uint32_t close_i,
                                             CTree& tree) {
    _Begin(span, tree);
    _FeedInvented({kTokenId_LPAR}, open_i);
    _FeedSpan(span, span.start);
    _FeedInvented({kTokenId_RPAR}, close_i);
    return _fTableParser.Finish(*_fClasses, span.tail);
}

void CStatementParser::_Begin(const CTokenSpan& span, CTree& tree) {
    constexpr size_t kMostLeavesOfToken = 3;
    constexpr size_t kMostInvented = 16;
    assert(&tree.Line() == span.line);
    _fTableParser.Begin(kMostLeavesOfToken * (span.end - span.start) + kMostInvented, tree);
    _fClasses = &_fLanguage.LeafClasses(span.in_async_def || _fLanguage.HasAsyncKeywords());
    _fEndsWithColon = false;
}

// The token that begins the statement, with the invented ones before it. `elif` is read as `if` from here on.
void CStatementParser::_FeedHead(const CTokenSpan& span, uint32_t i) {
    switch (span.Token(i).word) {
        case EWord::kElif:
            return _FeedInvented(kIf, i);
        case EWord::kExcept:
        case EWord::kFinally:
            _FeedInvented({kTry, {kTokenId_COLON}, kPass, {kTokenId_NEWLINE}}, i);
            break;
        case EWord::kElse:
            _FeedInvented({kIf, {kTokenId_NUMBER}, {kTokenId_COLON}, kPass, {kTokenId_NEWLINE}}, i);
            break;
        case EWord::kAsync:
            if (span.IsWord(span.Next(i), EWord::kDef)) return _FeedAsync(i);
            break;
        default:
            break;
    }
    _FeedTokens(span, i, i + 1);
}

// Before a `def` it is a keyword in every version that has it.
void CStatementParser::_FeedAsync(uint32_t i) {
    const CLeafClass& async = _fLanguage.LeafClasses(true).OfWord(EWord::kAsync);
    _fTableParser.Feed(async, i, 0);
}

void CStatementParser::_FeedSpan(const CTokenSpan& span, uint32_t from) {
    for (const CTokenRange& range : span.removed) {
        if (range.start > from) _FeedTokens(span, from, range.start);
        if (range.end > from) from = range.end;
    }
    _FeedTokens(span, from, span.end);
}

void CStatementParser::_FeedTokens(const CTokenSpan& span, uint32_t from, uint32_t to) {
    while (from < to) {
        const uint32_t i = _fTableParser.FeedTokens(*_fClasses, from, to);
        if (i > from) _fEndsWithColon = span.Token(i - 1).type == kTokenId_COLON;
        if (i < to) _FeedSpecial(span, i);
        from = i + 1;
    }
}

// A token that is skipped, or not fed as it is.
void CStatementParser::_FeedSpecial(const CTokenSpan& span, uint32_t i) {
    if (_fClasses->Of(span.Token(i)).label == CLeafClass::kThreeDots) {
        for (int dot_i = 0; dot_i < 3; ++dot_i) _FeedInvented({kTokenId_DOT}, i);
    } else if (!IsUnfed(span, i)) {
        throw CRefusal{i};
    }
}

void CStatementParser::_FeedInvented(CInvented token, uint32_t i) {
    const CLeafClass& leaf_class =
        token.word == EWord::kNone ? _fClasses->OfType(token.type) : _fClasses->OfWord(token.word);
    _fTableParser.Feed(leaf_class, i, CTreeNode::kInventedText);
}

void CStatementParser::_FeedInvented(std::initializer_list<CInvented> tokens, uint32_t i) {
    for (const CInvented& token : tokens) _FeedInvented(token, i);
}

}  // namespace codeloom
