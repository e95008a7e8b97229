#include "face/change.h"

#include <algorithm>
#include <tuple>
#include <utility>

#include "face/name_items.h"

namespace codeloom {

namespace {

using CPlaceKey = std::pair<uint32_t, uint32_t>;

CPlaceKey StartOf(const CRange& range) {
    return {range.row, range.column};
}

CPlaceKey EndOf(const CRange& range) {
    return {range.end_row, range.end_column};
}

auto KeyOf(const CRange& range) {
    return std::tuple(range.row, range.column, range.end_row, range.end_column);
}

template <class Items>
auto AllOf(const Items& items) {
    std::vector<typename Items::CItemType> all;
    all.reserve(items.Size());
    for (size_t i = 0; i < items.Size(); ++i) all.push_back(items.At(i));
    return all;
}

// What is said of a scope beside its range: the answers of its symbols, in the order of their names.
struct CSaidOfScope {
    using CAnswers = std::tuple<std::string_view, uint16_t, CSymbol::EBinding>;

    explicit CSaidOfScope(const CScopeItem& scope) : item(scope) {
        const CTextNames& names = scope.file->Names();
        const TPlainArray<CSymbol>& all = names.scopes.symbols;
        for (uint32_t i = scope.Data().first_symbol; i != kNoIndex; i = all[i].next)
            if (all[i].IsMentioned())
                symbols.emplace_back(names.occurrences.names->Text(all[i].name), all[i].flags & kAnswered,
                                     all[i].binding);
        std::sort(symbols.begin(), symbols.end());
    }

    std::pair<EScopeKind, std::string_view> Parent() const {
        const CScopeItem parent(item.file, item.Data().parent);
        return {parent.Data().kind, parent.Name()};
    }

    bool operator==(const CSaidOfScope& other) const {
        return item.Data().kind == other.item.Data().kind && item.Name() == other.item.Name() &&
               Parent() == other.Parent() && symbols == other.symbols;
    }

    // What a symbol answers; all else says how scopes use it that are further in.
    static constexpr uint16_t kAnswered = CSymbol::kIsReferenced | CSymbol::kIsAssigned |
                                          CSymbol::kIsParameter | CSymbol::kIsImported |
                                          CSymbol::kIsAnnotated | CSymbol::kIsDeclaredNonlocal |
                                          CSymbol::kIsTypeParameter | CSymbol::kIsNamespace;

    CScopeItem item;
    std::vector<CAnswers> symbols;
};

}  // namespace

std::optional<CRange> CChange::Moved(const CRange& range) const {
    const CPlaceKey start = StartOf(range), end = EndOf(range);
    const CPlaceKey cut = StartOf(_fRange), cut_end = EndOf(_fRange);
    if ((cut < start && start < cut_end) || (cut < end && end < cut_end)) return {};
    const auto shifted = [&](CPlaceKey place) -> CPlaceKey {
        if (place.first == _fRange.end_row) place.second += _fNewRange.end_column - _fRange.end_column;
        return {place.first + _fNewRange.end_row - _fRange.end_row, place.second};
    };
    const CPlaceKey new_start = start >= cut_end && end > cut ? shifted(start) : start;
    const CPlaceKey new_end = end <= cut ? end : shifted(end);
    return CRange{new_start.first, new_start.second, new_end.first, new_end.second};
}

// An item is the same if it is where the edit has moved it, and if the same is said of it.
template <class Item, class SaysSame>
nb::tuple CChange::_Differences(const std::vector<Item>& before, const std::vector<Item>& after,
                                const SaysSame& says_same) const {
    struct CLeft {
        CRange range;
        size_t i;
        bool is_taken;
    };
    std::vector<CLeft> left;
    std::vector<bool> is_gone(before.size(), true);
    for (size_t i = 0; i < before.size(); ++i)
        if (const std::optional<CRange> range = Moved(before[i].Range())) left.push_back({*range, i, false});
    const auto is_before = [](const CLeft& one, const CLeft& other) {
        return KeyOf(one.range) < KeyOf(other.range);
    };
    if (!std::is_sorted(left.begin(), left.end(), is_before))
        std::stable_sort(left.begin(), left.end(), is_before);
    nb::list come, gone;
    for (const Item& item : after) {
        const auto [first, last] =
            std::equal_range(left.begin(), left.end(), CLeft{item.Range(), 0, false}, is_before);
        const auto same = std::find_if(
            first, last, [&](const CLeft& one) { return !one.is_taken && says_same(before[one.i], item); });
        if (same == last) {
            come.append(NewObject<Item>(item));
        } else {
            same->is_taken = true;
            is_gone[same->i] = false;
        }
    }
    for (size_t i = 0; i < before.size(); ++i)
        if (is_gone[i]) gone.append(NewObject<Item>(before[i]));
    return nb::make_tuple(nb::tuple(gone), nb::tuple(come));
}

nb::tuple CChange::Lines() const {
    std::vector<CLineItem> before, after;
    const CReplacedLines all{0, _fBefore->LineCount(), 0, _fAfter->LineCount()};
    for (const CReplacedLines& lines : _fReplaced ? *_fReplaced : std::vector{all}) {
        for (uint32_t i = lines.old_first; i < lines.old_end; ++i) before.emplace_back(_fBefore, i);
        for (uint32_t i = lines.new_first; i < lines.new_end; ++i) after.emplace_back(_fAfter, i);
    }
    return _Differences(before, after, [](const CLineItem& one, const CLineItem& other) {
        return one.Data().type == other.Data().type && one.Indent() == other.Indent() &&
               one.Text() == other.Text();
    });
}

nb::tuple CChange::Problems() const {
    return _Differences(AllOf(ProblemsOf(_fBefore)), AllOf(ProblemsOf(_fAfter)),
                        [](const CProblemItem& one, const CProblemItem& other) {
                            const CProblem &before = one.Data(), &after = other.Data();
                            return before.code == after.code && before.message == after.message &&
                                   before.hint == after.hint && before.related.size() == after.related.size();
                        });
}

nb::tuple CChange::Occurrences() const {
    const CNameQueries before = QueriesOf(*_fBefore), after = QueriesOf(*_fAfter);
    return _Differences(AllOf(OccurrencesOf(_fBefore)), AllOf(OccurrencesOf(_fAfter)),
                        [&](const COccurrenceItem& one, const COccurrenceItem& other) {
                            return one.Data().role == other.Data().role && one.Name() == other.Name() &&
                                   before.Resolution(one.i) == after.Resolution(other.i);
                        });
}

nb::tuple CChange::Scopes() const {
    return _Differences(AllOf(ScopesOf(_fBefore)), AllOf(ScopesOf(_fAfter)),
                        [](const CScopeItem& one, const CScopeItem& other) {
                            return CSaidOfScope(one) == CSaidOfScope(other);
                        });
}

}  // namespace codeloom
