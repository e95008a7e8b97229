"""The text of an editor that changes, with what it says after each edit."""

import os
from functools import cached_property

from codeloom._analysis import (
    Analysis,
    DocumentChange,
    DocumentEdit,
    DocumentText,
    Line,
    Occurrence,
    Problem,
    Range,
    Scope,
)
from codeloom._face import analyze, path_text
from codeloom.reading.languages import NEWEST, version_number

TYPE_CHECKING = False  # `typing` takes longer to import than this module
if TYPE_CHECKING:
    from typing import Literal

    Encoding = Literal["utf-8", "utf-16", "utf-32"]

# From 1, and what columns count is said where a position is taken.
Position = tuple[int, int]

_ENCODINGS = ("utf-8", "utf-16", "utf-32")


class Document:
    """A text that is edited piece by piece.

    `encoding` is what the columns of positions count, here and nowhere else: "utf-32" characters,
    "utf-16" the units of UTF-16, "utf-8" bytes. Rows and columns count from 1, and rows end as they do
    in the analysis, at "\\n", "\\r\\n" and "\\r". The other arguments are those of `analyze`.

    Use a document from one thread at a time. What it has given stays as it is.
    """

    def __init__(
        self,
        source: str,
        *,
        path: str | os.PathLike[str] = "<string>",
        python: str = NEWEST,
        false_hints: bool = False,
        encoding: "Encoding" = "utf-32",
    ) -> None:
        if not isinstance(source, str):
            raise TypeError(f"source must be a str, not {type(source).__name__}")
        if not isinstance(encoding, str):
            raise TypeError(f"encoding must be a str, not {type(encoding).__name__}")
        if encoding not in _ENCODINGS:
            raise ValueError(f"encoding must be one of {', '.join(_ENCODINGS)}, not {encoding!r}")
        if not isinstance(false_hints, bool):
            raise TypeError(f"false_hints must be a bool, not {type(false_hints).__name__}")
        self._encoding: Encoding = encoding
        self._false_hints = false_hints
        self._path, self._python = path_text(path), python
        self._text = DocumentText(source, self._path, python, version_number(python), false_hints, encoding)
        self._analysis = self._text.analysis or self._analyzed()

    @property
    def path(self) -> str:
        """The name of the text, which is in its problems."""
        return self._path

    @property
    def python(self) -> str:
        """The version of Python that the text is written in."""
        return self._python

    @property
    def encoding(self) -> "Encoding":
        """What columns count: "utf-8", "utf-16" or "utf-32"."""
        return self._encoding

    @property
    def text(self) -> str:
        """The text as it is now."""
        return self._text.text

    @property
    def analysis(self) -> Analysis:
        """What `analyze` says of the text as it is now."""
        return self._analysis

    @property
    def end(self) -> Position:
        """The position after the last character."""
        return self._text.end

    def position(self, row: int, column: int) -> Position:
        """A row and a column of the analysis as a position in this document, whose columns count `encoding`.

        ValueError for a place that the text doesn't have.
        """
        row, column = _checked((row, column), "place")
        return row, self._text.column_of(row, column)

    def place(self, row: int, column: int) -> Position:
        """A position as the analysis counts, in characters.

        A column after the end of a row is its end, one within a character the end of that. ValueError for
        a row that the text doesn't have.
        """
        return row, self._text.character_column_of(row, column)

    @property
    def row_count(self) -> int:
        """How many rows the text has; the last one may be empty."""
        return self._text.row_count

    def row(self, row: int) -> str:
        """The text of a row, without its end; ValueError for one that isn't there."""
        return self._text.row(row)

    def between(self, start: Position, end: Position) -> str:
        """The text between two places of the analysis.

        ValueError for a place that the text doesn't have; nothing for an `end` before `start`.
        """
        return self._text.between(start, end)

    def edit(self, start: Position, end: Position, new_text: str) -> "Change":
        """Replace what is from `start` up to `end` by `new_text`, and say what that changes.

        ValueError for a position that the text doesn't have, or that is within a character, and for an
        `end` before `start`; the text then stays as it is.
        """
        if not isinstance(new_text, str):
            raise TypeError(f"new_text must be a str, not {type(new_text).__name__}")
        start, end = _checked(start, "start"), _checked(end, "end")
        before = self._analysis
        edit = self._text.edit(start, end, new_text)
        self._analysis = self._text.analysis or self._analyzed()
        return Change(before, self._analysis, edit)

    def _analyzed(self) -> Analysis:
        """What a text says that has to be mended before."""
        return analyze(self.text, path=self._path, python=self._python, false_hints=self._false_hints)

    def __repr__(self) -> str:
        return f"<Document {self.path!r}>"


