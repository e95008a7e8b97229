"""The syntax trees of logical lines, for those who look at what the engine is given."""

import re
from bisect import bisect_right
from collections.abc import Iterator, Sequence
from contextlib import suppress
from dataclasses import dataclass, replace

from codeloom._analysis import Analysis, Line, Problem, Range
from codeloom.logicalinspect import TextFromTokens
from codeloom.logicalline import CLogicalLine, kCommentedTypeHint
from codeloom.optpgen import ParseError
from codeloom.reading.languages import Language, language_of
from codeloom.rows import ROW_END, RowTexts
from codeloom.treesift import CExtendedParser, CNode, CPGenParserImpl
from codeloom.utils import GetLogicalsFromText

# Problems that keep a line from being parsed: it can't be read, or is too long.
_HINDRANCES = ("CL101", "CL902")


@dataclass(frozen=True, slots=True)
class LineTree:
    """A logical line with what is wrong with it, and its tree unless the grammar refuses it or it is empty.

    An expression within a line, such as the field of an f-string, is a line of its own here.
    """

    range: Range
    text: str
    tree: CNode | None
    problems: Sequence[Problem]


def new_parser(language: Language) -> CPGenParserImpl:
    """A parser of a language version, for the caller alone."""
    make = CExtendedParser if language.is_py3 else CPGenParserImpl
    return make(language.version_triple, language.grammar_file, language.keywords, language.is_py3)


def line_trees(analysis: Analysis, row: int | None = None) -> Iterator[LineTree]:
    """The trees of all logical lines of a text, or of those on one row, counted from 1."""
    reader = _TreeReader(analysis)
    for line, logical in zip(analysis.lines, GetLogicalsFromText(analysis.text), strict=True):
        if row is None or row - 1 in _rows_of(logical, logical.fFirstLine):
            yield from reader.read(line, logical)


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
        self._parser = new_parser(language_of(analysis.text, analysis.python))
        self._utf8 = analysis.text.encode()
        self._starts = [0, *(match.end() for match in _UTF8_ROW_END.finditer(self._utf8))]
        self._hindrances = {
            problem.range.row - 1 for problem in analysis.problems if problem.code in _HINDRANCES
        }

    def read(self, line: Line, logical: CLogicalLine) -> Iterator[LineTree]:
        """The tree of a line, then those of the expressions within it."""
        rest = list(line.problems)
        within = [each for each in self._expressions(logical, rest) if each.tree is not None or each.problems]
        yield self._read(logical, (logical.fFirstLine, 0), logical.fInAsyncDef, rest)
        yield from within

    def _expressions(self, logical: CLogicalLine, problems: list[Problem]) -> Iterator[LineTree]:
        """What lies within a line; each takes the problems that keep it from being parsed out of `problems`.

        What is refused without a problem only looks like a type hint.
        """
        for embedded in logical.GetExpLogicals():
            # A hint in a comment is rewritten before it is parsed.
            if embedded.fType == kCommentedTypeHint:
                continue
            found = self._read(embedded, embedded.fOrigin, logical.fInAsyncDef, ())
            if found.tree is None:
                own = [each for each in problems if _starts_within(each.range, found.range)]
                problems[:] = [each for each in problems if each not in own]
                found = replace(found, problems=own)
            yield found

    def _read(
        self,
        logical: CLogicalLine,
        origin: tuple[int, int],
        in_async_def: bool,
        problems: Sequence[Problem],
    ) -> LineTree:
        """The tree of a logical whose text begins at `origin`: row and UTF-8 column, from zero."""
        tree = None
        if self._hindrances.isdisjoint(_rows_of(logical, origin[0])):
            with suppress(ParseError, SyntaxError):  # what is wrong is among the problems
                tree = self._parser.ParseToNode(logical, in_async_def)
        place = self._range_of(logical, origin)
        return LineTree(place, TextFromTokens(logical).lstrip(), tree, problems)

    def _range_of(self, logical: CLogicalLine, origin: tuple[int, int]) -> Range:
        """From the first token of a logical to its last one."""
        if not logical.fPositions:
            return Range(*self._place(origin, 0, 0) * 2)
        row, col = logical.fPositions[-1]
        end = self._place(origin, row, col + len(logical.fToks[-1].encode()))
        return Range(*self._place(origin, *logical.fPositions[0]), *end)

    def _place(self, origin: tuple[int, int], row: int, utf8_col: int) -> tuple[int, int]:
        """Row and column, from 1, of a place in a logical whose text begins at `origin`.

        A column after the end of its row goes on in the rows below.
        """
        origin_row, origin_col = origin
        start = self._starts[origin_row + row] + (0 if row else origin_col)
        offset = min(start + utf8_col, len(self._utf8))
        row = bisect_right(self._starts, offset) - 1
        return row + 1, len(self._utf8[self._starts[row] : offset].decode(errors="ignore")) + 1


def _starts_within(place: Range, around: Range) -> bool:
    start, end = (around.row, around.column), (around.end_row, around.end_column)
    return start <= (place.row, place.column) <= end


_UTF8_ROW_END = re.compile(ROW_END.pattern.encode())
