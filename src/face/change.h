// What an edit has changed, item by item.
//   in     the analyses before and after, what was replaced and by what, and which lines are others
//   out    the items that are gone, and those that came
//   keeps  nothing
//   start  at CChange
#pragma once

#include <optional>
#include <vector>

#include "document/pieces.h"
#include "face/source_file.h"

namespace codeloom {

class CChange {
  public:
    // `range` was in the text before and `new_range` is there now; without `replaced` any line may be
    // another.
    CChange(CSourceFilePtr before, CSourceFilePtr after, const CRange& range, const CRange& new_range,
            std::optional<std::vector<CReplacedLines>> replaced)
        : _fBefore(std::move(before)),
          _fAfter(std::move(after)),
          _fRange(range),
          _fNewRange(new_range),
          _fReplaced(std::move(replaced)) {}

    // Where a range of the text before is now; none where the edit has cut into it.
    std::optional<CRange> Moved(const CRange& range) const;

    // Two tuples: what is gone, and what came.
    nb::tuple Lines() const;
    nb::tuple Problems() const;
    nb::tuple Occurrences() const;
    nb::tuple Scopes() const;

  private:
    template <class Item, class SaysSame>
    nb::tuple _Differences(const std::vector<Item>& before, const std::vector<Item>& after,
                           const SaysSame& says_same) const;

    CSourceFilePtr _fBefore;
    CSourceFilePtr _fAfter;
    CRange _fRange;
    CRange _fNewRange;
    std::optional<std::vector<CReplacedLines>> _fReplaced;
};

}  // namespace codeloom
