#include "face/file_reader.h"

#include <deque>
#include <exception>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include <nanobind/stl/string.h>
#include <nanobind/stl/vector.h>

#include <sys/types.h>
#include <unistd.h>

#include "face/bind_items.h"
#include "face/items.h"
#include "face/ordered_work.h"
#include "face/plain_file.h"
#include "face/settings.h"
#include "host/errors.h"
#include "host/without_lock.h"

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

nb::object AnalysisOf(CReadFile& read, const nb::str& path, const nb::str& python,
                      const CFileSettings& settings) {
    if (!read.file) return nb::none();
    return NewObject<CAnalysis>(
        std::make_shared<const CSourceFile>(std::move(*read.file), path, python, settings, read.analysis));
}

// Some files, and what is found in each.
struct CBatch {
    std::vector<nb::str> paths;
    std::vector<std::string> system_paths;
    std::vector<CReadFile> files;
    std::exception_ptr error;

    void Read(const CFileSettings& settings) noexcept {
        try {
            files.reserve(system_paths.size());
            for (const std::string& path : system_paths) files.push_back(codeloom::Read(path, settings));
        } catch (...) {  // no memory
            error = std::current_exception();
        }
    }
};

// What is read ahead, the oldest first.
struct CAhead {
    std::deque<CBatch> batches;
    COrderedWork work;  // last, so that its threads end before the batches go

    explicit CAhead(size_t thread_count) : work(thread_count) {}
};

// For one thread of the host. The threads of its own never need the interpreter, and so never wait for its
// lock.
class CFileReader {
  public:
    CFileReader(size_t jobs, nb::str python, int version, bool false_hints, bool with_records,
                bool with_names)
        : _fPython(std::move(python)),
          _fSettings(SettingsFor(version, false_hints)),
          _fProcess(getpid()),
          _fAhead(std::make_unique<CAhead>(jobs - 1)) {
        _fSettings.wants_records = with_records;
        _fSettings.wants_names = with_names;
        CSourceFile::MakeLanguages(version);
    }
    ~CFileReader() { Close(); }
    CFileReader(const CFileReader&) = delete;
    CFileReader& operator=(const CFileReader&) = delete;

    void Submit(std::vector<nb::str> paths) {
        _CheckProcess();
        CBatch& batch =
            _fAhead->batches.emplace_back();  // stays where it is: a deque only changes at its ends
        batch.paths = std::move(paths);
        for (const nb::str& path : batch.paths) batch.system_paths.push_back(SystemPath(path));
        _fAhead->work.Add([this, &batch] { batch.Read(_fSettings); });
    }

    nb::list Take() {
        _CheckProcess();
        if (_fAhead->batches.empty()) RaiseHost(PyExc_IndexError, "there is nothing to take");
        {
            const CWithoutLock released;
            _fAhead->work.FinishOldest();
        }
        CBatch batch = std::move(_fAhead->batches.front());
        _fAhead->batches.pop_front();
        if (batch.error) std::rethrow_exception(batch.error);
        nb::list analyses;
        for (size_t i = 0; i < batch.files.size(); ++i)
            analyses.append(AnalysisOf(batch.files[i], batch.paths[i], _fPython, _fSettings));
        return analyses;
    }

    void Close() {
        if (_IsForked())
            (void)_fAhead.release();  // its threads aren't in this process, and would be waited for forever
        else
            _fAhead->work.EndThreads();
    }

  private:
    bool _IsForked() const { return getpid() != _fProcess; }
    void _CheckProcess() const {
        if (_IsForked())
            RaiseHost(PyExc_RuntimeError,
                      "files that are read ahead can't be taken in a process forked since");
    }

    nb::str _fPython;
    CFileSettings _fSettings;
    pid_t _fProcess;
    std::unique_ptr<CAhead> _fAhead;
};

}  // namespace

void BindFileReader(nb::module_& module) {
    nb::class_<CFileReader>(
        module, "FileReader",
        "For `codeloom.analyze_paths`: files read and analysed by `jobs` threads, that which takes them "
        "included, with their problems worked out, with `with_records` their records, and with "
        "`with_names` their occurrences, scopes, signatures and hints.")
        .def(nb::init<size_t, nb::str, int, bool, bool, bool>(), "jobs"_a, "python"_a, "version"_a,
             "false_hints"_a, "with_records"_a, "with_names"_a)
        .def("submit", &CFileReader::Submit, "paths"_a, nb::sig("def submit(self, paths: list[str]) -> None"),
             "Some files to read. An empty path is none.")
        .def(
            "take", &CFileReader::Take, nb::sig("def take(self) -> list[Analysis | None]"),
            "What the files say that were submitted first. None for one that can't be read or that has to be "
            "decoded: the Python layer reads these.")
        .def("close", &CFileReader::Close, nb::call_guard<CWithoutLock>(),
             "Ends the threads. What is left is read when it is taken.");
}

}  // namespace codeloom
