#include "face/bind_names.h"

#include <algorithm>

#include <nanobind/stl/string.h>

#include "document/columns.h"
#include "face/kinds.h"
#include "face/name_items.h"
#include "host/arguments.h"
#include "host/errors.h"
#include "host/text.h"

namespace nb = nanobind;
using namespace nb::literals;

namespace codeloom {

namespace {

nb::object TupleOf(const CSourceFilePtr& file, const std::vector<uint32_t>& occurrences) {
    nb::list items;
    for (const uint32_t i : occurrences) items.append(NewObject<COccurrenceItem>(file, i));
    return nb::tuple(items);
}

// The byte of a place that counts from 1, columns in characters; beyond the text its end.
uint32_t OffsetOf(const CSourceFile& file, int row, int column) {
    if (row < 1) RaiseHost(PyExc_ValueError, "row must be at least 1");
    if (column < 1) RaiseHost(PyExc_ValueError, "column must be at least 1");
    if (static_cast<uint32_t>(row) > file.RowCount()) return static_cast<uint32_t>(file.Text().size());
    const auto row_i = static_cast<uint32_t>(row - 1);
    const CPlacedRows around = file.RowsAround(row_i);
    const std::string_view text = around.TextOf(row_i);
    const size_t before = *BytesBefore(text, column, EUnit::kCharacter);  // no column is within a character
    return around.StartOf(row_i) + static_cast<uint32_t>(std::min(before, text.size()));
}

nb::object OccurrenceAt(const CAnalysis& analysis, nb::handle row, nb::handle column) {
    const uint32_t offset = OffsetOf(*analysis.file, IntArgument(row, "row"), IntArgument(column, "column"));
    const uint32_t found = QueriesOf(*analysis.file).OccurrenceAt(offset);
    return found == kNoIndex ? nb::none() : NewObject<COccurrenceItem>(analysis.file, found);
}

nb::object References(const CAnalysis& analysis, nb::handle argument) {
    const auto& occurrence = InstanceArgument<COccurrenceItem>(argument, "occurrence", "an Occurrence");
    if (occurrence.file != analysis.file) RaiseHost(PyExc_ValueError, "occurrence is of another analysis");
    return TupleOf(analysis.file, QueriesOf(*analysis.file).References(occurrence.i));
}

void BindScope(nb::module_& module) {
    auto scope = BindItem<CScopeItem>(
        module, "Scope", "A module, class, function or other part of a text that has names of its own.");
    scope.def_prop_ro(
        "kind", [](const CScopeItem& self) { return MemberOf(self.Data().kind); },
        nb::sig("def kind(self) -> ScopeKind"), "What makes it a scope.");
    scope.def_prop_ro(
        "name", [](const CScopeItem& self) { return TextFromUtf8(self.Name()); },
        nb::sig("def name(self) -> str"), "Of a class, a function or an alias; empty for others.");
    scope.def_prop_ro("parent", &CScopeItem::Parent, nb::sig("def parent(self) -> Scope | None"),
                      "The scope around it; None for the module.");
    scope.def_prop_ro("range", &CScopeItem::Range,
                      "From its header or expression to the end of its last line.");
    scope.def_prop_ro("symbols", &CScopeItem::Symbols, nb::sig("def symbols(self) -> tuple[Symbol, ...]"),
                      "Its names, in the order in which they first appear.");
    scope.def("__repr__", [](const CScopeItem& self) {
        return nb::str("<Scope {}: {}>").format(self.Range().row, TextFromUtf8(self.Text()));
    });
}

// A question that the module `symtable` answers too.
void BindFlag(nb::class_<CSymbolItem>& symbol, const char* name, CSymbol::EFlag flag, const char* meaning) {
    symbol.def_prop_ro(name, [flag](const CSymbolItem& self) { return self.Data().Is(flag); }, meaning);
}

void BindBinding(nb::class_<CSymbolItem>& symbol, const char* name, CSymbol::EBinding binding,
                 const char* meaning) {
    symbol.def_prop_ro(
        name, [binding](const CSymbolItem& self) { return self.Data().binding == binding; }, meaning);
}

void BindSymbol(nb::module_& module) {
    nb::class_<CSymbolItem> symbol(
        module, "Symbol", "A name in a scope. It answers as the interpreter's module `symtable` does.",
        nb::pooled(), nb::type_slots(kNotMadeByHost));
    BindEquality(symbol);
    BindCopies(symbol);
    symbol.def_prop_ro(
        "name", [](const CSymbolItem& self) { return TextFromUtf8(self.Name()); },
        nb::sig("def name(self) -> str"), "The name, as the class around it mangles it.");
    symbol.def_prop_ro("scope", &CSymbolItem::Scope, "The scope that it is a name of.");
    symbol.def_prop_ro(
        "is_local", [](const CSymbolItem& self) { return self.Data().IsLocal(); }, "The scope binds it.");
    symbol.def_prop_ro(
        "is_global", [](const CSymbolItem& self) { return self.Data().IsGlobal(); },
        "It is a name of the module, or isn't bound in the text.");
    BindBinding(symbol, "is_free", CSymbol::EBinding::kFree, "A function around the scope binds it.");
    BindBinding(symbol, "is_declared_global", CSymbol::EBinding::kGlobalExplicit, "A `global` names it.");
    BindFlag(symbol, "is_nonlocal", CSymbol::kIsDeclaredNonlocal, "A `nonlocal` names it.");
    BindFlag(symbol, "is_referenced", CSymbol::kIsReferenced, "The scope reads it.");
    BindFlag(symbol, "is_assigned", CSymbol::kIsAssigned,
             "It gets a value, other than by an import or as a parameter.");
    BindFlag(symbol, "is_parameter", CSymbol::kIsParameter, "It is a parameter.");
    BindFlag(symbol, "is_imported", CSymbol::kIsImported, "An import binds it.");
    BindFlag(symbol, "is_annotated", CSymbol::kIsAnnotated, "It is annotated.");
    BindFlag(symbol, "is_type_parameter", CSymbol::kIsTypeParameter, "It is a type parameter.");
    BindFlag(symbol, "is_namespace", CSymbol::kIsNamespace, "A definition right in the scope binds it.");
    symbol.def("__repr__", [](const CSymbolItem& self) {
        return nb::str("<Symbol {} of {}>")
            .format(TextFromUtf8(self.Name()), TextFromUtf8(self.Scope().Text()));
    });
}

void BindOccurrence(nb::module_& module) {
    auto occurrence = BindItem<COccurrenceItem>(module, "Occurrence", "One appearance of a name in a text.");
    occurrence.def_prop_ro(
        "name", [](const COccurrenceItem& self) { return self.file->HostNameOfOccurrence(self.Data().name); },
        nb::sig("def name(self) -> str"), "The name as written; `*` for what `import *` binds.");
    occurrence.def_prop_ro(
        "role", [](const COccurrenceItem& self) { return MemberOf(self.Data().role); },
        nb::sig("def role(self) -> Role"), "What the name does there.");
    occurrence.def_prop_ro("range", &COccurrenceItem::Range, "Where it is.");
    occurrence.def_prop_ro("line", &COccurrenceItem::Line, "The line that it is on.");
    occurrence.def_prop_ro("scope", &COccurrenceItem::Scope, "The scope that it is in.");
    occurrence.def_prop_ro(
        "resolution", [](const COccurrenceItem& self) { return MemberOf(self.Resolution()); },
        nb::sig("def resolution(self) -> Resolution | None"),
        "Where its name is bound; None for what belongs to no scope, such as an attribute.");
    occurrence.def_prop_ro("home", &COccurrenceItem::Home, nb::sig("def home(self) -> Scope | None"),
                           "The scope that binds its name; None where no scope of the text is known to.");
    occurrence.def_prop_ro("symbol", &COccurrenceItem::Symbol, nb::sig("def symbol(self) -> Symbol | None"),
                           "Its name in its scope; None for what belongs to no scope.");
    occurrence.def_prop_ro("object", &COccurrenceItem::Object, nb::sig("def object(self) -> Range | None"),
                           "Of an attribute, what it hangs on: `a` for the `b` of `a.b`.");
    occurrence.def_prop_ro(
        "mangled", [](const COccurrenceItem& self) { return TextFromUtf8(self.Mangled()); },
        nb::sig("def mangled(self) -> str"),
        "The name as the class around mangles it: `_A__x` for `__x`, else the name itself.");
    occurrence.def_prop_ro(
        "is_definition", [](const COccurrenceItem& self) { return self.Has(COccurrence::kIsDefinition); },
        "It is the name of a `def` or a `class`.");
    occurrence.def_prop_ro(
        "in_f_string", [](const COccurrenceItem& self) { return self.Has(COccurrence::kInField); },
        "It is in a field of an f-string.");
    occurrence.def_prop_ro(
        "in_quotes", [](const COccurrenceItem& self) { return self.Has(COccurrence::kInQuotes); },
        "It is in a hint in quotes.");
    occurrence.def_prop_ro(
        "in_comment", [](const COccurrenceItem& self) { return self.Has(COccurrence::kInComment); },
        "It is in a hint in a comment.");
    occurrence.def("__repr__", [](const COccurrenceItem& self) {
        const CRange range = self.Range();
        const std::string_view role = WordOf(self.Data().role);
        return nb::str("<Occurrence {}:{}: {} {}>")
            .format(range.row, range.column, TextFromUtf8(role), TextFromUtf8(self.Name()));
    });
}

}  // namespace

void BindNameItems(nb::module_& module) {
    BindScope(module);
    BindSymbol(module);
    BindOccurrence(module);
    BindItems<COccurrenceItems>(module, "Occurrences",
                                "class Occurrences(collections.abc.Sequence[Occurrence])");
    BindItems<CScopeItems>(module, "Scopes", "class Scopes(collections.abc.Sequence[Scope])");
}

void BindNamesOfLine(nb::class_<CLineItem>& line) {
    line.def_prop_ro(
        "occurrences", [](const CLineItem& self) { return OccurrencesOf(self); },
        nb::sig("def occurrences(self) -> Occurrences"),
        "Every appearance of a name on it, in their order; nothing when it has a problem of its grammar.");
}

void BindNamesOfAnalysis(nb::class_<CAnalysis>& analysis) {
    analysis.def_prop_ro(
        "occurrences", [](const CAnalysis& self) { return OccurrencesOf(self.file); },
        "Every appearance of a name, in the order of the text. Names that are only made at run time, by "
        "`exec`, `globals()` or `setattr`, don't appear.");
    analysis.def_prop_ro(
        "scopes", [](const CAnalysis& self) { return ScopesOf(self.file); },
        "The scopes, in the order in which they begin; the module is the first.");
    analysis.def(
        "definitions",
        [](const CAnalysis& self, nb::handle name) {
            const CUtf8 text(StrArgument(name, "name"));
            return TupleOf(self.file, QueriesOf(*self.file).Definitions(text));
        },
        "name"_a, nb::sig("def definitions(self, name: str) -> tuple[Occurrence, ...]"),
        "Where the name gets a value, in any scope. Which of these runs isn't known.");
    analysis.def("references", &References, "occurrence"_a,
                 nb::sig("def references(self, occurrence: Occurrence) -> tuple[Occurrence, ...]"),
                 "All occurrences of the name that its scope binds, this one included; none for an "
                 "attribute, whose object isn't known. ValueError for one of another analysis.");
    analysis.def(
        "occurrence_at", &OccurrenceAt, "row"_a, "column"_a,
        nb::sig("def occurrence_at(self, row: int, column: int) -> Occurrence | None"),
        "The occurrence at a place, or the one that ends there. Row and column count from 1, columns in "
        "characters; ValueError for less than 1.");
    analysis.def(
        "unused",
        [](const CAnalysis& self, nb::handle parameters) {
            const bool with_parameters = BoolArgument(parameters, "parameters");
            return TupleOf(self.file, QueriesOf(*self.file).Unused(with_parameters));
        },
        nb::kw_only(), "parameters"_a = false,
        nb::sig("def unused(self, *, parameters: bool = False) -> tuple[Occurrence, ...]"),
        "The first binding of each import and of each local name of a function that nothing in the text "
        "reads; with `parameters` theirs too. Names that begin with `_` are left out, and what `__all__` "
        "lists. What other modules read isn't known, nor which names are looked up as text.");
    analysis.def(
        "undefined",
        [](const CAnalysis& self) { return TupleOf(self.file, QueriesOf(*self.file).Undefined()); },
        nb::sig("def undefined(self) -> tuple[Occurrence, ...]"),
        "What is read although nothing in the text binds it and no builtin has the name; what "
        "`import *` or a line with a fault may bind is left out. Whether a binding runs before isn't known.");
}

}  // namespace codeloom
