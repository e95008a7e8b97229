"""The texts that are open in the client: what each says, and where that is in the client's units."""

import asyncio
from collections.abc import AsyncIterator, Iterator, Sequence
from contextlib import contextmanager
from functools import cached_property
from typing import TypeVar

from lsprotocol import types
from pygls.exceptions import JsonRpcContentModified, JsonRpcInvalidParams
from pygls.uris import to_fs_path

from codeloom._analysis import Analysis, Occurrence, Range
from codeloom._document import Document
from codeloom.cli.items import Finding
from codeloom.cli.source import Source
from codeloom.rows import RowTexts
from codeloom.server.patience import Patience
from codeloom.server.places import PlacedText
from codeloom.server.rows import Place, Rows
from codeloom.server.settings import Settings, SettingsByFolder
from codeloom.server.units import Units

Item = TypeVar("Item")

# How many items are worked on before other messages get their turn.
_SLICE = 256


class _OpenSource(Source):
    """A source whose rows are at hand."""

    def __init__(self, path: str, analysis: Analysis, rows: Rows) -> None:
        super().__init__(path, analysis)
        self._open_rows = rows

    def row_text(self, row: int) -> str:
        """As the base class does, without splitting the text."""
        return self._open_rows[row - 1] if row <= len(self._open_rows) else ""

    def holds(self, text: str) -> bool:
        """Whether it does is looked up on the rows of problems alone, which are few."""
        return True


class OpenDocument(PlacedText):
    """One text. Places of the protocol count from zero in the client's units."""

    def __init__(self, item: types.TextDocumentItem, units: Units, settings: Settings) -> None:
        super().__init__(item.uri, Rows(item.text), units)
        self.path = to_fs_path(item.uri) or item.uri
        self.version = item.version
        self.patience = Patience()
        self._revision = 0
        self.take(settings)

    def take(self, settings: Settings) -> None:
        """Read the text by other settings."""
        self.settings = settings
        self._document = Document(
            self.rows.text, path=self.path, python=settings.python, false_hints=settings.false_hints
        )
        self._forget()

    @property
    def analysis(self) -> Analysis:
        """What the text says now."""
        return self._document.analysis

    @cached_property
    def findings(self) -> Sequence[Finding]:
        """The problems that settings and comments let through."""
        return self.settings.passed(_OpenSource(self.path, self.analysis, self.rows))

    @property
    def due(self) -> Sequence[Finding]:
        """Those of the problems that don't wait for the end of the typing."""
        return self.patience.due(self.findings, self.rows)

    def edit(self, change: types.TextDocumentContentChangeEvent) -> None:
        """Change the text as the client has; JsonRpcInvalidParams for a place that it doesn't have."""
        if isinstance(change, types.TextDocumentContentChangePartial):
            start, end = self._edge(change.range.start), self._edge(change.range.end)
            if end < start:
                raise JsonRpcInvalidParams(f"{self.uri}: the end of an edit is before its start")
        else:
            start, end = (0, 0), self.rows.end
        self.patience.before_edit(start, end, lambda: self.findings, self.rows)
        self.rows.replace(start, end, change.text)
        self._document.edit(_from_one(start), _from_one(end), change.text)
        self._forget()
        self.patience.after_edit(start, end, change.text)

    @contextmanager
    def trial(self, edits: Sequence[tuple[Range, str]]) -> Iterator[Analysis]:
        """What the text would say after edits, which are in its order and apart from each other."""
        (first, _), (last, _) = edits[0], edits[-1]
        start, end = (first.row, first.column), (last.end_row, last.end_column)
        old = self._between(start, end)
        pieces, here = [], start
        for place, text in edits:
            pieces += [self._between(here, (place.row, place.column)), text]
            here = place.end_row, place.end_column
        new = "".join(pieces)
        self._document.edit(start, end, new)
        try:
            yield self._document.analysis
        finally:
            self._document.edit(start, _end_of(start, new), old)

    def place(self, position: types.Position) -> tuple[int, int]:
        """A position of the client as the analysis counts: row and column from 1."""
        return _from_one(self._edge(position))

    def occurrence_at(self, position: types.Position) -> Occurrence | None:
        """The name at a position, or that ends there."""
        return self.analysis.occurrence_at(*self.place(position))

    async def slices(self, items: Sequence[Item], size: int = _SLICE) -> AsyncIterator[Sequence[Item]]:
        """The items in slices of a size, between which other messages are handled.

        JsonRpcContentModified when one of them has changed the text: the answer would be wrong.
        """
        revision = self._revision
        for first in range(0, len(items), size):
            if first:
                await asyncio.sleep(0)
                if self._revision != revision:
                    raise JsonRpcContentModified("the text has changed meanwhile")
            yield items[first : first + size]

    def _edge(self, position: types.Position) -> Place:
        """A position from zero in characters; after the end of a row is its end."""
        row, units = position.line, position.character
        if row == len(self.rows):
            return self.rows.end  # clients name the row after the last one for "up to the end"
        if not 0 <= row < len(self.rows) or units < 0:
            raise JsonRpcInvalidParams(
                f"{self.uri}: there is no position {row}:{units} in a text of {len(self.rows)} rows"
            )
        return row, self.units.characters(self.rows[row], units)

    def _between(self, start: tuple[int, int], end: tuple[int, int]) -> str:
        return self.rows.between((start[0] - 1, start[1] - 1), (end[0] - 1, end[1] - 1))

    def _forget(self) -> None:
        self._revision += 1
        self.__dict__.pop("findings", None)


def _end_of(start: tuple[int, int], text: str) -> tuple[int, int]:
    """Where a text ends that begins at a place."""
    *before, last = RowTexts(text)
    return start[0] + len(before), len(last) + (1 if before else start[1])


def _from_one(place: Place) -> tuple[int, int]:
    return place[0] + 1, place[1] + 1


class Documents:
    """The open texts by their names."""

    def __init__(self) -> None:
        self.units = Units("utf-16")
        self.settings = SettingsByFolder()
        self._by_uri: dict[str, OpenDocument] = {}

    def __getitem__(self, uri: str) -> OpenDocument:
        """JsonRpcInvalidParams for a text that isn't open."""
        document = self._by_uri.get(uri)
        if document is None:
            raise JsonRpcInvalidParams(f"{uri} isn't open")
        return document

    def __contains__(self, uri: str) -> bool:
        return uri in self._by_uri

    def __iter__(self) -> Iterator[OpenDocument]:
        return iter(list(self._by_uri.values()))

    def is_open(self, path: str) -> bool:
        """True for the path of a text that is open."""
        return any(document.path == path for document in self._by_uri.values())

    def open(self, item: types.TextDocumentItem) -> OpenDocument:
        """Take a text that the client has opened, also in the place of one of the same name."""
        settings = self.settings.of_file(to_fs_path(item.uri))
        document = OpenDocument(item, self.units, settings)
        self._by_uri[item.uri] = document
        return document

    def close(self, uri: str) -> OpenDocument:
        """Forget a text."""
        document = self[uri]
        del self._by_uri[uri]
        return document

    def read_settings_anew(self) -> None:
        """Take the settings of all texts as they are now."""
        self.settings.forget()
        for document in self._by_uri.values():
            document.take(self.settings.of_file(to_fs_path(document.uri)))
