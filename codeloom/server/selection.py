"""What is selected step by step: the name, its chain, the parentheses, the line, its block, the text."""

from collections.abc import Iterator
from typing import TYPE_CHECKING

from lsprotocol import types

from codeloom._analysis import Line, Range
from codeloom.server.blocks import block_end, contains, headers_around, line_at, start_of
from codeloom.server.document import OpenDocument
from codeloom.server.pieces import bracket_pairs, pieces_of

if TYPE_CHECKING:
    from codeloom.server.server import Server

Place = tuple[int, int]


def register(server: "Server") -> None:
    """Answer what selects more and more."""

    @server.feature(types.TEXT_DOCUMENT_SELECTION_RANGE)
    def selection_range(params: types.SelectionRangeParams) -> list[types.SelectionRange]:
        document = server.documents[params.text_document.uri]
        return [_selection(document, document.place(position)) for position in params.positions]


def _selection(document: OpenDocument, place: Place) -> types.SelectionRange:
    """The ranges around a place, each in the next one."""
    row, column = place
    found = {Range(row, column, row, column), *_ranges(document, place)}
    found.add(document.whole)
    chain: types.SelectionRange | None = None
    around: Range | None = None
    for range in sorted(found, key=_order):
        if around is None or _holds(around, range):
            chain, around = types.SelectionRange(document.range(range), chain), range
    assert chain is not None
    return chain


def _ranges(document: OpenDocument, place: Place) -> Iterator[Range]:
    analysis = document.analysis
    line = line_at(analysis, place)
    if line is not None:
        yield from _in_line(line, place)
        yield line.range
    indent = _indent_at(document, place[0], line)
    for i, header in headers_around(analysis, place, indent):
        last = block_end(analysis, i).range
        body = analysis.lines[i + 1].range
        yield Range(body.row, body.column, last.end_row, last.end_column)
        yield Range(*start_of(header), last.end_row, last.end_column)


def _in_line(line: Line, place: Place) -> Iterator[Range]:
    """What lies around a place within its line."""
    pieces = pieces_of(line)
    yield from (piece.range for piece in pieces if contains(piece.range, place))
    for occurrence in line.occurrences:
        whole = occurrence.object
        if whole is not None:
            chain = Range(whole.row, whole.column, occurrence.range.end_row, occurrence.range.end_column)
            yield from (one for one in (chain, occurrence.range) if contains(one, place))
    for opening, closing in bracket_pairs(pieces):
        inner = Range(*opening.end, *closing.start)
        if contains(inner, place):
            yield inner
        outer = Range(*opening.start, *closing.end)
        if contains(outer, place):
            yield outer


def _indent_at(document: OpenDocument, row: int, line: Line | None) -> int:
    if line is not None and line.indent is not None:
        return line.indent
    text = document.row(row).expandtabs(8)
    return len(text) - len(text.lstrip()) or len(text)


def _order(range: Range) -> tuple[int, ...]:
    """From the outermost to the innermost."""
    return range.row, range.column, -range.end_row, -range.end_column


def _holds(outer: Range, inner: Range) -> bool:
    return contains(outer, (inner.row, inner.column)) and contains(outer, (inner.end_row, inner.end_column))
