#include "face/change.h"

#include <algorithm>
#include <tuple>
#include <utility>

#include "face/name_items.h"
#include "text/scan.h"

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

// What a symbol answers beside its name; all else says how scopes use it that are further in.
constexpr uint16_t kAnswered = CSymbol::kIsReferenced | CSymbol::kIsAssigned | CSymbol::kIsParameter |
                               CSymbol::kIsImported | CSymbol::kIsAnnotated | CSymbol::kIsDeclaredNonlocal |
                               CSymbol::kIsTypeParameter | CSymbol::kIsNamespace;

using CAnswers = std::tuple<std::string_view, uint16_t, CSymbol::EBinding>;

// Takes items from both ends that are the same before and after.
template <class Candidates, class IsSame>
void DropSameEnds(Candidates& candidates, const IsSame& is_same) {
    auto &before = candidates.before, &after = candidates.after;
    const auto [end, after_end] =
        std::mismatch(before.rbegin(), before.rend(), after.rbegin(), after.rend(), is_same);
    before.erase(end.base(), before.end());
    after.erase(after_end.base(), after.end());
    const auto [first, after_first] =
        std::mismatch(before.begin(), before.end(), after.begin(), after.end(), is_same);
    before.erase(before.begin(), first);
    after.erase(after.begin(), after_first);
}

// The answers of a scope's symbols, in the order of their names.
std::vector<CAnswers> AnswersOf(const CScopeItem& scope) {
    const CTextNames& names = scope.file->Names();
    const TPlainArray<CSymbol>& all = names.scopes.symbols;
    std::vector<CAnswers> answers;
    for (uint32_t i = scope.Data().first_symbol; i != kNoIndex; i = all[i].next)
        if (all[i].IsMentioned())
            answers.emplace_back(names.occurrences.names->Text(all[i].name), all[i].flags & kAnswered,
                                 all[i].binding);
    std::sort(answers.begin(), answers.end());
    return answers;
}

// The same symbols in the same order: most scopes are known to be the same by that.
bool HaveEqualSymbols(const CScopeItem& one, const CScopeItem& other) {
    const CTextNames &before = one.file->Names(), &after = other.file->Names();
    if (before.occurrences.names != after.occurrences.names) return false;
    uint32_t i = one.Data().first_symbol, after_i = other.Data().first_symbol;
    for (; i != kNoIndex && after_i != kNoIndex;) {
        const CSymbol &symbol = before.scopes.symbols[i], &after_symbol = after.scopes.symbols[after_i];
        if (symbol.name != after_symbol.name || symbol.flags != after_symbol.flags ||
            symbol.binding != after_symbol.binding)
            return false;
        i = symbol.next;
        after_i = after_symbol.next;
    }
    return i == after_i;
}

// The same is said of two scopes beside their ranges.
bool SaysSame(const CScopeItem& one, const CScopeItem& other) {
    const auto kind_and_name = [](const CScopeItem& scope) {
        return std::pair(scope.Data().kind, scope.Name());
    };
    const CScopeItem parent(one.file, one.Data().parent), other_parent(other.file, other.Data().parent);
    return kind_and_name(one) == kind_and_name(other) &&
           kind_and_name(parent) == kind_and_name(other_parent) &&
           (HaveEqualSymbols(one, other) || AnswersOf(one) == AnswersOf(other));
}

}  // namespace

std::optional<CRange> CChange::Moved(const CRange& range) const {
    const CPlaceKey start = StartOf(range), end = EndOf(range);
    const CPlaceKey cut = StartOf(_fEdit.range), cut_end = EndOf(_fEdit.range);
    if ((cut < start && start < cut_end) || (cut < end && end < cut_end)) return {};
    const auto shifted = [&](CPlaceKey place) -> CPlaceKey {
        if (place.first == _fEdit.range.end_row)
            place.second += _fEdit.new_range.end_column - _fEdit.range.end_column;
        return {place.first + _fEdit.new_range.end_row - _fEdit.range.end_row, place.second};
    };
    const CPlaceKey new_start = start >= cut_end && end > cut ? shifted(start) : start;
    const CPlaceKey new_end = end <= cut ? end : shifted(end);
    return CRange{new_start.first, new_start.second, new_end.first, new_end.second};
}

// The byte of the text before is that of the text after.
bool CChange::_IsMoved(uint32_t before, uint32_t after) const {
    const CTextEdit& edit = _fEdit.bytes;
    if (before < edit.start) return before == after;
    return before > edit.end && before - edit.end + edit.NewEnd() == after;
}

// Calls `visit` with lines that are others, and `visit_same` with those between them, in the order of the
// text.
template <class Visit, class VisitSame>
void CChange::_ForEachRun(const Visit& visit, const VisitSame& visit_same) const {
    CReplacedLines same;
    for (const CReplacedLines& lines : *_fEdit.replaced) {
        same.old_end = lines.old_first;
        same.new_end = lines.new_first;
        visit_same(same);
        visit(lines);
        same.old_first = lines.old_end;
        same.new_first = lines.new_end;
    }
    same.old_end = _fBefore->LineCount();
    same.new_end = _fAfter->LineCount();
    visit_same(same);
}

