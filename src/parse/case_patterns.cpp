// The patterns of a `case`, by descent into ranges of tokens. Every step decides by the first token or by a
// search outside brackets, and puts down what the pattern is made of; what fits nothing fails at its token.
#include "host/errors.h"
#include "host/text.h"
#include "parse/match_case_parser.h"
#include "parse/pattern_work.h"
#include "text/token_type.h"
#include "tree/expression_nodes.h"
#include "tree/statement_nodes.h"

namespace codeloom {

using EKind = CPatternStep::EKind;
using CPlan = CPatternWork::CPlan;

// The operations as the host calls them, and as overrides see them. Each does its own work to the end.

CNodeRef CMatchCaseStatementParser::_NodeForPattern(Py_ssize_t start_i, Py_ssize_t end_i, bool allow_as) {
    return _NodeFor({EKind::kPattern, start_i, end_i, allow_as});
}

CNodeRef CMatchCaseStatementParser::_NodeForClassPattern(Py_ssize_t start_i, Py_ssize_t end_i) {
    return _NodeFor({EKind::kClassPattern, start_i, end_i});
}

CNodeRef CMatchCaseStatementParser::_NodeForDottedNameValue(Py_ssize_t start_i, Py_ssize_t end_i) {
    return _NodeFor({EKind::kDottedName, start_i, end_i});
}

CNodeRef CMatchCaseStatementParser::_NodeForNumberPattern(Py_ssize_t start_i, Py_ssize_t end_i) {
    return _NodeFor({EKind::kNumber, start_i, end_i});
}

CNodeRef CMatchCaseStatementParser::_NodeForSequencePattern(Py_ssize_t start_i, Py_ssize_t end_i) {
    return _NodeFor({EKind::kSequence, start_i, end_i});
}

CNodeRef CMatchCaseStatementParser::_NodeForMappingPattern(Py_ssize_t start_i, Py_ssize_t end_i) {
    return _NodeFor({EKind::kMapping, start_i, end_i});
}

CNodeRef CMatchCaseStatementParser::_NodeFor(const CPatternStep& first) {
    const CRecursionScope recursion;  // for overrides, which call one another
    CPatternWork work;
    CMatchCaseStatementParser::DoPatternStep(work, first);
    return _Finish(work);
}

CNodeRef CMatchCaseStatementParser::_Finish(CPatternWork& work) {
    while (!work.IsDone()) DoPatternStep(work, work.TakeStep());
    return work.Result();
}

void CMatchCaseStatementParser::DoPatternStep(CPatternWork& work, const CPatternStep& step) {
    switch (step.kind) {
        case EKind::kPattern:
            return _PlanPattern(CPlan(work), step.start_i, step.end_i, step.allow_as);
        case EKind::kClassPattern:
            return _PlanClassPattern(CPlan(work), step.start_i, step.end_i);
        case EKind::kClassArgument:
            return _PlanClassArgument(CPlan(work), step.start_i, step.end_i);
        case EKind::kDottedName:
            return _PlanDottedNameValue(CPlan(work), step.start_i, step.end_i);
        case EKind::kNumber:
            return _PlanNumberPattern(CPlan(work), step.start_i, step.end_i);
        case EKind::kSequence:
            return _PlanSequencePattern(CPlan(work), step.start_i, step.end_i);
        case EKind::kMapping:
            return _PlanMappingPattern(CPlan(work), step.start_i, step.end_i);
        case EKind::kToken:
            return work.AddNode(_TokNode(step.start_i));
        case EKind::kTokenBefore:
            return work.AddNodeBeforeLast(_TokNode(step.start_i));
        case EKind::kFail:
            _FailAt(step.start_i);
        case EKind::kBuild:
            return work.Build(step);
    }
}

void CMatchCaseStatementParser::_PlanPattern(CPlan&& plan, Py_ssize_t start_i, Py_ssize_t end_i,
                                             bool allow_as) {
    const nb::object tok = _Tok(start_i);
    const CUtf8 text(tok);
    const int type = GetTokenType(text);
    if (allow_as && end_i > start_i + 2 && _IsTok(end_i - 2, "as")) return _PlanCapture(plan, start_i, end_i);
    if (_Find("|", start_i, end_i) != -1) return _PlanAlternatives(plan, start_i, end_i);
    if (text == "[") return plan.Part(EKind::kSequence, start_i, end_i);
    if (text == "(" && _Find(",", start_i + 1, end_i) != -1)
        return plan.Part(EKind::kSequence, start_i, end_i);
    if (text == "{") return plan.Part(EKind::kMapping, start_i, end_i);
    if (text == "(") return _PlanGroup(plan, start_i, end_i);
    if (start_i + 1 == end_i) return _PlanSingleToken(plan, start_i, type);
    if (_IsSign(start_i) || type == kTokenId_NUMBER) return plan.Part(EKind::kNumber, start_i, end_i);
    if (type == kTokenId_NAME && _Find("(", start_i + 1, end_i) == -1)
        return plan.Part(EKind::kDottedName, start_i, end_i);
    if (type == kTokenId_NAME) return plan.Part(EKind::kClassPattern, start_i, end_i);
    if (text == "*") return _PlanStar(plan, start_i, end_i);
    _FailAt(start_i);
}

//   case a | b as c:
//        ^^^^^^^^^^
//   a CPatternNode: the pattern, `as`, the name
void CMatchCaseStatementParser::_PlanCapture(CPlan& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    plan.Pattern(start_i, end_i - 2, false);
    if (_TokType(end_i - 1) != kTokenId_NAME) plan.Fail(end_i - 1);
    plan.Token(end_i - 2);
    plan.Token(end_i - 1);
    plan.Build(&NewPseudoNode<CPatternNode>);
}

//   case a | b | c:
//        ^^^^^^^^^
//   a CPatternNode: the patterns with the bars between them
void CMatchCaseStatementParser::_PlanAlternatives(CPlan& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    for (Py_ssize_t i = start_i; i < end_i;) {
        const Py_ssize_t bar_i = _FindOrEnd("|", i, end_i);
        plan.Pattern(i, bar_i, false);
        if (bar_i != end_i) plan.Token(bar_i);
        i = bar_i + 1;
    }
    plan.Build(&NewPseudoNode<CPatternNode>);
}

//   case (a | b):
//        ^^^^^^^
//   a CPatternNode: `(`, the pattern, `)`
void CMatchCaseStatementParser::_PlanGroup(CPlan& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    plan.Pattern(start_i + 1, end_i - 1);
    if (!_IsTok(end_i - 1, ")")) plan.Fail(end_i - 1);
    plan.TokenBefore(start_i);
    plan.Token(end_i - 1);
    plan.Build(&NewPseudoNode<CPatternNode>);
}

//   case x:   case _:   case None:   case 1:   case "a":
//        ^         ^         ^^^^         ^         ^^^
//   a leaf, with no difference between captures and constants
void CMatchCaseStatementParser::_PlanSingleToken(CPlan& plan, Py_ssize_t tok_i, int tok_type) {
    const bool is_pattern =
        tok_type == kTokenId_NAME || tok_type == kTokenId_NUMBER || tok_type == kTokenId_STRING;
    if (!is_pattern) _FailAt(tok_i);
    plan.Token(tok_i);
}

//   case [a, *rest]:
//            ^^^^^
//   a CPatternNode: `*`, the name
void CMatchCaseStatementParser::_PlanStar(CPlan& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    const Py_ssize_t name_i = start_i + 1;
    const bool is_named = name_i < _TokCount() && _TokType(name_i) == kTokenId_NAME;
    if (!is_named || name_i + 1 != end_i) _FailAt(start_i);
    plan.Token(start_i);
    plan.Token(name_i);
    plan.Build(&NewPseudoNode<CPatternNode>);
}

//   case -1 + 2j:
//        ^^^^^^^
//   a CPatternNode: a leaf for each token
void CMatchCaseStatementParser::_PlanNumberPattern(CPlan&& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    Py_ssize_t i = start_i;
    const auto take = [&] { plan.Token(i++); };
    const auto take_number = [&] {
        const bool is_number = _TokType(i) == kTokenId_NUMBER;
        is_number ? take() : plan.Fail(i);
        return is_number;
    };
    if (_IsSign(i)) take();
    if (!take_number()) return;
    if (_IsSign(i)) {
        take();
        if (!take_number()) return;
    }
    if (i != end_i) return plan.Fail(i);
    plan.Build(&NewPseudoNode<CPatternNode>);
}

//   case a.b.c:
//        ^^^^^
//   a CExpression: a leaf for each token
void CMatchCaseStatementParser::_PlanDottedNameValue(CPlan&& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    bool dot_is_due = false;
    for (Py_ssize_t i = start_i; i < end_i; ++i) {
        if (_TokType(i) != (dot_is_due ? kTokenId_DOT : kTokenId_NAME)) return plan.Fail(i);
        plan.Token(i);
        dot_is_due = !dot_is_due;
    }
    if (!dot_is_due) return plan.Fail(end_i - 1);
    plan.Build(&NewPseudoNode<CExpression>);
}

//   case [a, b]:   case (a, b):
//        ^^^^^^         ^^^^^^
//   a CSequencePatternNode: the bracket, the patterns with the commas, the bracket
void CMatchCaseStatementParser::_PlanSequencePattern(CPlan&& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    if (start_i + 1 >= end_i) _FailAt(start_i);
    const Py_ssize_t close_i = end_i - 1;
    plan.Token(start_i);
    _PlanPatterns(plan, start_i + 1, close_i);
    if (_IsTok(start_i, "[") && !_IsTok(close_i, "]")) plan.Fail(close_i);
    if (_IsTok(start_i, "(") && !_IsTok(close_i, ")")) plan.Fail(close_i);
    plan.Token(close_i);
    plan.Build(&NewPseudoNode<CSequencePatternNode>);
}

void CMatchCaseStatementParser::_PlanPatterns(CPlan& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    for (Py_ssize_t i = start_i; i < end_i;) {
        const Py_ssize_t comma_i = _FindOrEnd(",", i, end_i);
        plan.Pattern(i, comma_i);
        if (comma_i != end_i) plan.Token(comma_i);
        i = comma_i + 1;
    }
}

//   case {"a": 1, **rest}:
//        ^^^^^^^^^^^^^^^^
//   a CSequencePatternNode: `{`, "a", `:`, 1, `**`, rest, `}`; the commas have no node
void CMatchCaseStatementParser::_PlanMappingPattern(CPlan&& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    if (start_i + 1 >= end_i) _FailAt(start_i);
    const Py_ssize_t close_i = end_i - 1;
    plan.Token(start_i);
    Py_ssize_t colon_i = start_i;
    for (Py_ssize_t i = start_i + 1; i < close_i;) {
        const Py_ssize_t comma_i = _FindOrEnd(",", i, close_i);
        if (colon_i != -1) colon_i = _Find(":", i, close_i);  // not stopped by the comma: keys come first
        if (colon_i == -1 && !_IsTok(i, "**")) return plan.Fail(i);
        if (colon_i != -1) plan.Pattern(i, colon_i);
        const Py_ssize_t mark_i = colon_i == -1 ? i : colon_i;
        plan.Token(mark_i);
        plan.Pattern(mark_i + 1, comma_i);
        i = comma_i + 1;
    }
    if (!_IsTok(close_i, "}")) plan.Fail(close_i);
    plan.Token(close_i);
    plan.Build(&NewPseudoNode<CSequencePatternNode>);
}

//   case Point(0, y=0):
//        ^^^^^^^^^^^^^
//   a CClassPatternNode: the name, `(`, the arguments with the commas; `)` has no node
void CMatchCaseStatementParser::_PlanClassPattern(CPlan&& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    const Py_ssize_t paren_i = _Find("(", start_i, end_i);
    if (paren_i == -1) _FailAt(start_i);
    plan.Part(EKind::kDottedName, start_i, paren_i);
    plan.Token(paren_i);
    for (Py_ssize_t i = paren_i + 1; i < end_i - 1;) {
        const Py_ssize_t comma_i = _Find(",", i, end_i);
        const Py_ssize_t part_end = comma_i == -1 ? end_i - 1 : comma_i;
        plan.Part(EKind::kClassArgument, i, part_end);
        if (comma_i != -1) plan.Token(comma_i);
        i = part_end + 1;
    }
    if (!_IsTok(end_i - 1, ")")) plan.Fail(end_i - 1);
    plan.Build(&NewPseudoNode<CClassPatternNode>);
}

//   case Point(0, y=0):
//                 ^^^    a CClassArgumentPatternNode: the name, `=`, the pattern
//              ^         a pattern
void CMatchCaseStatementParser::_PlanClassArgument(CPlan&& plan, Py_ssize_t start_i, Py_ssize_t end_i) {
    const Py_ssize_t eq_i = _Find("=", start_i, end_i);
    if (eq_i == -1) return plan.Pattern(start_i, end_i);
    if (eq_i != start_i + 1) _FailAt(eq_i);
    plan.Token(start_i);
    plan.Token(eq_i);
    plan.Pattern(eq_i + 1, end_i);
    plan.Build(&NewPseudoNode<CClassArgumentPatternNode>);
}

}  // namespace codeloom
