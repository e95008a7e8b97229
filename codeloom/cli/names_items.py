"""What `codeloom names` shows: the names of a line."""

from collections.abc import Iterable, Iterator
from itertools import chain
from typing import Any

from codeloom._analysis import Limit, Line, Record, RecordKind
from codeloom.cli.console import Colour, Console
from codeloom.cli.excerpt import on_one_row, printable
from codeloom.cli.items import Item
from codeloom.cli.names_in_words import statements
from codeloom.cli.source import Source

_INDENT = "    "
_LABEL_WIDTH = 9
_CUT = "..."


def show_head(console: Console, source: Source, line: Line) -> None:
    """Print a line's place and first row."""
    first_row, _, more = line.text.partition("\n")
    label = source.label(line.range)
    room = console.width - _LABEL_WIDTH
    if console.is_terminal:  # where a row that is too long would wrap
        room = min(room, console.room_after(label))
    text = _shortened(printable(first_row.rstrip()) + (f" {_CUT}" if more else ""), room)
    console.print_row(f"{console.coloured(Colour.BOLD, label)} {text}")


class LineNames(Item):
    """A line that says something of names."""

    def __init__(self, source: Source, line: Line, records: list[Record]) -> None:
        self._source = source
        self._line = line
        self._records = records

    def show(self, console: Console) -> None:
        """The line's place and first row, and what it does with names below."""
        show_head(console, self._source, self._line)
        for label, rows in statements(self._records):
            _show_statement(console, label, rows)

    def rows(self) -> Iterator[str]:
        """Place, kind, name and payload of each record."""
        for record in self._records:
            payload = f"  {record.payload}" if record.payload else ""
            place = self._source.label(record.range or self._line.range)
            yield f"{place} {record.kind.value} {printable(on_one_row(record.name + payload))}"

    def fields(self) -> Iterator[dict[str, Any]]:
        """An object for each record; one without a place has the place of its line."""
        scope = next((record.name for record in self._records if record.kind is RecordKind.SET), None)
        for record in self._records:
            place = record.range
            yield {
                "type": "record",
                **self._source.fields(place or self._line.range),
                "is_placed": place is not None,
                "kind": record.kind.value,
                "name": record.name,
                "payload": record.payload or None,
                "scope": scope if record.of_argument else None,
            }


class LimitItem(Item):
    """What a line lacks that was too much for a full walk."""

    def __init__(self, source: Source, limit: Limit) -> None:
        self._source = source
        self._limit = limit

    def show(self, console: Console) -> None:
        """A row below those of its line."""
        _show_statement(console, "partly", [[self._limit.message]])

    def rows(self) -> Iterator[str]:
        """Place and message."""
        yield f"{self._source.label(self._limit.line.range)} partly {self._limit.message}"

    def fields(self) -> Iterator[dict[str, Any]]:
        """An object of its own."""
        place = self._source.fields(self._limit.line.range)
        yield {"type": "limit", **place, "message": self._limit.message}


def _show_statement(console: Console, label: str, rows: Iterable[list[str]]) -> None:
    room = console.width - _LABEL_WIDTH
    shown = console.coloured(Colour.CYAN, f"{label:<{_LABEL_WIDTH}}")
    for row in chain.from_iterable(_wrapped(items, room) for items in rows):
        console.print_row(_INDENT + shown + printable(row))
        shown = " " * _LABEL_WIDTH


def _wrapped(items: list[str], room: int) -> Iterator[str]:
    """The items on as many rows as they need; one that is too long for a row is cut."""
    row = ""
    for item in items:
        item = _shortened(on_one_row(item), room)
        if row and len(row) + len(item) + 3 > room:
            yield f"{row},"
            row = item
        else:
            row = f"{row}, {item}" if row else item
    yield row


def _shortened(text: str, room: int) -> str:
    return text if len(text) <= room else text[: room - len(_CUT)] + _CUT
