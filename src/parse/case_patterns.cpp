// The patterns of a `case`, by recursive descent over ranges of tokens. Every step decides by the first token
// or by a search outside brackets; what fits nothing fails at its token.
#include "host/errors.h"
#include "host/text.h"
#include "neighbours/token_type.h"
#include "parse/match_case_parser.h"
#include "parse/pseudo_node.h"
#include "tree/expression_nodes.h"
#include "tree/statement_nodes.h"

namespace codeloom {

CNodeRef CMatchCaseStatementParser::_NodeForPattern(Py_ssize_t start_i, Py_ssize_t end_i, bool allow_as) {
    const CRecursionScope recursion;
    const nb::object tok = _Tok(start_i);
    const CUtf8 text(tok);
    const int type = GetTokenType(text);
    if (allow_as && end_i > start_i + 2 && _IsTok(end_i - 2, "as")) return _NodeForCapture(start_i, end_i);
    if (_Find("|", start_i, end_i) != -1) return _NodeForAlternatives(start_i, end_i);
    if (text == "[") return _NodeForSequencePattern(start_i, end_i);
    if (text == "(" && _Find(",", start_i + 1, end_i) != -1) return _NodeForSequencePattern(start_i, end_i);
    if (text == "{") return _NodeForMappingPattern(start_i, end_i);
    if (text == "(") return _NodeForGroup(start_i, end_i);
    if (start_i + 1 == end_i) return _NodeForSingleToken(start_i, type);
    if (_IsSign(start_i) || type == kTokenId_NUMBER) return _NodeForNumberPattern(start_i, end_i);
    if (type == kTokenId_NAME && _Find("(", start_i + 1, end_i) == -1)
        return _NodeForDottedNameValue(start_i, end_i);
    if (type == kTokenId_NAME) return _NodeForClassPattern(start_i, end_i);
    if (text == "*") return _NodeForStar(start_i, end_i);
    _FailAt(start_i);
}

//   case a | b as c:
//        ^^^^^^^^^^
//   a CPatternNode: the pattern, `as`, the name
CNodeRef CMatchCaseStatementParser::_NodeForCapture(Py_ssize_t start_i, Py_ssize_t end_i) {
    const CNodeRef pattern = _NodeForPattern(start_i, end_i - 2, false);
    if (_TokType(end_i - 1) != kTokenId_NAME) _FailAt(end_i - 1);
    return NewPseudoNode<CPatternNode>({pattern, _TokNode(end_i - 2), _TokNode(end_i - 1)});
}

//   case a | b | c:
//        ^^^^^^^^^
//   a CPatternNode: the patterns with the bars between them
CNodeRef CMatchCaseStatementParser::_NodeForAlternatives(Py_ssize_t start_i, Py_ssize_t end_i) {
    std::vector<CNodeRef> children;
    for (Py_ssize_t i = start_i; i < end_i;) {
        const Py_ssize_t bar_i = _FindOrEnd("|", i, end_i);
        children.push_back(_NodeForPattern(i, bar_i, false));
        if (bar_i != end_i) children.push_back(_TokNode(bar_i));
        i = bar_i + 1;
    }
    return NewPseudoNode<CPatternNode>(children);
}

//   case (a | b):
//        ^^^^^^^
//   a CPatternNode: `(`, the pattern, `)`
CNodeRef CMatchCaseStatementParser::_NodeForGroup(Py_ssize_t start_i, Py_ssize_t end_i) {
    const CNodeRef inner = _NodeForPattern(start_i + 1, end_i - 1);
    if (!_IsTok(end_i - 1, ")")) _FailAt(end_i - 1);
    return NewPseudoNode<CPatternNode>({_TokNode(start_i), inner, _TokNode(end_i - 1)});
}

//   case x:   case _:   case None:   case 1:   case "a":
//        ^         ^         ^^^^         ^         ^^^
//   a leaf, with no difference between captures and constants
CNodeRef CMatchCaseStatementParser::_NodeForSingleToken(Py_ssize_t tok_i, int tok_type) {
    const bool is_pattern =
        tok_type == kTokenId_NAME || tok_type == kTokenId_NUMBER || tok_type == kTokenId_STRING;
    if (!is_pattern) _FailAt(tok_i);
    return _TokNode(tok_i);
}

//   case [a, *rest]:
//            ^^^^^
//   a CPatternNode: `*`, the name
CNodeRef CMatchCaseStatementParser::_NodeForStar(Py_ssize_t start_i, Py_ssize_t end_i) {
    const Py_ssize_t name_i = start_i + 1;
    const bool is_named = name_i < _TokCount() && _TokType(name_i) == kTokenId_NAME;
    if (!is_named || name_i + 1 != end_i) _FailAt(start_i);
    return NewPseudoNode<CPatternNode>({_TokNode(start_i), _TokNode(name_i)});
}

//   case -1 + 2j:
//        ^^^^^^^
//   a CPatternNode: a leaf for each token
CNodeRef CMatchCaseStatementParser::_NodeForNumberPattern(Py_ssize_t start_i, Py_ssize_t end_i) {
    std::vector<CNodeRef> children;
    Py_ssize_t i = start_i;
    const auto take = [&] { children.push_back(_TokNode(i++)); };
    const auto take_number = [&] {
        if (_TokType(i) != kTokenId_NUMBER) _FailAt(i);
        take();
    };
    if (_IsSign(i)) take();
    take_number();
    if (_IsSign(i)) {
        take();
        take_number();
    }
    if (i != end_i) _FailAt(i);
    return NewPseudoNode<CPatternNode>(children);
}

//   case a.b.c:
//        ^^^^^
//   a CExpression: a leaf for each token
CNodeRef CMatchCaseStatementParser::_NodeForDottedNameValue(Py_ssize_t start_i, Py_ssize_t end_i) {
    std::vector<CNodeRef> children;
    bool dot_is_due = false;
    for (Py_ssize_t i = start_i; i < end_i; ++i) {
        if (_TokType(i) != (dot_is_due ? kTokenId_DOT : kTokenId_NAME)) _FailAt(i);
        children.push_back(_TokNode(i));
        dot_is_due = !dot_is_due;
    }
    if (!dot_is_due) _FailAt(end_i - 1);
    return NewPseudoNode<CExpression>(children);
}

//   case [a, b]:   case (a, b):
//        ^^^^^^         ^^^^^^
//   a CSequencePatternNode: the bracket, the patterns with the commas, the bracket
CNodeRef CMatchCaseStatementParser::_NodeForSequencePattern(Py_ssize_t start_i, Py_ssize_t end_i) {
    if (start_i + 1 >= end_i) _FailAt(start_i);
    const Py_ssize_t close_i = end_i - 1;
    std::vector<CNodeRef> children = {_TokNode(start_i)};
    for (Py_ssize_t i = start_i + 1; i < close_i;) {
        const Py_ssize_t comma_i = _FindOrEnd(",", i, close_i);
        children.push_back(_NodeForPattern(i, comma_i));
        if (comma_i != close_i) children.push_back(_TokNode(comma_i));
        i = comma_i + 1;
    }
    if (_IsTok(start_i, "[") && !_IsTok(close_i, "]")) _FailAt(close_i);
    if (_IsTok(start_i, "(") && !_IsTok(close_i, ")")) _FailAt(close_i);
    children.push_back(_TokNode(close_i));
    return NewPseudoNode<CSequencePatternNode>(children);
}

//   case {"a": 1, **rest}:
//        ^^^^^^^^^^^^^^^^
//   a CSequencePatternNode: `{`, "a", `:`, 1, `**`, rest, `}`; the commas have no node
CNodeRef CMatchCaseStatementParser::_NodeForMappingPattern(Py_ssize_t start_i, Py_ssize_t end_i) {
    if (start_i + 1 >= end_i) _FailAt(start_i);
    const Py_ssize_t close_i = end_i - 1;
    std::vector<CNodeRef> children = {_TokNode(start_i)};
    Py_ssize_t colon_i = start_i;
    for (Py_ssize_t i = start_i + 1; i < close_i;) {
        const Py_ssize_t comma_i = _FindOrEnd(",", i, close_i);
        if (colon_i != -1) colon_i = _Find(":", i, close_i);  // not stopped by the comma: keys come first
        if (colon_i == -1 && !_IsTok(i, "**")) _FailAt(i);
        if (colon_i != -1) children.push_back(_NodeForPattern(i, colon_i));
        const Py_ssize_t mark_i = colon_i == -1 ? i : colon_i;
        children.push_back(_TokNode(mark_i));
        children.push_back(_NodeForPattern(mark_i + 1, comma_i));
        i = comma_i + 1;
    }
    if (!_IsTok(close_i, "}")) _FailAt(close_i);
    children.push_back(_TokNode(close_i));
    return NewPseudoNode<CSequencePatternNode>(children);
}

//   case Point(0, y=0):
//        ^^^^^^^^^^^^^
//   a CClassPatternNode: the name, `(`, the arguments with the commas; `)` has no node
CNodeRef CMatchCaseStatementParser::_NodeForClassPattern(Py_ssize_t start_i, Py_ssize_t end_i) {
    const Py_ssize_t paren_i = _Find("(", start_i, end_i);
    if (paren_i == -1) _FailAt(start_i);
    std::vector<CNodeRef> children = {_NodeForDottedNameValue(start_i, paren_i), _TokNode(paren_i)};
    for (Py_ssize_t i = paren_i + 1; i < end_i - 1;) {
        const Py_ssize_t comma_i = _Find(",", i, end_i);
        const Py_ssize_t part_end = comma_i == -1 ? end_i - 1 : comma_i;
        children.push_back(_NodeForClassArgument(i, part_end));
        if (comma_i != -1) children.push_back(_TokNode(comma_i));
        i = part_end + 1;
    }
    if (!_IsTok(end_i - 1, ")")) _FailAt(end_i - 1);
    return NewPseudoNode<CClassPatternNode>(children);
}

//   case Point(0, y=0):
//                 ^^^    a CClassArgumentPatternNode: the name, `=`, the pattern
//              ^         a pattern
CNodeRef CMatchCaseStatementParser::_NodeForClassArgument(Py_ssize_t start_i, Py_ssize_t end_i) {
    const Py_ssize_t eq_i = _Find("=", start_i, end_i);
    if (eq_i == -1) return _NodeForPattern(start_i, end_i);
    if (eq_i != start_i + 1) _FailAt(eq_i);
    return NewPseudoNode<CClassArgumentPatternNode>(
        {_TokNode(start_i), _TokNode(eq_i), _NodeForPattern(eq_i + 1, end_i)});
}

}  // namespace codeloom
