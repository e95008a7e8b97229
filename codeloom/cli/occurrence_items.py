"""What `codeloom names` shows of single appearances of names."""

from collections.abc import Iterator
from typing import Any

from codeloom._analysis import Line, Occurrence, Resolution, Scope
from codeloom.cli.console import Colour, Console
from codeloom.cli.excerpt import printable
from codeloom.cli.items import Item
from codeloom.cli.names_items import show_head
from codeloom.cli.source import Source

_INDENT = "    "
_UNBOUND = {
    Resolution.BUILTIN: "builtin",
    Resolution.PERHAPS: "perhaps bound",
    Resolution.UNKNOWN: "undefined",
}


class LineOccurrences(Item):
    """The appearances of names on a line."""

    def __init__(self, source: Source, line: Line) -> None:
        self._source = source
        self._line = line
        self._items = [OccurrenceItem(source, occurrence) for occurrence in line.occurrences]

    def show(self, console: Console) -> None:
        """The line's place and first row, and a table of its names below."""
        show_head(console, self._source, self._line)
        cells = [item.cells() for item in self._items]
        widths = [max(len(row[i]) for row in cells) for i in range(3)]
        for row in cells:
            place, name, role = (f"{cell:<{width}}" for cell, width in zip(row, widths, strict=False))
            role = console.coloured(Colour.CYAN, role)
            console.print_row(f"{_INDENT}{place}  {name}  {role}  {row[3]}")

    def rows(self) -> Iterator[str]:
        """A row for each."""
        for item in self._items:
            yield from item.rows()

    def fields(self) -> Iterator[dict[str, Any]]:
        """An object for each."""
        for item in self._items:
            yield from item.fields()


class OccurrenceItem(Item):
    """One appearance of a name, with what it does there or what is found about it."""

    def __init__(self, source: Source, occurrence: Occurrence, finding: str | None = None) -> None:
        self._source = source
        self._occurrence = occurrence
        self._finding = finding  # "unused" or "undefined"

    def show(self, console: Console) -> None:
        """The same as for simple tools, the place in bold."""
        place = console.coloured(Colour.BOLD, self._source.label(self._occurrence.range))
        console.print_row(f"{place} {printable(self._text())}")

    def rows(self) -> Iterator[str]:
        """Place, finding or role, name, and where the name is bound."""
        yield f"{self._source.label(self._occurrence.range)} {printable(self._text())}"

    def fields(self) -> Iterator[dict[str, Any]]:
        """An object with all that is known of it."""
        occurrence = self._occurrence
        resolution = occurrence.resolution
        yield {
            "type": "occurrence",
            **self._source.fields(occurrence.range),
            "name": occurrence.name,
            "role": occurrence.role.value,
            "finding": self._finding,
            "scope": title(occurrence.scope),
            "resolution": resolution and resolution.value,
            "home": title(occurrence.home) if occurrence.home else None,
        }

    def cells(self) -> tuple[str, str, str, str]:
        """Place in its line, name, role, and where the name is bound, for a table."""
        occurrence = self._occurrence
        place, line = occurrence.range, occurrence.line.range
        _, row = self._source.cell_and_row(place.row)
        shown = str(place.column) if place.row == line.row else f"{row}:{place.column}"
        return shown, printable(occurrence.name), occurrence.role.value, printable(where(occurrence))

    def _text(self) -> str:
        occurrence = self._occurrence
        role = f"{occurrence.role.value} {occurrence.name}"
        if self._finding is not None:
            return f"{self._finding} {role} in {title(occurrence.scope)}"
        home = occurrence.home
        if home is None:
            where = f" ({occurrence.resolution.value})" if occurrence.resolution else ""
        else:
            where = "" if home == occurrence.scope else f" of {title(home)}"
        return f"{role}{where} in {title(occurrence.scope)}"


def where(occurrence: Occurrence) -> str:
    """The scope that a name is in, and the one that binds it or what else is known."""
    scope, home = occurrence.scope, occurrence.home
    if home is not None and home != scope:
        return f"{title(scope)}, of {title(home)}"
    if occurrence.resolution in _UNBOUND:
        return f"{title(scope)}, {_UNBOUND[occurrence.resolution]}"
    return title(scope)


def title(scope: Scope) -> str:
    """The kind of a scope, and its name where it has one."""
    return f"{scope.kind.value} {scope.name}".rstrip()
