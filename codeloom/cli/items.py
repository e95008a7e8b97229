"""What commands show of a source, one item after another, in a form for each kind of reader."""

from __future__ import annotations

from abc import ABC, abstractmethod
from collections.abc import Iterable, Iterator, Sequence
from itertools import groupby

from codeloom._analysis import Problem, Range
from codeloom.cli.console import Colour, Console
from codeloom.cli.excerpt import Mark, on_one_row, printable
from codeloom.cli.source import Source

TYPE_CHECKING = False  # `typing` takes long to import
if TYPE_CHECKING:
    from typing import Any, Literal

_INDENT = "    "


class Item(ABC):
    """Something that is said of a source."""

    @abstractmethod
    def show(self, console: Console) -> None:
        """Print it for people."""

    @abstractmethod
    def rows(self) -> Iterator[str]:
        """It for people and simple tools: rows that begin with the place."""

    @abstractmethod
    def fields(self) -> Iterator[dict[str, Any]]:
        """It for programs: objects of the report's schema."""

    def json(self) -> Iterator[str]:
        """The same as text, each on a single row."""
        from json import dumps

        return map(dumps, self.fields())


class Finding(Item):
    """A problem of a source, which may have been left out by what a run selects."""

    def __init__(
        self,
        source: Source,
        code: str,
        message: str,
        place: Range,
        related: Sequence[tuple[Range, str]] = (),
        hint: str | None = None,
        severity: Literal["error", "warning"] = "error",
    ) -> None:
        self.source = source
        self.code = code
        self.message = message
        self.range = place
        self.related = related
        self.hint = hint
        self.severity = severity
        self.fingerprint = ""

    @classmethod
    def of(cls, source: Source, problem: Problem) -> Finding:
        """A problem of the analysis."""
        return cls(
            source,
            problem.code,
            problem.message,
            problem.range,
            problem.related,
            problem.hint,
            problem.severity,
        )

    @property
    def is_warning(self) -> bool:
        """True for what the interpreter runs nevertheless."""
        return self.severity == "warning"

    @property
    def title(self) -> str:
        """The message, for a warning with this word before it."""
        return f"warning: {self.message}" if self.is_warning else self.message

    @property
    def source_row(self) -> str:
        """The text of the row in which it begins."""
        return self.source.row_text(self.range.row)

    def show(self, console: Console) -> None:
        """The problem alone."""
        show_findings([self], console)

    def rows(self) -> Iterator[str]:
        """Place, code and message."""
        hint = f" ({self.hint})" if self.hint else ""
        yield f"{self.source.label(self.range)} {self.code} {printable(on_one_row(self.title + hint))}"

    def fields(self) -> Iterator[dict[str, Any]]:
        """All that is known of it."""
        related = [{**self.source.place_fields(place), "message": text} for place, text in self.related]
        yield {
            "type": "problem",
            **self.source.fields(self.range),
            "code": self.code,
            "message": self.message,
            "severity": self.severity,
            "hint": self.hint,
            "related": related,
            "source_row": self.source_row,
            "fingerprint": self.fingerprint,
        }


def show_items(items: Iterable[Item], console: Console) -> None:
    """Print items for people, problems of one row together."""
    for row, group in groupby(items, key=_row_of_finding):
        if row is None:
            for item in group:
                item.show(console)
        else:
            show_findings([item for item in group if isinstance(item, Finding)], console)


def show_findings(findings: list[Finding], console: Console) -> None:
    """Print the problems of one row: their places and messages, the row with marks, and hints."""
    first = findings[0]
    if len(findings) > 1 and not console.fits(first.source_row):
        for finding in findings:
            show_findings([finding], console)
        return
    for finding in findings:
        place = finding.source.label(finding.range)
        colour = Colour.YELLOW if finding.is_warning else Colour.RED
        console.print_message([(Colour.BOLD, place), (colour, finding.code)], finding.title)
    _show_rows(findings, console)
    hints = {finding.hint: finding.range.column for finding in reversed(findings)}
    for hint, column in reversed(hints.items()):
        if hint:
            label = "hint:" if len(hints) == 1 else f"hint for column {column}:"
            console.print_message([(Colour.GREEN, label)], hint, _INDENT)


def _row_of_finding(item: Item) -> int | None:
    return item.range.row if isinstance(item, Finding) else None


def _show_rows(findings: list[Finding], console: Console) -> None:
    """The row of the findings, and those that it has to do with."""
    source = findings[0].source
    marks: dict[int, list[Mark]] = {}
    texts: dict[int, list[str]] = {}
    for finding in findings:
        marks.setdefault(finding.range.row, []).append(_mark(finding.range, "^"))
    for finding in findings:
        for place, text in finding.related:
            marks.setdefault(place.row, []).append(_mark(place, "-"))
            texts.setdefault(place.row, []).append(text)
    last = None
    for row in sorted(marks):
        if last is not None and row > last + 1:
            console.print_gap()
        last = row
        text = source.row_text(row)
        console.print_source(source.cell_and_row(row)[1], text, marks[row], "; ".join(texts.get(row, ())))


def _mark(place: Range, sign: str) -> Mark:
    end_column = place.end_column if place.end_row == place.row else 1 << 31
    return place.column, end_column, sign
