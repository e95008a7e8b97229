// Faults of lines that follow from one that is marked already, and aren't reported.
//   in     the problem of each line with a fault, in the order of the file
//   out    whether it follows from an earlier one
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "rules/problem.h"
#include "syntax/nodes.h"
#include "tokenizer/raw_logical.h"

namespace codeloom {

class CFollowUps {
  public:
    // True for one that isn't to be reported. `reported` are the problems so far.
    bool Take(const CProblem& problem, const CRawLogical& line, CProblems& reported);

    // Call once, after the last line: drops what lies within conflicts of a merge, whose two versions are
    // both there.
    void DropInConflicts(CProblems& problems) const;

  private:
    // A bracket that its line leaves open, since the line is broken off.
    struct COpen {
        int16_t type;
        uint32_t start;
        int32_t column;  // of its line
        bool is_first;   // it begins the line
    };

    bool _ClosesEarlier(const CProblem& problem, const CRawLogical& line, CProblems& reported);
    bool _EndsTriple(const CProblem& problem, std::string_view text);
    void _NoteOpen(const CRawLogical& line);
    void _NoteConflict(const CProblem& problem, std::string_view text);

    std::vector<COpen> _fOpen;       // the last one last
    std::vector<CSpan> _fConflicts;  // from the first marker of each to the row of the last one
    char _fTripleQuote = 0;          // of a string that wasn't closed
};

}  // namespace codeloom
