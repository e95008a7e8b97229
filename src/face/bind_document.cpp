// The text of a document as the host sees it.
#include "face/bind_document.h"

#include <nanobind/nanobind.h>
#include <nanobind/stl/optional.h>
#include <nanobind/stl/pair.h>
#include <nanobind/stl/string_view.h>

#include "face/bind_items.h"
#include "face/change.h"
#include "face/document.h"
#include "face/settings.h"
#include "host/refuse_new.h"
#include "host/text.h"

namespace nb = nanobind;
using namespace nb::literals;

namespace codeloom {

namespace {

EUnit UnitOf(std::string_view encoding) {
    if (encoding == "utf-8") return EUnit::kByte;
    return encoding == "utf-16" ? EUnit::kUtf16 : EUnit::kCharacter;
}

void BindEdit(nb::module_& module) {
    nb::class_<CDocumentEdit> edit(module, "DocumentEdit", "For `codeloom.Document`: what an edit replaced.",
                                   nb::type_slots(kNotMadeByHost));
    edit.def_ro("range", &CDocumentEdit::range, "What was replaced, in the text before.");
    edit.def_ro("new_range", &CDocumentEdit::new_range, "What is there now.");
}

void BindChange(nb::module_& module) {
    nb::class_<CChange> change(module, "DocumentChange",
                               "For `codeloom.Change`: what an edit has changed. Each question is answered "
                               "by two tuples: what is gone, and what came.");
    change.def(
        "__init__",
        [](CChange* self, const CAnalysis& before, const CAnalysis& after, const CDocumentEdit& edit) {
            new (self) CChange(before.file, after.file, edit);
        },
        "before"_a, "after"_a, "edit"_a);
    change.def("moved", &CChange::Moved, "range"_a,
               "Where a range of the text before is now; None where the edit has cut into it.");
    change.def_prop_ro("lines", &CChange::Lines,
                       nb::sig("def lines(self) -> tuple[tuple[Line, ...], tuple[Line, ...]]"),
                       "Logical lines.");
    change.def_prop_ro("problems", &CChange::Problems,
                       nb::sig("def problems(self) -> tuple[tuple[Problem, ...], tuple[Problem, ...]]"),
                       "Problems.");
    change.def_prop_ro(
        "occurrences", &CChange::Occurrences,
        nb::sig("def occurrences(self) -> tuple[tuple[Occurrence, ...], tuple[Occurrence, ...]]"),
        "Appearances of names.");
    change.def_prop_ro("scopes", &CChange::Scopes,
                       nb::sig("def scopes(self) -> tuple[tuple[Scope, ...], tuple[Scope, ...]]"), "Scopes.");
}

}  // namespace

void BindDocument(nb::module_& module) {
    BindEdit(module);
    BindChange(module);
    nb::class_<CDocument> document(
        module, "DocumentText",
        "For `codeloom.Document`: a text that changes, in pieces that keep what they say.");
    document.def(
        "__init__",
        [](CDocument* self, nb::str text, nb::str path, nb::str python, int version, bool false_hints,
           std::string_view encoding) {
            new (self) CDocument(std::move(text), std::move(path), std::move(python),
                                 SettingsFor(version, false_hints), UnitOf(encoding));
        },
        "text"_a, "path"_a, "python"_a, "version"_a, "false_hints"_a, "encoding"_a);
    document.def_prop_ro(
        "text", [](const CDocument& self) { return TextFromUtf8(self.Text()); },
        nb::sig("def text(self) -> str"), "The text as it is now.");
    document.def_prop_ro(
        "analysis",
        [](const CDocument& self) -> nb::object {
            return self.File() ? nb::cast(CAnalysis{self.File()}) : nb::none();
        },
        nb::sig("def analysis(self) -> Analysis | None"),
        "What the text says; None for a text with NUL or lone surrogates.");
    document.def_prop_ro(
        "end", [](const CDocument& self) { return std::pair(self.End().row, self.End().column); },
        "The row and the column after the last character.");
    document.def(
        "column_of",
        [](const CDocument& self, int64_t row, int64_t column) { return self.ColumnOf({row, column}); },
        "row"_a, "column"_a,
        "A column in characters as one of the document. ValueError for an unknown place.");
    document.def(
        "character_column_of",
        [](const CDocument& self, int64_t row, int64_t column) {
            return self.CharacterColumnOf({row, column});
        },
        "row"_a, "column"_a,
        "A column of the document as one in characters: the end of the row for one after it.");
    document.def_prop_ro("row_count", &CDocument::RowCount, "How many rows the text has.");
    document.def(
        "row", [](const CDocument& self, int64_t row) { return TextFromUtf8(self.Row(row)); }, "row"_a,
        nb::sig("def row(self, row: int) -> str"), "The text of a row, without its end.");
    document.def(
        "between",
        [](const CDocument& self, std::pair<int64_t, int64_t> start, std::pair<int64_t, int64_t> end) {
            return TextFromUtf8(self.Between({start.first, start.second}, {end.first, end.second}));
        },
        "start"_a, "end"_a, nb::sig("def between(self, start: tuple[int, int], end: tuple[int, int]) -> str"),
        "The text between two places in characters.");
    document.def(
        "edit",
        [](CDocument& self, std::pair<int64_t, int64_t> start, std::pair<int64_t, int64_t> end,
           nb::str new_text) {
            return self.Edit({start.first, start.second}, {end.first, end.second}, std::move(new_text));
        },
        "start"_a, "end"_a, "new_text"_a, "Put a text in the place of a range, and say what was replaced.");
}

}  // namespace codeloom
