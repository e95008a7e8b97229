// Fills the columns of a table row by row. What a table is made of is a class Source:
//     using CRow = ...;                                  // a plain struct
//     static const TColumns<CRow>& Columns();
//     static size_t Count(const CFileAnalysis& analysis);
//     explicit Source(const CTextFacts& text);
//     CRow Of(uint32_t i);                               // i < Count(analysis)
#pragma once

#include <algorithm>

#include "arrow/columns.h"
#include "arrow/tables.h"

namespace codeloom {

inline constexpr const char* kFileIdColumn = "file_id";

// Rows in columns.
template <class Row>
class TRows {
  public:
    // `columns` must outlive it.
    TRows(const TColumns<Row>& columns, CTableForm form) : _fWithFileId(form.with_file_id) {
        for (const auto& spec : columns.Specs())
            if (form.with_source || !spec.is_source) _fSpecs.push_back(&spec);
        _Begin();
    }

    void UsePool(CNamePool& pool) {
        for (CTable::CField& field : _fTable.fields) field.column->UsePool(pool);
    }

    void Append(const std::vector<Row>& rows, int64_t file_id) {
        size_t field_i = 0;
        if (_fWithFileId) {
            auto& ids = static_cast<TNumberColumn<int64_t>&>(*_fTable.fields[field_i++].column);
            for (size_t i = 0; i < rows.size(); ++i) ids.Add(file_id);
        }
        for (const auto* spec : _fSpecs) spec->append(*_fTable.fields[field_i++].column, rows);
        _fTable.count += rows.size();
    }

    std::shared_ptr<const CTable> Finish() {
        auto table = std::make_shared<const CTable>(std::move(_fTable));
        _Begin();
        return table;
    }

  private:
    void _Begin() {
        _fTable = {};
        if (_fWithFileId)
            _fTable.fields.push_back({kFileIdColumn, false, std::make_unique<TNumberColumn<int64_t>>()});
        for (const auto* spec : _fSpecs)
            _fTable.fields.push_back({spec->name, spec->is_nullable, spec->make()});
    }

    const bool _fWithFileId;
    std::vector<const TColumnSpec<Row>*> _fSpecs;
    CTable _fTable;
};

template <class Source>
class TTableBuilder final : public CTableBuilder {
  public:
    explicit TTableBuilder(CTableForm form) : _fTable(Source::Columns(), form) {}

    void Append(const CTextFacts& text, const CSelection& selection) override {
        Source source(text);
        _fTable.UsePool(text.names);
        for (size_t done = 0; done < selection.count; done += _fRows.size()) {
            _fRows.clear();
            const size_t end = std::min(selection.count, done + kMostRows);
            for (size_t i = done; i < end; ++i) _fRows.push_back(source.Of(selection.At(i)));
            _fTable.Append(_fRows, text.file_id);
        }
    }

    void AppendAll(const CTextFacts& text) override { Append(text, {0, 1, Source::Count(text.analysis)}); }

    std::shared_ptr<const CTable> Finish() override { return _fTable.Finish(); }

  private:
    // As many as stay in the processor's cache while they are put into columns.
    static constexpr size_t kMostRows = 256;

    TRows<typename Source::CRow> _fTable;
    std::vector<typename Source::CRow> _fRows;
};

// The name of a column's type, for people.
inline std::string_view TypeNameOf(const CColumn& column) {
    if (column.Dictionary() != nullptr) return "dictionary";
    switch (column.Format()[0]) {
        case 'l':
            return "int64";
        case 'i':
            return "int32";
        case 'b':
            return "bool";
        default:
            return "string";
    }
}

template <class Row>
std::vector<CTableKind::CColumnInfo> ColumnInfosOf(const TColumns<Row>& columns) {
    std::vector<CTableKind::CColumnInfo> infos;
    for (const auto& spec : columns.Specs())
        infos.push_back({spec.name, spec.meaning, spec.is_nullable, TypeNameOf(*spec.make())});
    return infos;
}

template <class Source>
CTableKind TableKindOf(std::string_view name, std::string_view meaning, bool wants_records,
                       bool wants_names) {
    return {name,
            meaning,
            wants_records,
            wants_names,
            [](CTableForm form) -> std::unique_ptr<CTableBuilder> {
                return std::make_unique<TTableBuilder<Source>>(form);
            },
            [] { return ColumnInfosOf(Source::Columns()); }};
}

}  // namespace codeloom
