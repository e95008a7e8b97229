#include "face/source_batch.h"

#include <algorithm>

#include <nanobind/stl/string.h>
#include <nanobind/stl/string_view.h>
#include <nanobind/stl/vector.h>

#include "face/settings.h"
#include "host/errors.h"
#include "host/text.h"
#include "host/without_lock.h"
#include "text/utf8.h"

using namespace nb::literals;

namespace codeloom {

namespace {

template <class Node>
TArrowOwner<Node> TakeFrom(nb::handle capsule, const char* name) {
    auto* const node = static_cast<Node*>(PyCapsule_GetPointer(capsule.ptr(), name));
    if (node == nullptr) throw nb::python_error();
    if (node->release == nullptr) RaiseHost(PyExc_ValueError, "the batch has been taken over already");
    return TArrowOwner<Node>(*node);
}

void CheckStream(ArrowArrayStream& stream, int error) {
    if (error == 0) return;
    const char* const message = stream.get_last_error(&stream);
    RaiseHost(PyExc_ValueError, message != nullptr ? message : "the batch can't be read");
}

// Others' code runs here, which may take its time.
template <class Read>
int WithoutLock(Read read) {
    const CWithoutLock released;
    return read();
}

CTableInput InputFromStream(ArrowArrayStream& stream) {
    ArrowSchema schema = {};
    CheckStream(stream, WithoutLock([&] { return stream.get_schema(&stream, &schema); }));
    CTableInput input{TArrowOwner<ArrowSchema>(schema)};
    for (;;) {
        ArrowArray batch = {};
        CheckStream(stream, WithoutLock([&] { return stream.get_next(&stream, &batch); }));
        if (batch.release == nullptr) return input;
        input.AddBatch(TArrowOwner<ArrowArray>(batch));
    }
}

nb::str HostText(std::string_view utf8) {
    return nb::borrow<nb::str>(TextFromUtf8(utf8));
}

// UTF-8 of a host's string, which keeps it.
std::string_view Utf8Of(const nb::str& text) {
    Py_ssize_t size = 0;
    const char* const utf8 = PyUnicode_AsUTF8AndSize(text.ptr(), &size);
    if (utf8 == nullptr) throw nb::python_error();
    return {utf8, static_cast<size_t>(size)};
}

std::string_view BytesIn(const nb::bytes& bytes) {
    return {bytes.c_str(), bytes.size()};
}

// Of str, bytes or None. The objects keep the texts.
std::vector<std::optional<std::string_view>> CellsOf(const nb::list& objects) {
    std::vector<std::optional<std::string_view>> cells;
    for (const nb::handle object : objects) {
        if (object.is_none())
            cells.emplace_back();
        else if (PyBytes_Check(object.ptr()))
            cells.emplace_back(BytesIn(nb::borrow<nb::bytes>(object)));
        else
            cells.emplace_back(Utf8Of(nb::cast<nb::str>(object)));
    }
    return cells;
}

EFileState StateNamed(std::string_view word) {
    const auto words = WordsOf<EFileState>();
    const auto found = std::find(words.begin(), words.end(), word);
    if (found == words.end()) RaiseHost(PyExc_ValueError, "unknown state of a file");
    return static_cast<EFileState>(found - words.begin());
}

}  // namespace

CSourceBatch::CSourceBatch(nb::handle table, const char* path, const char* content, const char* python)
    : _fInput(_Input(table)),
      _fPaths(_Column(path, false)),
      _fContents(_Column(content, false)),
      _fPythons(_Column(python, true)),
      _fHoldsText(_fInput.IsText(*_fInput.ColumnNamed(content))) {}

CSourceBatch::CSourceBatch(const nb::list& paths, const nb::list& contents, const nb::list& pythons)
    : _fInput(TArrowOwner<ArrowSchema>()),
      _fPaths(CellsOf(paths)),
      _fContents(CellsOf(contents)),
      _fPythons(CellsOf(pythons)) {
    for (const nb::list& list : {paths, contents, pythons}) _fLists.append(nb::tuple(list));
}

CTableInput CSourceBatch::_Input(nb::handle table) {
    if (nb::hasattr(table, "__arrow_c_stream__")) {
        const nb::object capsule = table.attr("__arrow_c_stream__")();
        TArrowOwner<ArrowArrayStream> stream = TakeFrom<ArrowArrayStream>(capsule, kArrowStreamCapsule);
        return InputFromStream(stream.node);
    }
    if (nb::hasattr(table, "__arrow_c_array__")) {
        const nb::object capsules = table.attr("__arrow_c_array__")();
        CTableInput input(TakeFrom<ArrowSchema>(capsules[0], kArrowSchemaCapsule));
        input.AddBatch(TakeFrom<ArrowArray>(capsules[1], kArrowArrayCapsule));
        return input;
    }
    const nb::str type = nb::borrow<nb::str>(table.type().attr("__name__"));
    RaiseHost(PyExc_TypeError,
              nb::str("batch must give __arrow_c_stream__ or __arrow_c_array__, as tables and batches of "
                      "pyarrow do, not be a {}")
                  .format(type));
}

CSourceBatch::CCells CSourceBatch::_Column(const char* name, bool may_lack) const {
    CCells cells;
    const std::optional<size_t> column_i = _fInput.ColumnNamed(name);
    if (!column_i) {
        if (may_lack) return cells;
        nb::list names;
        for (const std::string& known : _fInput.ColumnNames()) names.append(known);
        RaiseHost(PyExc_ValueError, nb::str("the batch has no column {!r}; it has {}")
                                        .format(name, nb::str(", ").attr("join")(names)));
    }
    if (!_fInput.TakeTexts(*column_i, cells))
        RaiseHost(PyExc_ValueError, nb::str("the column {!r} holds neither text nor bytes").format(name));
    return cells;
}

nb::object CSourceBatch::_TextOrNone(const CCells& cells, size_t i) {
    if (i >= cells.size() || !cells[i]) return nb::none();
    nb::object text = nb::steal(PyUnicode_DecodeUTF8(
        cells[i]->data(), static_cast<Py_ssize_t>(cells[i]->size()), "backslashreplace"));
    if (!text.is_valid()) throw nb::python_error();
    return text;
}

const std::optional<std::string_view>& CSourceBatch::_ContentAt(size_t i) const {
    if (i >= _fContents.size()) RaiseHost(PyExc_IndexError, "index out of range");
    return _fContents[i];
}

nb::object CSourceBatch::Size(size_t i) const {
    const auto& content = _ContentAt(i);
    return content ? nb::object(nb::int_(content->size())) : nb::none();
}

nb::object CSourceBatch::Content(size_t i) const {
    const auto& content = _ContentAt(i);
    return content ? nb::object(BytesFromUtf8(*content)) : nb::none();
}

nb::object CSourceBatch::Digest(size_t i, nb::handle hash) const {
    const auto& content = _ContentAt(i);
    if (!content) return nb::none();
    char empty = 0;  // where there are no bytes, there may be no place either
    char* const bytes = content->empty() ? &empty : const_cast<char*>(content->data());
    const nb::object view =
        nb::steal(PyMemoryView_FromMemory(bytes, static_cast<Py_ssize_t>(content->size()), PyBUF_READ));
    if (!view.is_valid()) throw nb::python_error();
    nb::object digest = hash(view).attr("hexdigest")();
    view.attr("release")();
    return digest;
}

bool CSourceBatch::IsPlain(size_t i) const {
    const auto& content = _ContentAt(i);
    if (!content) return false;
    return _fHoldsText ? IsSourceText(*content) : IsPlainSource(*content);
}

void CSourceBatch::Take(size_t i, int64_t file_id, nb::str path, nb::object sha256, nb::str python,
                        int version) {
    CheckVersion(version);
    _fFiles.push_back({.file_id = file_id,
                       .path = std::move(path),
                       .sha256 = std::move(sha256),
                       .python = std::move(python),
                       .version = version,
                       .content = _ContentAt(i),
                       .decoded = {},
                       .unreadable = std::nullopt,
                       .reason = {}});
}

void CSourceBatch::TakeDecoded(nb::bytes utf8, const nb::list& faults, const nb::list& unreadable) {
    CFile& file = _fFiles.back();
    file.unreadable = UnreadableOf(faults, unreadable);
    file.decoded = std::move(utf8);
}

void CSourceBatch::Mark(std::string_view state, nb::str reason) {
    CFile& file = _fFiles.back();
    file.state = StateNamed(state);
    file.reason = Utf8Of(reason);
}

std::string_view CSourceBatch::CFile::Text() const {
    if (!decoded.is_valid()) return *content;
    return BytesIn(nb::borrow<nb::bytes>(decoded));
}

CFileRow CSourceBatch::CFile::Row() const {
    CFileRow row = {.file_id = file_id,
                    .path = Utf8Of(path),
                    .sha256 = std::nullopt,
                    .bytes = std::nullopt,
                    .python = {Utf8Of(python)},
                    .state = state,
                    .reason = std::nullopt,
                    .rows = std::nullopt,
                    .lines = std::nullopt,
                    .problems = std::nullopt};
    if (!sha256.is_none()) row.sha256 = Utf8Of(nb::borrow<nb::str>(sha256));
    if (content) row.bytes = static_cast<int64_t>(content->size());
    if (state != EFileState::kOk) row.reason = reason;
    return row;
}

std::vector<CBatchFile> CSourceBatch::_Files() const {
    std::vector<CBatchFile> files;
    for (const CFile& file : _fFiles) {
        CBatchFile& made = files.emplace_back(CBatchFile{.row = file.Row(), .text = std::nullopt});
        made.version = file.version;
        if (file.unreadable) made.unreadable = &*file.unreadable;
        if (file.state == EFileState::kOk || file.state == EFileState::kUnreadable) made.text = file.Text();
        CSourceFile::MakeLanguages(file.version);
    }
    return files;
}

nb::dict CSourceBatch::Analyze(const std::vector<std::string>& tables, bool false_hints, bool with_source,
                               double max_seconds) const {
    CBatchSettings settings;
    settings.false_hints = false_hints;
    settings.with_source = with_source;
    settings.most_seconds = max_seconds;
    for (const std::string& name : tables) settings.tables.push_back(&TableKindNamed(name));
    const std::vector<CBatchFile> files = _Files();
    std::vector<std::shared_ptr<const CTable>> made;
    {
        const CWithoutLock released;
        made = AnalyzeBatch(files, settings);
    }
    nb::dict by_name;
    by_name[HostText(kFilesTable)] = CHostTable{kFilesTable, made.back()};
    for (size_t i = 0; i < settings.tables.size(); ++i) {
        const std::string_view name = settings.tables[i]->name;
        by_name[HostText(name)] = CHostTable{name, made[i]};
    }
    return by_name;
}

void BindSourceBatch(nb::module_& module) {
    nb::class_<CSourceBatch> batch(module, "SourceBatch",
                                   "For `codeloom.corpus`: the sources in a table of another library.");
    batch.def(nb::init<nb::handle, const char*, const char*, const char*>(), "table"_a, "path"_a, "content"_a,
              "python"_a);
    batch.def(nb::init<const nb::list&, const nb::list&, const nb::list&>(), "paths"_a, "contents"_a,
              "pythons"_a,
              nb::sig("def __init__(self, paths: list[str], contents: list[bytes | None], pythons: list[str "
                      "| None]) -> None"));
    batch.def("__len__", &CSourceBatch::Count);
    batch.def("path", &CSourceBatch::Path, "i"_a, nb::sig("def path(self, i: int) -> str | None"));
    batch.def("python", &CSourceBatch::Python, "i"_a, nb::sig("def python(self, i: int) -> str | None"));
    batch.def("size", &CSourceBatch::Size, "i"_a, nb::sig("def size(self, i: int) -> int | None"));
    batch.def("content", &CSourceBatch::Content, "i"_a, nb::sig("def content(self, i: int) -> bytes | None"));
    batch.def("digest", &CSourceBatch::Digest, "i"_a, "hash"_a,
              nb::sig("def digest(self, i: int, hash: typing.Any) -> str | None"),
              "The hash of the content by a function of hashlib, in hexadecimal digits.");
    batch.def_prop_ro("holds_text", &CSourceBatch::HoldsText, "True where contents are text, not bytes.");
    batch.def("is_plain", &CSourceBatch::IsPlain, "i"_a, "True where the content needs no decoding.");
    batch.def("take", &CSourceBatch::Take, "i"_a, "file_id"_a, "path"_a, "sha256"_a.none(), "python"_a,
              "version"_a,
              nb::sig("def take(self, i: int, file_id: int, path: str, sha256: str | None, python: str, "
                      "version: int) -> None"),
              "Says how a source is called and which version it is read as.");
    batch.def("take_decoded", &CSourceBatch::TakeDecoded, "utf8"_a, "faults"_a, "unreadable"_a,
              nb::sig("def take_decoded(self, utf8: bytes, faults: list[tuple[int, int, str]], unreadable: "
                      "list[int]) -> None"),
              "The text of the source that was taken last.");
    batch.def("mark", &CSourceBatch::Mark, "state"_a, "reason"_a,
              nb::sig("def mark(self, state: str, reason: str) -> None"),
              "What is wrong with the source that was taken last.");
    batch.def("analyze", &CSourceBatch::Analyze, "tables"_a, "false_hints"_a, "with_source"_a,
              "max_seconds"_a,
              nb::sig("def analyze(self, tables: list[str], false_hints: bool, with_source: bool, "
                      "max_seconds: float) -> "
                      "dict[str, Table]"));
}

}  // namespace codeloom
