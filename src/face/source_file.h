// face/: the package's face, codeloom._analysis: what a text says, as small objects that are made when asked
// for.
//   in     UTF-8 bytes and settings from the Python layer, which decodes
//   out    Analysis, and its sequences of Problem, Line, Record and Limit
//   keeps  the text, and what the pass over it found, as plain data
//   start  at CSourceFile here; items.h for the objects, module.cpp for what is bound
#pragma once

#include <memory>
#include <optional>
#include <string_view>
#include <vector>

#include <nanobind/nanobind.h>

#include "document/pieces.h"
#include "face/plain_file.h"
#include "file/file_analyzer.h"
#include "file/row_index.h"

namespace nb = nanobind;

namespace codeloom {

// What the Python layer says of what was no text.
CUnreadable UnreadableOf(const nb::list& faults, const nb::list& offsets);

// Some rows of a text: what they say is counted from a place of it.
struct CPlacedRows {
    const CRowIndex& rows;
    uint32_t start = 0;
    uint32_t first_row = 0;

    // Of a row of the whole text, counted from zero: its text, and the byte at which it begins there.
    std::string_view TextOf(uint32_t row) const { return rows.Text(row - first_row); }
    uint32_t StartOf(uint32_t row) const { return start + rows.Start(row - first_row); }
};

// One text with all that is known of it. Everything but the text is worked out when it is first asked for,
// and stays as it is from then on.
class CSourceFile {
  public:
    // Raises ValueError for a text that is too long.
    CSourceFile(nb::bytes utf8, nb::str path, nb::str python, const CFileSettings& settings,
                CUnreadable unreadable);
    // For a file that was read natively, with the result of a pass that was made as the settings say.
    CSourceFile(CPlainFile file, nb::str path, nb::str python, const CFileSettings& settings,
                const std::shared_ptr<const CFileAnalysis>& analysis);
    // For a text of a document, in its pieces.
    CSourceFile(CPlainFile text, nb::str path, nb::str python, const CFileSettings& settings,
                std::shared_ptr<const CPieces> pieces);

    std::string_view Text() const { return _fText; }
    nb::bytes Utf8() const;
    const nb::str& Path() const { return _fPath; }
    const nb::str& Python() const { return _fPython; }
    int Version() const { return _fSettings.version; }
    bool TakesFalseHints() const { return _fSettings.false_hints; }
    const CUnreadable& Unreadable() const { return _fUnreadable; }

    // The pass over the text; other threads of the host run meanwhile.
    const CFileAnalysis& Analysis() const {
        if (_fWithRecords) return *_fWithRecords;
        return _fWithNames ? *_fWithNames : _Analyzed(_fQuick, false);
    }
    // Of all that, without putting the pieces of a document together.
    uint32_t LineCount() const;
    CLine Line(uint32_t line_i) const;
    const CProblems& Problems() const;
    // The problems of a line are those from FirstProblem(line_i) up to FirstProblem(line_i + 1).
    uint32_t FirstProblem(uint32_t line_i) const;

    const CFileAnalysis& WithRecords() const { return _Analyzed(_fWithRecords, true); }
    const CFileAnalysis& WithNames() const { return _Analyzed(_fWithNames, false, true); }
    const CTextNames& Names() const { return WithNames().names; }
    const CSignatures& Signatures() const { return WithNames().signatures; }

    // What a pass needs is made while the interpreter's lock is held: a process that is forked while another
    // thread makes it would wait for it forever.
    static void MakeLanguages(int version);

    const CRowIndex& Rows() const;
    // The same for those around a byte, and for those around a row, from 0: of a document those of a piece.
    CPlacedRows RowsAt(uint32_t offset) const;
    CPlacedRows RowsAround(uint32_t row) const;
    uint32_t RowCount() const { return _fPieces ? _fPieces->RowCount() : Rows().Count(); }
    CRange RangeOf(uint32_t start, uint32_t end) const;

    nb::str HostText() const;
    // A name of the records, and one of the occurrences, by its number; the same object each time.
    nb::object HostName(uint32_t number) const {
        return _Named(*WithRecords().records.names, _fHostNames, number);
    }
    nb::object HostNameOfOccurrence(uint32_t number) const {
        return _Named(*Names().occurrences.names, _fHostNamesOfOccurrences, number);
    }

  private:
    // The pieces, if they say all.
    const CPieces* _Pieces() const { return _fArePiecesAll ? _fPieces.get() : nullptr; }
    static nb::object _Named(const CNameTable& names, std::vector<nb::object>& made, uint32_t number);
    std::unique_ptr<const CFileAnalysis> _FromPieces(bool wants_records, bool wants_names) const;
    const CFileAnalysis& _Analyzed(std::shared_ptr<const CFileAnalysis>& kept, bool wants_records,
                                   bool wants_names = false) const;

    nb::object _fUtf8;  // the text is in the host's bytes, or, if there are none,
    CPlainFile _fFile;  // in a file that was read natively
    std::string_view _fText;
    nb::str _fPath;
    nb::str _fPython;
    CFileSettings _fSettings;
    CUnreadable _fUnreadable;
    std::shared_ptr<const CPieces> _fPieces;  // of a document, else null
    bool _fArePiecesAll = false;
    mutable std::unique_ptr<const CProblems> _fProblemsOfPieces;
    // Results of passes; one that looked for both is kept as both.
    mutable std::shared_ptr<const CFileAnalysis> _fQuick;  // with neither records nor names
    mutable std::shared_ptr<const CFileAnalysis> _fWithRecords;
    mutable std::shared_ptr<const CFileAnalysis> _fWithNames;
    mutable std::unique_ptr<const CRowIndex> _fRows;
    mutable nb::object _fHostText;
    // By number, made when they are asked for.
    mutable std::vector<nb::object> _fHostNames;
    mutable std::vector<nb::object> _fHostNamesOfOccurrences;
};

using CSourceFilePtr = std::shared_ptr<const CSourceFile>;

}  // namespace codeloom
