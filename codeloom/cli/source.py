"""A file as a run has read it: what it says, and how its places are named."""

from __future__ import annotations

import os
from bisect import bisect_right
from collections.abc import Sequence
from functools import cached_property

from codeloom._analysis import Analysis, Problem, Range
from codeloom.cli.excerpt import printable
from codeloom.rows import RowTexts

TYPE_CHECKING = False  # `typing` takes long to import
if TYPE_CHECKING:
    from typing import Any, Protocol

    class CellPlaces(Protocol):
        """Where the rows of a notebook's text come from."""

        def place(self, row: int) -> tuple[int, int]:
            """The number of the cell, and the row in it."""


# What a cell of a notebook may do and a module may not.
_NOTEBOOK_FORMS = ("'await' outside function", "'async ", "asynchronous comprehension")


class Source:
    """A file, or the standard input, with its analysis; for a notebook the one of its cells.

    `written_rows` are the rows as the file has them, where the text isn't the same.
    """

    def __init__(
        self,
        path: str,
        analysis: Analysis,
        notebook: CellPlaces | None = None,
        written_rows: Sequence[str] | None = None,
    ) -> None:
        self.path = path
        self.analysis = analysis
        self._notebook = notebook
        self._written_rows = written_rows

    @property
    def is_notebook(self) -> bool:
        """True when rows count in cells."""
        return self._notebook is not None

    @property
    def problems(self) -> list[Problem]:
        """What is wrong, without what a notebook allows."""
        problems = self.analysis.problems
        if self._notebook is None:
            return list(problems)
        return [problem for problem in problems if not self._is_for_notebooks(problem)]

    @cached_property
    def rows(self) -> list[str]:
        """The rows of the text, without their ends."""
        return RowTexts(self.analysis.text)

    def row_text(self, row: int) -> str:
        """A row of the text; nothing for one after the last."""
        return self.rows[row - 1] if row <= len(self.rows) else ""

    def written_row(self, row: int) -> str:
        """The same as the file has it."""
        rows = self.rows if self._written_rows is None else self._written_rows
        return rows[row - 1] if row <= len(rows) else ""

    def holds(self, text: str) -> bool:
        """False when a text is nowhere in the source."""
        return text in self.analysis.text

    def cell_and_row(self, row: int) -> tuple[int | None, int]:
        """The cell of a notebook, or None, and the row in it; for a row of the analysis."""
        return (None, row) if self._notebook is None else self._notebook.place(row)

    def row_in_text(self, cell: int | None, row: int) -> int | None:
        """The row of the analysis for one of a notebook's cell; None where no cell has it."""
        rows = range(1, len(self.rows) + 1)
        return next((each for each in rows if self.cell_and_row(each) == (cell, row)), None)

    def row_label(self, row: int) -> str:
        """The file and a row in it, as people read it."""
        cell, row = self.cell_and_row(row)
        return f"{printable_path(self.path)}:{'' if cell is None else f'cell {cell}:'}{row}"

    def label(self, place: Range) -> str:
        """The file and where a range begins in it."""
        return f"{self.row_label(place.row)}:{place.column}:"

    def fields(self, place: Range) -> dict[str, Any]:
        """The same for programs."""
        return {**self.path_fields(), **self.place_fields(place)}

    def path_fields(self) -> dict[str, str]:
        """The path, and its bytes where it isn't text."""
        return path_fields(self.path)

    def place_fields(self, place: Range) -> dict[str, int]:
        """A range in the file's own rows."""
        cell, row = self.cell_and_row(place.row)
        end_cell, end_row = self.cell_and_row(place.end_row)
        end_column = place.end_column
        if end_cell != cell:  # what goes on in the next cell is shown in the first one
            end_row, end_column = row, place.column
        fields = {} if cell is None else {"cell": cell}
        return {**fields, "row": row, "column": place.column, "end_row": end_row, "end_column": end_column}

    def line_rows(self, row: int) -> tuple[int, int]:
        """The first and the last row of the logical lines that lie on a row."""
        first = last = row
        lines = self.analysis.lines
        for i in range(bisect_right(lines, row, key=lambda line: line.range.row) - 1, -1, -1):
            place = lines[i].range
            if place.end_row >= row:
                first, last = min(first, place.row), max(last, place.end_row)
            if place.row < row:  # one may end on the row and others begin
                break
        return first, last

    def _is_for_notebooks(self, problem: Problem) -> bool:
        return problem.message.startswith(_NOTEBOOK_FORMS) and not problem.source_row[:1].isspace()


def printable_path(path: str) -> str:
    """`path` as a row of a terminal can show it, whatever bytes it is made of."""
    return printable(os.fsencode(path).decode(errors="backslashreplace")) or "''"


def path_fields(path: str) -> dict[str, str]:
    """A path for programs: `path` as text, and `path_bytes` in hexadecimal where it isn't."""
    raw = os.fsencode(path)
    try:
        return {"path": raw.decode()}
    except UnicodeDecodeError:
        return {"path": raw.decode(errors="replace"), "path_bytes": raw.hex()}
