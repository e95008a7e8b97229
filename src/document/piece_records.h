// The records of a piece, and those of a text out of them.
#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "file/file_part.h"

namespace codeloom {

// Places, lines and records are counted from the beginning of the piece.
struct CPieceRecords {
    CRecords records;
    std::vector<uint32_t> first_records;  // by line
    std::vector<CLineLimit> limits;
};

// Those of a part that begins at `start`.
std::unique_ptr<const CPieceRecords> MakeRecords(CFilePart part, uint32_t start);

// Appends them for a piece that begins at `start`, whose lines are there already, from `first_line` on.
void AppendRecords(const CPieceRecords& piece, uint32_t start, uint32_t first_line, CFileAnalysis& analysis);

}  // namespace codeloom
