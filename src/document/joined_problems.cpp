#include "document/joined_problems.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace codeloom {

void CJoinedProblems::Add(const CPiece& piece, uint32_t start) {
    auto fault = piece.faults.begin();
    for (size_t i = 0; i < piece.problems.size(); ++i) {
        CProblem problem = piece.problems[i];
        Move(problem, start);
        const bool is_fault = fault != piece.faults.end() && fault->problem_i == i;
        if (is_fault && _FollowsFromOther(problem, fault++->line, start)) continue;
        _fProblems.push_back(std::move(problem));
    }
}

void CJoinedProblems::AddLate(const CPiece& piece, uint32_t start) {
    for (const CProblem& problem : piece.late_problems) Move(_fLate.emplace_back(problem), start);
}

bool CJoinedProblems::_FollowsFromOther(const CProblem& problem, CRawLogical line, uint32_t start) {
    Move(line, start);
    line.file_text = _fText;
    return _fFollowUps.Take(problem, line, _fProblems);
}

CProblems CJoinedProblems::Take() {
    _fFollowUps.DropInConflicts(_fProblems);
    std::move(_fLate.begin(), _fLate.end(), std::back_inserter(_fProblems));
    SortByPlace(_fProblems);
    return std::move(_fProblems);
}

}  // namespace codeloom
