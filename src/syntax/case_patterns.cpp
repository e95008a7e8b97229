// The patterns of a `case`, by descent into ranges of tokens. Every step decides by the first token or by a
// search outside brackets, and puts down what the pattern is made of; what fits nothing fails at its token.
#include "syntax/match_case_parser.h"
#include "syntax/span_parser.h"

namespace codeloom {

CTreeNode CMatchCaseParser::_ParsePattern(uint32_t start_i, uint32_t end_i) {
    _fWork.Begin({EKind::kPattern, start_i, end_i});
    while (!_fWork.IsDone()) _DoStep(_fWork.TakeStep());
    return _fWork.Result();
}

void CMatchCaseParser::_DoStep(const CCasePatternStep& step) {
    const uint32_t start_i = step.start_i, end_i = step.end_i;
    switch (step.kind) {
        case EKind::kPattern:
            if (_fParser.Language().has_newer_statements && _PlanNewerPattern(step)) return;
            return _PlanPattern(CPlan(_fWork), start_i, end_i, step.allow_as);
        case EKind::kClassPattern:
            return _PlanClassPattern(CPlan(_fWork), start_i, end_i);
        case EKind::kClassArgument:
            return _PlanClassArgument(CPlan(_fWork), start_i, end_i);
        case EKind::kDottedName:
            return _PlanDottedName(CPlan(_fWork), start_i, end_i);
        case EKind::kNumber:
            return _PlanNumber(CPlan(_fWork), start_i, end_i);
        case EKind::kSequence:
            return _PlanSequence(CPlan(_fWork), start_i, end_i);
        case EKind::kMapping:
            return _PlanMapping(CPlan(_fWork), start_i, end_i);
        case EKind::kToken:
            if (_Token(start_i).word != EWord::kAs) _RefuseKeyword(start_i);
            return _fWork.AddNode(_Leaf(start_i));
        case EKind::kTokenBefore:
            return _fWork.AddNodeBeforeLast(_Leaf(start_i));
        case EKind::kFail:
            _FailAt(start_i);
        case EKind::kBuild:
            return _fWork.Build(step, _fParser.Tree());
    }
}

// The patterns of the newer versions; false for the others.
bool CMatchCaseParser::_PlanNewerPattern(const CCasePatternStep& step) {
    _RefuseWhatNoPatternIs(step);
    if (_IsOpenSequence(step)) {
        CPlan plan(_fWork);
        _PlanPatterns(plan, step.start_i, step.end_i);
        plan.Build(ENodeKind::kSequencePattern);
        return true;
    }
    if (_BeginsWithStrings(step)) {
        _PlanStrings(CPlan(_fWork), step.start_i, step.end_i);
        return true;
    }
    if (_IsEmptySequence(step)) {
        CPlan(_fWork).Part(EKind::kSequence, step.start_i, step.end_i);
        return true;
    }
    return false;
}

// What follows takes keywords for names, and a bar at the end.
void CMatchCaseParser::_RefuseWhatNoPatternIs(const CCasePatternStep& step) const {
    if (step.start_i + 1 == step.end_i) _RefuseKeyword(step.start_i);
    if (step.start_i + 1 < step.end_i && _Type(step.end_i - 1) == kTokenId_VBAR) _FailAt(step.end_i);
}

void CMatchCaseParser::_RefuseKeyword(uint32_t i) const {
    if (!_fParser.Language().has_newer_statements) return;
    const EWord word = _Token(i).word;
    const bool is_constant = word == EWord::kNoneValue || word == EWord::kTrue || word == EWord::kFalse;
    if (!is_constant && _fParser.Language().IsKeyword(word)) _FailAt(i);
}

// Of the ranges that begin after `case`, the whole pattern is the only one with a comma outside brackets.
bool CMatchCaseParser::_IsOpenSequence(const CCasePatternStep& step) const {
    return step.start_i == kFirstAfterWord && step.allow_as &&
           _Find(kTokenId_COMMA, step.start_i, step.end_i) != kNone;
}

bool CMatchCaseParser::_BeginsWithStrings(const CCasePatternStep& step) const {
    if (step.start_i + 1 >= step.end_i || _Type(step.start_i) != kTokenId_STRING) return false;
    return !_IsCapture(step.start_i, step.end_i, step.allow_as) &&
           _Find(kTokenId_VBAR, step.start_i, step.end_i) == kNone;
}

bool CMatchCaseParser::_IsEmptySequence(const CCasePatternStep& step) const {
    return step.start_i + 2 == step.end_i && _Type(step.start_i) == kTokenId_LPAR &&
           _Type(step.start_i + 1) == kTokenId_RPAR;
}

bool CMatchCaseParser::_IsCapture(uint32_t start_i, uint32_t end_i, bool allow_as) const {
    return allow_as && end_i > start_i + 2 && _Token(end_i - 2).word == EWord::kAs;
}

void CMatchCaseParser::_PlanPattern(CPlan&& plan, uint32_t start_i, uint32_t end_i, bool allow_as) {
    const int type = _Type(start_i);
    if (_IsCapture(start_i, end_i, allow_as)) return _PlanCapture(plan, start_i, end_i);
    if (_Find(kTokenId_VBAR, start_i, end_i) != kNone) return _PlanAlternatives(plan, start_i, end_i);
    if (type == kTokenId_LSQB) return plan.Part(EKind::kSequence, start_i, end_i);
    if (type == kTokenId_LPAR && _Find(kTokenId_COMMA, start_i + 1, end_i) != kNone)
        return plan.Part(EKind::kSequence, start_i, end_i);
    if (type == kTokenId_LBRACE) return plan.Part(EKind::kMapping, start_i, end_i);
    if (type == kTokenId_LPAR) return _PlanGroup(plan, start_i, end_i);
    if (start_i + 1 == end_i) return _PlanSingleToken(plan, start_i);
    if (_IsSign(start_i) || type == kTokenId_NUMBER) return plan.Part(EKind::kNumber, start_i, end_i);
    if (type == kTokenId_NAME && _Find(kTokenId_LPAR, start_i + 1, end_i) == kNone)
        return plan.Part(EKind::kDottedName, start_i, end_i);
    if (type == kTokenId_NAME) return plan.Part(EKind::kClassPattern, start_i, end_i);
    if (type == kTokenId_STAR) return _PlanStar(plan, start_i, end_i);
    _FailAt(start_i);
}

//   case a | b as c:
//        ^^^^^^^^^^
//   a kPattern: the pattern, `as`, the name
void CMatchCaseParser::_PlanCapture(CPlan& plan, uint32_t start_i, uint32_t end_i) {
    plan.Pattern(start_i, end_i - 2, false);
    if (_Type(end_i - 1) != kTokenId_NAME) plan.Fail(end_i - 1);
    plan.Token(end_i - 2);
    plan.Token(end_i - 1);
    plan.Build(ENodeKind::kPattern);
}

//   case a | b | c:
//        ^^^^^^^^^
//   a kPattern: the patterns with the bars between them
void CMatchCaseParser::_PlanAlternatives(CPlan& plan, uint32_t start_i, uint32_t end_i) {
    for (uint32_t i = start_i; i < end_i;) {
        const uint32_t bar_i = _FindOrEnd(kTokenId_VBAR, i, end_i);
        plan.Pattern(i, bar_i, false);
        if (bar_i != end_i) plan.Token(bar_i);
        i = bar_i + 1;
    }
    plan.Build(ENodeKind::kPattern);
}

//   case (a | b):
//        ^^^^^^^
//   a kPattern: `(`, the pattern, `)`
void CMatchCaseParser::_PlanGroup(CPlan& plan, uint32_t start_i, uint32_t end_i) {
    plan.Token(start_i);
    plan.Pattern(start_i + 1, end_i - 1);
    if (_Type(end_i - 1) != kTokenId_RPAR) plan.Fail(end_i - 1);
    plan.Token(end_i - 1);
    plan.Build(ENodeKind::kPattern);
}

//   case x:   case _:   case None:   case 1:   case "a":
//        ^         ^         ^^^^         ^         ^^^
//   a leaf, with no difference between captures and constants
void CMatchCaseParser::_PlanSingleToken(CPlan& plan, uint32_t i) {
    const int type = _Type(i);
    if (type != kTokenId_NAME && type != kTokenId_NUMBER && type != kTokenId_STRING) _FailAt(i);
    plan.Token(i);
}

//   case [a, *rest]:
//            ^^^^^
//   a kPattern: `*`, the name
void CMatchCaseParser::_PlanStar(CPlan& plan, uint32_t start_i, uint32_t end_i) {
    const uint32_t name_i = start_i + 1;
    const bool is_named = name_i < _Count() && _Type(name_i) == kTokenId_NAME;
    if (!is_named || name_i + 1 != end_i) _FailAt(start_i);
    plan.Token(start_i);
    plan.Token(name_i);
    plan.Build(ENodeKind::kPattern);
}

//   case -1 + 2j:
//        ^^^^^^^
//   a kPattern: a leaf for each token
void CMatchCaseParser::_PlanNumber(CPlan&& plan, uint32_t start_i, uint32_t end_i) {
    uint32_t i = start_i;
    const auto take_number = [&] {
        const bool is_number = _Type(i) == kTokenId_NUMBER;
        is_number ? plan.Token(i++) : plan.Fail(i);
        return is_number;
    };
    if (_IsSign(i)) plan.Token(i++);
    if (!take_number()) return;
    if (_IsSign(i)) {
        plan.Token(i++);
        if (!take_number()) return;
    }
    if (i != end_i) return plan.Fail(i);
    plan.Build(ENodeKind::kPattern);
}

//   case a.b.c:
//        ^^^^^
//   a kExpression: a leaf for each token
void CMatchCaseParser::_PlanDottedName(CPlan&& plan, uint32_t start_i, uint32_t end_i) {
    bool dot_is_due = false;
    for (uint32_t i = start_i; i < end_i; ++i) {
        if (_Type(i) != (dot_is_due ? kTokenId_DOT : kTokenId_NAME)) return plan.Fail(i);
        plan.Token(i);
        dot_is_due = !dot_is_due;
    }
    if (!dot_is_due) return plan.Fail(end_i - 1);
    plan.Build(ENodeKind::kExpression);
}

//   case "a" "b":
//        ^^^^^^^
//   a kAtom, as in an expression: a leaf for each string
void CMatchCaseParser::_PlanStrings(CPlan&& plan, uint32_t start_i, uint32_t end_i) {
    for (uint32_t i = start_i; i < end_i; ++i) {
        if (_Type(i) != kTokenId_STRING) _FailAt(i);
        plan.Token(i);
    }
    plan.Build(ENodeKind::kAtom);
}

//   case [a, b]:   case (a, b):
//        ^^^^^^         ^^^^^^
//   a kSequencePattern: the bracket, the patterns with the commas, the bracket
void CMatchCaseParser::_PlanSequence(CPlan&& plan, uint32_t start_i, uint32_t end_i) {
    if (start_i + 1 >= end_i) _FailAt(start_i);
    const uint32_t close_i = end_i - 1;
    const int close_type = _Type(start_i) == kTokenId_LSQB ? kTokenId_RSQB : kTokenId_RPAR;
    plan.Token(start_i);
    _PlanPatterns(plan, start_i + 1, close_i);
    if (_Type(close_i) != close_type) plan.Fail(close_i);
    plan.Token(close_i);
    plan.Build(ENodeKind::kSequencePattern);
}

void CMatchCaseParser::_PlanPatterns(CPlan& plan, uint32_t start_i, uint32_t end_i) {
    for (uint32_t i = start_i; i < end_i;) {
        const uint32_t comma_i = _FindOrEnd(kTokenId_COMMA, i, end_i);
        plan.Pattern(i, comma_i);
        if (comma_i != end_i) plan.Token(comma_i);
        i = comma_i + 1;
    }
}

//   case {"a": 1, **rest}:
//        ^^^^^^^^^^^^^^^^
//   a kSequencePattern: `{`, "a", `:`, 1, `**`, rest, `}`; the commas have no node
void CMatchCaseParser::_PlanMapping(CPlan&& plan, uint32_t start_i, uint32_t end_i) {
    if (start_i + 1 >= end_i) _FailAt(start_i);
    const uint32_t close_i = end_i - 1;
    plan.Token(start_i);
    uint32_t colon_i = start_i;
    for (uint32_t i = start_i + 1; i < close_i;) {
        const uint32_t comma_i = _FindOrEnd(kTokenId_COMMA, i, close_i);
        // Not stopped by the comma: keys come first.
        if (colon_i != kNone) colon_i = _Find(kTokenId_COLON, i, close_i);
        if (colon_i == kNone && _Type(i) != kTokenId_DOUBLESTAR) return plan.Fail(i);
        if (colon_i != kNone) plan.Pattern(i, colon_i);
        const uint32_t mark_i = colon_i == kNone ? i : colon_i;
        plan.Token(mark_i);
        plan.Pattern(mark_i + 1, comma_i);
        i = comma_i + 1;
    }
    if (_Type(close_i) != kTokenId_RBRACE) plan.Fail(close_i);
    plan.Token(close_i);
    plan.Build(ENodeKind::kSequencePattern);
}

//   case Point(0, y=0):
//        ^^^^^^^^^^^^^
//   a kClassPattern: the name, `(`, the arguments with the commas; `)` has no node
void CMatchCaseParser::_PlanClassPattern(CPlan&& plan, uint32_t start_i, uint32_t end_i) {
    const uint32_t paren_i = _Find(kTokenId_LPAR, start_i, end_i);
    if (paren_i == kNone) _FailAt(start_i);
    plan.Part(EKind::kDottedName, start_i, paren_i);
    plan.Token(paren_i);
    for (uint32_t i = paren_i + 1; i < end_i - 1;) {
        const uint32_t comma_i = _Find(kTokenId_COMMA, i, end_i);
        const uint32_t part_end = comma_i == kNone ? end_i - 1 : comma_i;
        plan.Part(EKind::kClassArgument, i, part_end);
        if (comma_i != kNone) plan.Token(comma_i);
        i = part_end + 1;
    }
    if (_Type(end_i - 1) != kTokenId_RPAR) plan.Fail(end_i - 1);
    plan.Build(ENodeKind::kClassPattern);
}

//   case Point(0, y=0):
//                 ^^^    a kClassArgumentPattern: the name, `=`, the pattern
//              ^         a pattern
void CMatchCaseParser::_PlanClassArgument(CPlan&& plan, uint32_t start_i, uint32_t end_i) {
    const uint32_t eq_i = _Find(kTokenId_EQUAL, start_i, end_i);
    if (eq_i == kNone) return plan.Pattern(start_i, end_i);
    if (eq_i != start_i + 1) _FailAt(eq_i);
    plan.Token(start_i);
    plan.Token(eq_i);
    plan.Pattern(eq_i + 1, end_i);
    plan.Build(ENodeKind::kClassArgumentPattern);
}

}  // namespace codeloom