class Change:
    """What an edit has changed.

    `range` is what it replaced in the text before, and `new_range` what is there now, both in
    characters. An item of the analysis before that the analysis after has too, at the place where the
    edit has moved it, has neither gone nor come; all others have.
    """

    before: Analysis
    """The analysis before the edit."""
    after: Analysis
    """The analysis after it."""
    range: Range
    """What the edit replaced, in the text before."""
    new_range: Range
    """What is there now, in the text after."""

    def __init__(self, before: Analysis, after: Analysis, edit: DocumentEdit) -> None:
        self.before = before
        self.after = after
        self.range = edit.range
        self.new_range = edit.new_range
        self._changed = DocumentChange(before, after, edit)

    @property
    def lines_gone(self) -> tuple[Line, ...]:
        """The logical lines of the text before that are gone, or have another text or indentation now."""
        return self._lines[0]

    @property
    def lines_come(self) -> tuple[Line, ...]:
        """The logical lines of the text after that weren't there before."""
        return self._lines[1]

    @property
    def problems_gone(self) -> tuple[Problem, ...]:
        """The problems that are gone."""
        return self._problems[0]

    @property
    def problems_come(self) -> tuple[Problem, ...]:
        """The problems that weren't there before."""
        return self._problems[1]

    @property
    def occurrences_gone(self) -> tuple[Occurrence, ...]:
        """The appearances of names that are gone, or have another resolution now."""
        return self._occurrences[0]

    @property
    def occurrences_come(self) -> tuple[Occurrence, ...]:
        """The appearances of names that weren't there before, or had another resolution."""
        return self._occurrences[1]

    @property
    def scopes_gone(self) -> tuple[Scope, ...]:
        """The scopes that are gone, or have other symbols now."""
        return self._scopes[0]

    @property
    def scopes_come(self) -> tuple[Scope, ...]:
        """The scopes that weren't there before, or had other symbols."""
        return self._scopes[1]

    def moved(self, range: Range) -> Range | None:
        """Where a range of the text before is now; None where the edit has cut into it."""
        return self._changed.moved(range)

    def __repr__(self) -> str:
        gone, come = self.range, self.new_range
        return f"<Change of {self.after.path!r}: {gone} to {come}>"

    @cached_property
    def _lines(self) -> tuple[tuple[Line, ...], tuple[Line, ...]]:
        return self._changed.lines

    @cached_property
    def _problems(self) -> tuple[tuple[Problem, ...], tuple[Problem, ...]]:
        return self._changed.problems

    @cached_property
    def _occurrences(self) -> tuple[tuple[Occurrence, ...], tuple[Occurrence, ...]]:
        return self._changed.occurrences

    @cached_property
    def _scopes(self) -> tuple[tuple[Scope, ...], tuple[Scope, ...]]:
        return self._changed.scopes


def _checked(position: object, name: str) -> Position:
    match position:
        case (int(row), int(column)) if not isinstance(row, bool) and not isinstance(column, bool):
            return row, column
    raise TypeError(f"{name} must be a row and a column, both of type int, not {position!r}")
