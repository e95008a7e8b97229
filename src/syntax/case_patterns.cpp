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
    static constexpr uint32_t kFirstAfterWord = CMatchCaseParser::kFirstAfterWord;
    static constexpr ENodeKind kPattern = ENodeKind::kPattern;
    static constexpr ENodeKind kSequencePattern = ENodeKind::kSequencePattern;
    static constexpr ENodeKind kClassPattern = ENodeKind::kClassPattern;
    static constexpr ENodeKind kClassArgumentPattern = ENodeKind::kClassArgumentPattern;
    static constexpr ENodeKind kExpression = ENodeKind::kExpression;
    static constexpr ENodeKind kAtom = ENodeKind::kAtom;

    const CMatchCaseParser& parser;

    int Type(uint32_t i) const { return parser._Type(i); }
    uint32_t Count() const { return parser._Count(); }
    bool IsAs(uint32_t i) const { return parser._Token(i).word == EWord::kAs; }
    uint32_t Find(const CPatternMark& mark, uint32_t start_i, uint32_t end_i) const {
        return parser._Find(mark.type, start_i, end_i);
    }
    void RefuseKeyword(uint32_t i) const { parser._RefuseKeyword(i); }
    [[noreturn]] void FailAt(uint32_t i) const { parser._FailAt(i); }
};

CTreeNode CMatchCaseParser::_ParsePattern(uint32_t start_i, uint32_t end_i) {
    _fWork.Begin({EKind::kPattern, start_i, end_i});
    while (!_fWork.IsDone()) _DoStep(_fWork.TakeStep());
    return _fWork.Result();
}

void CMatchCaseParser::_DoStep(const CCasePatternStep& step) {
    TCasePatternPlans plans(CPatternTokens{*this});
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
            if (_fParser.Language().has_newer_statements && plans.PlanExtended(CPlan(_fWork), step)) return;
            [[fallthrough]];
        default:
            return plans.Plan(CPlan(_fWork), step);
    }
}

void CMatchCaseParser::_RefuseKeyword(uint32_t i) const {
    if (!_fParser.Language().has_newer_statements) return;
    const EWord word = _Token(i).word;
    const bool is_constant = word == EWord::kNoneValue || word == EWord::kTrue || word == EWord::kFalse;
    if (!is_constant && _fParser.Language().IsKeyword(word)) _FailAt(i);
}

}  // namespace codeloom
