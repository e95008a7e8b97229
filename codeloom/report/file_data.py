"""What the page holds of one file, for its scripts to show."""

from bisect import bisect_left
from collections import Counter
from collections.abc import Iterator, Sequence
from itertools import chain
from typing import Any

from codeloom._analysis import Line, Range
from codeloom.cli.formats.base import portable_path
from codeloom.cli.items import Finding
from codeloom.cli.source import Source, printable_path
from codeloom.report.excerpts import Stretch, readable, row_count, shown_row, stretches_around
from codeloom.report.names import NamesOfRows


def shown_path(path: str) -> str:
    """A path as the page shows it: with slashes, and from the current folder on where it lies there."""
    return printable_path(portable_path(path))


def summary_fields(source: Source, findings: Sequence[Finding], shown: Sequence[Finding]) -> dict[str, Any]:
    """A file in the list of all: its counts, the problems that are shown, and its names to search."""
    severities = Counter(finding.severity for finding in findings)
    fields = {
        "path": shown_path(source.path),
        "lines": len(source.analysis.lines),
        "errors": severities["error"],
        "warnings": severities["warning"],
        "problems": [_problem_fields(finding) for finding in shown],
        "more_codes": " ".join(sorted({finding.code for finding in findings[len(shown) :]})),
        "names": _names(source),
    }
    return {key: value for key, value in fields.items() if value or key == "path"}


def _names(source: Source) -> str:
    """The names in a file, one a row."""
    return "\n".join(map(readable, sorted({each.name for each in source.analysis.occurrences})))


def row_fields(source: Source, findings: Sequence[Finding], *, is_whole: bool) -> dict[str, Any]:
    """The rows of a file that are in the page, with their names; those around problems, or all."""
    shown = stretches_around(source, findings)
    held = [(1, row_count(source))] if is_whole else shown
    rows = list(chain.from_iterable(range(first, last + 1) for first, last in held))
    names = NamesOfRows()
    for line in _lines_on(source, held):
        names.add_line(line)
    faults = _first_faults(findings)
    fields = {
        "whole": is_whole,
        "shown": shown,
        "rows": [shown_row(source.written_row(row), faults.get(row)) for row in rows],
        **names.fields(rows),
    }
    if source.is_notebook:
        fields["cells"] = [source.cell_and_row(row) for row in rows]
    return fields


def _problem_fields(finding: Finding) -> dict[str, Any]:
    fields: dict[str, Any] = {
        "code": finding.code,
        "message": readable(finding.message),
        "severity": finding.severity,
        "at": _numbers(finding.range),
        "hint": finding.hint and readable(finding.hint),
        "related": [(*_numbers(place), readable(text)) for place, text in finding.related],
    }
    if finding.source.is_notebook:
        fields["cell"] = finding.source.cell_and_row(finding.range.row)
    return {key: value for key, value in fields.items() if value}


def _numbers(place: Range) -> tuple[int, int, int, int]:
    return place.row, place.column, place.end_row, place.end_column


def _lines_on(source: Source, stretches: Sequence[Stretch]) -> Iterator[Line]:
    """The logical lines that lie on some rows, each once."""
    lines = source.analysis.lines
    done = 0
    for first, last in stretches:
        # A line that begins before a stretch may go on in it.
        start = bisect_left(lines, source.line_rows(first)[0], key=lambda line: line.range.row)
        end = bisect_left(lines, last + 1, key=lambda line: line.range.row)
        for i in range(max(start, done), end):
            yield lines[i]
        done = max(done, end)


def _first_faults(findings: Sequence[Finding]) -> dict[int, int]:
    """By row the column of the first fault on it."""
    columns: dict[int, int] = {}
    for finding in findings:
        for place in (finding.range, *(place for place, _ in finding.related)):
            columns[place.row] = min(place.column, columns.get(place.row, place.column))
    return columns
