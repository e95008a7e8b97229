"""Which rows of a file are worth showing, and how each is written into the page."""

from collections.abc import Iterator, Sequence

from codeloom.cli.excerpt import printable
from codeloom.cli.items import Finding
from codeloom.cli.source import Source

# Rows beside a broken line, and rows of the line itself on either side of the fault.
_AROUND = 2
_OF_LINE = 8
# Fewer rows between two stretches are shown too.
_LEAST_GAP = 3
# Characters of a row, and those of them before its first fault.
_LONGEST_ROW = 1000
_BEFORE_FAULT = 200

# The first and the last row of some that follow each other.
Stretch = tuple[int, int]
# A row's text; where it is cut, the characters left out before and after it too.
Row = str | tuple[int, str, int]


def row_count(source: Source) -> int:
    """How many rows there are, but for an empty one after the last end of a row."""
    rows = source.rows
    return len(rows) - (len(rows) > 1 and not rows[-1])


def stretches_around(source: Source, findings: Sequence[Finding]) -> list[Stretch]:
    """The rows around what the findings are about, in order and apart from each other."""
    merged: list[Stretch] = []
    last_row = row_count(source)
    for first, last in sorted(stretch for finding in findings for stretch in _around(source, finding)):
        first = 1 if first <= _LEAST_GAP else min(first, last_row)
        last = last_row if last > last_row - _LEAST_GAP else last
        if merged and first - merged[-1][1] <= _LEAST_GAP:
            merged[-1] = merged[-1][0], max(last, merged[-1][1])
        else:
            merged.append((first, last))
    return merged


def _around(source: Source, finding: Finding) -> Iterator[Stretch]:
    row = finding.range.row
    first, last = source.line_rows(row)
    last = max(last, finding.range.end_row)
    yield max(first, row - _OF_LINE) - _AROUND, min(last, row + _OF_LINE) + _AROUND
    for place, _ in finding.related:
        yield place.row, place.row


def shown_row(text: str, first_fault: int | None) -> Row:
    """A row as the page holds it; `first_fault` is the column of its first fault."""
    if len(text) <= _LONGEST_ROW:
        return readable(text)
    start = max(0, (first_fault or 1) - 1 - _BEFORE_FAULT)
    end = start + _LONGEST_ROW
    return start, readable(text[start:end]), max(0, len(text) - end)


def readable(text: str) -> str:
    """A text for the page: tabs stay, what else can't be seen is U+FFFD, character for character."""
    return text if text.isprintable() else "\t".join(map(printable, text.split("\t")))
