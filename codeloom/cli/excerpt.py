"""Places in a row of source as a terminal shows them: the row, cut where it is long, and marks below it."""

import re
import unicodedata
from collections.abc import Iterator, Sequence

_TAB_WIDTH = 4
_ROW_END = re.compile(r"\s*[\r\n]\s*")
_CUT = "..."
# What moves the cursor, turns the direction of writing or doesn't stand for a character.
_UNPRINTABLE = frozenset({"Cc", "Cf", "Cs", "Cn", "Zl", "Zp"})
_COMBINING = frozenset({"Mn", "Me"})
_WIDE = frozenset({"W", "F"})

# From column to column, counted in characters from 1, the end after the last one; and the sign to mark it.
Mark = tuple[int, int, str]


def excerpt(
    source_row: str, marks: Sequence[Mark], width: int = 100, encoding: str = "utf-8"
) -> tuple[str, str]:
    """What to print of `source_row`, and the row with the marks to print below it.

    A mark may lie after the row's end, and one of no width is a single sign. `width` is in terminal
    columns; a wider row is cut on either side of the first mark's start. Of two marks in one place the
    earlier one shows. What the terminal's encoding lacks is shown by its number.
    """
    place_i = min(marks[0][0] - 1, len(source_row))
    # No more than this can be shown, and a row may be as long as a file.
    first_i = max(0, place_i - width)
    cells = list(_cells(source_row[first_i : place_i + width + 1], encoding))
    start, end = _window(cells, place_i - first_i, width)
    if first_i + start > 0 or first_i + end < len(source_row):
        start, end = _window(cells, place_i - first_i, width - 2 * len(_CUT))
    cut_before = _CUT if first_i + start > 0 else ""
    cut_after = _CUT if first_i + end < len(source_row) else ""
    shown = "".join(cell for cell, _ in cells[start:end])
    widths = [cell_width for _, cell_width in cells[start:end]]
    marked = _marked(widths, marks, first_i + start, min(len(source_row), first_i + end))
    return cut_before + shown + cut_after, " " * len(cut_before) + marked


def fits(source_row: str, width: int, encoding: str) -> bool:
    """True when a row needn't be cut."""
    if len(source_row) > width:
        return False
    return sum(cell_width for _, cell_width in _cells(source_row, encoding)) <= width


def wrapped(text: str, first_room: int, room: int) -> Iterator[str]:
    """`text` on rows that end between words; the first one has `first_room` columns and may stay empty."""
    row, free = "", first_room
    for word in text.split(" "):
        width = sum(map(_width_of, word)) + (1 if row else 0)
        if width > free and (row or free < room):
            yield row
            row, free = "", room
            width = sum(map(_width_of, word))
        row += f" {word}" if row else word
        free -= width
    yield row


def printable(text: str) -> str:
    """`text` with U+FFFD for each character that would do something to a terminal."""
    if text.isprintable():
        return text
    return "".join(
        "\N{REPLACEMENT CHARACTER}" if unicodedata.category(char) in _UNPRINTABLE else char for char in text
    )


def width_of(text: str) -> int:
    """How many columns of a terminal it takes."""
    return len(text) if text.isascii() else sum(map(_width_of, text))


def on_one_row(text: str) -> str:
    """`text` with a blank for each end of a row and the blanks around it, as hints in quotes may have."""
    return _ROW_END.sub(" ", text.strip())


def _marked(widths: Sequence[int], marks: Sequence[Mark], first_i: int, row_end_i: int) -> str:
    """The row of marks below the cells from `first_i` on."""
    signs = [" " * width for width in widths] + [" "]
    for column, end_column, sign in reversed(marks):
        start = min(column - 1, row_end_i) - first_i
        end = max(min(end_column - 1, row_end_i) - first_i, start + 1)
        for i in range(max(start, 0), min(end, len(signs))):
            signs[i] = sign * len(signs[i])
    return "".join(signs).rstrip()


def _cells(chars: str, encoding: str) -> Iterator[tuple[str, int]]:
    """Each character as it is printed, and how many columns of the terminal it takes."""
    col = 0
    for char in chars:
        if char == "\t":
            cell = " " * (_TAB_WIDTH - col % _TAB_WIDTH)
        else:
            cell = " " if char == "\f" else printable(char)
        cell = cell.encode(encoding, "backslashreplace").decode(encoding)
        cell_width = sum(map(_width_of, cell))
        yield cell, cell_width
        col += cell_width


def _width_of(char: str) -> int:
    if unicodedata.category(char) in _COMBINING:
        return 0
    return 2 if unicodedata.east_asian_width(char) in _WIDE else 1


def _window(cells: Sequence[tuple[str, int]], place_i: int, room: int) -> tuple[int, int]:
    """The range of cells around `place_i` that fits into `room` columns, alike on both sides."""
    start = end = place_i
    used = 0
    grown = True
    while grown:
        grown = False
        if end < len(cells) and used + cells[end][1] <= room:
            used += cells[end][1]
            end += 1
            grown = True
        if start > 0 and used + cells[start - 1][1] <= room:
            start -= 1
            used += cells[start][1]
            grown = True
    return start, end
