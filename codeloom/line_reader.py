"""What readers of single lines share: the rows a line stands on, its places in the file, faults there."""

from codeloom.check import Problem
from codeloom.engine import Complaint
from codeloom.line_length import TooLong
from codeloom.logicalline import CLogicalLine
from codeloom.rows import RowTexts
from codeloom.source import RowMap, Source


class LineReader:
    """Reads the logical lines of one text; `path` is the name that their problems bear."""

    def __init__(self, source: Source, path: str) -> None:
        self._fPath = path
        self._fFaults = source.faults
        self._fRowMap = RowMap(source.text)

    def _Hindrance(self, logical: CLogicalLine, first_row: int) -> Problem | None:
        """Why a logical that begins on a row, counted from zero, can't be handed to the engine."""
        problem = self._Fault(RowsOf(logical, first_row))
        if problem is not None:
            return problem
        too_long = TooLong(logical)
        return too_long and self._Problem(too_long)

    def _Fault(self, rows: range) -> Problem | None:
        """What can't be read on these rows, which count from zero."""
        for fault in self._fFaults:
            if fault.row - 1 in rows:
                source_row = self._fRowMap.Text(fault.row - 1)
                return Problem(self._fPath, fault.row, fault.column, fault.message, source_row)
        return None

    def _Problem(self, complaint: Complaint) -> Problem:
        row, column = self._Place((complaint.row, 0), 0, complaint.utf8_col)
        return Problem(self._fPath, row, column, complaint.message, self._fRowMap.Text(row - 1))

    def _Place(self, origin: tuple[int, int], row: int, utf8_col: int) -> tuple[int, int]:
        """Row and column, from 1, of a place in a logical whose text begins at `origin`, from zero."""
        origin_row, origin_col = origin
        place = self._fRowMap.Place(origin_row + row, utf8_col if row else origin_col + utf8_col)
        return place[0] + 1, place[1] + 1

    def _FirstPlace(self, logical: CLogicalLine, origin: tuple[int, int]) -> tuple[int, int]:
        """Row and column, from 1, of a logical's first token."""
        return self._Place(origin, *(logical.fPositions[0] if logical.fPositions else (0, 0)))


def RowsOf(logical: CLogicalLine, first_row: int) -> range:
    """The rows of the file that a logical stands on, from zero."""
    if not logical.fPositions:
        return range(first_row, first_row)
    last_row = logical.fPositions[-1][0] + len(RowTexts(logical.fToks[-1]))
    return range(first_row + logical.fPositions[0][0], first_row + last_row)


def CountRows(text: str) -> int:
    """The number of rows of a text; the last one may lack its end."""
    rows = RowTexts(text)
    return len(rows) if rows[-1] else len(rows) - 1
