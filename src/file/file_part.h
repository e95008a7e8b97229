// A part of a text, from one statement to a later one, each of the module or right in a class of it, so that
// the rest needn't be analysed anew when the part changes.
#pragma once

#include <cstdint>
#include <string_view>

#include "file/file_analysis.h"
#include "rules/text_checker.h"
#include "typing/false_hints.h"

namespace codeloom {

// All that matters of the text before a part.
struct CPartState {
    CCheckState check;
    bool has_print_function = false;
    bool defers_annotations = false;

    bool IsInClass() const { return check.blocks.IsInClass(); }
    bool operator==(const CPartState&) const = default;
};

// Says where a part ends.
class CPartEnd {
  public:
    // The part may end after `line_count` lines, before the row that begins at `start`.
    virtual bool EndsAt(uint32_t start, const CPartState& state, size_t line_count) = 0;

    // The part is analysed once more, from its beginning.
    virtual void Restart() = 0;

  protected:
    ~CPartEnd() = default;
};

// A line with a fault, which may follow from one in another part.
struct CLineFault {
    uint32_t start = 0;  // of its problem
    ECode code = ECode::kInvalidSyntax;
    size_t problem_i = 0;
    CRawLogical line = {};
};

// Places are those in the text.
struct CFilePart {
    CFileAnalysis analysis;  // its problems are in the order in which they were found
    std::vector<CLineFault> faults;
    CProblems late_problems;  // those of declarations, after all others
    uint32_t end = 0;
    CPartState state;  // after it
    // What it says depends on the text up to here: on the line after it, and a row more.
    uint32_t looked_at = 0;
    // Shares of what a whole text may have.
    size_t scanned_in_vain = 0;
    size_t repeated_text = 0;
    bool has_asked_for_literals = false;  // which the whole text says
    std::vector<CBlock> closed;           // blocks, as CBlockTracker gives them
    bool may_have_reopened = false;       // a block, which may have been closed before
    // A declaration concerns other parts, so late problems are to be found from the names of all parts.
    bool declares_for_others = false;
    // The scope around its end, if names are wanted; 1 is the class that it began in.
    uint32_t open_scope = 0;
    // What it says depends on more of the text before than its state: only an analysis of the whole text is
    // right.
    bool needs_whole_text = false;
};

// Requires: as for AnalyzeFile, and `start` is zero or where another part has ended, with its state. Settings
// that ask for records or names aren't regarded. `closed` are the blocks that were closed before, with their
// places in the text; they matter only for a part that may have reopened one.
CFilePart AnalyzePart(std::string_view text, const CFileSettings& settings, CLiteralNames& literal_names,
                      uint32_t start, const CPartState& state, const std::vector<CBlock>& closed,
                      CPartEnd& part_end);

// The same up to a known end, with the records or the names that the settings ask for.
CFilePart AnalyzeKnownPart(std::string_view text, const CFileSettings& settings, CLiteralNames& literal_names,
                           uint32_t start, uint32_t end, const CPartState& state);

// The parts of a text, whose shares come to these sums, say together what AnalyzeFile says.
bool MayBeInParts(size_t text_size, size_t scanned_in_vain, size_t repeated_text);

}  // namespace codeloom
