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
    CNamePool& names;  // at this text
    int version;       // 312 for 3.12
    int64_t file_id = 0;
};

// Some of the rows that a text has, by their indexes.
struct CSelection {
    size_t first = 0;
    ptrdiff_t step = 1;
    size_t count = 0;

    uint32_t At(size_t i) const { return static_cast<uint32_t>(first + i * static_cast<size_t>(step)); }
};

class CTableBuilder {
  public:
    virtual ~CTableBuilder() = default;
    virtual void Append(const CTextFacts& text, const CSelection& selection) = 0;
    virtual void AppendAll(const CTextFacts& text) = 0;
    // The builder is empty afterwards.
    virtual std::shared_ptr<const CTable> Finish() = 0;
};

// Which columns a table has.
struct CTableForm {
    bool with_file_id = false;  // for the rows of many texts
    bool with_source = true;    // columns that are no more than pieces of the source
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
    std::unique_ptr<CTableBuilder> (*make)(CTableForm form);
    std::vector<CColumnInfo> (*columns)();
};

std::span<const CTableKind> TableKinds();

// Null for a name that no table has.
const CTableKind* FindTable(std::string_view name);

}  // namespace codeloom
