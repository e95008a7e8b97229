"""The engine as the upper layers use it: its analyzers, and its complaints in places of the file."""

import threading
from collections.abc import Iterator
from contextlib import contextmanager, redirect_stdout
from functools import cache
from io import StringIO
from typing import NamedTuple

from codeloom import logicalline
from codeloom.false_hints import FalseHintRemover
from codeloom.languages import Language
from codeloom.logicalinspect import TextFromTokens
from codeloom.logicalline import CLogicalLine
from codeloom.rows import RowTexts
from codeloom.source import REPLACEMENT
from codeloom.treesift import CNewerAnalyzer, CNewerParser, CPGenAnalyzerImpl, CPGenParserImpl

# The file name in the errors of a line. Those of an expression within it that doesn't parse have
# another one; only walkers use this one there too.
_LINE_FILENAME = "<string>"


class Complaint(NamedTuple):
    """What is wrong at a place of the file; row and column count from zero."""

    row: int
    utf8_col: int
    message: str


@cache
def AnalyzerOf(language: Language) -> CPGenAnalyzerImpl:
    """The one analyzer of a language version. Use it within `Analysis` only."""
    make = CNewerAnalyzer if language.is_py3 else CPGenAnalyzerImpl
    return make(language.version_triple, language.grammar_file, language.keywords, language.is_py3)


def NewParser(language: Language) -> CPGenParserImpl:
    """A parser of a language version, for the caller alone."""
    make = CNewerParser if language.is_py3 else CPGenParserImpl
    return make(language.version_triple, language.grammar_file, language.keywords, language.is_py3)


_gLock = threading.Lock()


@contextmanager
def Analysis() -> Iterator[StringIO]:
    """The time in which this thread alone may use the analyzers.

    They aren't reentrant, and the standard output, on which a walk that hits a limit prints a line,
    is one for all threads. What is printed goes into the stream that is yielded.
    """
    with _gLock, redirect_stdout(StringIO()) as printed:
        yield printed


class LineAnalyzer:
    """Analyses the lines of one text without its false hints. Use it within `Analysis` only.

    With `false_hints` they stay, and all is as the engine itself sees it.
    """

    def __init__(self, text: str, language: Language, false_hints: bool) -> None:
        self._fAnalyze = AnalyzerOf(language).AnalyzeSingleLogical
        self._fFalseHints = FalseHintRemover(text, keep=false_hints)

    def Analyze(self, logical: CLogicalLine) -> tuple[CLogicalLine, SyntaxError | None]:
        """The line as it was analysed, which has the records, and what is wrong with it."""
        plain = self._fFalseHints.Without(logical) or logical
        return plain, self._fAnalyze(plain, logical.fInAsyncDef, logical.fFirstInDef)


def ComplaintOf(error: SyntaxError, logical: CLogicalLine) -> Complaint:
    """An error that the analysis of `logical` gave, with its place in the file."""
    return Complaint(*_PlaceInFile(error, logical), error.msg)


def IsSpoiled(logical: CLogicalLine, spoiled_rows: frozenset[int]) -> bool:
    """True when the line holds something that can't be read, and that is reported already."""
    if not spoiled_rows:
        return False
    for token, (row, _) in zip(logical.fToks, logical.fPositions, strict=True):
        if token and REPLACEMENT in token:
            first_row = logical.fFirstLine + row
            if not spoiled_rows.isdisjoint(range(first_row, first_row + len(RowTexts(token)))):
                return True
    return False


def _PlaceInFile(error: SyntaxError, logical: CLogicalLine) -> tuple[int, int]:
    """Where an error of `logical` lies in the file: row, and column in UTF-8 bytes, from zero."""
    assert error.lineno is not None and error.offset is not None
    row, col = logical.fFirstLine + error.lineno - 1, error.offset - 1
    embedded = _EmbeddedAtFault(error, logical)
    if embedded is None:
        return row, col
    origin_row, origin_col = embedded.fOrigin
    if error.filename == _LINE_FILENAME:
        # A walker found it, and counts rows from the embedded expression's own first row.
        row += origin_row - logical.fFirstLine
    return row, col + origin_col if row == origin_row else col


def _EmbeddedAtFault(error: SyntaxError, logical: CLogicalLine) -> CLogicalLine | None:
    """The expression within `logical` that the error is about; None for one of the line itself.

    Expressions are analysed in order, so that of equal ones the first is at fault.
    """
    exp_logicals: tuple[CLogicalLine, ...] = logical.GetExpLogicals()
    if not exp_logicals:
        return None
    if error.filename == _LINE_FILENAME and error.text == TextFromTokens(logical):
        return None
    for embedded in exp_logicals:
        if embedded.fType != logicalline.kCommentedTypeHint and TextFromTokens(embedded) == error.text:
            return embedded
    return None
