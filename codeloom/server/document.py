"""A text that is open in the client, and where its places are in the client's units."""

from collections.abc import Iterable, Sequence

from lsprotocol import types
from pygls.exceptions import JsonRpcInvalidParams

from codeloom._analysis import Analysis, Line, Occurrence, Range
from codeloom._document import Document, Position
from codeloom.server.live_text import LiveText
from codeloom.server.places import PlacedText


class OpenDocument(PlacedText):
    """One text as the client names it. Positions of the protocol count from zero in the client's units."""

    def __init__(self, item: types.TextDocumentItem, live: LiveText) -> None:
        super().__init__(item.uri)
        self.version = item.version
        self.live = live
        # How many rows of the analysis are before it: those of other cells, for the cell of a notebook.
        self.rows_before = 0

    @property
    def own(self) -> Document:
        """The text as it is in the client."""
        return self.live.document

    @property
    def analysis(self) -> Analysis:
        """What the text says now, for a cell that of its notebook."""
        return self.live.analysis

    @property
    def lines(self) -> Sequence[Line]:
        """The lines of this text."""
        return self.analysis.lines

    @property
    def occurrences(self) -> Sequence[Occurrence]:
        """The occurrences of names in this text."""
        return self.analysis.occurrences

    @property
    def whole(self) -> Range:
        """All of the text."""
        own, before = self.own, self.rows_before
        row, column = own.place(*own.end)
        return Range(1 + before, 1, row + before, column)

    @property
    def row_count(self) -> int:
        """How many rows the analysis has."""
        return self.live.document.row_count

    def row(self, row: int) -> str:
        """The text of a row of the analysis, without its end."""
        return self.live.document.row(row)

    def between(self, start: Position, end: Position) -> str:
        """The text between two places of the analysis."""
        return self.live.document.between(start, end)

    def holds(self, row: int) -> bool:
        """True for a row of the analysis that is in this text."""
        return True

    def row_in_words(self, row: int) -> str:
        """What users call a row of the analysis."""
        return f"row {row}"

    def change(self, changes: Iterable[types.TextDocumentContentChangeEvent], version: int) -> None:
        """Change the text as the client has; JsonRpcInvalidParams for a place that it doesn't have."""
        for change in changes:
            self._edit(change)
        self.version = version

    def _edit(self, change: types.TextDocumentContentChangeEvent) -> None:
        start, end = (1, 1), self.own.place(*self.own.end)
        if isinstance(change, types.TextDocumentContentChangePartial):
            first, last = change.range.start, change.range.end
            if (last.line, last.character) < (first.line, first.character):
                raise JsonRpcInvalidParams(f"{self.uri}: the end of an edit is before its start")
            start, end = self._own_place(first), self._own_place(last)
        self._write(start, end, change.text)

    def place(self, position: types.Position) -> Position:
        """A position of the client as the analysis counts; after the end of a row is its end."""
        row, column = self._own_place(position)
        return row + self.rows_before, column

    def counted(self, row: int, column: int) -> tuple[int, int]:
        """As the base class says."""
        row, column = self.own.position(row, column)
        return row - 1, column - 1

    def occurrence_at(self, position: types.Position) -> Occurrence | None:
        """The name at a position, or that ends there."""
        return self.analysis.occurrence_at(*self.place(position))

    def _write(self, start: Position, end: Position, new_text: str) -> None:
        self.live.edit(start, end, new_text)

    def _own_place(self, position: types.Position) -> Position:
        row, units, rows = position.line, position.character, self.own.row_count
        if row == rows:  # clients name the row after the last one for "up to the end"
            return self.own.place(*self.own.end)
        if not 0 <= row < rows or units < 0:
            raise JsonRpcInvalidParams(
                f"{self.uri}: there is no position {row}:{units} in a text of {rows} rows"
            )
        return self.own.place(row + 1, units + 1)
