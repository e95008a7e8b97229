// A part of a text, wherever it is: all places are counted from its beginning.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "document/piece_records.h"
#include "file/file_part.h"
#include "file/row_index.h"

namespace codeloom {

// What a piece says of names.
struct CPieceNames {
    CTextNames names;
    uint32_t open_scope = 0;  // as CFilePart has it
    CSignatures signatures;
};

struct CPiece {
    // `part` begins at `start` of the text, after `state`.
    CPiece(std::string_view file_text, CFilePart part, uint32_t start, const CPartState& state);
    CPiece(const CPiece&) = delete;
    CPiece& operator=(const CPiece&) = delete;

    uint32_t Length() const { return static_cast<uint32_t>(text.size()); }
    // A piece ends with a row, but for the last one.
    uint32_t RowCount() const { return rows.Count() - 1; }
    bool HasProblems() const { return !problems.empty() || !late_problems.empty(); }

    const std::string text;
    const CRowIndex rows;
    const CPartState state;  // before it
    uint32_t looked_at = 0;
    CProblems problems;
    std::vector<CLineFault> faults;
    CProblems late_problems;
    TPlainArray<CLine> lines;
    size_t scanned_in_vain = 0;
    size_t repeated_text = 0;
    bool has_asked_for_literals = false;
    std::vector<CBlock> closed;
    bool may_have_reopened = false;
    bool declares_for_others = false;
    bool needs_whole_text = false;
    // Once they have been asked for, by the table of that time.
    mutable std::unique_ptr<const CPieceNames> names;
    mutable std::unique_ptr<const CPieceRecords> records;
};

using CPiecePtr = std::shared_ptr<const CPiece>;

void Move(CProblem& problem, uint32_t shift);
void Move(CRawLogical& line, uint32_t shift);
void Move(CBlock& block, uint32_t shift);

// What a part says of names, with places counted from `start`.
std::unique_ptr<const CPieceNames> MakeNames(CFilePart part, uint32_t start);

}  // namespace codeloom
