"""For people: rows of source with marks."""

from collections.abc import Iterable

from codeloom.cli.formats.base import Format
from codeloom.cli.items import Item, show_items
from codeloom.cli.source import Source


class TextFormat(Format):
    """Each item as it likes to be shown."""

    IS_FOR_PROGRAMS = False

    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Print the items of one file."""
        show_items(items, self._console)
