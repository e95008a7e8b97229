// file/: a text through the whole road in one pass.
//   in     UTF-8 bytes, settings, and what of them was no text
//   out    a CFileAnalysis: problems, lines, records, names and limits, each with the bytes of the text it is
//          about
//   keeps  nothing
//   start  at AnalyzeFile in file/file_analyzer.h
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string_view>
#include <vector>

#include "file/time_limit.h"
#include "line/line_analyzer.h"
#include "names/records.h"
#include "rules/problem.h"
#include "scopes/text_names.h"
#include "signatures/signatures.h"
#include "syntax/language.h"
#include "text/plain_array.h"
#include "tokenizer/logical_types.h"

namespace codeloom {

struct CFileSettings {
    int version = CLanguage::kNewest;
    bool false_hints = false;  // take all that looks like a type hint for one
    bool wants_records = true;
    const CTimeLimit* time_limit = nullptr;  // none unless given
    bool wants_names = false;                // occurrences, scopes, signatures and hints
    // Gets the names of the text; null for a table of its own. Not for two threads at once.
    std::shared_ptr<CNameTable> names;
};

// A logical line: from its first token to the end of its last one, a comment at its end included.
struct CLine {
    uint32_t start = 0;
    uint32_t end = 0;
    uint32_t first_record = 0;  // up to the first record of the next line
    ELogicalType type = ELogicalType::kUnknown;
};

// A line whose walk ended early; it has the records that were found before.
struct CLineLimit {
    uint32_t line = 0;
    ELimit limit = ELimit::kNone;
};

struct CFileAnalysis {
    bool is_cut = false;  // the pass met its time limit, and there is nothing else
    CProblems problems;   // by their place
    TPlainArray<CLine> lines;
    CRecords records;  // empty unless the settings ask for them
    std::vector<CLineLimit> limits;
    CTextNames names;  // empty unless the settings ask for them, as are the next ones
    CSignatures signatures;

    // The records of a line are those from FirstRecord(line_i) up to FirstRecord(line_i + 1).
    uint32_t FirstRecord(size_t line_i) const {
        return line_i < lines.size() ? lines[line_i].first_record
                                     : static_cast<uint32_t>(records.records.size());
    }
    uint32_t LineOfRecord(uint32_t record_i) const;
    // The line that holds a place, or the one before it; none in a text without lines.
    std::optional<uint32_t> LineAt(uint32_t offset) const;
};

// The index of the first problem that begins at the byte or after it.
uint32_t FirstProblemFrom(const CProblems& problems, uint32_t start);

}  // namespace codeloom
