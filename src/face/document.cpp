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

}  // namespace

CDocument::CDocument(nb::str text, nb::str path, nb::str python, const CFileSettings& settings, EUnit unit)
    : _fPath(std::move(path)),
      _fPython(std::move(python)),
      _fSettings(settings),
      _fUnit(unit),
      _fRows(CUtf8(text)) {
    CSourceFile::MakeLanguages(settings.version);
    const CUtf8 utf8(text);
    _Take(Spliced(utf8, {}, {}), {});
}

std::pair<CRange, CRange> CDocument::Edit(const CRowColumn& start, const CRowColumn& end, nb::str new_text) {
    const uint32_t first = _OffsetOf("start", start, _fUnit);
    const uint32_t last = _OffsetOf("end", end, _fUnit);
    if (last < first)
        RaiseHost(PyExc_ValueError, ("end " + Shown(end) + " is before start " + Shown(start)).c_str());
    const CUtf8 came(new_text);
    const CRange gone = _RangeOf(first, last);
    const std::string_view text = Text();
    CPlainFile joined = Spliced(text.substr(0, first), came, text.substr(last));
    const CTextEdit edit{first, last, static_cast<uint32_t>(came->size())};
    _fRows.Edit(joined.Text(), edit);
    _Take(std::move(joined), edit);
    return {gone, _RangeOf(first, edit.NewEnd())};
}

// The pieces of a text that couldn't be analysed are made anew for the next one.
void CDocument::_Take(CPlainFile text, const CTextEdit& edit) {
    if (!IsSourceText(text.Text())) {
        _fUnreadable = text.Text();
        _fFile.reset();
        _fPieces.reset();
        return;
    }
    _fPieces = std::make_shared<const CPieces>(_fPieces ? _fPieces->Edited(text.Text(), edit)
                                                        : CPieces(text.Text(), _fSettings));
    _fFile = std::make_shared<const CSourceFile>(std::move(text), _fPath, _fPython, _fSettings, _fPieces,
                                                 _fRows.Starts());
    _fUnreadable = {};
}

CRowColumn CDocument::End() const {
    const int64_t row = _fRows.Count();
    return {row, EndColumn(_fRows.Row(Text(), row), _fUnit)};
}

int64_t CDocument::ColumnOf(const CRowColumn& place) const {
    const uint32_t offset = _OffsetOf("place", place, EUnit::kCharacter);
    const uint32_t start = _fRows.Starts()[static_cast<size_t>(place.row) - 1];
    return EndColumn(Text().substr(start, offset - start), _fUnit);
}

uint32_t CDocument::_OffsetOf(const char* argument, const CRowColumn& place, EUnit unit) const {
    const auto refuse = [&](const std::string& why) {
        RaiseHost(PyExc_ValueError, (std::string(argument) + " " + Shown(place) + why).c_str());
    };
    if (place.row < 1 || place.row > _fRows.Count())
        refuse(": there is no row " + std::to_string(place.row) + ", but " + std::to_string(_fRows.Count()));
    const std::string_view row = _fRows.Row(Text(), place.row);
    const std::optional<size_t> bytes =
        place.column < 1 ? row.size() + 1 : BytesBefore(row, place.column, unit);
    if (!bytes) refuse(" is within a character");
    if (*bytes > row.size())
        refuse(": row " + std::to_string(place.row) + " ends at column " +
               std::to_string(EndColumn(row, unit)));
    return _fRows.Starts()[static_cast<size_t>(place.row) - 1] + static_cast<uint32_t>(*bytes);
}

CRange CDocument::_RangeOf(uint32_t start, uint32_t end) const {
    const std::vector<uint32_t>& starts = _fRows.Starts();
    const auto place = [&](uint32_t offset) {
        const auto row = std::upper_bound(starts.begin(), starts.end(), offset) - starts.begin();
        const uint32_t row_start = starts[static_cast<size_t>(row) - 1];
        const std::string_view before = Text().substr(row_start, offset - row_start);
        return CRowColumn{row, EndColumn(before, EUnit::kCharacter)};
    };
    const CRowColumn first = place(start), last = place(end);
    return {static_cast<uint32_t>(first.row), static_cast<uint32_t>(first.column),
            static_cast<uint32_t>(last.row), static_cast<uint32_t>(last.column)};
}

}  // namespace codeloom
