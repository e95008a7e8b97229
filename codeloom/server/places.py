"""A text with its name, and the places of it in the client's units."""

from lsprotocol import types

from codeloom._analysis import Range
from codeloom.server.rows import Rows
from codeloom.server.units import Units


class PlacedText:
    """A text whose places are sent to the client, which counts from zero in its own units."""

    def __init__(self, uri: str, rows: Rows, units: Units) -> None:
        self.uri = uri
        self.rows = rows
        self.units = units

    def position(self, row: int, column: int) -> types.Position:
        """A place of the analysis as the client counts."""
        text = self.rows[row - 1]
        units = column - 1 if text.isascii() else self.units.length(text[: column - 1])
        return types.Position(row - 1, units)

    def range(self, place: Range) -> types.Range:
        """A range of the analysis as the client counts."""
        return types.Range(
            self.position(place.row, place.column), self.position(place.end_row, place.end_column)
        )

    def location(self, place: Range) -> types.Location:
        """The same with the name of the text."""
        return types.Location(self.uri, self.range(place))
