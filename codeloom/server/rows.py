"""The rows of a text that is edited, so that any of them is at hand without a look at the others."""

import re

# Each with its end; the last one may be empty.
_ROW = re.compile(r"[^\r\n]*(?:\r\n|\r|\n)")

# A row and a column, both from zero, the column in characters.
Place = tuple[int, int]


class Rows:
    """The rows of a text. They end at LF, CR LF and CR, and at nothing else."""

    def __init__(self, text: str) -> None:
        self._rows = _split(text)

    def __len__(self) -> int:
        return len(self._rows)

    def __getitem__(self, row: int) -> str:
        """The text of a row from zero, without its end."""
        return self._rows[row].rstrip("\r\n")

    @property
    def text(self) -> str:
        """All rows."""
        return "".join(self._rows)

    @property
    def end(self) -> Place:
        """The place after the last character."""
        return len(self._rows) - 1, len(self._rows[-1])

    def between(self, start: Place, end: Place) -> str:
        """What lies between two places."""
        (row, column), (end_row, end_column) = start, end
        if row == end_row:
            return self._rows[row][column:end_column]
        between = self._rows[row + 1 : end_row]
        return "".join([self._rows[row][column:], *between, self._rows[end_row][:end_column]])

    def replace(self, start: Place, end: Place, new_text: str) -> None:
        """Put a text in the place of what lies between two places."""
        (row, column), (end_row, end_column) = start, end
        text = self._rows[row][:column] + new_text + self._rows[end_row][end_column:]
        if row and column == 0 and text.startswith("\n") and self._rows[row - 1].endswith("\r"):
            row -= 1  # the two are one end of a row now
            text = self._rows[row] + text
        rows = _split(text)
        if end_row + 1 < len(self._rows) and not rows[-1]:
            rows.pop()  # the last row isn't the end of the text
        self._rows[row : end_row + 1] = rows


def _split(text: str) -> list[str]:
    rows = _ROW.findall(text)
    rows.append(text[sum(map(len, rows)) :])
    return rows
