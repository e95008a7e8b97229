"""What each logical line of a source says of names: what it reads, binds, and what is known of it."""

from collections.abc import Iterator, Sequence
from dataclasses import dataclass
from functools import cache
from io import StringIO
from os import PathLike, fspath
from pathlib import Path

from codeloom import logicalline
from codeloom.check import Problem
from codeloom.engine import Analysis, AnalyzerOf, ComplaintOf, LineAnalyzer
from codeloom.languages import DEFAULT_LANGUAGE_NAME, Language, LanguageOf
from codeloom.line_reader import LineReader
from codeloom.logicalinspect import TextFromTokens
from codeloom.logicalline import CLogicalLine
from codeloom.name_places import NamePlaces, PlaceFinder, Tokens
from codeloom.records import CRecord, RecordsOfLogical
from codeloom.rows import RowTexts
from codeloom.scopes import ScopeReader, WithSelfLeftOut
from codeloom.source import Source, SourceFromBytes, SourceFromText
from codeloom.utils import GetLogicalsFromText


@dataclass(frozen=True, slots=True)
class SourceRange:
    """A piece of a file. Rows and columns count from 1, columns in characters; the end is behind it."""

    row: int
    column: int
    end_row: int
    end_column: int


@dataclass(frozen=True, slots=True)
class PlacedRecord:
    """A record, and where its name stands: None where that can't be told.

    `scope` is None when the name belongs to the scope that the line stands in, and the name of the
    definition when it is an argument's.
    """

    record: CRecord
    range: SourceRange | None
    scope: str | None


@dataclass(frozen=True, slots=True)
class LineNames:
    """A logical line with its records in their order, those of arguments last.

    A line with a problem has none. `limits` tells which limits the walk over the line hit; then
    records are missing. `row` and `column` count from 1, the column in characters.
    """

    path: str
    row: int
    column: int
    text: str
    records: tuple[PlacedRecord, ...] = ()
    problem: Problem | None = None
    limits: tuple[str, ...] = ()


def NamesInFile(
    path: str | PathLike[str],
    language: Language | str = DEFAULT_LANGUAGE_NAME,
    *,
    false_hints: bool = False,
) -> Iterator[LineNames]:
    """The names in each logical line of a file, in its order; OSError when it can't be read.

    `language` is the version of Python that it is written in, such as "3.12". With `false_hints`
    all that looks like a type hint is taken for one, as the engine itself does.
    """
    return NamesInBytes(Path(path).read_bytes(), language, fspath(path), false_hints=false_hints)


def NamesInText(
    text: str,
    language: Language | str = DEFAULT_LANGUAGE_NAME,
    path: str = "<string>",
    *,
    false_hints: bool = False,
) -> Iterator[LineNames]:
    """The same for a source text; `path` is the name that its lines bear."""
    return _Names(SourceFromText(text), language, path, false_hints)


def NamesInBytes(
    data: bytes, language: Language | str, path: str, *, false_hints: bool = False
) -> Iterator[LineNames]:
    """The same for the bytes of a file, decoded as the file says; `path` is its name."""
    return _Names(SourceFromBytes(data), language, path, false_hints)


def _Names(source: Source, language: Language | str, path: str, false_hints: bool) -> Iterator[LineNames]:
    language = LanguageOf(source.text, language)
    reader = _NameReader(source, language, path, false_hints)
    return map(reader.Read, GetLogicalsFromText(source.text))


@cache
def _PlaceFinderOf(language: Language) -> PlaceFinder:
    return PlaceFinder(language.version_triple)


class _NameReader(LineReader):
    """Analyses the logical lines of one text."""

    def __init__(self, source: Source, language: Language, path: str, false_hints: bool) -> None:
        super().__init__(source, path)
        self._fAnalyzer = LineAnalyzer(source.text, language, false_hints)
        self._fLanguage = language
        self._fScopes = ScopeReader(self._fRowMap)

    def Read(self, logical: CLogicalLine) -> LineNames:
        """The names in a line, or what is wrong with it."""
        self._fScopes.Read(logical)
        origin = logical.fFirstLine, 0
        head = self._fPath, *self._FirstPlace(logical, origin), TextFromTokens(logical).lstrip()
        problem = self._Hindrance(logical, logical.fFirstLine)
        if problem is not None:
            return LineNames(*head, problem=problem)
        with Analysis() as printed:
            return self._Analyzed(head, logical, printed)

    def _Analyzed(
        self, head: tuple[str, int, int, str], logical: CLogicalLine, printed: StringIO
    ) -> LineNames:
        plain, error = self._fAnalyzer.Analyze(logical)
        if error is not None:
            return LineNames(*head, problem=self._Problem(ComplaintOf(error, plain)))
        records: Sequence[CRecord] = RecordsOfLogical(plain)
        if logical.fType == logicalline.kFunctionDef and self._fScopes.is_method:
            records = WithSelfLeftOut(records, plain)
        limits = tuple(printed.getvalue().splitlines())
        places = self._Places(plain, logical.fInAsyncDef) if records else NamePlaces()
        return LineNames(*head, tuple(self._Placed(records, places)), limits=limits)

    def _Places(self, logical: CLogicalLine, in_async_def: bool) -> NamePlaces:
        """The places of the names in a line that is sound."""
        places = NamePlaces()
        analyzer, finder = AnalyzerOf(self._fLanguage), _PlaceFinderOf(self._fLanguage)
        for part in (logical, *logical.GetExpLogicals()):
            if part.fType == logicalline.kCommentedTypeHint:
                places.AddComment(part)
            elif part.fType != logicalline.kComment:
                tree = analyzer.ParseToNode(part, in_async_def)
                if tree is not None:
                    finder.Find(tree, part, places)
        return places

    def _Placed(self, records: Sequence[CRecord], places: NamePlaces) -> Iterator[PlacedRecord]:
        scope = next((record.name for record in records if record.kind.name == "Set"), None)
        for record in records:
            tokens = places.Take(*record.ToPair(), record.of_arg)
            yield PlacedRecord(record, tokens and self._Range(tokens), scope if record.of_arg else None)

    def _Range(self, tokens: Tokens) -> SourceRange:
        logical, first, last = tokens
        origin = logical.fOrigin
        last_row, last_col = logical.fPositions[last]
        *rows_above, end = RowTexts(logical.fToks[last])
        end_col = len(end.encode()) + (0 if rows_above else last_col)
        return SourceRange(
            *self._Place(origin, *logical.fPositions[first]),
            *self._Place(origin, last_row + len(rows_above), end_col),
        )
