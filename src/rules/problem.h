// rules/: what the interpreter refuses although a line by itself parses, and what is wrong with lines that
// don't.
//   in     logical lines with their trees and faults, in the order of the file
//   out    CProblem: code, bytes, message, related places, hint
//   keeps  the blocks around the line
// One mark per fault: what follows from a fault already marked isn't a problem of its own.
#pragma once

#include <algorithm>
#include <cstdint>
#include <string>
#include <vector>

#include "rules/codes.h"

namespace codeloom {

// Another place that matters to a problem: where the parenthesis was opened, the header that lacks its
// block.
struct CRelated {
    uint32_t start;
    uint32_t end;
    std::string text;
};

struct CProblem {
    ECode code = ECode::kInvalidSyntax;
    uint32_t start = 0;  // bytes of the file; at least one character unless the file ends there
    uint32_t end = 0;
    std::string message;
    std::string hint;  // empty where no usual slip is recognised
    std::vector<CRelated> related;
};

using CProblems = std::vector<CProblem>;

inline void SortByPlace(CProblems& problems) {
    const auto is_before = [](const CProblem& one, const CProblem& other) { return one.start < other.start; };
    if (!std::is_sorted(problems.begin(), problems.end(), is_before))
        std::stable_sort(problems.begin(), problems.end(), is_before);
}

}  // namespace codeloom
