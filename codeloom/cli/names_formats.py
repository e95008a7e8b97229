"""The forms in which `codeloom names` prints what lines say of names."""

import json
from abc import abstractmethod
from collections.abc import Iterable, Iterator, Mapping
from itertools import chain

from codeloom._analysis import Analysis, Limit, Line, Problem, Range, Record, RecordKind
from codeloom.cli.console import Colour, Console, printable_path
from codeloom.cli.excerpt import on_one_row, printable
from codeloom.cli.item_command import ItemFormat
from codeloom.cli.names_in_words import statements

_INDENT = "    "
_LABEL_WIDTH = 9
_CUT = "..."


class NamesFormat(ItemFormat):
    """Prints what each line says."""

    def add(self, analysis: Analysis) -> bool:
        """Print the lines of a file, and its problems where they stand."""
        limits = {limit.line: limit for limit in analysis.limits}
        problems = iter(analysis.problems)
        problem = next(problems, None)
        for line in analysis.lines:
            while problem is not None and _starts_before_end(problem.range, line.range):
                self._add_problem(analysis.path, problem)
                problem = next(problems, None)
            records = list(line.records)
            limit = limits.get(line) if limits else None
            if records or limit is not None:
                self._add_line(analysis.path, line, records, limit)
        while problem is not None:
            self._add_problem(analysis.path, problem)
            problem = next(problems, None)
        return not analysis.problems

    @abstractmethod
    def _add_line(self, path: str, line: Line, records: list[Record], limit: Limit | None) -> None:
        """Print a line that says something."""

    @abstractmethod
    def _add_problem(self, path: str, problem: Problem) -> None:
        """Print what is wrong with a line."""


def _starts_before_end(place: Range, line: Range) -> bool:
    return (place.row, place.column) <= (line.end_row, line.end_column)


class TextFormat(NamesFormat):
    """For people: the line's place and first row, and what it does with names below."""

    def __init__(self, console: Console) -> None:
        super().__init__(console)
        self._room = console.width - _LABEL_WIDTH

    def _add_problem(self, path: str, problem: Problem) -> None:
        self._console.print_problem(problem)

    def _add_line(self, path: str, line: Line, records: list[Record], limit: Limit | None) -> None:
        place = f"{printable_path(path)}:{line.range.row}:{line.range.column}:"
        first_row, _, more = line.text.partition("\n")
        text = printable(first_row.rstrip()) + (f" {_CUT}" if more else "")
        self._console.print_row(f"{self._console.coloured(Colour.BOLD, place)} {self._shortened(text)}")
        for label, rows in statements(records):
            self._print_statement(label, rows)
        if limit is not None:
            self._print_statement("partly", [[limit.message]])

    def _print_statement(self, label: str, rows: Iterable[list[str]]) -> None:
        shown = self._console.coloured(Colour.CYAN, f"{label:<{_LABEL_WIDTH}}")
        for row in chain.from_iterable(map(self._wrapped, rows)):
            self._console.print_row(_INDENT + shown + printable(row))
            shown = " " * _LABEL_WIDTH

    def _wrapped(self, items: list[str]) -> Iterator[str]:
        """The items on as many rows as they need; one that is too long for a row is cut."""
        row = ""
        for item in map(self._shortened, map(on_one_row, items)):
            if row and len(row) + len(item) + 3 > self._room:
                yield f"{row},"
                row = item
            else:
                row = f"{row}, {item}" if row else item
        yield row

    def _shortened(self, text: str) -> str:
        return text if len(text) <= self._room else text[: self._room - len(_CUT)] + _CUT


class JsonLinesFormat(NamesFormat):
    """For programs: an object for each record on a row of its own."""

    def _add_line(self, path: str, line: Line, records: list[Record], limit: Limit | None) -> None:
        """The line's records; its limit goes to the standard error."""
        scope = next((record.name for record in records if record.kind is RecordKind.SET), None)
        for record in records:
            place = record.range
            self._print(
                path,
                _values(place) if place else (line.range.row, None, None, None),
                record.name,
                record.kind.value,
                record.payload or None,
                scope if record.of_argument else None,
            )
        if limit is not None:
            self._console.print_error(f"{printable_path(path)}:{line.range.row}: {limit.message}")

    def _add_problem(self, path: str, problem: Problem) -> None:
        self._print(path, _values(problem.range), None, "error", problem.message, None)

    def _print(self, path: str, place: Iterable[int | None], *rest: str | None) -> None:
        names = ("path", "row", "column", "end_row", "end_column", "name", "kind", "payload", "scope")
        self._console.print_row(json.dumps(dict(zip(names, (path, *place, *rest), strict=True))))


FORMATS: Mapping[str, type[ItemFormat]] = {"text": TextFormat, "jsonl": JsonLinesFormat}


def _values(place: Range) -> tuple[int, int, int, int]:
    return place.row, place.column, place.end_row, place.end_column
