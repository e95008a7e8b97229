// document/: a text that changes, and what it says after each change.
//   in     a text, then edits of it
//   out    for each text what AnalyzeFile says of it, and which of its lines are others than before
//   keeps  the text in pieces, each with what it says; an edit leaves most of them as they are
//   start  at CPieces
//
// piece.h            a part of a text, and what it says
// piece_records.h    the records of pieces, one piece after the other
// piece_list.h       pieces one after the other, found by byte, line and row
// joined_problems.h  the problems of all pieces, without those that follow from others
// columns.h          what the columns of a host count
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "document/piece_list.h"

namespace codeloom {

// What went from `start` to `end`, and how much came in its place.
struct CTextEdit {
    uint32_t start = 0;
    uint32_t end = 0;
    uint32_t new_length = 0;

    uint32_t NewEnd() const { return start + new_length; }
};

// Lines of the text before, and those of the text after that are in their place. All others are the same.
struct CReplacedLines {
    uint32_t old_first = 0;
    uint32_t old_end = 0;
    uint32_t new_first = 0;
    uint32_t new_end = 0;
};

// A text in pieces. Copies share what is the same in them, and nothing in them changes. Names of all that
// share are in one table, so they are for one thread at a time.
class CPieces {
  public:
    // Requires: `text` is UTF-8 that can be read, and not longer than kMaxTextSize; the version is known.
    // Settings that ask for records or names aren't regarded.
    CPieces(std::string_view text, const CFileSettings& settings);

    // Those of the text that an edit has made of `old_text`, the one of these pieces; appends to `replaced`.
    CPieces Edited(std::string_view old_text, std::string_view text, const CTextEdit& edit,
                   std::vector<CReplacedLines>& replaced) const;

    // False where the text is one of the rare ones that must be analysed as a whole. Requires for what
    // follows: true.
    bool SayAll() const;

    // The same as AnalyzeFile says of the text, with limits if records are wanted. None where records or
    // names are wanted and only an analysis of the whole text gives them.
    std::optional<CFileAnalysis> Analysis(std::string_view text, bool wants_records, bool wants_names) const;
    CProblems Problems(std::string_view text) const;
    uint32_t LineCount() const { return _fPieces.Sums().size.line; }
    CLine Line(uint32_t line_i) const;

    uint32_t RowCount() const { return _fPieces.Sums().size.row + 1; }

    const CPieceList& List() const { return _fPieces; }

  private:
    friend class CPieceWork;
    using CLiteralTexts = std::set<std::string, std::less<>>;

    explicit CPieces(const CFileSettings& settings) : _fSettings(settings) {}

    void _AddRecords(std::string_view text, CFileAnalysis& analysis) const;
    CTextNames _Names(std::string_view text) const;

    CFileSettings _fSettings;
    CPieceList _fPieces;
    std::optional<CLiteralTexts> _fLiterals;  // the names for `Literal`, if a piece has asked for them
};

}  // namespace codeloom
