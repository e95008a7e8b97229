"""Checks whole files: which logical lines aren't sound, and where in the file the fault lies."""

import threading
from collections.abc import Iterable
from contextlib import redirect_stdout
from dataclasses import dataclass
from functools import cache
from io import TextIOBase
from os import PathLike, fspath
from pathlib import Path
from typing import NamedTuple

from codeloom import logicalline
from codeloom.excerpt import Excerpt
from codeloom.false_hints import FalseHintRemover
from codeloom.languages import DEFAULT_LANGUAGE_NAME, Language, LanguageNamed
from codeloom.logicalinspect import TextFromTokens
from codeloom.logicalline import CLogicalLine
from codeloom.source import REPLACEMENT, RowMap, Source, SourceFromBytes, SourceFromText
from codeloom.treesift import CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

# A logical line of more tokens isn't analysed.
MOST_TOKENS = 1_000_000

# The file name in the errors of a line. Those of an expression within it that doesn't parse have
# another one; only walkers use this one there too.
_LINE_FILENAME = "<string>"


@dataclass(frozen=True, slots=True)
class Problem:
    """One fault of a file. `row` counts from 1, and so does `column`, in characters."""

    path: str
    row: int
    column: int
    message: str
    source_row: str

    def __str__(self) -> str:
        return f"{self.path}:{self.row}:{self.column}: {self.message}"

    def Rendered(self, width: int = 100) -> str:
        """Place and message, the row of the source and a caret under the place, each in a row.

        The source's row is cut to `width` columns of a terminal.
        """
        return "\n".join((str(self), *Excerpt(self.source_row, self.column, width)))


@dataclass(frozen=True, slots=True)
class Report:
    """What a check of one file gave: its problems in the order of the file, its logical lines."""

    problems: tuple[Problem, ...]
    logical_count: int


def CheckFile(path: str | PathLike[str], language: Language | str = DEFAULT_LANGUAGE_NAME) -> list[Problem]:
    """The problems of a file, in the order of the file; OSError when it can't be read.

    `language` is the version of Python that it is written in, such as "3.12".
    """
    return list(CheckBytes(Path(path).read_bytes(), language, fspath(path)).problems)


def CheckText(
    text: str, language: Language | str = DEFAULT_LANGUAGE_NAME, path: str = "<string>"
) -> list[Problem]:
    """The problems of a source text, in its order; `path` is the name that they bear."""
    return list(_Check(SourceFromText(text), language, path).problems)


def CheckBytes(data: bytes, language: Language | str, path: str) -> Report:
    """The report on the bytes of a file, decoded as the file says; `path` is its name."""
    return _Check(SourceFromBytes(data), language, path)


def _Check(source: Source, language: Language | str, path: str) -> Report:
    if isinstance(language, str):
        language = LanguageNamed(language)
    logicals = GetLogicalsFromText(source.text)
    errors = _Errors(logicals, source, _AnalyzerOf(language))
    if not errors and not source.faults:
        return Report((), len(logicals))
    found = [(fault.row, fault.column, fault.message) for fault in source.faults]
    rows = RowMap(source.text)
    for error in errors:
        row, col = rows.Place(error.row, error.utf8_col)
        found.append((row + 1, col + 1, error.message))
    problems = tuple(
        Problem(path, row, column, message, rows.Text(row - 1)) for row, column, message in sorted(found)
    )
    return Report(problems, len(logicals))


class _Error(NamedTuple):
    """An error at a place of the file; row and column count from zero."""

    row: int
    utf8_col: int
    message: str


@cache
def _AnalyzerOf(language: Language) -> CPGenAnalyzerImpl:
    return CPGenAnalyzerImpl(
        language.version_triple, language.grammar_file, language.keywords, language.is_py3
    )


# An analyzer isn't reentrant, and the standard output is one for all threads.
_gAnalysisLock = threading.Lock()


def _Errors(logicals: Iterable[CLogicalLine], source: Source, analyzer: CPGenAnalyzerImpl) -> list[_Error]:
    """What is wrong with logical lines, false hints and unreadable places apart."""
    analyze = analyzer.AnalyzeSingleLogical
    false_hints = FalseHintRemover(source.text)
    errors = []
    # A walk that hits a limit prints a line, which says nothing of the file.
    with _gAnalysisLock, redirect_stdout(_NullStream()):
        for logical in logicals:
            if logical.fTokenCount > MOST_TOKENS:
                errors.append(_TooLong(logical))
                continue
            error = analyze(logical, logical.fInAsyncDef, logical.fFirstInDef)
            if error is None or _IsSpoiled(logical, source.spoiled_rows):
                continue
            plain = false_hints.Without(logical)
            if plain is not None:
                error = analyze(plain, logical.fInAsyncDef, logical.fFirstInDef)
            if error is not None:
                errors.append(_Error(*_PlaceInFile(error, plain or logical), error.msg))
    return errors


def _TooLong(logical: CLogicalLine) -> _Error:
    row, col = logical.fPositions[0]
    message = (
        f"this logical line has {logical.fTokenCount:,} tokens and isn't analysed: "
        f"split it into lines of {MOST_TOKENS:,} at the most"
    )
    return _Error(logical.fFirstLine + row, col, message)


class _NullStream(TextIOBase):
    def write(self, text: str) -> int:
        return len(text)


def _IsSpoiled(logical: CLogicalLine, spoiled_rows: frozenset[int]) -> bool:
    """True when the line holds something that can't be read, and that is reported already."""
    if not spoiled_rows:
        return False
    for token, (row, _) in zip(logical.fToks, logical.fPositions, strict=True):
        if token and REPLACEMENT in token:
            first_row = logical.fFirstLine + row
            if not spoiled_rows.isdisjoint(range(first_row, first_row + len(token.splitlines()))):
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
