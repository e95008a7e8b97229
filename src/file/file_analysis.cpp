#include "file/file_analysis.h"

#include <algorithm>

namespace codeloom {

uint32_t CFileAnalysis::LineOfRecord(uint32_t record_i) const {
    const auto next = std::upper_bound(lines.begin(), lines.end(), record_i,
                                       [](uint32_t i, const CLine& line) { return i < line.first_record; });
    return static_cast<uint32_t>(next - lines.begin()) - 1;
}

std::optional<uint32_t> CFileAnalysis::LineAt(uint32_t offset) const {
    if (lines.empty()) return std::nullopt;
    const auto after = std::upper_bound(lines.begin() + 1, lines.end(), offset,
                                        [](uint32_t place, const CLine& line) { return place < line.start; });
    return static_cast<uint32_t>(after - lines.begin()) - 1;
}

uint32_t FirstProblemFrom(const CProblems& problems, uint32_t start) {
    const auto first =
        std::lower_bound(problems.begin(), problems.end(), start,
                         [](const CProblem& problem, uint32_t offset) { return problem.start < offset; });
    return static_cast<uint32_t>(first - problems.begin());
}

}  // namespace codeloom
