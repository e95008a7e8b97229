"""For GitHub's workflows: annotations of the files of a change.

GitHub shows 10 errors and 10 warnings of a step, so that more are printed as plain rows, with their number
at the end.
"""

import os
from collections import Counter
from collections.abc import Iterable

from codeloom.cli.excerpt import on_one_row, printable
from codeloom.cli.formats.base import Format, failed_path, portable_path
from codeloom.cli.items import Finding, Item
from codeloom.cli.source import Source
from codeloom.cli.tally import Tally

MOST_ANNOTATIONS = 10  # of a kind
_LONGEST_MESSAGE = 4_000  # GitHub cuts what is longer than 4 KB in what it shows

_ESCAPES = {"%": "%25", "\r": "%0D", "\n": "%0A"}
_PROPERTY_ESCAPES = {**_ESCAPES, ":": "%3A", ",": "%2C"}


class GithubFormat(Format):
    """An `::error` or `::warning` row for each of the first problems."""

    def begin(self) -> None:
        """Nothing is counted yet."""
        self._counts: Counter[str] = Counter()

    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Print the problems of one file."""
        for item in items:
            if isinstance(item, Finding):
                self._add(source, item)

    def add_failure(self, error: OSError) -> None:
        """Print an annotation for a file that can't be read."""
        properties = {"file": _path_in_repository(failed_path(error)), "title": "codeloom"}
        self._annotate(properties, f"can't be read: {error.strerror or error}")

    def end(self, tally: Tally) -> None:
        """Say how much isn't annotated."""
        more = sum(max(count - MOST_ANNOTATIONS, 0) for count in self._counts.values())
        if more > 0:
            noun = "problem isn't" if more == 1 else "problems aren't"
            limit = f"{MOST_ANNOTATIONS} errors and {MOST_ANNOTATIONS} warnings"
            self._console.print_row(f"{more:,} more {noun} annotated: GitHub shows {limit} of a step")

    def _add(self, source: Source, finding: Finding) -> None:
        place = source.place_fields(finding.range)
        properties = {"file": _path_in_repository(source.path), "title": finding.code}
        message = printable(on_one_row(finding.message))
        if "cell" in place:  # its rows aren't those of the file
            message = f"cell {place['cell']}, row {place['row']}, column {place['column']}: {message}"
        else:
            properties |= {"line": str(place["row"]), "endLine": str(place["end_row"])}
            properties["col"] = str(place["column"])
            if place["end_row"] == place["row"]:  # GitHub takes an end column on the same row alone
                properties["endColumn"] = str(max(place["end_column"] - 1, place["column"]))
        self._annotate(properties, message + (f" ({finding.hint})" if finding.hint else ""), finding)

    def _annotate(self, properties: dict[str, str], message: str, finding: Finding | None = None) -> None:
        kind = "error" if finding is None else finding.severity
        self._counts[kind] += 1
        if self._counts[kind] > MOST_ANNOTATIONS and finding is not None:
            for row in finding.rows():
                self._console.print_row(row)
            return
        pairs = (f"{name}={_escaped(value, _PROPERTY_ESCAPES)}" for name, value in properties.items())
        text = _escaped(message[:_LONGEST_MESSAGE], _ESCAPES)
        self._console.print_row(f"::{kind} {','.join(pairs)}::{text}")


def _escaped(text: str, escapes: dict[str, str]) -> str:
    return "".join(escapes.get(char, char) for char in text)


def _path_in_repository(path: str) -> str:
    """A path relative to the folder that the workflow checked out."""
    checkout = os.environ.get("GITHUB_WORKSPACE")
    if checkout:
        below = os.path.relpath(path, checkout)
        if not below.startswith(os.pardir):
            path = below
    return os.fsencode(portable_path(path)).decode(errors="replace")
