"""Jupyter notebooks as source text: the code cells one after another, and where each row comes from."""

import errno
import json
import re
from bisect import bisect_right
from typing import Any

# What is the notebook's own, on a row and those that it goes on in: magic, a command of the shell, help; it
# may be assigned.
_MAGIC = re.compile(
    r"(?P<blanks>[ \t]*)(?P<target>[\w.,* \t\[\]]+=[ \t]*(?=[%!](?!=)))?"
    r"(?P<magic>[%!?](?:\\\n|[^\n])*|[\w.*%]+\?{1,2}[ \t]*(?=\n|\Z))(?P<end>\n?)"
)
# Cell magic whose cell still holds Python.
_PYTHON_CELL = re.compile(r"\s*%%(?:time|timeit|capture|prun|debug|python3?|pypy)\b")
# What decides whether a row goes on: strings, comments, parentheses, ends of rows.
_PIECE = re.compile(
    r"""(?P<quotes>\'{3}|"{3})(?:\\.|(?!(?P=quotes)).)*(?:(?P=quotes)|\Z)"""
    r"""|"(?:\\.|[^"\\\n])*"?|'(?:\\.|[^'\\\n])*'?"""
    r"""|\#[^\n]*|(?P<bracket>[()\[\]{}])|\\\n|(?P<end>\n)""",
    re.DOTALL,
)
_ROW_END = re.compile(r"\r\n|\r")
_FIRST_BLANKS = re.compile(r"\s*^(?P<blanks>[ \t]+)\S", re.MULTILINE)
# A row that can't be within parentheses, so that what a cell leaves open ends with the cell.
_END_OF_OPEN_CELL = "pass\n"


class Notebook:
    """The text of a notebook's code cells, and the place of each of its rows.

    `text` holds the cells in their order, each from a row of its own. Rows that are the notebook's own,
    such as `%magic` and `!command`, are comments in it, so that rows keep their numbers.
    """

    text: str
    """The text of the code cells, for `analyze`."""
    is_python: bool
    """False for a notebook in another language, whose text is empty."""
    written_rows: list[str]
    """The rows of `text` as the cells have them, with their magic; empty ones for those that no cell has."""

    def __init__(self, data: bytes) -> None:
        """Read a notebook from its JSON; ValueError when it isn't one."""
        cells, self.is_python = _code_cells(data)
        self._cells: list[int] = []
        self._first_rows: list[int] = []
        self.written_rows: list[str] = []
        texts = []
        row = 1
        for number, source in cells if self.is_python else ():
            text = code_of_cell(source)
            self._cells.append(number)
            self._first_rows.append(row)
            texts.append(text)
            count = text.count("\n")
            row += count
            written = _ROW_END.sub("\n", source).split("\n")
            self.written_rows += [*written, ""][:count]
        self.text = "".join(texts)

    def place(self, row: int) -> tuple[int, int]:
        """The number of the cell that a row of `text` comes from, and the row in that cell.

        All count from 1, and cells of all kinds count. The row after the last one belongs to the last cell.
        """
        if not self._cells:
            return 1, row
        i = max(bisect_right(self._first_rows, row) - 1, 0)
        return self._cells[i], row - self._first_rows[i] + 1


def read_notebook(data: bytes, path: str) -> Notebook:
    """The notebook in a file's bytes; OSError, with the path, when it isn't one."""
    try:
        return Notebook(data)
    except (ValueError, RecursionError) as error:
        raise OSError(errno.EINVAL, f"it isn't a notebook: {error}", path) from None


def code_of_cell(source: str) -> str:
    """A cell's text with comments, or `pass` within a block, in place of what isn't Python.

    Its rows end with a line feed, the last one too, and have their numbers and columns. A row may be added.
    """
    return _at_depth_zero(_without_magic(source))


def _code_cells(data: bytes) -> tuple[list[tuple[int, str]], bool]:
    """The number and the text of each code cell, and whether they are Python."""
    notebook = json.loads(data)
    if not isinstance(notebook, dict):
        raise ValueError("it has no cells")
    cells = notebook.get("cells")
    if cells is None and isinstance(notebook.get("worksheets"), list):  # version 3 of the format
        sheets = notebook["worksheets"]
        cells = [cell for sheet in sheets if isinstance(sheet, dict) for cell in sheet.get("cells") or ()]
    if not isinstance(cells, list):
        raise ValueError("it has no cells")
    found = [
        (number, _source_of(cell))
        for number, cell in enumerate(cells, 1)
        if isinstance(cell, dict) and cell.get("cell_type") == "code"
    ]
    return found, _language(notebook) in ("python", "")


def _language(notebook: dict[str, Any]) -> str:
    metadata = notebook.get("metadata")
    for key, field in (("language_info", "name"), ("kernelspec", "language")):
        part = metadata.get(key) if isinstance(metadata, dict) else None
        name = part.get(field) if isinstance(part, dict) else None
        if isinstance(name, str):
            return name.lower().rstrip("23")
    return ""


def _source_of(cell: dict[str, Any]) -> str:
    source = cell.get("source", cell.get("input", ""))
    if isinstance(source, list):
        return "".join(piece for piece in source if isinstance(piece, str))
    return source if isinstance(source, str) else ""


def _without_magic(source: str) -> str:
    text = _ROW_END.sub("\n", source)
    if not text.endswith("\n"):
        text += "\n"
    if text.lstrip().startswith("%%") and not _PYTHON_CELL.match(text):
        return "".join(f"# {row}\n" for row in text.splitlines())
    pieces = []
    start = 0
    while start < len(text):
        match = _MAGIC.match(text, start)
        end = match.end() if match else _end_of_statement(text, start)
        if end is None:
            pieces += [text[start:], _END_OF_OPEN_CELL]
            break
        pieces.append(_passed_over(match) if match else text[start:end])
        start = end
    return "".join(pieces)


def _at_depth_zero(text: str) -> str:
    """A cell whose first statement is indented, as if it weren't: notebooks run such a cell.

    A form feed, with which indentation begins anew, keeps the columns.
    """
    match = _FIRST_BLANKS.match(text)
    if match is None:
        return text
    blanks = match["blanks"]
    return re.sub(f"^{blanks}(?=.)", f"{blanks[:-1]}\f", text, flags=re.MULTILINE)


def _end_of_statement(text: str, start: int) -> int | None:
    """Where the rows end that parentheses, quotes and backslashes join; None when they don't end."""
    depth = 0
    for piece in _PIECE.finditer(text, start):
        if piece["bracket"]:
            depth = max(depth + (1 if piece["bracket"] in "([{" else -1), 0)
        elif piece["end"] and depth == 0:
            return piece.end()
    return None


def _passed_over(match: re.Match[str]) -> str:
    blanks, target = match["blanks"], match["target"]
    statement = f"{target}None  " if target else "pass  " if blanks else ""
    rows = match["magic"].replace("\\\n", "\n").split("\n")
    return f"{blanks}{statement}" + "\n".join(f"# {row}" for row in rows) + match["end"]
