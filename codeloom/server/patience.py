"""What isn't shown yet: problems elsewhere that are there only because somebody is in the middle of typing.

A header without its body, a parenthesis that is closed three rows further down, a text in triple quotes:
while they are typed, rows above and beneath them are broken too. Such problems wait until the typing goes on
elsewhere or stops for a moment. Those of the row that is typed, and those that were there before, don't wait.
"""

from collections import Counter
from collections.abc import Callable, Sequence

from codeloom._document import Position
from codeloom.cli.items import Finding

# How long nobody types until all is shown.
SECONDS = 0.75

_Key = tuple[str, str, str]


class Patience:
    """Follows the edits of one text."""

    def __init__(self) -> None:
        # The row that is being typed; None when nobody types.
        self._row: int | None = None
        self._known: Counter[_Key] = Counter()

    def before_edit(self, start: Position, end: Position, findings: Callable[[], Sequence[Finding]]) -> None:
        """An edit follows; what is found now stays shown when it begins a new piece of typing."""
        if self._row is None or not start[0] <= self._row <= end[0]:
            self._known = Counter(map(_key, findings()))

    def after_edit(self, start: Position, end: Position, new_text: str) -> None:
        """It is typing when it puts in or takes away a part of a row, or an end of one."""
        added = new_text.count("\n") or new_text.count("\r")
        self._row = start[0] + added if added <= 1 and end[0] - start[0] <= 1 else None

    def settle(self) -> None:
        """Nobody types any more."""
        self._row = None

    def due(self, findings: Sequence[Finding]) -> Sequence[Finding]:
        """The problems that don't wait."""
        if self._row is None or not findings:
            return findings
        known, due = Counter(self._known), []
        for finding in findings:
            key = _key(finding)
            is_typed = finding.range.row <= self._row <= finding.range.end_row
            if is_typed or known[key] > 0:
                due.append(finding)
                known[key] -= 1
        return due


def _key(finding: Finding) -> _Key:
    """What stays the same of a problem when other rows change."""
    return finding.code, finding.message, finding.source_row