// The items of lines that are others, and of all others those that aren't the same as the one in their place.
// `first_of` gives the first item of a line, in the text before or after.
template <class Item, class FirstOf, class IsSame>
CChange::TCandidates<Item> CChange::_Candidates(const FirstOf& first_of, const IsSame& is_same) const {
    TCandidates<Item> found;
    const auto add = [&](const CReplacedLines& lines) {
        for (uint32_t i = first_of(*_fBefore, lines.old_first); i < first_of(*_fBefore, lines.old_end); ++i)
            found.before.emplace_back(_fBefore, i);
        for (uint32_t i = first_of(*_fAfter, lines.new_first); i < first_of(*_fAfter, lines.new_end); ++i)
            found.after.emplace_back(_fAfter, i);
    };
    const auto add_others = [&](const CReplacedLines& lines) {
        const uint32_t end = first_of(*_fBefore, lines.old_end);
        uint32_t after_i = first_of(*_fAfter, lines.new_first);
        for (uint32_t i = first_of(*_fBefore, lines.old_first); i < end; ++i, ++after_i) {
            if (is_same(i, after_i)) continue;
            found.before.emplace_back(_fBefore, i);
            found.after.emplace_back(_fAfter, after_i);
        }
    };
    _ForEachRun(add, add_others);
    return found;
}

// An item is the same if it is where the edit has moved it, and if the same is said of it.
template <class Item, class SaysSame>
nb::tuple CChange::_Differences(const TCandidates<Item>& candidates, const SaysSame& says_same) const {
    struct CLeft {
        CRange range;
        size_t i;
        bool is_taken;
    };
    const std::vector<Item>& before = candidates.before;
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
    for (const Item& item : candidates.after) {
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

// Before the edit, and after the row that it ends in, lines are the same where their bytes are.
nb::tuple CChange::Lines() const {
    const auto line_itself = [](const CSourceFile&, uint32_t line) { return line; };
    const auto any = [](uint32_t, uint32_t) { return true; };
    TCandidates<CLineItem> lines = _Candidates<CLineItem>(line_itself, any);
    const size_t row_end = FindRowEnd(_fAfter->Text(), _fEdit.bytes.NewEnd());
    DropSameEnds(lines, [&](const CLineItem& one, const CLineItem& other) {
        const CLine before = one.Data(), after = other.Data();
        return (before.end < _fEdit.bytes.start || after.start > row_end) && before.type == after.type &&
               _IsMoved(before.start, after.start) && _IsMoved(before.end, after.end);
    });
    return _Differences(lines, [](const CLineItem& one, const CLineItem& other) {
        return one.Data().type == other.Data().type && one.Indent() == other.Indent() &&
               one.Text() == other.Text();
    });
}

nb::tuple CChange::Problems() const {
    const auto says_same = [](const CProblemItem& one, const CProblemItem& other) {
        const CProblem &before = one.Data(), &after = other.Data();
        return before.code == after.code && before.message == after.message && before.hint == after.hint &&
               before.related.size() == after.related.size();
    };
    TCandidates<CProblemItem> problems{AllOf(ProblemsOf(_fBefore)), AllOf(ProblemsOf(_fAfter))};
    DropSameEnds(problems, [&](const CProblemItem& one, const CProblemItem& other) {
        return _IsMoved(one.Data().start, other.Data().start) && _IsMoved(one.Data().end, other.Data().end) &&
               says_same(one, other);
    });
    return _Differences(problems, says_same);
}

nb::tuple CChange::Occurrences() const {
    const CNameQueries before = QueriesOf(*_fBefore), after = QueriesOf(*_fAfter);
    const auto first_of = [](const CSourceFile& file, uint32_t line) {
        return file.Names().FirstOccurrence(line);
    };
    const auto is_same = [&](uint32_t i, uint32_t after_i) {
        return before.Resolution(i) == after.Resolution(after_i);
    };
    return _Differences(_Candidates<COccurrenceItem>(first_of, is_same), [&](const COccurrenceItem& one,
                                                                             const COccurrenceItem& other) {
        return one.Data().role == other.Data().role && one.Name() == other.Name() && is_same(one.i, other.i);
    });
}

// That of the module is on no line.
nb::tuple CChange::Scopes() const {
    const auto first_of = [](const CSourceFile& file, uint32_t line) {
        return file.Names().FirstScope(line);
    };
    const auto is_same = [&](uint32_t i, uint32_t after_i) {
        const CScopeItem one(_fBefore, i), other(_fAfter, after_i);
        return _IsMoved(one.Data().start, other.Data().start) && _IsMoved(one.Data().end, other.Data().end) &&
               SaysSame(one, other);
    };
    TCandidates<CScopeItem> scopes = _Candidates<CScopeItem>(first_of, is_same);
    scopes.before.insert(scopes.before.begin(), CScopeItem(_fBefore, 0));
    scopes.after.insert(scopes.after.begin(), CScopeItem(_fAfter, 0));
    return _Differences(scopes, SaysSame);
}

}  // namespace codeloom
