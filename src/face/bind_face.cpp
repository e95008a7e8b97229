// The classes of the face as the host sees them.
#include "face/bind_face.h"

#include <nanobind/nanobind.h>
#include <nanobind/operators.h>
#include <nanobind/stl/string.h>
#include <nanobind/stl/string_view.h>
#include <nanobind/stl/tuple.h>

#include "face/arrow_streams.h"
#include "face/bind_items.h"
#include "face/bind_names.h"
#include "face/items.h"
#include "face/kinds.h"
#include "face/settings.h"
#include "face/source_batch.h"
#include "host/arguments.h"
#include "host/refuse_new.h"
#include "host/text.h"

namespace nb = nanobind;
using namespace nb::literals;

namespace codeloom {

namespace {

CAnalysis MakeAnalysis(nb::bytes utf8, nb::str path, nb::str python, int version, bool false_hints,
                       nb::list faults, nb::list unreadable) {
    return {std::make_shared<const CSourceFile>(std::move(utf8), std::move(path), std::move(python),
                                                SettingsFor(version, false_hints),
                                                UnreadableOf(faults, unreadable))};
}

// The arguments that make the analysis anew.
nb::object ArgumentsOf(const CSourceFile& file) {
    nb::list faults, unreadable;
    for (const CUnreadable::CFault& fault : file.Unreadable().faults)
        faults.append(nb::make_tuple(fault.start, fault.end, fault.message));
    for (const uint32_t offset : file.Unreadable().offsets) unreadable.append(offset);
    return nb::make_tuple(file.Utf8(), file.Path(), file.Python(), file.Version(), file.TakesFalseHints(),
                          faults, unreadable);
}

void BindRange(nb::module_& module) {
    nb::class_<CRange> range(
        module, "Range",
        "A piece of a text. Rows and columns count from 1, columns in characters; the end is "
        "after the last character.",
        nb::pooled());
    range.def(
        "__init__",
        [](CRange* self, nb::handle row, nb::handle column, nb::handle end_row, nb::handle end_column) {
            new (self) CRange{CountArgument(row, "row"), CountArgument(column, "column"),
                              CountArgument(end_row, "end_row"), CountArgument(end_column, "end_column")};
        },
        "row"_a, "column"_a, "end_row"_a, "end_column"_a,
        nb::sig("def __init__(self, row: int, column: int, end_row: int, end_column: int) -> None"));
    range.def_ro("row", &CRange::row, "The row of its first character.");
    range.def_ro("column", &CRange::column, "The column of its first character.");
    range.def_ro("end_row", &CRange::end_row, "The row of its last character.");
    range.def_ro("end_column", &CRange::end_column, "The column after its last character.");
    range.def(
        "__eq__", [](const CRange& self, const CRange& other) { return self == other; }, nb::is_operator(),
        nb::sig("def __eq__(self, other: object, /) -> bool"));
    range.def("__hash__", [](const CRange& self) {
        return ((size_t{self.row} * 1'000'003 + self.column) * 1'000'003 + self.end_row) * 31 +
               self.end_column;
    });
    range.def("__repr__", [](const CRange& self) {
        return nb::str("Range({}, {}, {}, {})").format(self.row, self.column, self.end_row, self.end_column);
    });
    range.def(
        "__reduce__",
        [](nb::pointer_and_handle<CRange> self) {
            return nb::make_tuple(self.h.type(), nb::make_tuple(self.p->row, self.p->column, self.p->end_row,
                                                                self.p->end_column));
        },
        nb::sig("def __reduce__(self) -> tuple[typing.Any, ...]"));
    BindCopies(range);
}

void BindProblem(nb::module_& module) {
    auto problem = BindItem<CProblemItem>(module, "Problem", "A fault of a text.");
    problem.def_prop_ro(
        "path", [](const CProblemItem& self) { return self.file->Path(); }, "The path of its text.");
    problem.def_prop_ro(
        "message", [](const CProblemItem& self) { return TextFromUtf8(self.Message()); },
        nb::sig("def message(self) -> str"), "What is wrong, in words.");
    problem.def_prop_ro("code", &CProblemItem::Code, "What kind of fault it is, such as \"CL201\".");
    problem.def_prop_ro(
        "severity",
        [](const CProblemItem& self) { return TextFromUtf8(WordOf(SeverityOf(self.Data().code))); },
        nb::sig("def severity(self) -> typing.Literal[\"error\", \"warning\"]"),
        "\"error\" for what the interpreter refuses; \"warning\" for a type hint that can't be read, a way "
        "out of a `finally`, and a line that is too long to analyse.");
    problem.def_prop_ro("range", &CProblemItem::Range,
                        "Where it is: at least one character, unless the text is empty.");
    problem.def_prop_ro("related", &CProblemItem::Related,
                        nb::sig("def related(self) -> tuple[tuple[Range, str], ...]"),
                        "Other places that belong to it, each with a few words on why.");
    problem.def_prop_ro(
        "hint",
        [](const CProblemItem& self) -> nb::object {
            return self.Data().hint.empty() ? nb::none() : TextFromUtf8(self.Data().hint);
        },
        nb::sig("def hint(self) -> str | None"), "What may have been meant; None where that isn't known.");
    problem.def_prop_ro(
        "source_row",
        [](const CProblemItem& self) {
            const uint32_t start = self.Data().start;
            const CPlacedRows at = self.file->RowsAt(start);
            return TextFromUtf8(at.rows.Text(at.rows.PlaceOf(start - at.start).row));
        },
        nb::sig("def source_row(self) -> str"), "The text of the row in which it begins.");
    problem.def("__str__", &CProblemItem::Text);
    problem.def("__repr__",
                [](const CProblemItem& self) { return nb::str("<Problem {}>").format(self.Text()); });
}

void BindLine(nb::module_& module) {
    auto line = BindItem<CLineItem>(
        module, "Line", "A logical line: a statement, the header of one, or a comment on rows of its own.");
    line.def_prop_ro("range", &CLineItem::Range, "From its first character to its last one.");
    line.def_prop_ro(
        "kind", [](const CLineItem& self) { return MemberOf(self.Data().type); },
        nb::sig("def kind(self) -> LineKind"), "What kind of statement it holds or begins.");
    line.def_prop_ro(
        "text", [](const CLineItem& self) { return TextFromUtf8(self.Text()); },
        nb::sig("def text(self) -> str"), "Its text, as written.");
    line.def_prop_ro(
        "indent",
        [](const CLineItem& self) -> nb::object {
            const int indent = self.Indent();
            if (indent < 0) return nb::none();
            return nb::int_(indent);
        },
        nb::sig("def indent(self) -> int | None"),
        "The width of the blanks before it; None after another line on the same row.");
    line.def_prop_ro(
        "problems", [](const CLineItem& self) { return ProblemsOf(self); },
        "What is wrong with it, in the order of the text.");
    line.def_prop_ro(
        "records", [](const CLineItem& self) { return RecordsOf(self); },
        "What it says of names; empty when it has a problem.");
    BindNamesOfLine(line);
    line.def("__repr__", [](const CLineItem& self) {
        return nb::str("<Line {}: {!r}>").format(self.Range().row, TextFromUtf8(self.Text()));
    });
}

void BindRecord(nb::module_& module) {
    auto record = BindItem<CRecordItem>(module, "Record", "What a line says of one name.");
    record.def_prop_ro(
        "kind", [](const CRecordItem& self) { return MemberOf(RecordKindOf(self.Data().kind)); },
        nb::sig("def kind(self) -> RecordKind"), "What is said.");
    record.def_prop_ro(
        "name", [](const CRecordItem& self) { return self.file->HostName(self.Data().name); },
        nb::sig("def name(self) -> str"), "The name; a chain such as `a.b` is one too.");
    record.def_prop_ro(
        "payload", [](const CRecordItem& self) { return TextFromUtf8(self.Payload()); },
        nb::sig("def payload(self) -> str"), "What else is said, as text; its form depends on the kind.");
    record.def_prop_ro("value", &CRecordItem::Value,
                       nb::sig("def value(self) -> None | int | str | tuple[str, str | None]"),
                       "The payload as a value: None, a text, the index of a token, (module, name) or "
                       "(type, value).");
    record.def_prop_ro(
        "of_argument", [](const CRecordItem& self) { return self.Data().of_arg; },
        "True when the name is a parameter or a type parameter of the definition on its line.");
    record.def_prop_ro(
        "range",
        [](const CRecordItem& self) -> nb::object {
            return self.HasPlace() ? NewObject<CRange>(self.Range()) : nb::none();
        },
        nb::sig("def range(self) -> Range | None"), "Where the name is; None if it has no place.");
    record.def_prop_ro("line", &CRecordItem::Line, "The line that says it.");
    record.def("__str__", &CRecordItem::Text);
    record.def("__repr__",
               [](const CRecordItem& self) { return nb::str("<Record {}>").format(self.Text()); });
}

void BindLimit(nb::module_& module) {
    auto limit = BindItem<CLimitItem>(
        module, "Limit", "A line that was too much for a full walk and lacks some of its records.");
    limit.def_prop_ro(
        "kind", [](const CLimitItem& self) { return MemberOf(self.Data().limit); },
        nb::sig("def kind(self) -> LimitKind"), "Which limit it met.");
    limit.def_prop_ro("message", &CLimitItem::Message, "The limit in words.");
    limit.def_prop_ro("line", &CLimitItem::Line, "The line that is too much.");
    limit.def("__repr__", [](const CLimitItem& self) {
        return nb::str("<Limit {}: {}>").format(self.Line().Range().row, self.Message());
    });
}

void BindAnalysis(nb::class_<CAnalysis>& analysis) {
    analysis.def(
        "__init__",
        [](CAnalysis* self, nb::bytes utf8, nb::str path, nb::str python, int version, bool false_hints,
           nb::list faults, nb::list unreadable) {
            new (self) CAnalysis(MakeAnalysis(std::move(utf8), std::move(path), std::move(python), version,
                                              false_hints, std::move(faults), std::move(unreadable)));
        },
        "utf8"_a, "path"_a, "python"_a, "version"_a, "false_hints"_a, "faults"_a, "unreadable"_a,
        nb::sig("def __init__(self, utf8: bytes, path: str, python: str, version: int, false_hints: bool, "
                "faults: list[tuple[int, int, str]], unreadable: list[int]) -> None"),
        "For `codeloom.analyze`, which decodes. `faults` are places that aren't text, and `unreadable` the "
        "offset of each character that stands for something unreadable.");
    analysis.def_prop_ro(
        "path", [](const CAnalysis& self) { return self.file->Path(); },
        "The name of the text, which is in its problems.");
    analysis.def_prop_ro(
        "python", [](const CAnalysis& self) { return self.file->Python(); },
        "The version of Python that the text is written in.");
    analysis.def_prop_ro(
        "text", [](const CAnalysis& self) { return self.file->HostText(); },
        "The source text, with U+FFFD for what can't be read.");
    analysis.def_prop_ro(
        "problems", [](const CAnalysis& self) { return ProblemsOf(self.file); },
        "What is wrong, in the order of the text.");
    analysis.def_prop_ro(
        "lines", [](const CAnalysis& self) { return LinesOf(self.file); },
        "The logical lines, in the order of the text.");
    analysis.def_prop_ro(
        "records", [](const CAnalysis& self) { return RecordsOf(self.file); },
        "What the lines say of names.");
    analysis.def_prop_ro(
        "limits", [](const CAnalysis& self) { return LimitsOf(self.file); },
        "The lines that lack some of their records.");
    analysis.def("__repr__", [](const CAnalysis& self) {
        return nb::str("<Analysis of {!r}>").format(self.file->Path());
    });
    analysis.def(
        "__reduce__",
        [](nb::pointer_and_handle<CAnalysis> self) {
            return nb::make_tuple(self.h.type(), ArgumentsOf(*self.p->file));
        },
        nb::sig("def __reduce__(self) -> tuple[typing.Any, ...]"));
    BindCopies(analysis);
}

}  // namespace

void BindFace(nb::module_& module) {
    BindKinds(module);
    BindRange(module);
    BindProblem(module);
    BindLine(module);
    BindRecord(module);
    BindLimit(module);
    BindItems<CProblemItems>(module, "Problems", "class Problems(collections.abc.Sequence[Problem])");
    BindItems<CLineItems>(module, "Lines", "class Lines(collections.abc.Sequence[Line])");
    BindItems<CRecordItems>(module, "Records", "class Records(collections.abc.Sequence[Record])");
    BindItems<CLimitItems>(module, "Limits", "class Limits(collections.abc.Sequence[Limit])");
    BindNameItems(module);
    BindSignatureItems(module);
    BindTables(module);
    BindSourceBatch(module);
    nb::class_<CAnalysis> analysis(module, "Analysis",
                                   "What a text says. Each part is worked out when it is first asked for.");
    BindAnalysis(analysis);
    BindNamesOfAnalysis(analysis);
    BindSignaturesOfAnalysis(analysis);
    analysis.def(
        "table",
        [](const CAnalysis& self, nb::handle name) {
            return TableOf(*self.file, CUtf8(StrArgument(name, "name")));
        },
        "name"_a, nb::sig("def table(self, name: str) -> Table"),
        "One of the tables of docs/tables.md, such as \"lines\", whole; ValueError for an "
        "unknown name.");
}

}  // namespace codeloom
