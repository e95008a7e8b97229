#include "scopes/queries.h"

#include <algorithm>
#include <array>
#include <unordered_set>

#include "scopes/builtin_names.h"

namespace codeloom {

namespace {

// Set in every class body.
bool IsNameOfClassBody(std::string_view name) {
    return name == "__module__" || name == "__qualname__";
}

// What reads the names of the scope that calls it.
bool ReadsAllNames(std::string_view name) {
    return name == "locals" || name == "vars" || name == "eval" || name == "exec" || name == "dir";
}

bool NeedsBinding(ERole role) {
    return role == ERole::kRead || role == ERole::kAugment || role == ERole::kDelete;
}

// What follows `globals` on its row.
bool IsOnlyRead(std::string_view rest) {
    constexpr std::array<std::string_view, 5> kReaders = {"().get(", "().keys(", "().items(", "().values(",
                                                          "().copy("};
    return !rest.starts_with("()") ||
           std::ranges::any_of(kReaders, [&](std::string_view reader) { return rest.starts_with(reader); });
}

bool IsUse(ERole role) {
    return role == ERole::kRead || role == ERole::kDelete;
}

}  // namespace

EResolution CNameQueries::Resolution(uint32_t occurrence_i) const {
    const uint32_t symbol_i = _fNames.scopes.symbol_of[occurrence_i];
    if (symbol_i == kNoIndex) return EResolution::kNone;
    const CSymbol& symbol = _fNames.scopes.symbols[symbol_i];
    const CSymbol& home = _fNames.scopes.symbols[symbol.home];
    if (home.MayBeBound()) return EResolution::kScope;
    const std::string_view name = _fNames.occurrences.names->Text(home.name);
    if (IsBuiltinName(name, _fVersion)) return EResolution::kBuiltin;
    if (IsNameOfClassBody(name) && _fNames.scopes.scopes[symbol.scope].kind == EScopeKind::kClass)
        return EResolution::kBuiltin;
    return _IsLost(home.name) || _MayBindAnyName() ? EResolution::kPerhaps : EResolution::kUnknown;
}

bool CNameQueries::_IsLost(uint32_t name) const {
    return std::binary_search(_fNames.lost_names.begin(), _fNames.lost_names.end(), name);
}

// By `import *`, which a function of Python 2 may have too, or as `globals().update(a)`, `exec(a)` and
// `enum.global_enum(a)` do.
bool CNameQueries::_MayBindAnyName() const {
    if (!_fMayBindAnyName) {
        const TPlainArray<CScope>& scopes = _fNames.scopes.scopes;
        const TPlainArray<COccurrence>& items = _fNames.occurrences.items;
        _fMayBindAnyName = std::any_of(scopes.begin(), scopes.end(),
                                       [](const CScope& scope) { return scope.has_star_import; }) ||
                           std::any_of(items.begin(), items.end(), [&](const COccurrence& occurrence) {
                               return _BindsUnseen(occurrence);
                           });
    }
    return *_fMayBindAnyName;
}

bool CNameQueries::_BindsUnseen(const COccurrence& occurrence) const {
    const std::string_view name = _fNames.occurrences.Name(occurrence);
    // Members of an enumeration become global names.
    if (name == "global_enum" || name == "_convert_") return true;
    if (occurrence.role != ERole::kRead) return false;
    const std::string_view rest = _fText.substr(occurrence.end);
    return name == "exec" ? rest.starts_with('(') : name == "globals" && !IsOnlyRead(rest);
}

uint32_t CNameQueries::OccurrenceAt(uint32_t offset) const {
    const TPlainArray<COccurrence>& items = _fNames.occurrences.items;
    const auto after = std::upper_bound(
        items.begin(), items.end(), offset,
        [](uint32_t wanted, const COccurrence& occurrence) { return wanted < occurrence.start; });
    if (after == items.begin() || (after - 1)->end < offset) return kNoIndex;
    return static_cast<uint32_t>(after - 1 - items.begin());
}

std::vector<uint32_t> CNameQueries::Definitions(std::string_view name) const {
    std::vector<uint32_t> found;
    const TPlainArray<COccurrence>& items = _fNames.occurrences.items;
    for (uint32_t i = 0; i < items.size(); ++i)
        if (IsBinding(items[i].role) && _fNames.occurrences.Name(items[i]) == name) found.push_back(i);
    return found;
}

std::vector<uint32_t> CNameQueries::References(uint32_t occurrence_i) const {
    std::vector<uint32_t> found;
    const uint32_t home = HomeOf(occurrence_i);
    if (home == kNoIndex) return found;
    for (uint32_t i = 0; i < _fNames.scopes.symbol_of.size(); ++i)
        if (HomeOf(i) == home) found.push_back(i);
    return found;
}

// Unused names

// Reasons not to call a name unused.
struct CNameQueries::CUses {
    std::vector<bool> is_used;                      // by symbol
    std::vector<bool> is_all_read;                  // by scope: something in it may read any of its names
    std::unordered_set<std::string_view> exported;  // by `__all__`
};

CNameQueries::CUses CNameQueries::_Uses() const {
    CUses uses;
    const CScopeTable& table = _fNames.scopes;
    uses.is_used.resize(table.symbols.size());
    uses.is_all_read.resize(table.scopes.size());
    for (const CSymbol& symbol : table.symbols)
        if (symbol.Is(CSymbol::kIsReferenced) && ReadsAllNames(_fNames.occurrences.names->Text(symbol.name)))
            uses.is_all_read[symbol.scope] = true;
    const TPlainArray<COccurrence>& items = _fNames.occurrences.items;
    for (uint32_t i = 0; i < items.size(); ++i) {
        const uint32_t home = HomeOf(i);
        if (home == kNoIndex) continue;
        if (IsUse(items[i].role)) uses.is_used[home] = true;
        if (_fNames.occurrences.Name(items[i]) == "__all__" && (IsBinding(items[i].role) || _IsExtended(i)))
            _AddExported(uses, i);
    }
    return uses;
}

// `__all__.extend(['a'])`
bool CNameQueries::_IsExtended(uint32_t occurrence_i) const {
    const std::string_view rest = _fText.substr(_fNames.occurrences.items[occurrence_i].end);
    return rest.starts_with(".extend(") || rest.starts_with(".append(");
}

// The strings after `__all__` on its line.
void CNameQueries::_AddExported(CUses& uses, uint32_t occurrence_i) const {
    const uint32_t end = _fNames.lines[_fNames.LineOfOccurrence(occurrence_i)].end;
    std::string_view rest = _fText.substr(0, end).substr(_fNames.occurrences.items[occurrence_i].end);
    for (size_t start = 0; (start = rest.find_first_of("'\"")) < rest.size();) {
        const size_t length = rest.substr(start + 1).find(rest[start]);
        if (length == std::string_view::npos) return;
        uses.exported.insert(rest.substr(start + 1, length));
        rest.remove_prefix(start + length + 2);
    }
}

std::vector<uint32_t> CNameQueries::Unused(bool with_parameters) const {
    CUses uses = _Uses();
    std::vector<uint32_t> found;
    for (uint32_t i = 0; i < _fNames.occurrences.items.size(); ++i) {
        const uint32_t home = HomeOf(i);
        if (home == kNoIndex || !IsBinding(_fNames.occurrences.items[i].role)) continue;
        if (uses.is_used[home]) continue;
        if (_MayBeUnused(i, uses, with_parameters)) found.push_back(i);
        uses.is_used[home] = true;
    }
    return found;
}

bool CNameQueries::_MayBeUnused(uint32_t occurrence_i, const CUses& uses, bool with_parameters) const {
    const COccurrence& occurrence = _fNames.occurrences.items[occurrence_i];
    const std::string_view name = _fNames.occurrences.Name(occurrence);
    const uint32_t scope_i = _fNames.scopes.symbols[HomeOf(occurrence_i)].scope;
    const CScope& scope = _fNames.scopes.scopes[scope_i];
    if (name.starts_with('_') || _IsLost(occurrence.name) || uses.is_all_read[scope_i]) return false;
    if (occurrence.role == ERole::kParameter) return with_parameters;
    if (scope.kind == EScopeKind::kFunction) return true;
    const bool is_module_import = occurrence.role == ERole::kImport && scope.kind == EScopeKind::kModule;
    return is_module_import && !uses.exported.contains(name) && !_IsImportForOthers(occurrence_i);
}

// `from __future__ import a`, and `from m import a as a`, which is how a module offers what it imports.
bool CNameQueries::_IsImportForOthers(uint32_t occurrence_i) const {
    const TPlainArray<COccurrence>& items = _fNames.occurrences.items;
    const uint32_t first = _fNames.lines[_fNames.LineOfOccurrence(occurrence_i)].first_occurrence;
    if (_fNames.occurrences.Name(items[first]) == "__future__") return true;
    const COccurrence& before = items[occurrence_i - (occurrence_i > first)];
    return before.role == ERole::kOrigin && before.name == items[occurrence_i].name;
}

std::vector<uint32_t> CNameQueries::Undefined() const {
    std::vector<uint32_t> found;
    for (uint32_t i = 0; i < _fNames.occurrences.items.size(); ++i)
        if (NeedsBinding(_fNames.occurrences.items[i].role) && Resolution(i) == EResolution::kUnknown)
            found.push_back(i);
    return found;
}

}  // namespace codeloom
