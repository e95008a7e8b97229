"""A notebook that is open: the client edits cells, and the analysis is that of their code in one text."""

from bisect import bisect_left, bisect_right
from collections.abc import Iterator, Mapping, Sequence
from typing import TYPE_CHECKING, TypeVar

from lsprotocol import types
from pygls.exceptions import JsonRpcInvalidParams

from codeloom._analysis import Line, Occurrence, Range
from codeloom._document import Document, Position
from codeloom.common_start import common_start
from codeloom.reading.notebooks import code_of_cell
from codeloom.server.blocks import start_of
from codeloom.server.document import OpenDocument
from codeloom.server.json_text import Fields
from codeloom.server.live_text import LiveText, Written
from codeloom.server.settings import Settings

if TYPE_CHECKING:
    from codeloom._document import Encoding

Item = TypeVar("Item", Line, Occurrence)

# Which cells of which notebooks a client sends.
SYNC = types.NotebookDocumentSyncOptions(
    [types.NotebookDocumentFilterWithNotebook("*", [types.NotebookCellLanguage("python")])], save=True
)


class Cell(OpenDocument):
    """A cell with code: rows of the notebook's text, in which magic is a comment."""

    def __init__(self, item: types.TextDocumentItem, notebook: "OpenNotebook") -> None:
        super().__init__(item, notebook.live)
        self._notebook = notebook
        self._own = Document(item.text, encoding=notebook.live.document.encoding)
        self.code = _code(item.text)

    @property
    def own(self) -> Document:
        """As it is in the client."""
        return self._own

    @property
    def lines(self) -> Sequence[Line]:
        """Those that begin in this cell."""
        return self._within(self.analysis.lines)

    @property
    def occurrences(self) -> Sequence[Occurrence]:
        """Those of this cell."""
        return self._within(self.analysis.occurrences)

    def holds(self, row: int) -> bool:
        """True for a row of this cell."""
        return self.rows_before < row <= self.rows_before + self.code.count("\n")

    def counted(self, row: int, column: int) -> tuple[int, int]:
        """As the base class says; the nearest one for a place that isn't in the cell."""
        row -= self.rows_before
        if row < 1:
            return 0, 0
        rows = self._own.row_count
        row, column = (row, column) if row <= rows else (rows, len(self._own.row(rows)) + 1)
        row, column = self._own.position(row, min(column, len(self._own.row(row)) + 1))
        return row - 1, column - 1

    def location_fields(self, place: Range) -> Fields:
        """In the cell where it begins."""
        cell = self._notebook.cell_at(place.row)
        return {"uri": cell.uri, "range": cell.range_fields(place)}

    def row_in_words(self, row: int) -> str:
        """With the number of the cell."""
        number, row = self._notebook.place(row)
        return f"row {row} of cell {number}"

    def _write(self, start: Position, end: Position, new_text: str) -> None:
        self._own.edit(self._own.position(*start), self._own.position(*end), new_text)
        self.code = _code(self._own.text)
        before = self.rows_before
        self._notebook.join(((start[0] + before, start[1]), (end[0] + before, end[1]), new_text))

    def _within(self, items: Sequence[Item]) -> Sequence[Item]:
        first = bisect_left(items, (self.rows_before + 1, 1), key=start_of)
        last = bisect_left(items, (self.rows_before + self.code.count("\n") + 1, 1), key=start_of)
        return items[first:last]


class OpenNotebook:
    """The cells of a notebook in their order; None for one without code."""

    def __init__(self, uri: str, encoding: "Encoding", settings: Settings) -> None:
        self.uri = uri
        self.live = LiveText("", uri, encoding, settings, self)
        self._cells: list[Cell | None] = []
        self._code_cells: list[Cell] = []
        self._first_rows: list[int] = []

    def __iter__(self) -> Iterator[Cell]:
        return iter(self._code_cells)

    def splice(
        self, change: types.NotebookCellArrayChange, opened: Mapping[str, types.TextDocumentItem]
    ) -> None:
        """Put cells in the place of others; JsonRpcInvalidParams for what the notebook doesn't have."""
        end = change.start + change.delete_count
        if end > len(self._cells):
            raise JsonRpcInvalidParams(f"{self.uri} has {len(self._cells)} cells, and not {end}")
        known = {cell.uri: cell for cell in self._code_cells}
        self._cells[change.start : end] = [self._cell(cell, opened, known) for cell in change.cells or ()]
        self.join(None)

    def _cell(
        self,
        cell: types.NotebookCell,
        opened: Mapping[str, types.TextDocumentItem],
        known: Mapping[str, Cell],
    ) -> Cell | None:
        item = opened.get(cell.document)
        if cell.kind is not types.NotebookCellKind.Code or (item and item.language_id != "python"):
            return None
        if item is not None:
            return Cell(item, self)
        if cell.document not in known:
            raise JsonRpcInvalidParams(f"the text of the cell {cell.document} is missing")
        return known[cell.document]

    def join(self, written: Written | None) -> None:
        """Take the code of the cells as it is now. `written` has the rows of the analysis."""
        self._code_cells = [cell for cell in self._cells if cell is not None]
        self._first_rows = []
        row = 1
        for cell in self._code_cells:
            self._first_rows.append(row)
            cell.rows_before = row - 1
            row += cell.code.count("\n")
        old, new = _rows(self.live.document.text), _rows("".join(cell.code for cell in self))
        first = common_start(old, new)
        last = common_start(old[first:][::-1], new[first:][::-1])
        between = "".join(f"{row}\n" for row in new[first : len(new) - last])
        self.live.edit((first + 1, 1), (len(old) - last + 1, 1), between, written)

    def cell(self, uri: str) -> Cell:
        """A cell by its name; JsonRpcInvalidParams for another one's."""
        for cell in self._code_cells:
            if cell.uri == uri:
                return cell
        raise JsonRpcInvalidParams(f"{uri} is no cell of {self.uri}")

    def cell_at(self, row: int) -> Cell:
        """The cell that a row of the analysis is in."""
        return self._code_cells[max(bisect_right(self._first_rows, row) - 1, 0)]

    def place(self, row: int) -> tuple[int, int]:
        """The number of the cell that a row is in, and its row there; all count from 1."""
        cell = self.cell_at(row)
        return self._cells.index(cell) + 1, row - cell.rows_before


def _code(text: str) -> str:
    """A row for each row of the text, the empty one at its end too."""
    return code_of_cell(text + "\n")


def _rows(text: str) -> list[str]:
    return text.split("\n")[:-1]
