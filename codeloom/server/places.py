"""Texts with their names, and places of them in the client's units."""

from abc import ABC, abstractmethod
from collections.abc import Iterable

from lsprotocol import types

from codeloom._analysis import Range
from codeloom.cli.source import Source
from codeloom.server.json_text import Fields

# How a text is written of which the client counts the units, and how long one is.
_UNITS = {"utf-8": ("utf-8", 1), "utf-16": ("utf-16-le", 2), "utf-32": ("utf-32-le", 4)}


class PlacedText(ABC):
    """A text whose places are sent to the client, which counts from zero in its own units."""

    def __init__(self, uri: str) -> None:
        self.uri = uri

    @abstractmethod
    def counted(self, row: int, column: int) -> tuple[int, int]:
        """A place of the analysis as the client counts, from zero."""

    def position(self, row: int, column: int) -> types.Position:
        """The same for the protocol."""
        return types.Position(*self.counted(row, column))

    def range(self, place: Range) -> types.Range:
        """A range of the analysis as the client counts."""
        return types.Range(
            self.position(place.row, place.column), self.position(place.end_row, place.end_column)
        )

    def range_fields(self, place: Range) -> Fields:
        """The same as JSON."""
        row, column = self.counted(place.row, place.column)
        end_row, end_column = self.counted(place.end_row, place.end_column)
        return {
            "start": {"line": row, "character": column},
            "end": {"line": end_row, "character": end_column},
        }

    def location_fields(self, place: Range) -> Fields:
        """A range with the name of the text."""
        return {"uri": self.uri, "range": self.range_fields(place)}

    def workspace_edit(self, edits: Iterable[tuple[Range, str]]) -> Fields:
        """Edits of the text, or of the cells that it is analysed with."""
        changes: dict[str, list[Fields]] = {}
        for place, text in edits:
            location = self.location_fields(place)
            changes.setdefault(location["uri"], []).append({"range": location["range"], "newText": text})
        return {"changes": changes}


class ClosedText(PlacedText):
    """A text that isn't open: few places of it are asked for."""

    def __init__(self, uri: str, source: Source, encoding: str) -> None:
        super().__init__(uri)
        self._source = source
        self._codec, self._size = _UNITS[encoding]

    def counted(self, row: int, column: int) -> tuple[int, int]:
        """As the base class says."""
        before = self._source.row_text(row)[: column - 1]
        return row - 1, len(before.encode(self._codec, "surrogatepass")) // self._size
