#include "face/document.h"

#include <algorithm>

#include "host/errors.h"
#include "host/text.h"
#include "text/utf8.h"

namespace codeloom {

namespace {

CPlainFile Spliced(std::string_view before, std::string_view between, std::string_view after) {
    CPlainFile joined;
    joined.size = before.size() + between.size() + after.size();
    if (joined.size > kMaxTextSize) RaiseHost(PyExc_ValueError, "source is longer than 2 GB");
    joined.bytes = std::make_unique_for_overwrite<char[]>(joined.size + 1);
    char* end = joined.bytes.get();
    for (const std::string_view part : {before, between, after})
        end = std::copy(part.begin(), part.end(), end);
    *end = '\0';
    return joined;
}

std::string Shown(const CRowColumn& place) {
    return "(" + std::to_string(place.row) + ", " + std::to_string(place.column) + ")";
}

void Refuse(const char* argument, const CRowColumn& place, const std::string& why) {
    RaiseHost(PyExc_ValueError, (std::string(argument) + " " + Shown(place) + why).c_str());
}

}  // namespace

CDocument::CDocument(nb::str text, nb::str path, nb::str python, const CFileSettings& settings, EUnit unit)
    : _fPath(std::move(path)), _fPython(std::move(python)), _fSettings(settings), _fUnit(unit) {
    CSourceFile::MakeLanguages(settings.version);
    const CUtf8 utf8(text);
    _Take(Spliced(utf8, {}, {}));
}

CDocumentEdit CDocument::Edit(const CRowColumn& start, const CRowColumn& end, nb::str new_text) {
    const uint32_t first = _OffsetOf("start", start, _fUnit);
    const uint32_t last = _OffsetOf("end", end, _fUnit);
    if (last < first) Refuse("end", end, " is before start " + Shown(start));
    const CUtf8 came(new_text);
    CDocumentEdit done;
    done.range = _RangeOf(first, last);
    const std::string_view text = Text();
    CPlainFile joined = Spliced(text.substr(0, first), came, text.substr(last));
    const CTextEdit edit{first, last, static_cast<uint32_t>(came->size())};
    if (_fFile && IsSourceText(came)) {
        done.bytes = edit;
        done.replaced = _TakeEdited(std::move(joined), edit);
    } else {
        _Take(std::move(joined));
    }
    done.new_range = _RangeOf(first, edit.NewEnd());
    return done;
}

void CDocument::_Take(CPlainFile text) {
    if (IsSourceText(text.Text())) {
        CPieces pieces(text.Text(), _fSettings);
        return _TakePieces(std::move(text), std::move(pieces));
    }
    _fFile.reset();
    _fPieces.reset();
    _fUnreadable = text.Text();
    _fUnreadableRows.emplace(_fUnreadable);
}

// Which lines are others is known only where pieces say what they say before and after.
std::optional<std::vector<CReplacedLines>> CDocument::_TakeEdited(CPlainFile text, const CTextEdit& edit) {
    std::vector<CReplacedLines> replaced;
    const bool was_in_pieces = _fPieces->SayAll();
    CPieces edited = _fPieces->Edited(Text(), text.Text(), edit, replaced);
    _TakePieces(std::move(text), std::move(edited));
    if (!was_in_pieces || !_fPieces->SayAll()) return {};
    return replaced;
}

void CDocument::_TakePieces(CPlainFile text, CPieces pieces) {
    _fPieces = std::make_shared<const CPieces>(std::move(pieces));
    _fFile = std::make_shared<const CSourceFile>(std::move(text), _fPath, _fPython, _fSettings, _fPieces);
    _fUnreadable = {};
    _fUnreadableRows.reset();
}

CPlacedRows CDocument::_RowsAround(int64_t row) const {
    if (_fFile) return _fFile->RowsAround(static_cast<uint32_t>(row - 1));
    return {*_fUnreadableRows};
}

std::string_view CDocument::_Row(int64_t row) const {
    return _RowsAround(row).TextOf(static_cast<uint32_t>(row - 1));
}

uint32_t CDocument::_StartOf(int64_t row) const {
    return _RowsAround(row).StartOf(static_cast<uint32_t>(row - 1));
}

CRowColumn CDocument::End() const {
    const int64_t row = RowCount();
    return {row, EndColumn(_Row(row), _fUnit)};
}

int64_t CDocument::ColumnOf(const CRowColumn& place) const {
    const uint32_t offset = _OffsetOf("place", place, EUnit::kCharacter);
    const uint32_t start = _StartOf(place.row);
    return EndColumn(Text().substr(start, offset - start), _fUnit);
}

int64_t CDocument::CharacterColumnOf(const CRowColumn& position) const {
    _CheckRow("position", position);
    if (position.column < 1) Refuse("position", position, ": columns count from 1");
    return 1 + CharactersBefore(_Row(position.row), position.column, _fUnit);
}

std::string_view CDocument::Row(int64_t row) const {
    _CheckRow("place", {row, 1});
    return _Row(row);
}

std::string_view CDocument::Between(const CRowColumn& start, const CRowColumn& end) const {
    const uint32_t first = _OffsetOf("start", start, EUnit::kCharacter);
    const uint32_t last = _OffsetOf("end", end, EUnit::kCharacter);
    return Text().substr(first, std::max(last, first) - first);
}

void CDocument::_CheckRow(const char* argument, const CRowColumn& place) const {
    if (place.row < 1 || place.row > RowCount())
        Refuse(argument, place, ": the last row is " + std::to_string(RowCount()));
}

uint32_t CDocument::_OffsetOf(const char* argument, const CRowColumn& place, EUnit unit) const {
    _CheckRow(argument, place);
    const std::string_view row = _Row(place.row);
    const std::optional<size_t> bytes =
        place.column < 1 ? row.size() + 1 : BytesBefore(row, place.column, unit);
    if (!bytes) Refuse(argument, place, " is within a character");
    if (*bytes > row.size())
        Refuse(
            argument, place,
            ": row " + std::to_string(place.row) + " ends at column " + std::to_string(EndColumn(row, unit)));
    return _StartOf(place.row) + static_cast<uint32_t>(*bytes);
}

CRange CDocument::_RangeOf(uint32_t start, uint32_t end) const {
    return _fFile ? _fFile->RangeOf(start, end) : _fUnreadableRows->RangeOf(start, end);
}

}  // namespace codeloom
