"""What can be folded: blocks, statements on several rows, runs of comments and imports, marked regions."""

import re
from collections.abc import Iterable
from operator import itemgetter
from typing import TYPE_CHECKING

from lsprotocol import types

from codeloom._analysis import Line, LineKind
from codeloom.server.json_text import JsonText, items_as_json

if TYPE_CHECKING:
    from codeloom.server.server import Server

_IMPORTS = frozenset({LineKind.IMPORT, LineKind.FROM_IMPORT})
_REGION = re.compile(r"#\s*(?P<end>end)?region\b")


def register(server: "Server") -> None:
    """Answer what asks for parts to fold."""

    @server.feature(types.TEXT_DOCUMENT_FOLDING_RANGE)
    async def folding_range(params: types.FoldingRangeParams) -> JsonText:
        document = server.documents[params.text_document.uri]
        folds, parts = _Folds(document.rows_before), []
        async for lines in document.live.slices(document.lines):
            folds.add(lines)
            parts.append(folds.complete())
        folds.end()
        return JsonText.of_list([*parts, folds.complete()])


class _Folds:
    """The folds of a text, line by line; rows count from 1 until they are sent."""

    def __init__(self, rows_before: int) -> None:
        self._rows_before = rows_before
        self._found: list[tuple[int, int, types.FoldingRangeKind | None]] = []
        # Blocks that are open: the indentation and the last row of their header.
        self._open: list[tuple[int, int]] = []
        self._regions: list[int] = []
        self._run: tuple[types.FoldingRangeKind, int, int] | None = None
        self._last_row = 0
        self._last_indent = 0

    def add(self, lines: Iterable[Line]) -> None:
        """Take the next lines."""
        for line in lines:
            self._add(line)

    def end(self) -> None:
        """There are no more lines."""
        self._close(-1)
        self._end_run()
        self._regions.clear()
        self._last_row += 1

    def complete(self) -> str:
        """As JSON those before all that is still open, by their rows; each is given once."""
        first_open = min([self._last_row, *self._regions, *(row for _, row in self._open[:1])])
        if self._run is not None:
            first_open = min(first_open, self._run[1])
        kinds: dict[tuple[int, int], types.FoldingRangeKind | None] = {}
        for first, last, kind in self._found:
            if first < first_open:
                kinds[first, -last] = kind or kinds.get((first, -last))
        self._found = [fold for fold in self._found if fold[0] >= first_open]
        before = self._rows_before + 1
        return items_as_json(
            [
                {
                    "startLine": first - before,
                    "endLine": -last - before,
                    **({"kind": kind.value} if kind else {}),
                }
                for (first, last), kind in sorted(kinds.items(), key=itemgetter(0))
            ]
        )

    def _add(self, line: Line) -> None:
        place, indent = line.range, line.indent
        if line.kind is LineKind.COMMENT:
            self._add_comment(line)
            return
        if indent is not None:
            self._close(indent)
            if indent > self._last_indent and self._last_row:
                self._open.append((self._last_indent, self._last_row))
            self._last_indent = indent
        self._extend_run(types.FoldingRangeKind.Imports if line.kind in _IMPORTS else None, line)
        if place.end_row > place.row:
            self._found.append((place.row, place.end_row, None))
        self._last_row = place.end_row

    def _close(self, indent: int) -> None:
        """End the blocks whose lines are deeper than this."""
        while self._open and self._open[-1][0] >= indent:
            _, row = self._open.pop()
            if self._last_row > row:
                self._found.append((row, self._last_row, None))

    def _add_comment(self, line: Line) -> None:
        row = line.range.row
        match = _REGION.match(line.text)
        if match is None:
            self._extend_run(types.FoldingRangeKind.Comment, line)
        elif not match["end"]:
            self._regions.append(row)
        elif self._regions:
            self._found.append((self._regions.pop(), row, types.FoldingRangeKind.Region))

    def _extend_run(self, kind: types.FoldingRangeKind | None, line: Line) -> None:
        if self._run is not None:
            known, first, last = self._run
            gap = 1 if known is types.FoldingRangeKind.Comment else 2
            if kind is known and line.range.row <= last + gap:
                self._run = known, first, line.range.end_row
                return
            self._end_run()
        if kind is not None:
            self._run = kind, line.range.row, line.range.end_row

    def _end_run(self) -> None:
        if self._run is not None:
            kind, first, last = self._run
            if last > first:
                self._found.append((first, last, kind))
            self._run = None
