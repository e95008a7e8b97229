"""Checks whole files: which logical lines aren't sound, and where in the file the fault lies."""

from collections.abc import Iterable
from dataclasses import dataclass
from os import PathLike, fspath
from pathlib import Path

from codeloom.engine import Analysis, Complaint, ComplaintOf, IsSpoiled, LineAnalyzer
from codeloom.excerpt import Excerpt
from codeloom.languages import DEFAULT_LANGUAGE_NAME, Language, LanguageOf
from codeloom.line_length import TooLong
from codeloom.logicalline import CLogicalLine
from codeloom.source import RowMap, Source, SourceFromBytes, SourceFromText
from codeloom.utils import GetLogicalsFromText


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


def CheckFile(
    path: str | PathLike[str],
    language: Language | str = DEFAULT_LANGUAGE_NAME,
    *,
    false_hints: bool = False,
) -> list[Problem]:
    """The problems of a file, in the order of the file; OSError when it can't be read.

    `language` is the version of Python that it is written in, such as "3.12". With `false_hints`
    all that looks like a type hint is taken for one, as the engine itself does.
    """
    return list(CheckBytes(Path(path).read_bytes(), language, fspath(path), false_hints=false_hints).problems)


def CheckText(
    text: str,
    language: Language | str = DEFAULT_LANGUAGE_NAME,
    path: str = "<string>",
    *,
    false_hints: bool = False,
) -> list[Problem]:
    """The problems of a source text, in its order; `path` is the name that they bear."""
    return list(_Check(SourceFromText(text), language, path, false_hints).problems)


def CheckBytes(data: bytes, language: Language | str, path: str, *, false_hints: bool = False) -> Report:
    """The report on the bytes of a file, decoded as the file says; `path` is its name."""
    return _Check(SourceFromBytes(data), language, path, false_hints)


def _Check(source: Source, language: Language | str, path: str, false_hints: bool) -> Report:
    language = LanguageOf(source.text, language)
    logicals = GetLogicalsFromText(source.text)
    complaints = _Complaints(logicals, source, LineAnalyzer(source.text, language, false_hints))
    if not complaints and not source.faults:
        return Report((), len(logicals))
    found = [(fault.row, fault.column, fault.message) for fault in source.faults]
    rows = RowMap(source.text)
    for complaint in complaints:
        row, col = rows.Place(complaint.row, complaint.utf8_col)
        found.append((row + 1, col + 1, complaint.message))
    problems = tuple(
        Problem(path, row, column, message, rows.Text(row - 1)) for row, column, message in sorted(found)
    )
    return Report(problems, len(logicals))


def _Complaints(logicals: Iterable[CLogicalLine], source: Source, analyzer: LineAnalyzer) -> list[Complaint]:
    """What is wrong with logical lines, false hints and unreadable places apart."""
    complaints = []
    with Analysis():
        for logical in logicals:
            too_long = TooLong(logical)
            if too_long is not None:
                complaints.append(too_long)
                continue
            plain, error = analyzer.Analyze(logical)
            if error is not None and not IsSpoiled(logical, source.spoiled_rows):
                complaints.append(ComplaintOf(error, plain))
    return complaints
