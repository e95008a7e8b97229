#include "face/parquet_part.h"

#include <nanobind/stl/map.h>
#include <nanobind/stl/string.h>
#include <nanobind/stl/vector.h>

#include "host/text.h"

using namespace nb::literals;

namespace codeloom {

CParquetPart::CParquetPart(const std::vector<std::string>& tables, bool false_hints, double max_seconds,
                           std::map<std::string, std::map<std::string, std::string>> notes,
                           nb::callable compress)
    : _fAnalyzer(BatchSettings(tables, false_hints, max_seconds)),
      _fNotes(std::move(notes)),
      _fCompress(std::move(compress)),
      _fFiles(tables.size() + 1) {
    _AddPages();  // so that each file is there, if with no rows
}

std::string CParquetPart::_Compress(std::string_view bytes) const {
    const nb::gil_scoped_acquire acquired;
    const nb::object view = nb::steal(PyMemoryView_FromMemory(
        const_cast<char*>(bytes.data()), static_cast<Py_ssize_t>(bytes.size()), PyBUF_READ));
    if (!view.is_valid()) throw nb::python_error();
    const nb::bytes compressed = nb::cast<nb::bytes>(_fCompress(view));
    return {compressed.c_str(), compressed.size()};
}

void CParquetPart::_AddPages() {
    const auto compress = [this](std::string_view bytes) { return _Compress(bytes); };
    const auto tables = _fAnalyzer.Tables();
    for (size_t i = 0; i < tables.size(); ++i) _fFiles[i].Add(*tables[i].second, compress);
    _fAnalyzer.ClearRows();
}

void CParquetPart::Add(const CSourceBatch& sources) {
    const std::vector<CBatchFile> files = sources.Files();
    const nb::gil_scoped_release released;
    for (const CBatchFile& file : files) _fAnalyzer.Take(file);
    _AddPages();
}

nb::dict CParquetPart::Finish() {
    const auto compress = [this](std::string_view bytes) { return _Compress(bytes); };
    nb::dict by_name;
    for (size_t i = 0; i < _fFiles.size(); ++i) {
        const auto [name, table] = _fAnalyzer.Tables()[i];
        const auto& notes = _fNotes[std::string(name)];
        std::string file;
        {
            const nb::gil_scoped_release released;
            file = _fFiles[i].Finish(*table, {notes.begin(), notes.end()}, compress);
        }
        by_name[nb::str(name.data(), name.size())] = BytesFromUtf8(file);
    }
    return by_name;
}

void BindParquetPart(nb::module_& module) {
    nb::class_<CParquetPart> part(module, "ParquetPart",
                                  "For `codeloom.corpus`: what many sources say, as Parquet files.");
    part.def(nb::init<const std::vector<std::string>&, bool, double,
                      std::map<std::string, std::map<std::string, std::string>>, nb::callable>(),
             "tables"_a, "false_hints"_a, "max_seconds"_a, "notes"_a, "compress"_a,
             nb::sig("def __init__(self, tables: list[str], false_hints: bool, max_seconds: float, notes: "
                     "dict[str, dict[str, str]], compress: typing.Callable[[memoryview], bytes]) -> None"),
             "`notes` are those of each table's file; `compress` is that of Zstandard.");
    part.def("add", &CParquetPart::Add, "sources"_a, "Analyses what was taken of a batch.");
    part.def("finish", &CParquetPart::Finish, nb::sig("def finish(self) -> dict[str, bytes]"),
             "The files by the names of their tables, once.");
}

}  // namespace codeloom
