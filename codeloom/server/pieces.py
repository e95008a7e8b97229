"""The tokens of one logical line with their places in the text, and the parentheses that they are in."""

from collections.abc import Iterator, Sequence
from typing import NamedTuple

from codeloom._analysis import Line, Range
from codeloom.rows import RowTexts
from codeloom.utils import GetLogicalsFromText

CLOSER_OF = {"(": ")", "[": "]", "{": "}"}


class Piece(NamedTuple):
    """One token: its text, and where it is."""

    text: str
    range: Range

    @property
    def start(self) -> tuple[int, int]:
        """Where it begins."""
        return self.range.row, self.range.column

    @property
    def end(self) -> tuple[int, int]:
        """Where it ends."""
        return self.range.end_row, self.range.end_column

    @property
    def is_comment(self) -> bool:
        """True for a comment."""
        return self.text.startswith("#")

    @property
    def is_string(self) -> bool:
        """True for a string, also for one without its end."""
        return self.text.lstrip("rRbBuUfFtT")[:1] in ("'", '"')


def pieces_of(line: Line) -> list[Piece]:
    """The tokens of a line, comments and the backslashes between rows too."""
    rows = RowTexts(line.text)
    found = []
    for logical in GetLogicalsFromText(line.text):
        first_row = logical.fFirstLine
        for text, (row, column) in zip(logical.fToks, logical.fPositions, strict=True):
            found.append(Piece(text, _place_of(line, rows, text, row + first_row, column)))
    return found


def _place_of(line: Line, rows: Sequence[str], text: str, row: int, column: int) -> Range:
    """The place of a token, of which the engine counts bytes from the beginning of the line."""
    before = len(rows[row].encode()[:column].decode(errors="replace")) if row < len(rows) else column
    *others, last = RowTexts(text)
    end_row, end = row + len(others), len(last) + (0 if others else before)
    start = line.range
    return Range(
        start.row + row,
        before + (1 if row else start.column),
        start.row + end_row,
        end + (1 if end_row else start.column),
    )


def bracket_pairs(pieces: Sequence[Piece]) -> Iterator[tuple[Piece, Piece]]:
    """Each opening parenthesis with the one that closes it, the inner ones first."""
    open_ones: list[Piece] = []
    for piece in pieces:
        if piece.text in CLOSER_OF:
            open_ones.append(piece)
        elif open_ones and piece.text == CLOSER_OF[open_ones[-1].text]:
            yield open_ones.pop(), piece
