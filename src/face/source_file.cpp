#include "face/source_file.h"

#include <nanobind/stl/string.h>
#include <nanobind/stl/tuple.h>

#include "host/errors.h"
#include "host/text.h"
#include "host/without_lock.h"

namespace codeloom {

CUnreadable UnreadableOf(const nb::list& faults, const nb::list& offsets) {
    CUnreadable places;
    for (nb::handle fault : faults) {
        const auto [start, end, message] = nb::cast<std::tuple<uint32_t, uint32_t, std::string>>(fault);
        places.faults.push_back({start, end, message});
    }
    for (nb::handle offset : offsets) places.offsets.push_back(nb::cast<uint32_t>(offset));
    return places;
}

CSourceFile::CSourceFile(nb::bytes utf8, nb::str path, nb::str python, const CFileSettings& settings,
                         CUnreadable unreadable)
    : _fUtf8(std::move(utf8)),
      _fPath(std::move(path)),
      _fPython(std::move(python)),
      _fSettings(settings),
      _fUnreadable(std::move(unreadable)) {
    const nb::bytes bytes = nb::borrow<nb::bytes>(_fUtf8);
    if (bytes.size() > kMaxTextSize) RaiseHost(PyExc_ValueError, "source is longer than 2 GB");
    _fText = {bytes.c_str(), bytes.size()};
}

CSourceFile::CSourceFile(CPlainFile file, nb::str path, nb::str python, const CFileSettings& settings,
                         const std::shared_ptr<const CFileAnalysis>& analysis)
    : _fFile(std::move(file)),
      _fText(_fFile.Text()),
      _fPath(std::move(path)),
      _fPython(std::move(python)),
      _fSettings(settings) {
    if (settings.wants_records) _fWithRecords = analysis;
    if (settings.wants_names) _fWithNames = analysis;
    if (!settings.wants_records && !settings.wants_names) _fQuick = analysis;
}

CSourceFile::CSourceFile(CPlainFile text, nb::str path, nb::str python, const CFileSettings& settings,
                         std::shared_ptr<const CPieces> pieces)
    : _fFile(std::move(text)),
      _fText(_fFile.Text()),
      _fPath(std::move(path)),
      _fPython(std::move(python)),
      _fSettings(settings),
      _fPieces(std::move(pieces)),
      _fArePiecesAll(_fPieces->SayAll()) {}

// What the pieces of a document say, which they all share: the interpreter's lock is kept.
std::unique_ptr<const CFileAnalysis> CSourceFile::_FromPieces(bool wants_records, bool wants_names) const {
    std::optional<CFileAnalysis> analysis = _fPieces->Analysis(Text(), wants_records, wants_names);
    if (!analysis) return nullptr;
    return std::make_unique<const CFileAnalysis>(std::move(*analysis));
}

nb::bytes CSourceFile::Utf8() const {
    return _fUtf8.is_valid() ? nb::borrow<nb::bytes>(_fUtf8) : BytesFromUtf8(_fText);
}

const CFileAnalysis& CSourceFile::_Analyzed(std::shared_ptr<const CFileAnalysis>& kept, bool wants_records,
                                            bool wants_names) const {
    if (kept) return *kept;
    if (_Pieces() != nullptr && (kept = _FromPieces(wants_records, wants_names))) return *kept;
    CFileSettings settings = _fSettings;
    settings.wants_records = wants_records;
    settings.wants_names = wants_names;
    MakeLanguages(settings.version);
    std::shared_ptr<const CFileAnalysis> made;
    {
        const CWithoutLock released;
        made = std::make_shared<const CFileAnalysis>(AnalyzeFile(Text(), settings, _fUnreadable));
    }
    if (!kept) kept = std::move(made);  // another thread may have been faster
    return *kept;
}

void CSourceFile::MakeLanguages(int version) {
    LanguageOf(version);
    if (version < 300) LanguageOf(version, true);
}

const CRowIndex& CSourceFile::Rows() const {
    if (!_fRows) _fRows = std::make_unique<const CRowIndex>(Text());
    return *_fRows;
}

CPlacedRows CSourceFile::RowsAt(uint32_t offset) const {
    if (!_fPieces) return {Rows()};
    const CPlacedPiece& at = _fPieces->List().AtByte(offset);
    return {at.piece->rows, at.before.start, at.before.row};
}

CPlacedRows CSourceFile::RowsAround(uint32_t row) const {
    if (!_fPieces) return {Rows()};
    const CPlacedPiece& at = _fPieces->List().AtRow(row);
    return {at.piece->rows, at.before.start, at.before.row};
}

CRange CSourceFile::RangeOf(uint32_t start, uint32_t end) const {
    const CPlacedRows at = RowsAt(start);
    if (end - at.start <= at.rows.TextSize()) {
        CRange range = at.rows.RangeOf(start - at.start, end - at.start);
        range.row += at.first_row;
        range.end_row += at.first_row;
        return range;
    }
    const CPlacedRows at_end = RowsAt(end);
    const CCharPlace first = at.rows.PlaceOf(start - at.start);
    const CCharPlace last = at_end.rows.PlaceOf(end - at_end.start);
    return {first.row + at.first_row + 1, first.column + 1, last.row + at_end.first_row + 1, last.column + 1};
}

uint32_t CSourceFile::LineCount() const {
    return _Pieces() != nullptr ? _fPieces->LineCount() : static_cast<uint32_t>(Analysis().lines.size());
}

CLine CSourceFile::Line(uint32_t line_i) const {
    return _Pieces() != nullptr ? _fPieces->Line(line_i) : Analysis().lines[line_i];
}

const CProblems& CSourceFile::Problems() const {
    if (_Pieces() == nullptr) return Analysis().problems;
    if (!_fProblemsOfPieces)
        _fProblemsOfPieces = std::make_unique<const CProblems>(_fPieces->Problems(Text()));
    return *_fProblemsOfPieces;
}

uint32_t CSourceFile::FirstProblem(uint32_t line_i) const {
    if (line_i >= LineCount()) return static_cast<uint32_t>(Problems().size());
    return line_i == 0 ? 0 : FirstProblemFrom(Problems(), Line(line_i).start);
}

nb::str CSourceFile::HostText() const {
    if (!_fHostText.is_valid()) _fHostText = nb::str(_fText.data(), _fText.size());
    return nb::borrow<nb::str>(_fHostText);
}

nb::object CSourceFile::_Named(const CNameTable& names, std::vector<nb::object>& made, uint32_t number) {
    if (made.empty()) made.resize(names.Count());
    nb::object& name = made[number];
    if (!name.is_valid()) name = TextFromUtf8(names.Text(number));
    return name;
}

}  // namespace codeloom
