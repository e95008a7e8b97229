// The patterns of a `case` on plain trees.
#include "syntax/case_pattern_plans.h"
#include "syntax/match_case_parser.h"
#include "syntax/span_parser.h"

namespace codeloom {

// The tokens of the statement as plans of patterns look at them.
struct CMatchCaseParser::CPatternTokens {
    using CIndex = uint32_t;
    using CPlan = CCasePatternWork::CPlan;

    static constexpr uint32_t kNone = CTokenSpan::kNone;
    static constexpr ENodeKind kPattern = ENodeKind::kPattern;
    static constexpr ENodeKind kSequencePattern = ENodeKind::kSequencePattern;
    static constexpr ENodeKind kClassPattern = ENodeKind::kClassPattern;
    static constexpr ENodeKind kClassArgumentPattern = ENodeKind::kClassArgumentPattern;
    static constexpr ENodeKind kExpression = ENodeKind::kExpression;

    const CMatchCaseParser& parser;

    int Type(uint32_t i) const { return parser._Type(i); }
    uint32_t Count() const { return parser._Count(); }
    bool IsAs(uint32_t i) const { return parser._Token(i).word == EWord::kAs; }
    uint32_t Find(const CPatternMark& mark, uint32_t start_i, uint32_t end_i) const {
        return parser._Find(mark.type, start_i, end_i);
    }
    [[noreturn]] void FailAt(uint32_t i) const { parser._FailAt(i); }
};

CTreeNode CMatchCaseParser::_ParsePattern(uint32_t start_i, uint32_t end_i) {
    _fWork.Begin({EKind::kPattern, start_i, end_i});
    while (!_fWork.IsDone()) _DoStep(_fWork.TakeStep());
    return _fWork.Result();
}

void CMatchCaseParser::_DoStep(const CCasePatternStep& step) {
    switch (step.kind) {
        case EKind::kToken:
            if (_Token(step.start_i).word != EWord::kAs) _RefuseKeyword(step.start_i);
            return _fWork.AddNode(_Leaf(step.start_i));
        case EKind::kTokenBefore:
            return _fWork.AddNodeBeforeLast(_Leaf(step.start_i));
        case EKind::kFail:
            _FailAt(step.start_i);
        case EKind::kBuild:
            return _fWork.Build(step, _fParser.Tree());
        case EKind::kPattern:
            if (_fParser.Language().has_newer_statements && _PlanNewerPattern(step)) return;
            [[fallthrough]];
        default:
            return TCasePatternPlans(CPatternTokens{*this}).Plan(CPlan(_fWork), step);
    }
}

// The patterns of the newer versions; false for the others.
bool CMatchCaseParser::_PlanNewerPattern(const CCasePatternStep& step) {
    _RefuseWhatNoPatternIs(step);
    if (_IsOpenSequence(step)) {
        CPlan plan(_fWork);
        TCasePatternPlans(CPatternTokens{*this}).Patterns(plan, step.start_i, step.end_i);
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
    return !TCasePatternPlans(CPatternTokens{*this}).IsCapture(step.start_i, step.end_i, step.allow_as) &&
           _Find(kTokenId_VBAR, step.start_i, step.end_i) == kNone;
}

bool CMatchCaseParser::_IsEmptySequence(const CCasePatternStep& step) const {
    return step.start_i + 2 == step.end_i && _Type(step.start_i) == kTokenId_LPAR &&
           _Type(step.start_i + 1) == kTokenId_RPAR;
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

}  // namespace codeloom
