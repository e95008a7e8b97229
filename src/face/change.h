// What an edit has changed, item by item.
//   in     the analyses before and after, what was replaced and by what, and which lines are others
//   out    the items that are gone, and those that came
//   keeps  nothing
//   start  at CChange
#pragma once

#include <optional>
#include <utility>
#include <vector>

#include "document/pieces.h"
#include "face/items.h"

namespace codeloom {

// What an edit replaced, where the new text is, and which lines are others: where that isn't known, all of
// them. The bytes are known if both texts are analysed as they are; else they stand for all of a text.
struct CDocumentEdit {
    CRange range;
    CRange new_range;
    CTextEdit bytes = {0, UINT32_MAX, 0};
    std::optional<std::vector<CReplacedLines>> replaced;
};

class CChange {
  public:
    CChange(CSourceFilePtr before, CSourceFilePtr after, CDocumentEdit edit)
        : _fBefore(std::move(before)), _fAfter(std::move(after)), _fEdit(std::move(edit)) {
        if (!_fEdit.replaced) _fEdit.replaced = {{0, _fBefore->LineCount(), 0, _fAfter->LineCount()}};
    }

    // Where a range of the text before is now; none where the edit has cut into it.
    std::optional<CRange> Moved(const CRange& range) const;

    // Two tuples: what is gone, and what came.
    nb::tuple Lines() const;
    nb::tuple Problems() const;
    nb::tuple Occurrences() const;
    nb::tuple Scopes() const;

  private:
    // Items that may be gone, and those that may have come.
    template <class Item>
    struct TCandidates {
        std::vector<Item> before;
        std::vector<Item> after;
    };

    bool _IsMoved(uint32_t before, uint32_t after) const;
    template <class Visit, class VisitSame>
    void _ForEachRun(const Visit& visit, const VisitSame& visit_same) const;
    template <class Item, class FirstOf, class IsSame>
    TCandidates<Item> _Candidates(const FirstOf& first_of, const IsSame& is_same) const;
    template <class Item, class SaysSame>
    nb::tuple _Differences(const TCandidates<Item>& candidates, const SaysSame& says_same) const;

    CSourceFilePtr _fBefore;
    CSourceFilePtr _fAfter;
    CDocumentEdit _fEdit;
};

}  // namespace codeloom
