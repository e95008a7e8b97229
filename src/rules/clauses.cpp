// What may follow what in a block: clauses of a statement, cases, what comes after a decorator.
#include <string>
#include <utility>

#include "rules/blocks.h"
#include "rules/patterns.h"

namespace codeloom {

namespace {

std::string Quoted(std::string_view keyword) {
    return std::string("'").append(keyword).append("'");
}

bool IsLoop(EClause clause) {
    return clause == EClause::kFor || clause == EClause::kAsyncFor || clause == EClause::kWhile;
}

constexpr uint32_t BitOf(EClause clause) {
    return uint32_t{1} << static_cast<unsigned>(clause);
}

template <class... Clauses>
constexpr uint32_t BitsOf(Clauses... clauses) {
    return (BitOf(clauses) | ...);
}

// What depends on the statement before it.
constexpr uint32_t kDependOnBefore =
    BitsOf(EClause::kElif, EClause::kElse, EClause::kExcept, EClause::kBareExcept, EClause::kExceptStar,
           EClause::kFinally, EClause::kCase);
// What isn't complete by itself.
constexpr uint32_t kAskForMore = BitsOf(EClause::kTry, EClause::kDecorator);

// What a clause goes on with, for a message.
std::string_view WhatComesBefore(EClause clause) {
    if (clause == EClause::kElif) return "'if'";
    if (clause == EClause::kElse) return "'if', 'for', 'while' or 'try'";
    return "'try'";
}

}  // namespace

// A `try` or a decorator that the end of its block leaves without what belongs to it.
void CBlockTracker::_CheckPending(CBlock& block, uint32_t start, uint32_t end) {
    const CStatementHead previous = std::exchange(block.previous, CStatementHead());
    if (block.may_follow_anything || block.is_unknown || _fHasPlaceProblem) return;
    if (previous.clause == EClause::kTry) {
        CProblem& problem =
            _Report(ECode::kTryWithoutHandler, start, end, "expected 'except' or 'finally' block");
        problem.related.push_back({previous.start, previous.end, "the 'try' that lacks its handler"});
        _fHasPlaceProblem = true;
    } else if (previous.clause == EClause::kDecorator) {
        CProblem& problem = _Report(ECode::kDecoratorWithoutDefinition, start, end,
                                    "expected a function or class definition after the decorator");
        problem.related.push_back({previous.start, previous.end, "the decorator"});
        _fHasPlaceProblem = true;
    }
}

// What later clauses of the statement must know.
void CBlockTracker::_NoteClause(CBlock& block) const {
    switch (_fHead.clause) {
        case EClause::kTry:
            block.bare_except_start = block.bare_except_end = 0;
            break;
        case EClause::kBareExcept:
            block.bare_except_start = _fHead.start;
            block.bare_except_end = _fHead.end;
            break;
        case EClause::kCase:
            block.takes_all = _fTakesAll;
            break;
        case EClause::kElse:
            block.is_of_try = IsHandler(block.previous.clause);
            break;
        default:
            break;
    }
}

// False for most lines: they depend on nothing before them, which in turn asks for nothing.
bool CBlockTracker::_MayBreakClause(const CBlock& block) const {
    return (BitOf(_fHead.clause) & kDependOnBefore) != 0 ||
           (BitOf(block.previous.clause) & kAskForMore) != 0 || block.clause == EClause::kMatch;
}

bool CBlockTracker::_BreaksClause(CBlock& block) {
    _fFollowsUnknown |= _fIsClassUnknown && Depth() == 0;
    const size_t problem_count = _fProblems.size();
    _CheckClause(block);
    return _fProblems.size() > problem_count;
}

void CBlockTracker::_CheckClause(CBlock& block) {
    const EClause clause = _fHead.clause;
    const EClause before = block.previous.clause;
    if (_fIsMidRow || block.may_follow_anything) return;
    if (block.clause == EClause::kMatch && !block.is_unknown && clause != EClause::kCase) {
        CProblem& problem = _Report(ECode::kStatementInMatch, _fHead.start, _fHead.end,
                                    "expected a 'case' block in the 'match' statement");
        problem.related.push_back({block.header.start, block.header.end, "the 'match' statement"});
        return;
    }
    if (clause == EClause::kCase && block.clause != EClause::kMatch && !block.is_unknown) {
        if (_fHead.may_be_annotation) return;
        _Report(ECode::kCaseOutsideMatch, _fHead.start, _fHead.end, "'case' outside a 'match' statement");
        return;
    }
    if (before == EClause::kDecorator && !IsDefinition(clause))
        return _CheckPending(block, _fHead.start, _fHead.end);
    const bool ends_try = IsHandler(clause) || clause == EClause::kFinally;
    if (before == EClause::kTry && !ends_try) return _CheckPending(block, _fHead.start, _fHead.end);
    if (clause == EClause::kCase) return _CheckCase(block);
    if (!IsContinuation(clause)) return;
    if (!_MayFollow(block, clause)) {
        std::string message = Quoted(KeywordOf(clause));
        message += " without a matching ";
        message += WhatComesBefore(clause);
        _Report(ECode::kClauseWithoutStatement, _fHead.start, _fHead.end, std::move(message));
    } else if (IsHandler(clause)) {
        _CheckExcept(block);
    }
}

bool CBlockTracker::_MayFollow(const CBlock& block, EClause clause) const {
    const EClause before = block.previous.clause;
    switch (clause) {
        case EClause::kElif:
            return before == EClause::kIf || before == EClause::kElif;
        case EClause::kElse:
            return before == EClause::kIf || before == EClause::kElif || IsLoop(before) || IsHandler(before);
        case EClause::kFinally:
            return before == EClause::kTry || IsHandler(before) ||
                   (before == EClause::kElse && block.is_of_try);
        default:
            return before == EClause::kTry || IsHandler(before);
    }
}

void CBlockTracker::_CheckCase(CBlock& block) {
    const CSpan name = std::exchange(block.takes_all, {});
    if (name.start == name.end) return;
    CProblem& problem = _Report(ECode::kPatternsUnreachable, name.start, name.end,
                                WordsOfUnreachable(_fText.substr(name.start, name.end - name.start)));
    problem.related.push_back({_fHead.start, _fHead.end, "a case after it"});
}

void CBlockTracker::_CheckExcept(CBlock& block) {
    const EClause before = block.previous.clause;
    if (!IsHandler(before)) return;
    if ((before == EClause::kExceptStar) != (_fHead.clause == EClause::kExceptStar)) {
        CProblem& problem = _Report(ECode::kMixedExceptKinds, _fHead.start, _fHead.end,
                                    "cannot have both 'except' and 'except*' on the same 'try'");
        problem.related.push_back({block.previous.start, block.previous.end, "the other kind"});
    } else if (block.bare_except_end > block.bare_except_start) {
        CProblem& problem = _Report(ECode::kBareExceptNotLast, block.bare_except_start, block.bare_except_end,
                                    "default 'except:' must be last");
        problem.related.push_back({_fHead.start, _fHead.end, "a handler after it"});
        block.bare_except_start = block.bare_except_end;
    }
}

}  // namespace codeloom
