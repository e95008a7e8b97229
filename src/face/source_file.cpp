#include "face/source_file.h"

#include "host/errors.h"
#include "host/text.h"

namespace codeloom {

CSourceFile::CSourceFile(nb::bytes utf8, nb::str path, nb::str python, const CFileSettings& settings,
                         CUnreadable unreadable)
    : _fUtf8(std::move(utf8)),
      _fPath(std::move(path)),
      _fPython(std::move(python)),
      _fSettings(settings),
      _fUnreadable(std::move(unreadable)) {
    if (_fUtf8.size() > kMaxTextSize) RaiseHost(PyExc_ValueError, "source is longer than 2 GB");
}

const CFileAnalysis& CSourceFile::_Analyzed(std::unique_ptr<const CFileAnalysis>& kept, bool wants_records,
                                            bool wants_names) const {
    if (kept) return *kept;
    CFileSettings settings = _fSettings;
    settings.wants_records = wants_records;
    settings.wants_names = wants_names;
    // Made before the interpreter's lock is given up: a process forked meanwhile would wait for it forever.
    LanguageOf(settings.version);
    if (settings.version < 300) LanguageOf(settings.version, true);
    std::unique_ptr<const CFileAnalysis> made;
    {
        const nb::gil_scoped_release released;
        made = std::make_unique<const CFileAnalysis>(AnalyzeFile(Text(), settings, _fUnreadable));
    }
    if (!kept) kept = std::move(made);  // another thread may have been faster
    return *kept;
}

const CRowIndex& CSourceFile::Rows() const {
    if (!_fRows) _fRows = std::make_unique<const CRowIndex>(Text());
    return *_fRows;
}

nb::str CSourceFile::HostText() const {
    if (!_fHostText.is_valid()) _fHostText = nb::str(_fUtf8.c_str(), _fUtf8.size());
    return nb::borrow<nb::str>(_fHostText);
}

nb::object CSourceFile::_Named(const CNameTable& names, std::vector<nb::object>& made, uint32_t number) {
    if (made.empty()) made.resize(names.Count());
    nb::object& name = made[number];
    if (!name.is_valid()) name = TextFromUtf8(names.Text(number));
    return name;
}

}  // namespace codeloom
