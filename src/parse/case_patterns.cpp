// The patterns of a `case` on hosted trees.
#include "host/errors.h"
#include "host/text.h"
#include "parse/match_case_parser.h"
#include "parse/pattern_tokens.h"

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
        case EKind::kToken:
            return work.AddNode(_TokNode(step.start_i));
        case EKind::kTokenBefore:
            return work.AddNodeBeforeLast(_TokNode(step.start_i));
        case EKind::kFail:
            _FailAt(step.start_i);
        case EKind::kBuild:
            return work.Build(step);
        default:
            return TCasePatternPlans(CPatternTokens{*this}).Plan(CPlan(work), step);
    }
}

}  // namespace codeloom
