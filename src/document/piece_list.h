// Pieces one after the other, in pages that lists of other texts share: a list that differs from another in a
// few pieces has a page or two of its own.
#pragma once

#include <algorithm>
#include <cstdint>
#include <memory>
#include <vector>

#include "document/piece.h"

namespace codeloom {

// How much of a text is before something.
struct CPiecePlace {
    uint32_t start = 0;  // in bytes
    uint32_t line = 0;
    uint32_t row = 0;

    CPiecePlace operator+(const CPiecePlace& other) const {
        return {start + other.start, line + other.line, row + other.row};
    }
};

// What pieces are together.
struct CPieceSums {
    CPiecePlace size;
    uint32_t looked_at = 0;  // from their beginning, by any of them
    size_t scanned_in_vain = 0;
    size_t repeated_text = 0;
    // Of at least one of them.
    bool has_problems = false;
    bool has_asked_for_literals = false;
    bool may_have_reopened = false;
    bool declares_for_others = false;
    bool needs_whole_text = false;

    static CPieceSums Of(const CPiece& piece);
    // Those of pieces that follow.
    void Add(const CPieceSums& next);
};

struct CPlacedPiece {
    CPiecePtr piece;
    CPiecePlace before;
};

struct CPiecePage {
    std::vector<CPlacedPiece> pieces;  // places are counted from the page
    CPieceSums sums;
};

struct CPlacedPage {
    std::shared_ptr<const CPiecePage> page;
    CPiecePlace before;
};

class CPieceList {
  public:
    // To make one, from its beginning; then call End.
    void Add(CPiecePtr piece);
    void Add(const CPlacedPage& page);
    void End() { _EndPage(); }

    const std::vector<CPlacedPage>& Pages() const { return _fPages; }
    const CPieceSums& Sums() const { return _fSums; }
    // The same while the list is being made.
    CPiecePlace Size() const { return _fSums.size + _fStarted.sums.size; }

    // Calls `visit(piece, place)` for all pieces, or for those of pages where `of_any` is true.
    template <class Visit>
    void ForEach(const Visit& visit, bool CPieceSums::* of_any = nullptr) const {
        for (const CPlacedPage& page : _fPages)
            if (of_any == nullptr || page.page->sums.*of_any)
                for (const CPlacedPiece& placed : page.page->pieces)
                    visit(*placed.piece, page.before + placed.before);
        for (const CPlacedPiece& placed : _fStarted.pieces) visit(*placed.piece, _fSums.size + placed.before);
    }

    // The piece that holds a byte, a line, a row: the last one that begins there or before, with its place in
    // the text.
    CPlacedPiece AtByte(uint32_t offset) const { return _At(&CPiecePlace::start, offset); }
    CPlacedPiece AtLine(uint32_t line) const { return _At(&CPiecePlace::line, line); }
    CPlacedPiece AtRow(uint32_t row) const { return _At(&CPiecePlace::row, row); }

  private:
    CPlacedPiece _At(uint32_t CPiecePlace::* what, uint32_t wanted) const;
    void _EndPage();

    std::vector<CPlacedPage> _fPages;
    CPieceSums _fSums;     // of the pages
    CPiecePage _fStarted;  // the page under way
};

// Goes over the pieces of a list.
class CPieceCursor {
  public:
    explicit CPieceCursor(const CPieceList& list) : _fList(&list) {}

    bool IsAtEnd() const { return _fPage_i == _fList->Pages().size(); }
    bool BeginsPage() const { return _fPiece_i == 0; }
    const CPlacedPage& Page() const { return _fList->Pages()[_fPage_i]; }
    const CPiecePtr& Piece() const { return Page().page->pieces[_fPiece_i].piece; }
    // At the end the size of all.
    CPiecePlace Place() const {
        return IsAtEnd() ? _fList->Size() : Page().before + Page().page->pieces[_fPiece_i].before;
    }

    void Next() {
        if (++_fPiece_i == Page().page->pieces.size()) NextPage();
    }
    void NextPage() {
        ++_fPage_i;
        _fPiece_i = 0;
    }
    void GoToEnd() {
        _fPage_i = _fList->Pages().size();
        _fPiece_i = 0;
    }

  private:
    const CPieceList* _fList;
    size_t _fPage_i = 0;
    size_t _fPiece_i = 0;
};

}  // namespace codeloom
