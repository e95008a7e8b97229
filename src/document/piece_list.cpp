#include "document/piece_list.h"

#include <utility>

namespace codeloom {

namespace {

// A text of 100,000 rows has about as many pages as a page has pieces.
constexpr size_t kFewestPieces = 16;
constexpr size_t kMostPieces = 64;

// The last of some items that begins at the place or before.
template <class Item>
const Item& LastUpTo(const std::vector<Item>& items, uint32_t CPiecePlace::* what, uint32_t wanted) {
    const auto after =
        std::upper_bound(items.begin() + 1, items.end(), wanted,
                         [what](uint32_t place, const Item& item) { return place < item.before.*what; });
    return *(after - 1);
}

}  // namespace

CPieceSums CPieceSums::Of(const CPiece& piece) {
    return {.size = {piece.Length(), static_cast<uint32_t>(piece.lines.size()), piece.RowCount()},
            .looked_at = piece.looked_at,
            .scanned_in_vain = piece.scanned_in_vain,
            .repeated_text = piece.repeated_text,
            .has_problems = piece.HasProblems(),
            .has_asked_for_literals = piece.has_asked_for_literals,
            .may_have_reopened = piece.may_have_reopened,
            .declares_for_others = piece.declares_for_others,
            .needs_whole_text = piece.needs_whole_text};
}

void CPieceSums::Add(const CPieceSums& next) {
    looked_at = std::max(looked_at, size.start + next.looked_at);
    size = size + next.size;
    scanned_in_vain += next.scanned_in_vain;
    repeated_text += next.repeated_text;
    has_problems |= next.has_problems;
    has_asked_for_literals |= next.has_asked_for_literals;
    may_have_reopened |= next.may_have_reopened;
    declares_for_others |= next.declares_for_others;
    needs_whole_text |= next.needs_whole_text;
}

void CPieceList::Add(CPiecePtr piece) {
    if (_fStarted.pieces.size() == kMostPieces) _EndPage();
    const CPieceSums sums = CPieceSums::Of(*piece);
    _fStarted.pieces.push_back({std::move(piece), _fStarted.sums.size});
    _fStarted.sums.Add(sums);
}

// A page under way that is short takes over what follows, so that edits don't leave ever shorter ones.
void CPieceList::Add(const CPlacedPage& page) {
    if (!_fStarted.pieces.empty() && _fStarted.pieces.size() < kFewestPieces) {
        for (const CPlacedPiece& placed : page.page->pieces) Add(placed.piece);
        return;
    }
    _EndPage();
    _fPages.push_back({page.page, _fSums.size});
    _fSums.Add(page.page->sums);
}

void CPieceList::_EndPage() {
    if (_fStarted.pieces.empty()) return;
    auto page = std::make_shared<const CPiecePage>(std::exchange(_fStarted, {}));
    _fPages.push_back({page, _fSums.size});
    _fSums.Add(page->sums);
}

CPlacedPiece CPieceList::_At(uint32_t CPiecePlace::* what, uint32_t wanted) const {
    const CPlacedPage& page = LastUpTo(_fPages, what, wanted);
    const CPlacedPiece& placed = LastUpTo(page.page->pieces, what, wanted - page.before.*what);
    return {placed.piece, page.before + placed.before};
}

}  // namespace codeloom
