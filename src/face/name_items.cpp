#include "face/name_items.h"

#include "face/kinds.h"
#include "host/text.h"
#include "scopes/mangling.h"

namespace codeloom {

// Scopes

// That of the module is its whole text.
CRange CScopeItem::Range() const {
    if (i == 0) return RangeOfBytes(*file, 0, static_cast<uint32_t>(file->Text().size()));
    return RangeOfBytes(*file, Data().start, Data().end);
}

nb::object CScopeItem::Parent() const {
    return i == 0 ? nb::none() : NewObject<CScopeItem>(file, Data().parent);
}

nb::object CScopeItem::Symbols() const {
    nb::list symbols;
    const TPlainArray<CSymbol>& all = file->Names().scopes.symbols;
    for (uint32_t symbol_i = Data().first_symbol; symbol_i != kNoIndex; symbol_i = all[symbol_i].next)
        if (all[symbol_i].IsMentioned()) symbols.append(NewObject<CSymbolItem>(file, symbol_i));
    return nb::tuple(symbols);
}

std::string CScopeItem::Text() const {
    std::string text(WordOf(Data().kind));
    if (!Name().empty()) text.append(" ").append(Name());
    return text;
}

bool CScopeItem::operator==(const CScopeItem& other) const {
    if (file == other.file) return i == other.i;
    return Data().kind == other.Data().kind && Name() == other.Name() && Range() == other.Range() &&
           file->Path().equal(other.file->Path());
}

// Symbols

bool CSymbolItem::operator==(const CSymbolItem& other) const {
    if (file == other.file) return i == other.i;
    return Name() == other.Name() && Data().flags == other.Data().flags && Scope() == other.Scope();
}

// Occurrences

nb::object COccurrenceItem::Object() const {
    const COccurrence& data = Data();
    if (data.object_start == data.object_end) return nb::none();
    return NewObject<CRange>(RangeOfBytes(*file, data.object_start, data.object_end));
}

std::string COccurrenceItem::Mangled() const {
    const CTextNames& names = file->Names();
    const CNameTable& texts = *names.occurrences.names;
    const uint32_t symbol_i = names.scopes.symbol_of[i];
    if (symbol_i != kNoIndex) return std::string(texts.Text(names.scopes.symbols[symbol_i].name));
    // An attribute has no symbol, but is mangled too.
    const std::string_view name = Name();
    const bool is_attribute = Data().object_start != Data().object_end;
    uint32_t scope_i = is_attribute && IsPrivate(name) ? names.ScopeOfOccurrence(i) : 0;
    for (; scope_i != 0; scope_i = names.scopes.scopes[scope_i].parent) {
        const CScope& scope = names.scopes.scopes[scope_i];
        if (scope.kind == EScopeKind::kClass) return MangledName(name, texts.Text(scope.name));
    }
    return std::string(name);
}

nb::object COccurrenceItem::Symbol() const {
    const uint32_t symbol_i = file->Names().scopes.symbol_of[i];
    return symbol_i == kNoIndex ? nb::none() : NewObject<CSymbolItem>(file, symbol_i);
}

nb::object COccurrenceItem::Home() const {
    const uint32_t home = QueriesOf(*file).HomeOf(i);
    if (home == kNoIndex || Resolution() != EResolution::kScope) return nb::none();
    return NewObject<CScopeItem>(file, file->Names().scopes.symbols[home].scope);
}

bool COccurrenceItem::operator==(const COccurrenceItem& other) const {
    if (file == other.file) return i == other.i;
    return Data().role == other.Data().role && Name() == other.Name() && Range() == other.Range() &&
           file->Path().equal(other.file->Path());
}

// Sequences

COccurrenceItems OccurrencesOf(const CSourceFilePtr& file) {
    return {file, 0, 1, file->Names().occurrences.items.size()};
}

COccurrenceItems OccurrencesOf(const CLineItem& line) {
    const CTextNames& names = line.file->Names();
    const size_t first = names.FirstOccurrence(line.i);
    return {line.file, first, 1, names.FirstOccurrence(line.i + 1) - first};
}

CScopeItems ScopesOf(const CSourceFilePtr& file) {
    return {file, 0, 1, file->Names().scopes.scopes.size()};
}

}  // namespace codeloom
