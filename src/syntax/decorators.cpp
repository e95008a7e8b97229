// Decorators that are any expression.
#include "syntax/span_parser.h"

namespace codeloom {

//   @a.b(c)    the grammar's
//   @a[0].b    parsed as `(a[0].b)`
//   a kSingleDecorator: `@`, the expression, the end of the row
CParsed CSpanParser::_ParseDecorator(const CTokenSpan& span, uint32_t at_i) {
    if (!_fLanguage.has_newer_statements || _FitsDecoratorRule(span, at_i)) return {};
    const uint32_t expression_i = span.Next(at_i);
    if (expression_i >= span.end) throw CRefusal{span.tail};
    const uint32_t close_i = span.Find(kTokenId_RPAR, at_i + 1, span.end);
    if (close_i != CTokenSpan::kNone) throw CRefusal{close_i};
    const CTreeNode expression =
        WithoutParentheses(ParseInParentheses(span.Within(at_i + 1, span.end), at_i, span.tail));
    _RequireSingle(expression);
    _fForms.Note(forms::kDecorator, expression_i);
    const CTreeNode row_end{CTreeNode::kInventedText, 0, span.tail, kTokenId_NEWLINE};
    const std::array children = {LeafOf(span, at_i), expression, row_end};
    const int rule_number = _fLanguage.grammar->NumberOfRule("decorator");
    return _fTree->AddParent(ENodeKind::kSingleDecorator, static_cast<uint16_t>(rule_number), at_i, children);
}

// `@name.name`, perhaps called: the form that the grammar has a tree for.
bool CSpanParser::_FitsDecoratorRule(const CTokenSpan& span, uint32_t at_i) const {
    uint32_t i = at_i;
    do {
        i = span.Next(i);
        if (!_IsPlainName(span, i)) return false;
        i = span.Next(i);
    } while (span.IsType(i, kTokenId_DOT));
    if (span.IsType(i, kTokenId_LPAR)) {
        i = span.Find(kTokenId_RPAR, i + 1, span.end);
        if (i == CTokenSpan::kNone) return true;  // the grammar says what is wrong
        i = span.Next(i);
    }
    return i >= span.end;
}

}  // namespace codeloom
