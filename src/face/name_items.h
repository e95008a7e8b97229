// The names of an analysis as objects: occurrences, scopes and their symbols.
#pragma once

#include <string>

#include "face/items.h"
#include "scopes/queries.h"

namespace codeloom {

inline CNameQueries QueriesOf(const CSourceFile& file) {
    return {file.Names(), file.Text(), file.Version()};
}

struct CScopeItem : CItem {
    using CItem::CItem;
    static constexpr const char* kSequence = "scopes";

    const CScope& Data() const { return file->Names().scopes.scopes[i]; }
    std::string_view Name() const { return file->Names().occurrences.names->Text(Data().name); }
    CRange Range() const;
    nb::object Parent() const;
    nb::object Symbols() const;
    // "module", "function f"
    std::string Text() const;
    bool operator==(const CScopeItem& other) const;
    size_t Hash() const { return Range().row; }
};

struct CSymbolItem : CItem {
    using CItem::CItem;

    const CSymbol& Data() const { return file->Names().scopes.symbols[i]; }
    std::string_view Name() const { return file->Names().occurrences.names->Text(Data().name); }
    CScopeItem Scope() const { return {file, Data().scope}; }
    bool operator==(const CSymbolItem& other) const;
    size_t Hash() const { return std::hash<std::string_view>()(Name()); }
};

struct COccurrenceItem : CItem {
    using CItem::CItem;
    static constexpr const char* kSequence = "occurrences";

    const COccurrence& Data() const { return file->Names().occurrences.items[i]; }
    std::string_view Name() const { return file->Names().occurrences.Name(Data()); }
    CRange Range() const { return RangeOfBytes(*file, Data().start, Data().end); }
    CLineItem Line() const { return {file, file->Names().LineOfOccurrence(i)}; }
    CScopeItem Scope() const { return {file, file->Names().ScopeOfOccurrence(i)}; }
    EResolution Resolution() const { return QueriesOf(*file).Resolution(i); }
    bool Has(COccurrence::EFlag flag) const { return (Data().flags & flag) != 0; }
    // The range of what an attribute hangs on, else None.
    nb::object Object() const;
    // The name as a class around mangles it.
    std::string Mangled() const;
    nb::object Symbol() const;
    // The scope that binds it, else None.
    nb::object Home() const;
    bool operator==(const COccurrenceItem& other) const;
    size_t Hash() const { return std::hash<std::string_view>()(Name()) + Data().start; }
};

using COccurrenceItems = TItems<COccurrenceItem>;
using CScopeItems = TItems<CScopeItem>;

COccurrenceItems OccurrencesOf(const CSourceFilePtr& file);
COccurrenceItems OccurrencesOf(const CLineItem& line);
CScopeItems ScopesOf(const CSourceFilePtr& file);

}  // namespace codeloom
