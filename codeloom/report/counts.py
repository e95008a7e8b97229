"""How many problems there are by what: the numbers of the tables and the charts."""

from collections import Counter
from collections.abc import Iterable, Sequence
from typing import NamedTuple

from codeloom.cli.items import Finding
from codeloom.explanations import Explanation, explanations

# Bars of a chart; what is over is one bar of its own.
_MOST_BARS = 8


class Bar(NamedTuple):
    """One bar of a chart."""

    label: str
    meaning: str
    """What the label stands for; empty where it says that itself."""
    link: str | None
    """The fragment that it leads to."""
    problems: int
    share: float
    """Of the longest bar, in percent."""


class CodeCount(NamedTuple):
    """A code with its problems."""

    explanation: Explanation
    severity: str
    problems: int
    files: int


class Counts:
    """Problems by code, severity and folder."""

    def __init__(self) -> None:
        self.by_severity: Counter[str] = Counter()
        self._by_folder: Counter[str] = Counter()
        self._by_code: Counter[str] = Counter()
        self._files_by_code: Counter[str] = Counter()
        self._severities: dict[str, str] = {}

    def add(self, path: str, findings: Sequence[Finding]) -> None:
        """Count the problems of a file; `path` is as the page shows it."""
        for finding in findings:
            self.by_severity[finding.severity] += 1
            self._by_code[finding.code] += 1
            self._severities.setdefault(finding.code, finding.severity)
        self._files_by_code.update({finding.code for finding in findings})
        if findings:
            self._by_folder[path.rpartition("/")[0] or "."] += len(findings)

    def codes(self) -> list[CodeCount]:
        """Each code that was reported, the most frequent first."""
        known = explanations()
        return [
            CodeCount(known[code], self._severities[code], count, self._files_by_code[code])
            for code, count in _ordered(self._by_code)
        ]

    def code_bars(self) -> list[Bar]:
        """The most frequent codes."""
        known = explanations()
        return _bars(
            (code, known[code].title, f"code-{code}", count) for code, count in _ordered(self._by_code)
        )

    def folder_bars(self) -> list[Bar]:
        """The folders with the most problems."""
        return _bars((path, "", f"folder-{path}", count) for path, count in _ordered(self._by_folder))


def _ordered(counter: Counter[str]) -> list[tuple[str, int]]:
    return sorted(counter.items(), key=lambda pair: (-pair[1], pair[0]))


def _bars(counts: Iterable[tuple[str, str, str, int]]) -> list[Bar]:
    """Bars of labels, what these mean, links and counts."""
    rows: list[tuple[str, str, str | None, int]] = list(counts)
    if len(rows) > _MOST_BARS:
        others = rows[_MOST_BARS - 1 :]
        rows[_MOST_BARS - 1 :] = [(f"{len(others):,} others", "", None, sum(count for *_, count in others))]
    longest = max((count for *_, count in rows), default=1)
    return [Bar(*row, share=round(100 * row[-1] / longest, 1)) for row in rows]
