// arrow/: what analyses give as tables in columns, which other libraries take over as they are.
//   in     the CFileAnalysis of one text, or of many one after the other
//   out    a CTable, and its stream of the Arrow C stream interface
//   keeps  nothing
//   start  at TableKinds here for the tables; columns.h says how columns are declared, export.cpp how they
//          leave
#pragma once

#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "arrow/table.h"
#include "file/file_analysis.h"
#include "file/row_index.h"

namespace codeloom {

// A text and what is known of it.
struct CTextFacts {
    std::string_view text;
    const CFileAnalysis& analysis;
    const CRowIndex& rows;
    int version;  // 312 for 3.12
    int64_t file_id = 0;
};

// Some of the rows that a text has, by their indexes.
struct CSelection {
    size_t first = 0;
    ptrdiff_t step = 1;
    size_t count = 0;

    uint32_t At(size_t i) const { return static_cast<uint32_t>(first + i * static_cast<size_t>(step)); }
};

struct CIndexRange {
    uint32_t first = 0;
    uint32_t end = 0;

    bool Has(uint32_t i) const { return first <= i && i < end; }
};

class CTableBuilder {
  public:
    virtual ~CTableBuilder() = default;
    virtual void Append(const CTextFacts& text, const CSelection& selection) = 0;
    virtual void AppendAll(const CTextFacts& text) = 0;
    // What was appended.
    virtual const CTable& Rows() const = 0;
    // Leaves no rows, but the dictionaries, so that further rows go by the same numbers.
    virtual void ClearRows() = 0;
    // The builder is empty afterwards.
    virtual std::shared_ptr<const CTable> Finish() = 0;
};

struct CTableKind {
    struct CColumnInfo {
        std::string name;
        std::string_view meaning;
        bool is_nullable;
        std::string_view type;
    };

    std::string_view name;
    std::string_view meaning;
    // What the analysis must have been made with.
    bool wants_records;
    bool wants_names;
    // The rows of many texts say which one they are of, in a column `file_id`.
    std::unique_ptr<CTableBuilder> (*make)(bool with_file_id);
    std::vector<CColumnInfo> (*columns)();
};

std::span<const CTableKind> TableKinds();

// Null for a name that no table has.
const CTableKind* FindTable(std::string_view name);

}  // namespace codeloom
