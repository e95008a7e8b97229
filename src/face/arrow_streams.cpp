#include "face/arrow_streams.h"

#include <nanobind/stl/string_view.h>

#include "arrow/batch.h"
#include "host/errors.h"
#include "host/refuse_new.h"

using namespace nb::literals;

namespace codeloom {

namespace {

void FreeStream(void* pointer) noexcept {
    const std::unique_ptr<ArrowArrayStream> stream(static_cast<ArrowArrayStream*>(pointer));
    if (stream->release != nullptr) stream->release(stream.get());
}

const CFileAnalysis& AnalysisFor(const CSourceFile& file, const CTableKind& kind) {
    if (kind.wants_names) return file.WithNames();
    return kind.wants_records ? file.WithRecords() : file.Analysis();
}

// The rows of a table, by a function of its builder.
template <class Append>
std::shared_ptr<const CTable> Built(const CSourceFile& file, const CTableKind& kind, Append append) {
    const CFileAnalysis& analysis = AnalysisFor(file, kind);
    CNamePool names(kind.wants_names ? *analysis.names.occurrences.names : *analysis.records.names);
    const std::unique_ptr<CTableBuilder> builder = kind.make({});
    append(*builder, CTextFacts{file.Text(), analysis, file.Rows(), names, file.Version()});
    return builder->Finish();
}

nb::list ColumnsOf(const std::vector<CTableKind::CColumnInfo>& infos) {
    nb::list columns;
    for (const CTableKind::CColumnInfo& column : infos)
        columns.append(nb::make_tuple(column.name.c_str(), column.type, column.is_nullable, column.meaning));
    return columns;
}

}  // namespace

const CTableKind& TableKindNamed(std::string_view name) {
    if (const CTableKind* kind = FindTable(name)) return *kind;
    std::string message = "no table is called '" + std::string(name) + "'; there are";
    const char* before = " ";
    for (const CTableKind& kind : TableKinds()) {
        message.append(before).append(kind.name);
        before = ", ";
    }
    RaiseHost(PyExc_ValueError, message.c_str());
}

nb::object StreamCapsule(std::shared_ptr<const CTable> table) {
    auto stream = std::make_unique<ArrowArrayStream>();
    ExportStream(std::move(table), *stream);
    return nb::capsule(stream.release(), kArrowStreamCapsule, FreeStream);
}

nb::object StreamOfRows(const CSourceFile& file, const char* table, const CSelection& selection) {
    const auto append = [&](CTableBuilder& builder, const CTextFacts& text) {
        builder.Append(text, selection);
    };
    return StreamCapsule(Built(file, *FindTable(table), append));
}

CHostTable TableOf(const CSourceFile& file, std::string_view name) {
    const CTableKind& kind = TableKindNamed(name);
    const auto append = [](CTableBuilder& builder, const CTextFacts& text) { builder.AppendAll(text); };
    return {kind.name, Built(file, kind, append)};
}

void BindTables(nb::module_& module) {
    nb::class_<CHostTable> table(module, "Table",
                                 "Rows in columns. Libraries that know the Arrow C stream interface take it "
                                 "as it is: `pyarrow.table(t)`, `polars.DataFrame(t)`.",
                                 nb::type_slots(kNotMadeByHost));
    table.def_prop_ro("name", [](const CHostTable& self) { return self.name; }, "Such as \"lines\".");
    table.def_prop_ro(
        "column_names",
        [](const CHostTable& self) {
            nb::list names;
            for (const CTable::CField& field : self.table->fields) names.append(field.name.c_str());
            return nb::tuple(names);
        },
        nb::sig("def column_names(self) -> tuple[str, ...]"), "The names of its columns.");
    table.def("__len__", [](const CHostTable& self) { return self.table->count; });
    table.def(
        "__arrow_c_stream__", [](const CHostTable& self, nb::handle) { return StreamCapsule(self.table); },
        "requested_schema"_a.none() = nb::none(),
        nb::sig("def __arrow_c_stream__(self, requested_schema: object = None) -> object"),
        "The table as a stream of one batch. No other schema is made on request.");
    table.def("__repr__", [](const CHostTable& self) {
        return nb::str("<Table {}: {}>").format(self.name, self.table->count);
    });
    module.def(
        "table_kinds",
        [] {
            nb::list kinds;
            for (const CTableKind& kind : TableKinds())
                kinds.append(nb::make_tuple(kind.name, kind.meaning, ColumnsOf(kind.columns())));
            return kinds;
        },
        nb::sig("def table_kinds() -> list[tuple[str, str, list[tuple[str, str, bool, str]]]]"),
        "For each table its name, its meaning and its columns: name, type, whether it may hold nulls, "
        "meaning.");
    module.def(
        "file_columns", [] { return ColumnsOf(FileColumnInfos()); },
        nb::sig("def file_columns() -> list[tuple[str, str, bool, str]]"),
        "The same for the columns of the table `files`, which only a batch has.");
}

}  // namespace codeloom
