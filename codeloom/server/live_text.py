"""A text that is edited: what it says now, and which of its problems are shown."""

import asyncio
from collections.abc import AsyncIterator, Iterator, Sequence
from contextlib import contextmanager
from functools import cached_property
from typing import TYPE_CHECKING, TypeVar

from pygls.exceptions import JsonRpcContentModified
from pygls.uris import to_fs_path

from codeloom._analysis import Analysis, Range
from codeloom._document import Document, Position
from codeloom.cli.items import Finding
from codeloom.cli.source import Source
from codeloom.rows import RowTexts
from codeloom.server.patience import Patience
from codeloom.server.settings import Settings

if TYPE_CHECKING:
    from codeloom._document import Encoding
    from codeloom.cli.source import CellPlaces

Item = TypeVar("Item")
# What a client has written: where, and which text.
Written = tuple[Position, Position, str]

# How many items are worked on before other messages get their turn.
_SLICE = 256


class _LiveSource(Source):
    """A source whose rows are at hand."""

    def __init__(self, live: "LiveText", notebook: "CellPlaces | None") -> None:
        super().__init__(live.path, live.analysis, notebook)
        self._document = live.document
        self._live = live

    def row_text(self, row: int) -> str:
        """As the base class does, without splitting the text."""
        return self._document.row(row) if row <= self._document.row_count else ""

    def holds(self, text: str) -> bool:
        """As the base class does; True also where the text has been there before."""
        return self._live.may_hold(text)


class LiveText:
    """A text with its analysis, its settings and the problems that wait. Places are those of the analysis."""

    def __init__(
        self,
        text: str,
        uri: str,
        encoding: "Encoding",
        settings: Settings,
        notebook: "CellPlaces | None" = None,
    ) -> None:
        self.uri = uri
        self.path = to_fs_path(uri) or uri
        self.patience = Patience()
        self._encoding: Encoding = encoding
        self._notebook = notebook
        self._revision = 0
        self._take(text, settings)

    def read_by(self, settings: Settings) -> None:
        """Read the text by other settings."""
        self._take(self.document.text, settings)

    @property
    def analysis(self) -> Analysis:
        """What the text says now."""
        return self.document.analysis

    @cached_property
    def findings(self) -> Sequence[Finding]:
        """The problems that settings and comments let through."""
        return self.settings.passed(_LiveSource(self, self._notebook))

    @property
    def due(self) -> Sequence[Finding]:
        """Those of the problems that don't wait for the end of the typing."""
        return self.patience.due(self.findings)

    def may_hold(self, text: str) -> bool:
        """False for a part of a row that isn't in the text and hasn't been since it was asked for."""
        if text not in self._held:
            self._held[text] = text in self.document.text
        return self._held[text]

    def edit(self, start: Position, end: Position, new_text: str, written: "Written | None" = None) -> None:
        """Put a text in the place of another one; `written` is what the client did, where that is less."""
        written = written or (start, end, new_text)
        self.patience.before_edit(*written[:2], lambda: self.findings)
        self._edit(start, end, new_text)
        self._forget()
        self._look_for_held(start[0], start[0] + len(RowTexts(new_text)))
        self.patience.after_edit(*written)

    @contextmanager
    def trial(self, edits: Sequence[tuple[Range, str]]) -> Iterator[Analysis]:
        """What the text would say after edits, which are in its order and apart from each other."""
        (first, _), (last, _) = edits[0], edits[-1]
        start, end = (first.row, first.column), (last.end_row, last.end_column)
        old = self.document.between(start, end)
        pieces, here = [], start
        for place, text in edits:
            pieces += [self.document.between(here, (place.row, place.column)), text]
            here = place.end_row, place.end_column
        new = "".join(pieces)
        self._edit(start, end, new)
        try:
            yield self.document.analysis
        finally:
            self._edit(start, _end_of(start, new), old)

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

    def _take(self, text: str, settings: Settings) -> None:
        self.settings = settings
        self._held: dict[str, bool] = {}
        self.document = Document(
            text,
            path=self.path,
            python=settings.python,
            false_hints=settings.false_hints,
            encoding=self._encoding,
        )
        self._forget()

    def _edit(self, start: Position, end: Position, new_text: str) -> None:
        self.document.edit(self.document.position(*start), self.document.position(*end), new_text)

    def _look_for_held(self, first: int, after: int) -> None:
        rows = [self.document.row(row) for row in range(first, min(after, self.document.row_count + 1))]
        for text, was_held in self._held.items():
            self._held[text] = was_held or any(text in row for row in rows)

    def _forget(self) -> None:
        self._revision += 1
        self.__dict__.pop("findings", None)


def _end_of(start: Position, text: str) -> Position:
    """Where a text ends that begins at a place."""
    *before, last = RowTexts(text)
    return start[0] + len(before), len(last) + (1 if before else start[1])
