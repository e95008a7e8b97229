#include "face/file_batch.h"

#include <nanobind/stl/string.h>
#include <nanobind/stl/vector.h>

#include "face/bind_items.h"
#include "face/items.h"
#include "face/plain_file.h"
#include "face/settings.h"

using namespace nb::literals;

namespace codeloom {

namespace {

// What is found in one file; no file where the Python layer has to read it.
struct CReadFile {
    std::optional<CPlainFile> file;
    std::shared_ptr<const CFileAnalysis> analysis;
};

// The path as the system takes it; empty for one that it can't take.
std::string SystemPath(nb::handle path) {
    const nb::object encoded = nb::steal(PyUnicode_EncodeFSDefault(path.ptr()));
    if (!encoded.is_valid()) {
        PyErr_Clear();
        return {};
    }
    const nb::bytes bytes = nb::borrow<nb::bytes>(encoded);
    std::string text(bytes.c_str(), bytes.size());
    return text.find('\0') == std::string::npos ? text : std::string();
}

CReadFile Read(const std::string& path, const CFileSettings& settings) {
    CReadFile read;
    if (!path.empty()) read.file = ReadPlainFile(path.c_str());
    if (read.file)
        read.analysis = std::make_shared<const CFileAnalysis>(AnalyzeFile(read.file->Text(), settings, {}));
    return read;
}

std::vector<CReadFile> ReadEach(const std::vector<std::string>& paths, const CFileSettings& settings) {
    CSourceFile::MakeLanguages(settings.version);
    const nb::gil_scoped_release released;
    std::vector<CReadFile> files;
    files.reserve(paths.size());
    for (const std::string& path : paths) files.push_back(Read(path, settings));
    return files;
}

nb::object AnalysisOf(CReadFile& read, const nb::str& path, const nb::str& python,
                      const CFileSettings& settings) {
    if (!read.file) return nb::none();
    return NewObject<CAnalysis>(
        std::make_shared<const CSourceFile>(std::move(*read.file), path, python, settings, read.analysis));
}

nb::list AnalyzeFiles(const std::vector<nb::str>& paths, nb::str python, int version, bool false_hints,
                      bool with_records, bool with_names) {
    CFileSettings settings = SettingsFor(version, false_hints);
    settings.wants_records = with_records;
    settings.wants_names = with_names;
    std::vector<std::string> system_paths;
    system_paths.reserve(paths.size());
    for (const nb::str& path : paths) system_paths.push_back(SystemPath(path));
    std::vector<CReadFile> files = ReadEach(system_paths, settings);
    nb::list analyses;
    for (size_t i = 0; i < files.size(); ++i)
        analyses.append(AnalysisOf(files[i], paths[i], python, settings));
    return analyses;
}

}  // namespace

void BindFileBatch(nb::module_& module) {
    module.def(
        "analyze_files", &AnalyzeFiles, "paths"_a, "python"_a, "version"_a, "false_hints"_a, "with_records"_a,
        "with_names"_a,
        nb::sig("def analyze_files(paths: list[str], python: str, version: int, false_hints: bool, "
                "with_records: bool, with_names: bool) -> list[Analysis | None]"),
        "For `codeloom.analyze_paths`: what each file says, with its problems worked out, with "
        "`with_records` its records, and with `with_names` its occurrences, scopes, signatures and hints."
        "\n\n"
        "None for a file that can't be read or that has to be decoded: the Python layer reads these.");
}

}  // namespace codeloom
