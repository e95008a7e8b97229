// `with` statements whose items are in parentheses.
#include "syntax/span_parser.h"

namespace codeloom {

namespace {

// What is in the parentheses after a `with`.
struct CWithContents {
    bool has_target = false;  // `a as b`, which no expression has
    bool are_items = false;   // without a target, expressions with commas between them
};

CWithContents ReadWithContents(const CTokenSpan& span) {
    CWithContents contents;
    bool is_item_start = true, is_expression = false;
    ForEachOutsideBrackets(span, span.start, [&](uint32_t, const CRawToken& token) {
        contents.are_items = true;
        contents.has_target |= token.word == EWord::kAs;
        is_expression |= token.word == EWord::kYield || token.word == EWord::kFor ||
                         token.type == kTokenId_COLONEQUAL || (is_item_start && token.type == kTokenId_STAR);
        is_item_start = token.type == kTokenId_COMMA;
        return !contents.has_target;
    });
    contents.are_items &= contents.has_target || !is_expression;
    return contents;
}

//   with a, b,:
//             ^    is within parentheses only, which are off when the grammar reads the items
void RefuseLastComma(const CTokenSpan& span, uint32_t with_i) {
    bool is_after_comma = false;
    ForEachOutsideBrackets(span, with_i + 1, [&](uint32_t i, const CRawToken& token) {
        if (is_after_comma && token.type == kTokenId_COLON) throw CRefusal{i};
        is_after_comma = token.type == kTokenId_COMMA;
        return token.type != kTokenId_COLON;
    });
}

}  // namespace

//   with (open(a) as f, open(b)):
//        ^                     ^     passed over
//   with (a), (b):   with (a)[0]:    with (x := f()) as y:    with (yield):    have none around all items
CParsed CSpanParser::_ParseWith(const CTokenSpan& span, uint32_t with_i) {
    const bool is_newer = _fLanguage.has_newer_statements;
    if (is_newer) RefuseLastComma(span, with_i);
    const uint32_t open_i = span.Next(with_i);
    if (!span.IsType(open_i, kTokenId_LPAR)) return {};
    const uint32_t close_i = span.Find(kTokenId_RPAR, open_i + 1, span.end);
    if (close_i == CTokenSpan::kNone) return {};
    if (is_newer) {
        if (!span.IsType(span.Next(close_i), kTokenId_COLON)) return {};
        const CWithContents contents = ReadWithContents(span.Within(open_i + 1, close_i));
        if (!contents.are_items) return {};
        if (contents.has_target) _fForms.Note(forms::kWithBrackets, open_i);
    }
    const std::array parentheses = {CTokenRange{open_i, open_i + 1}, CTokenRange{close_i, close_i + 1}};
    return ParseByGrammar(span.Without(parentheses));
}

}  // namespace codeloom
