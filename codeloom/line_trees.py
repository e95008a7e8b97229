"""The syntax trees of logical lines, for those who look at what the engine is given."""

import re
from bisect import bisect_right
from collections.abc import Iterator
from dataclasses import dataclass

from codeloom._analysis import Analysis
from codeloom.logicalinspect import TextFromTokens
from codeloom.logicalline import CLogicalLine, kCommentedTypeHint
from codeloom.optpgen import ParseError
from codeloom.reading.languages import Language, language_of
from codeloom.rows import ROW_END, RowTexts
from codeloom.treesift import CExtendedParser, CNode, CPGenParserImpl, CreateSyntaxError
from codeloom.utils import GetLogicalsFromText

# Problems that keep a line from being parsed: it can't be read, or is too long.
_HINDRANCES = ("CL101", "CL902")


@dataclass(frozen=True, slots=True)
class Fault:
    """What is wrong with a line; row and column count from 1."""

    path: str
    row: int
    column: int
    message: str
    source_row: str
    code: str = "CL201"

    def __str__(self) -> str:
        return f"{self.path}:{self.row}:{self.column}: {self.message}"


@dataclass(frozen=True, slots=True)
class LineTree:
    """A logical line with its tree, or with what is wrong with it; with neither when it is empty.

    `row` and `column` count from 1, the column in characters. An expression within a line, such as
    the field of an f-string, is a line of its own here.
    """

    path: str
    row: int
    column: int
    text: str
    tree: CNode | None
    fault: Fault | None


def new_parser(language: Language) -> CPGenParserImpl:
    """A parser of a language version, for the caller alone."""
    make = CExtendedParser if language.is_py3 else CPGenParserImpl
    return make(language.version_triple, language.grammar_file, language.keywords, language.is_py3)


def line_trees(analysis: Analysis, row: int | None = None) -> Iterator[LineTree]:
    """The trees of all logical lines of a text, or of those on one row, counted from 1."""
    reader = _TreeReader(analysis)
    for logical in GetLogicalsFromText(analysis.text):
        origin = logical.fFirstLine, 0
        if row is not None and row - 1 not in _rows_of(logical, origin[0]):
            continue
        yield reader.read(logical, origin, logical.fInAsyncDef)
        for embedded in logical.GetExpLogicals():
            # A hint in a comment is rewritten before it is parsed.
            if embedded.fType != kCommentedTypeHint:
                yield reader.read(embedded, embedded.fOrigin, logical.fInAsyncDef)


def count_rows(text: str) -> int:
    """The number of rows of a text; the last one may lack its end."""
    rows = RowTexts(text)
    return len(rows) if rows[-1] else len(rows) - 1


def _rows_of(logical: CLogicalLine, first_row: int) -> range:
    """The rows of the file that a logical is on, from zero."""
    if not logical.fPositions:
        return range(first_row, first_row)
    last_row = logical.fPositions[-1][0] + len(RowTexts(logical.fToks[-1]))
    return range(first_row + logical.fPositions[0][0], first_row + last_row)


class _TreeReader:
    """Parses the logical lines of one text."""

    def __init__(self, analysis: Analysis) -> None:
        self._path = analysis.path
        self._parser = new_parser(language_of(analysis.text, analysis.python))
        self._utf8 = analysis.text.encode()
        self._starts = [0, *(match.end() for match in _UTF8_ROW_END.finditer(self._utf8))]
        self._hindrances = [problem for problem in analysis.problems if problem.code in _HINDRANCES]

    def read(self, logical: CLogicalLine, origin: tuple[int, int], in_async_def: bool) -> LineTree:
        """The tree of a logical whose text begins at `origin`: row and UTF-8 column, from zero."""
        tree, fault = None, self._hindrance(_rows_of(logical, origin[0]))
        if fault is None:
            try:
                tree = self._parser.ParseToNode(logical, in_async_def)
            except ParseError as error:
                *_, context = error.args
                fault = self._refusal(CreateSyntaxError("invalid syntax", logical, context), origin)
            except SyntaxError as error:
                fault = self._refusal(error, origin)
        row, col = logical.fPositions[0] if logical.fPositions else (0, 0)
        row, column = self._place(origin, row, col)
        return LineTree(self._path, row, column, TextFromTokens(logical).lstrip(), tree, fault)

    def _hindrance(self, rows: range) -> Fault | None:
        """Why what is on these rows, from zero, can't be parsed."""
        for problem in self._hindrances:
            if problem.range.row - 1 in rows:
                place = problem.range
                return Fault(
                    self._path, place.row, place.column, problem.message, problem.source_row, problem.code
                )
        return None

    def _refusal(self, error: SyntaxError, origin: tuple[int, int]) -> Fault:
        assert error.lineno is not None and error.offset is not None
        row, column = self._place(origin, error.lineno - 1, error.offset - 1)
        return Fault(self._path, row, column, error.msg, self._row_text(row - 1))

    def _place(self, origin: tuple[int, int], row: int, utf8_col: int) -> tuple[int, int]:
        """Row and column, from 1, of a place in a logical whose text begins at `origin`.

        A column after the end of its row goes on in the rows below.
        """
        origin_row, origin_col = origin
        start = self._starts[origin_row + row] + (0 if row else origin_col)
        offset = min(start + utf8_col, len(self._utf8))
        row = bisect_right(self._starts, offset) - 1
        return row + 1, len(self._utf8[self._starts[row] : offset].decode(errors="ignore")) + 1

    def _row_text(self, row: int) -> str:
        end = self._starts[row + 1] if row + 1 < len(self._starts) else None
        return self._utf8[self._starts[row] : end].decode().rstrip("\r\n")


_UTF8_ROW_END = re.compile(ROW_END.pattern.encode())
