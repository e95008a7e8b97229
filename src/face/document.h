// The text of codeloom.Document.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "document/columns.h"
#include "document/pieces.h"
#include "face/change.h"
#include "face/source_file.h"

namespace codeloom {

// For one thread at a time. A text that can't be analysed as it is, since it holds NUL or lone surrogates, is
// edited here all the same.
class CDocument {
  public:
    // Raises ValueError for a text that is too long.
    CDocument(nb::str text, nb::str path, nb::str python, const CFileSettings& settings, EUnit unit);

    std::string_view Text() const { return _fFile ? _fFile->Text() : _fUnreadable; }
    // What the text says; null for one that can't be analysed as it is.
    const CSourceFilePtr& File() const { return _fFile; }

    // Puts a text in the place of a range. Raises ValueError, naming the argument, for a place that the text
    // doesn't have; the text then stays as it is.
    CDocumentEdit Edit(const CRowColumn& start, const CRowColumn& end, nb::str new_text);

    // After the last character.
    CRowColumn End() const;
    // The column of a place that is counted in characters, in what the document counts.
    int64_t ColumnOf(const CRowColumn& place) const;
    // The other way round: the end of the row for a column after it, and the end of a character for one
    // within it.
    int64_t CharacterColumnOf(const CRowColumn& position) const;
    uint32_t RowCount() const { return _fFile ? _fFile->RowCount() : _fUnreadableRows->Count(); }
    // Without its end; `row` from 1.
    std::string_view Row(int64_t row) const;
    // Places are counted in characters.
    std::string_view Between(const CRowColumn& start, const CRowColumn& end) const;

  private:
    void _CheckRow(const char* argument, const CRowColumn& place) const;
    // `row` from 1.
    CPlacedRows _RowsAround(int64_t row) const;
    std::string_view _Row(int64_t row) const;
    uint32_t _StartOf(int64_t row) const;
    uint32_t _OffsetOf(const char* argument, const CRowColumn& place, EUnit unit) const;
    CRange _RangeOf(uint32_t start, uint32_t end) const;
    void _Take(CPlainFile text);
    std::optional<std::vector<CReplacedLines>> _TakeEdited(CPlainFile text, const CTextEdit& edit);
    void _TakePieces(CPlainFile text, CPieces pieces);

    nb::str _fPath;
    nb::str _fPython;
    CFileSettings _fSettings;
    EUnit _fUnit;
    CSourceFilePtr _fFile;
    std::shared_ptr<const CPieces> _fPieces;
    // Where there is no file.
    std::string _fUnreadable;
    std::optional<CRowIndex> _fUnreadableRows;
};

}  // namespace codeloom
