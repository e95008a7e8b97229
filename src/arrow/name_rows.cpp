#include "arrow/name_rows.h"

#include <algorithm>

namespace codeloom {

// Occurrences

const TColumns<COccurrenceRow>& COccurrenceSource::Columns() {
    static const auto columns =
        TColumns<COccurrenceRow>()
            .Add<&COccurrenceRow::line>("line", "The index of its line.")
            .Add<&COccurrenceRow::name>("name", "The name as written; `*` for what `import *` binds.")
            .Add<&COccurrenceRow::role>("role", "What the name does there.")
            .AddRange<&COccurrenceRow::range>("", "Its row, from 1.")
            .Add<&COccurrenceRow::scope>("scope", "The index of the scope that it is in.")
            .Add<&COccurrenceRow::resolution>("resolution",
                                              "Where its name is bound; null for what belongs "
                                              "to no scope, such as an attribute.")
            .Add<&COccurrenceRow::home>("home",
                                        "The index of the scope that binds its name; null where no scope "
                                        "of the text is known to.")
            .Add<&COccurrenceRow::is_definition>("is_definition", "It is the name of a `def` or a `class`.")
            .Add<&COccurrenceRow::in_f_string>("in_f_string", "It is in a field of an f-string.")
            .Add<&COccurrenceRow::in_quotes>("in_quotes", "It is in a hint in quotes.")
            .Add<&COccurrenceRow::in_comment>("in_comment", "It is in a hint in a comment.")
            .AddRange<&COccurrenceRow::object>("object_",
                                               "Of an attribute, the row of what it hangs on; null for all "
                                               "else, as are the next three.");
    return columns;
}

COccurrenceRow COccurrenceSource::Of(uint32_t i) {
    const CTextNames& names = _fText.analysis.names;
    if (i < names.FirstOccurrence(_fLine)) _fLine = names.LineOfOccurrence(i);
    while (i >= names.FirstOccurrence(_fLine + 1)) ++_fLine;
    const COccurrence& item = names.occurrences.items[i];
    const EResolution resolution = _fQueries.Resolution(i);
    const auto has = [&](COccurrence::EFlag flag) { return (item.flags & flag) != 0; };
    COccurrenceRow row = {.line = _fLine,
                          .name = {item.name},
                          .role = item.role,
                          .range = _fText.rows.RangeOf(item.start, item.end),
                          .scope = names.ScopeOf(names.lines[_fLine], item.scope),
                          .resolution = std::nullopt,
                          .home = std::nullopt,
                          .is_definition = has(COccurrence::kIsDefinition),
                          .in_f_string = has(COccurrence::kInField),
                          .in_quotes = has(COccurrence::kInQuotes),
                          .in_comment = has(COccurrence::kInComment),
                          .object = std::nullopt};
    if (resolution != EResolution::kNone) row.resolution = resolution;
    if (resolution == EResolution::kScope) row.home = names.scopes.symbols[_fQueries.HomeOf(i)].scope;
    if (item.object_start < item.object_end)
        row.object = _fText.rows.RangeOf(item.object_start, item.object_end);
    return row;
}

// Scopes

const TColumns<CScopeRow>& CScopeSource::Columns() {
    static const auto columns =
        TColumns<CScopeRow>()
            .Add<&CScopeRow::scope>("scope",
                                    "The index of the scope, by which other tables name it; zero "
                                    "for the module.")
            .Add<&CScopeRow::kind>("kind", "What makes it a scope.")
            .Add<&CScopeRow::name>("name", "Of a class, a function or an alias; empty for others.")
            .Add<&CScopeRow::parent>("parent", "The index of the scope around it; null for the module.")
            .AddRange<&CScopeRow::range>("", "The row of its header or expression, from 1.");
    return columns;
}

CScopeRow CScopeSource::Of(uint32_t i) const {
    const CTextNames& names = _fText.analysis.names;
    const CScope& scope = names.scopes.scopes[i];
    const auto text_end = static_cast<uint32_t>(_fText.text.size());
    return {.scope = i,
            .kind = scope.kind,
            .name = {scope.name},
            .parent = i == 0 ? std::nullopt : std::optional(scope.parent),
            .range = i == 0 ? _fText.rows.RangeOf(0, text_end) : _fText.rows.RangeOf(scope.start, scope.end)};
}

// Symbols

const TColumns<CSymbolRow>& CSymbolSource::Columns() {
    static const auto columns =
        TColumns<CSymbolRow>()
            .Add<&CSymbolRow::scope>("scope", "The index of its scope.")
            .Add<&CSymbolRow::name>("name", "The name, as the class around it mangles it.")
            .Add<&CSymbolRow::is_local>("is_local", "The scope binds it.")
            .Add<&CSymbolRow::is_global>("is_global",
                                         "It is a name of the module, or isn't bound in the text.")
            .Add<&CSymbolRow::is_free>("is_free", "A function around the scope binds it.")
            .Add<&CSymbolRow::is_declared_global>("is_declared_global", "A `global` names it.")
            .Add<&CSymbolRow::is_nonlocal>("is_nonlocal", "A `nonlocal` names it.")
            .Add<&CSymbolRow::is_referenced>("is_referenced", "The scope reads it.")
            .Add<&CSymbolRow::is_assigned>("is_assigned",
                                           "It gets a value, other than by an import or as a parameter.")
            .Add<&CSymbolRow::is_parameter>("is_parameter", "It is a parameter.")
            .Add<&CSymbolRow::is_imported>("is_imported", "An import binds it.")
            .Add<&CSymbolRow::is_annotated>("is_annotated", "It is annotated.")
            .Add<&CSymbolRow::is_type_parameter>("is_type_parameter", "It is a type parameter.")
            .Add<&CSymbolRow::is_namespace>("is_namespace", "A definition right in the scope binds it.");
    return columns;
}

size_t CSymbolSource::Count(const CFileAnalysis& analysis) {
    const TPlainArray<CSymbol>& symbols = analysis.names.scopes.symbols;
    return static_cast<size_t>(std::count_if(symbols.begin(), symbols.end(),
                                             [](const CSymbol& symbol) { return symbol.IsMentioned(); }));
}

CSymbolSource::CSymbolSource(const CTextFacts& text) : _fText(text) {
    const CScopeTable& table = text.analysis.names.scopes;
    for (const CScope& scope : table.scopes) {
        for (uint32_t i = scope.first_symbol; i != kNoIndex; i = table.symbols[i].next)
            if (table.symbols[i].IsMentioned()) _fMentioned.push_back(i);
    }
}

CSymbolRow CSymbolSource::Of(uint32_t i) const {
    const CTextNames& names = _fText.analysis.names;
    const CSymbol& symbol = names.scopes.symbols[_fMentioned[i]];
    return {.scope = symbol.scope,
            .name = {symbol.name},
            .is_local = symbol.IsLocal(),
            .is_global = symbol.IsGlobal(),
            .is_free = symbol.binding == CSymbol::EBinding::kFree,
            .is_declared_global = symbol.binding == CSymbol::EBinding::kGlobalExplicit,
            .is_nonlocal = symbol.Is(CSymbol::kIsDeclaredNonlocal),
            .is_referenced = symbol.Is(CSymbol::kIsReferenced),
            .is_assigned = symbol.Is(CSymbol::kIsAssigned),
            .is_parameter = symbol.Is(CSymbol::kIsParameter),
            .is_imported = symbol.Is(CSymbol::kIsImported),
            .is_annotated = symbol.Is(CSymbol::kIsAnnotated),
            .is_type_parameter = symbol.Is(CSymbol::kIsTypeParameter),
            .is_namespace = symbol.Is(CSymbol::kIsNamespace)};
}

}  // namespace codeloom
