"""For people and simple tools: each item on a row that begins with its place."""

from collections.abc import Iterable

from codeloom.cli.formats.base import Format
from codeloom.cli.items import Item
from codeloom.cli.source import Source


class ConciseFormat(Format):
    """`path:row:column: CODE message` for a problem."""

    IS_FOR_PROGRAMS = False

    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Print the rows of one file."""
        for item in items:
            for row in item.rows():
                self._console.print_row(row)
