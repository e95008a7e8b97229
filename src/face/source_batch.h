// Many sources out of a table of another library, and tables of what they say.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "arrow/batch.h"
#include "arrow/input.h"
#include "face/arrow_streams.h"
#include "face/source_file.h"

namespace codeloom {

// The sources of a batch as they came. The Python layer looks at each one and says how to read it; then all
// are analysed in one go, without the interpreter's lock.
class CSourceBatch {
  public:
    // Takes over what `table` gives by the Arrow interfaces. Raises TypeError for what gives nothing,
    // ValueError for a column that isn't there or that holds no text. `python` may be missing.
    CSourceBatch(nb::handle table, const char* path, const char* content, const char* python);
    // Of lists: str, bytes or None, and str or None. Raises TypeError for anything else.
    CSourceBatch(const nb::list& paths, const nb::list& contents, const nb::list& pythons);

    size_t Count() const { return _fPaths.size(); }
    // Of a source, by its row; None for a null.
    nb::object Path(size_t i) const { return _TextOrNone(_fPaths, i); }
    nb::object Python(size_t i) const { return _TextOrNone(_fPythons, i); }
    nb::object Size(size_t i) const;
    nb::object Content(size_t i) const;
    // What a hash of the host such as hashlib.sha256 makes of it, in hexadecimal digits.
    nb::object Digest(size_t i, nb::handle hash) const;
    // True where the contents are text, which a coding comment says nothing about.
    bool HoldsText() const { return _fHoldsText; }
    // True where the content can be read as it is.
    bool IsPlain(size_t i) const;

    // How the source of a row is to be read, and how it is called. What isn't plain comes decoded.
    void Take(size_t i, int64_t file_id, nb::str path, nb::object sha256, nb::str python, int version);
    void TakeDecoded(nb::bytes utf8, const nb::list& faults, const nb::list& unreadable);
    // Of the source that was taken last, which has no rows in tables unless it is `unreadable`.
    void Mark(std::string_view state, nb::str reason);

    // The tables of these names, and the table `files`; `with_source` is that of CTableForm.
    nb::dict Analyze(const std::vector<std::string>& tables, bool false_hints, bool with_source,
                     double max_seconds) const;

  private:
    using CCells = std::vector<std::optional<std::string_view>>;

    // Under the interpreter's lock. Its texts live as long as it and the input.
    struct CFile {
        int64_t file_id;
        nb::str path;
        nb::object sha256;
        nb::str python;
        int version;
        std::optional<std::string_view> content;
        nb::object decoded;
        std::optional<CUnreadable> unreadable;
        EFileState state = EFileState::kOk;
        std::string reason;

        std::string_view Text() const;
        CFileRow Row() const;
    };

    static CTableInput _Input(nb::handle table);
    CCells _Column(const char* name, bool may_lack) const;
    static nb::object _TextOrNone(const CCells& cells, size_t i);
    const std::optional<std::string_view>& _ContentAt(size_t i) const;
    // What was taken, as long as the batch is there.
    std::vector<CBatchFile> _Files() const;

    CTableInput _fInput;
    nb::list _fLists;  // what was given in place of a table
    CCells _fPaths;
    CCells _fContents;
    CCells _fPythons;
    bool _fHoldsText = false;
    std::vector<CFile> _fFiles;
};

void BindSourceBatch(nb::module_& module);

}  // namespace codeloom
