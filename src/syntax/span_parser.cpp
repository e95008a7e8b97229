#include "syntax/span_parser.h"

namespace codeloom {

CSpanParser::CSpanParser(const CLanguage& language)
    : _fLanguage(language),
      _fForms(language.forms_version),
      _fStatementParser(language, _fForms),
      _fMatchCaseParser(*this) {}

CParsed CSpanParser::_ParseAfterRefusal(const CTokenSpan& span, uint32_t token_i) {
    const bool may_be_alias =
        _fLanguage.has_newer_statements && span.IsWord(span.Previous(token_i), EWord::kType);
    if (!may_be_alias) return _ParseNewestForms(span, token_i);
    const std::vector<CTokenRange> ranges = _RangesOfAliases(span);
    return _fStatementParser.Parse(span.Without(ranges), *_fTree);
}

CParsed CSpanParser::_ParseNewestForms(const CTokenSpan& span, uint32_t token_i) {
    const bool is_met = span.IsWord(token_i, EWord::kFor) || span.IsWord(token_i, EWord::kAsync) ||
                        span.IsWord(span.Previous(token_i), EWord::kLazy);
    if (!is_met || !span.removed.empty() || !_fLanguage.has_newer_statements) throw CRefusal{token_i};
    const std::vector<CTokenRange> ranges = _RangesOfNewestForms(span);
    if (ranges.empty()) throw CRefusal{token_i};
    return _fStatementParser.Parse(span.Without(ranges), *_fTree);
}

// In Python 2 each of the words may be a name, and parentheses after `with` are part of an expression.
CParsed CSpanParser::_ParseBeyondGrammar(const CTokenSpan& span, uint32_t i) {
    if (_fLanguage.has_newer_statements) return _ParseUnusual(span, i);
    return _ParseOrByGrammar(span, [&] { return _ParseUnusual(span, i); });
}

// What the grammar takes isn't refused.
template <class TParse>
CParsed CSpanParser::_ParseOrByGrammar(const CTokenSpan& span, TParse parse) {
    try {
        return parse();
    } catch (const CRefusal&) {
        try {
            return ParseByGrammar(span);
        } catch (const CRefusal&) {  // the first one counts
        }
        throw;
    }
}

// None when the grammar takes the statement that begins at `i`.
CParsed CSpanParser::_ParseUnusual(const CTokenSpan& span, uint32_t i) {
    switch (span.Token(i).word) {
        case EWord::kWith:
            return _ParseWith(span, i);
        case EWord::kExcept:
            return _ParseExcept(span, i);
        case EWord::kMatch:
        case EWord::kCase:
            return _ParseMatchOrCase(span, i);
        case EWord::kType:
        case EWord::kDef:
        case EWord::kClass:
            return _ParseWithTypeParameters(span, i);
        case EWord::kAsync:
            return _ParseAsync(span, i);
        default:
            return span.IsType(i, kTokenId_AT) ? _ParseDecorator(span, i) : CParsed();
    }
}

CParsed CSpanParser::_ParseAsync(const CTokenSpan& span, uint32_t async_i) {
    const uint32_t next_i = span.Next(async_i);
    if (span.IsWord(next_i, EWord::kDef)) return _ParseWithTypeParameters(span, next_i);
    const bool is_with = _fLanguage.has_newer_statements && span.IsWord(next_i, EWord::kWith);
    return is_with ? _ParseWith(span, next_i) : CParsed();
}

CTreeNode CSpanParser::ParseInParentheses(const CTokenSpan& span, uint32_t open_i, uint32_t close_i) {
    const CParsed node = _fStatementParser.ParseInParentheses(span, open_i, close_i, *_fTree);
    if (!node) throw CRefusal{span.tail};
    return *node;
}

CTreeNode CSpanParser::WithoutParentheses(const CTreeNode& node) const {
    const bool has_parentheses = node.child_count == 3 && _fTree->Child(node, 0).symbol == kTokenId_LPAR &&
                                 _fTree->Child(node, 2).symbol == kTokenId_RPAR;
    return has_parentheses ? _fTree->Child(node, 1) : node;
}

CTreeNode CSpanParser::LeafOf(const CTokenSpan& span, uint32_t i) const {
    const CRawToken& token = span.Token(i);
    const CLeafClass& leaf_class = _fLanguage.LeafClasses(false).Of(token);
    return {0, 0, i, leaf_class.symbol, leaf_class.kind, token.word};
}

//   except* ValueError as e:
//         ^                    passed over
CParsed CSpanParser::_ParseExcept(const CTokenSpan& span, uint32_t except_i) {
    if (_fLanguage.has_newer_statements) _RefuseTypesWithTarget(span, except_i);
    const uint32_t star_i = span.Next(except_i);
    if (!span.IsType(star_i, kTokenId_STAR)) return {};
    const uint32_t next_i = span.Next(star_i);
    if (next_i >= span.end || span.IsType(next_i, kTokenId_COLON)) return {};
    const CTokenRange star{star_i, star_i + 1};
    const CParsed node = ParseByGrammar(span.Without({&star, 1}));
    if (node) _fForms.Note(forms::kExceptStar, star_i);
    return node;
}

//   except A, B:         may lack its parentheses
//   except A, B as e:    may not, which the grammar doesn't say
void CSpanParser::_RefuseTypesWithTarget(const CTokenSpan& span, uint32_t except_i) const {
    uint32_t comma_i = CTokenSpan::kNone;
    bool has_target = false;
    ForEachOutsideBrackets(span, except_i + 1, [&](uint32_t i, const CRawToken& token) {
        if (comma_i == CTokenSpan::kNone && token.type == kTokenId_COMMA) comma_i = i;
        has_target = token.word == EWord::kAs;
        return !has_target && token.type != kTokenId_COLON;
    });
    if (comma_i != CTokenSpan::kNone && has_target) throw CRefusal{comma_i};
}

CParsed CSpanParser::_ParseMatchOrCase(const CTokenSpan& span, uint32_t word_i) {
    if (!_fLanguage.has_newer_statements) return _ParseMatchOrCaseAlone(span, word_i);
    const bool may_be_name = span.IsType(span.Next(word_i), kTokenId_LSQB);
    if (may_be_name && _fLanguage.forms_version < forms::kCase.version) {
        // An annotation, unless a block follows.
        try {
            return ParseByGrammar(span);
        } catch (const CRefusal&) {
        }
    }
    // `case[x + 1]: int` looks like a case whose pattern is bad. It may be the annotation of a name.
    const CParsed node = may_be_name
                             ? _ParseOrByGrammar(span, [&] { return _ParseMatchOrCaseAlone(span, word_i); })
                             : _ParseMatchOrCaseAlone(span, word_i);
    if (node && node->Is(ENodeKind::kMatch)) _fForms.Note(forms::kMatch, word_i);
    if (node && node->Is(ENodeKind::kCase)) _fForms.Note(forms::kCase, word_i);
    return node;
}

CParsed CSpanParser::_ParseMatchOrCaseAlone(const CTokenSpan& span, uint32_t word_i) {
    return span.IsWord(word_i, EWord::kMatch) ? _fMatchCaseParser.ParseMatch(span)
                                              : _fMatchCaseParser.ParseCase(span);
}

// Refuses what makes more of a node than one expression: a comma, a comprehension, `=`, `yield`, `*`.
void CSpanParser::_RequireSingle(const CTreeNode& node) const {
    const bool is_list = node.Is(ENodeKind::kTestList) || !node.Is(ENodeKind::kExpression);
    if (is_list) throw CRefusal{node.IsLeaf() ? node.token : _fTree->Child(node, 1).token};
    if (node.Is(ENodeKind::kStar) || node.Is(ENodeKind::kYield) || node.word == EWord::kYield)
        throw CRefusal{node.token};
}

// A name that isn't a keyword.
bool CSpanParser::_IsPlainName(const CTokenSpan& span, uint32_t i) const {
    return span.IsName(i) && !_fLanguage.IsKeyword(span.Token(i).word);
}

}  // namespace codeloom
