// document/: a text that changes, and what it says after each change.
//   in     a text, then edits of it
//   out    for each text what AnalyzeFile says of it
//   keeps  the text in pieces, each with what it says; an edit leaves most of them as they are
//   start  at CPieces
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "file/file_part.h"

namespace codeloom {

// What a piece says of names, its places counted as those of the piece.
struct CPieceNames {
    CTextNames names;
    CSignatures signatures;
};

// A part of a text, wherever it is: all places are counted from its beginning.
struct CPiece {
    uint32_t length = 0;
    uint32_t looked_at = 0;
    CPartState state;  // before it
    CProblems problems;
    std::vector<CLineFault> faults;
    CProblems late_problems;
    std::vector<CLine> lines;
    std::vector<CLineLimit> limits;  // lines are counted from its first one
    size_t scanned_in_vain = 0;
    size_t repeated_text = 0;
    bool has_asked_for_literals = false;
    std::vector<CBlock> closed;
    bool may_have_reopened = false;
    bool needs_whole_text = false;
    mutable std::unique_ptr<const CPieceNames> names;  // once they have been asked for
};

using CPiecePtr = std::shared_ptr<const CPiece>;

// What went from `start` to `end`, and how much came in its place.
struct CTextEdit {
    uint32_t start = 0;
    uint32_t end = 0;
    uint32_t new_length = 0;

    uint32_t NewEnd() const { return start + new_length; }
};

// A text in pieces. Copies share what is the same in them, and nothing in them changes. Names of all that
// share are in one table, so they are for one thread at a time.
class CPieces {
  public:
    // Requires: `text` is UTF-8 that can be read, and not longer than kMaxTextSize; the version is known.
    // Settings that ask for records or names aren't regarded.
    CPieces(std::string_view text, const CFileSettings& settings);

    // Those of the text that an edit has made of the one of these pieces.
    CPieces Edited(std::string_view text, const CTextEdit& edit) const;

    // The same as AnalyzeFile says of the text, without records; none where the text is one of the rare ones
    // that must be analysed as a whole.
    std::optional<CFileAnalysis> Analysis(std::string_view text, bool wants_names) const;

    size_t Count() const { return _fPieces.size(); }

  private:
    friend class CPieceWork;
    using CLiteralTexts = std::set<std::string, std::less<>>;

    explicit CPieces(const CFileSettings& settings) : _fSettings(settings) {}

    void _JoinNames(std::string_view text, CFileAnalysis& analysis) const;

    CFileSettings _fSettings;
    std::vector<CPiecePtr> _fPieces;
    CLiteralTexts _fLiterals;  // the names for `Literal`, if a piece has asked for them
};

}  // namespace codeloom
