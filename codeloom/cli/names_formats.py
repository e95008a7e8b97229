"""The forms in which `codeloom names` prints what lines say of names."""

import json
from collections.abc import Iterable, Iterator, Mapping
from dataclasses import astuple
from itertools import chain
from typing import Any

from codeloom.cli.console import Colour, Console, PrintablePath
from codeloom.cli.item_command import ItemFormat
from codeloom.cli.names_in_words import Statements
from codeloom.excerpt import OnOneRow, Printable
from codeloom.line_names import LineNames, PlacedRecord

_INDENT = "    "
_LABEL_WIDTH = 9
_CUT = "..."


class TextFormat(ItemFormat[LineNames]):
    """For people: the line's place and first row, and what it does with names below."""

    def __init__(self, console: Console) -> None:
        super().__init__(console)
        self._fRoom = console.width - _LABEL_WIDTH

    def Add(self, line: LineNames, /) -> None:
        """Print one line, unless it says nothing."""
        if line.problem is not None:
            self._fConsole.PrintProblem(line.problem)
            return
        if not line.records and not line.limits:
            return
        place = f"{PrintablePath(line.path)}:{line.row}:{line.column}:"
        first_row, _, more = line.text.partition("\n")
        text = Printable(first_row.rstrip()) + (f" {_CUT}" if more else "")
        self._fConsole.PrintRow(f"{self._fConsole.Coloured(Colour.BOLD, place)} {self._Shortened(text)}")
        for label, rows in Statements([placed.record for placed in line.records]):
            self._PrintStatement(label, rows)
        for limit in line.limits:
            self._PrintStatement("partly", [[f"the line is too much for a full walk: {limit}"]])

    def _PrintStatement(self, label: str, rows: Iterable[list[str]]) -> None:
        shown = self._fConsole.Coloured(Colour.CYAN, f"{label:<{_LABEL_WIDTH}}")
        for row in chain.from_iterable(map(self._Wrapped, rows)):
            self._fConsole.PrintRow(_INDENT + shown + Printable(row))
            shown = " " * _LABEL_WIDTH

    def _Wrapped(self, items: list[str]) -> Iterator[str]:
        """The items on as many rows as they need; one that is too long for a row is cut."""
        row = ""
        for item in map(self._Shortened, map(OnOneRow, items)):
            if row and len(row) + len(item) + 3 > self._fRoom:
                yield f"{row},"
                row = item
            else:
                row = f"{row}, {item}" if row else item
        yield row

    def _Shortened(self, text: str) -> str:
        return text if len(text) <= self._fRoom else text[: self._fRoom - len(_CUT)] + _CUT


class JsonLinesFormat(ItemFormat[LineNames]):
    """For programs: an object for each record on a row of its own."""

    def Add(self, line: LineNames, /) -> None:
        """The line's records, or what is wrong with it; limits go to the standard error."""
        for placed in line.records:
            self._fConsole.PrintRow(json.dumps(_Fields(line, placed)))
        if line.problem is not None:
            self._fConsole.PrintRow(json.dumps(_ErrorFields(line)))
        for limit in line.limits:
            self._fConsole.PrintError(f"{PrintablePath(line.path)}:{line.row}: {limit}")


FORMATS: Mapping[str, type[ItemFormat[LineNames]]] = {"text": TextFormat, "jsonl": JsonLinesFormat}


def _Fields(line: LineNames, placed: PlacedRecord) -> dict[str, Any]:
    place = (line.row, None, None, None) if placed.range is None else astuple(placed.range)
    record = placed.record
    return _Object(line.path, place, record.name, record.kind.word, record.payload or None, placed.scope)


def _ErrorFields(line: LineNames) -> dict[str, Any]:
    assert line.problem is not None
    place = line.problem.row, line.problem.column, None, None
    return _Object(line.path, place, None, "error", line.problem.message, None)


def _Object(path: str, place: Iterable[int | None], *rest: str | None) -> dict[str, Any]:
    names = ("path", "row", "column", "end_row", "end_column", "name", "kind", "payload", "scope")
    return dict(zip(names, (path, *place, *rest), strict=True))
