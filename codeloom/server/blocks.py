"""Lines and scopes by place: which line is there, which blocks are around it, which scope it is in."""

from bisect import bisect_right
from collections.abc import Iterator

from codeloom._analysis import Analysis, Line, LineKind, Occurrence, Range, Scope, ScopeKind

# A row and a column, both from 1.
Place = tuple[int, int]

_HEADERS = (LineKind.DEF, LineKind.CLASS)
_OF_HEADERS = (ScopeKind.FUNCTION, ScopeKind.CLASS)
_IN_LINES = (
    ScopeKind.LAMBDA,
    ScopeKind.LIST_COMPREHENSION,
    ScopeKind.SET_COMPREHENSION,
    ScopeKind.DICT_COMPREHENSION,
    ScopeKind.GENERATOR,
)


def start_of(item: Line | Scope | Occurrence) -> Place:
    """Where a line, a scope or an occurrence begins."""
    return item.range.row, item.range.column


def contains(range: Range, place: Place) -> bool:
    """True for a place in a range or at its end."""
    return (range.row, range.column) <= place <= (range.end_row, range.end_column)


def line_index(analysis: Analysis, place: Place) -> int:
    """The number of the last line that begins at or before a place; -1 when none does."""
    return bisect_right(analysis.lines, place, key=start_of) - 1


def line_at(analysis: Analysis, place: Place) -> Line | None:
    """The line that a place lies in."""
    i = line_index(analysis, place)
    if i < 0:
        return None
    line = analysis.lines[i]
    return line if contains(line.range, place) else None


def headers_around(analysis: Analysis, place: Place, indent: int) -> Iterator[tuple[int, Line]]:
    """The lines, each with its number, whose blocks a line of this indentation is in; the innermost first."""
    lines = analysis.lines
    for i in range(line_index(analysis, place), -1, -1):
        if indent == 0:
            return
        line = lines[i]
        if line.indent is None or line.indent >= indent or line.kind is LineKind.COMMENT:
            continue
        if start_of(line) < place:
            indent = line.indent
            yield i, line


def block_end(analysis: Analysis, i: int) -> Line:
    """The last line of the block of a header, or the header itself."""
    lines = analysis.lines
    indent = lines[i].indent or 0
    last = lines[i]
    for line in lines[i + 1 :]:
        if line.indent is not None and line.indent <= indent:
            if line.kind is LineKind.COMMENT:
                continue
            break
        last = line
    return last


def scope_at(analysis: Analysis, place: Place, indent: int) -> Scope:
    """The innermost scope at a place whose row has, or gets, this indentation."""
    line = line_at(analysis, place)
    if line is not None:
        inner = [one for one in scopes_in(analysis, line.range) if one.kind in _IN_LINES]
        around = [one for one in inner if start_of(one) <= place and contains(one.range, place)]
        if around:
            return around[-1]
    for _, header in headers_around(analysis, place, indent):
        if header.kind in _HEADERS and (scope := scope_of_header(analysis, header)) is not None:
            return scope
    return analysis.scopes[0]


def scope_of_header(analysis: Analysis, header: Line) -> Scope | None:
    """The scope that the header of a class or a def opens."""
    for scope in scopes_in(analysis, header.range):
        if scope.kind in _OF_HEADERS:
            return scope
    return None


def scopes_in(analysis: Analysis, range: Range) -> Iterator[Scope]:
    """The scopes that begin in a range."""
    scopes = analysis.scopes
    # The module begins at the start of the text and is no part of it.
    i = max(bisect_right(scopes, (range.row, range.column - 1), key=start_of, lo=1), 1)
    while i < len(scopes) and start_of(scopes[i]) < (range.end_row, range.end_column):
        yield scopes[i]
        i += 1
