"""The syntax trees of logical lines, for those who look at what the engine is given."""

from collections.abc import Iterator
from dataclasses import dataclass

from codeloom import logicalline
from codeloom.check import Problem
from codeloom.engine import NewParser
from codeloom.languages import Language, LanguageOf
from codeloom.line_reader import LineReader, RowsOf
from codeloom.logicalinspect import TextFromTokens
from codeloom.logicalline import CLogicalLine
from codeloom.optpgen import ParseError
from codeloom.source import Source
from codeloom.treesift import CNode, CreateSyntaxError
from codeloom.utils import GetLogicalsFromText


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
    reader = _TreeReader(source, LanguageOf(source.text, language), path)
    for logical in GetLogicalsFromText(source.text):
        origin = logical.fFirstLine, 0
        if row is not None and row - 1 not in RowsOf(logical, origin[0]):
            continue
        yield reader.Read(logical, origin, logical.fInAsyncDef)
        for embedded in logical.GetExpLogicals():
            # A hint in a comment is rewritten before it is parsed.
            if embedded.fType != logicalline.kCommentedTypeHint:
                yield reader.Read(embedded, embedded.fOrigin, logical.fInAsyncDef)


class _TreeReader(LineReader):
    """Parses the logical lines of one text."""

    def __init__(self, source: Source, language: Language, path: str) -> None:
        super().__init__(source, path)
        self._fParser = NewParser(language)

    def Read(self, logical: CLogicalLine, origin: tuple[int, int], in_async_def: bool) -> LineTree:
        """The tree of a logical whose text begins at `origin`: row and UTF-8 column, from zero."""
        tree, problem = None, self._Hindrance(logical, origin[0])
        if problem is None:
            try:
                tree = self._fParser.ParseToNode(logical, in_async_def)
            except ParseError as error:
                *_, context = error.args
                problem = self._Refusal(CreateSyntaxError("invalid syntax", logical, context), origin)
            except SyntaxError as error:
                problem = self._Refusal(error, origin)
        row, column = self._FirstPlace(logical, origin)
        return LineTree(self._fPath, row, column, TextFromTokens(logical).lstrip(), tree, problem)

    def _Refusal(self, error: SyntaxError, origin: tuple[int, int]) -> Problem:
        assert error.lineno is not None and error.offset is not None
        row, column = self._Place(origin, error.lineno - 1, error.offset - 1)
        return Problem(self._fPath, row, column, error.msg, self._fRowMap.Text(row - 1))
