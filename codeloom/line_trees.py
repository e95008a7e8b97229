"""The syntax trees of logical lines, for those who look at what the engine is given."""

import re
from collections.abc import Iterator
from dataclasses import dataclass

from codeloom import logicalline
from codeloom.check import Problem
from codeloom.languages import Language
from codeloom.logicalinspect import TextFromTokens
from codeloom.logicalline import CLogicalLine
from codeloom.optpgen import ParseError
from codeloom.source import RowMap, Source
from codeloom.treesift import CNode, CPGenParserImpl, CreateSyntaxError
from codeloom.utils import GetLogicalsFromText

_ROW_END = re.compile(r"\r\n|\r|\n")


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
    problem: Problem | None


def LineTrees(source: Source, language: Language, path: str, row: int | None = None) -> Iterator[LineTree]:
    """The trees of all logical lines of a text, or of those that stand on one row, counted from 1."""
    reader = _TreeReader(source, language, path)
    for logical in GetLogicalsFromText(source.text):
        origin = logical.fFirstLine, 0
        if row is not None and row - 1 not in _RowsOf(logical, origin[0]):
            continue
        yield reader.Read(logical, origin, logical.fInAsyncDef)
        for embedded in logical.GetExpLogicals():
            # A hint in a comment is rewritten before it is parsed.
            if embedded.fType != logicalline.kCommentedTypeHint:
                yield reader.Read(embedded, embedded.fOrigin, logical.fInAsyncDef)


class _TreeReader:
    """Parses the logical lines of one text."""

    def __init__(self, source: Source, language: Language, path: str) -> None:
        self._fPath = path
        self._fFaults = source.faults
        self._fRowMap = RowMap(source.text)
        self._fParser = CPGenParserImpl(
            language.version_triple, language.grammar_file, language.keywords, language.is_py3
        )

    def Read(self, logical: CLogicalLine, origin: tuple[int, int], in_async_def: bool) -> LineTree:
        """The tree of a logical whose text begins at `origin`: row and UTF-8 column, from zero."""
        tree, problem = None, self._Fault(_RowsOf(logical, origin[0]))
        if problem is None:
            try:
                tree = self._fParser.ParseToNode(logical, in_async_def)
            except ParseError as error:
                problem = self._Problem(logical, origin, error)
        first_place = logical.fPositions[0] if logical.fPositions else (0, 0)
        row, column = self._Place(origin, *first_place)
        return LineTree(self._fPath, row, column, TextFromTokens(logical).lstrip(), tree, problem)

    def _Fault(self, rows: range) -> Problem | None:
        """What can't be read on these rows, which count from zero."""
        for fault in self._fFaults:
            if fault.row - 1 in rows:
                source_row = self._fRowMap.Text(fault.row - 1)
                return Problem(self._fPath, fault.row, fault.column, fault.message, source_row)
        return None

    def _Problem(self, logical: CLogicalLine, origin: tuple[int, int], parse_error: ParseError) -> Problem:
        *_, context = parse_error.args
        error = CreateSyntaxError("invalid syntax", logical, context)
        row, column = self._Place(origin, error.lineno - 1, error.offset - 1)
        return Problem(self._fPath, row, column, error.msg, self._fRowMap.Text(row - 1))

    def _Place(self, origin: tuple[int, int], row: int, utf8_col: int) -> tuple[int, int]:
        """Row and column, from 1, of a place in a logical."""
        origin_row, origin_col = origin
        place = self._fRowMap.Place(origin_row + row, utf8_col if row else origin_col + utf8_col)
        return place[0] + 1, place[1] + 1


def _RowsOf(logical: CLogicalLine, first_row: int) -> range:
    """The rows of the file that a logical stands on, from zero."""
    if not logical.fPositions:
        return range(first_row, first_row)
    last_row = logical.fPositions[-1][0] + len(_ROW_END.findall(logical.fToks[-1]))
    return range(first_row + logical.fPositions[0][0], first_row + last_row + 1)


def CountRows(text: str) -> int:
    """The number of rows of a text; the last one may lack its end."""
    rows = _ROW_END.split(text)
    return len(rows) if rows[-1] else len(rows) - 1
