"""How far a long run is, on a standard error that is a terminal."""

from __future__ import annotations

import sys
import time
from collections.abc import Callable

from codeloom.cli.console import Console
from codeloom.cli.tally import Tally

TYPE_CHECKING = False  # rich is imported when there is something to show
if TYPE_CHECKING:
    from codeloom.cli.rich_output import Bar

# Seconds before a run counts as long, and between two updates.
_PATIENCE = 1.0
_INTERVAL = 0.1


class Pace:
    """When to show how far a run is: as soon as it is a long one, and then now and then."""

    def __init__(self, *, is_wanted: bool) -> None:
        self._is_wanted = is_wanted and sys.stderr is not None and sys.stderr.isatty()
        self._next = time.monotonic() + _PATIENCE

    def is_due(self) -> bool:
        """True when it is time; not again for a moment then."""
        if not self._is_wanted or time.monotonic() < self._next:
            return False
        self._next = time.monotonic() + _INTERVAL
        return True


def write_over(row: str) -> None:
    """Write a row in the place of the one before; an empty one takes that away."""
    print(f"\r\033[K{row}", end="", file=sys.stderr, flush=True)


class PlainRow:
    """Counts of files and problems, written over again and again; `total` is the number of files."""

    def __init__(self, total: int) -> None:
        self._total = total

    def show(self, tally: Tally) -> None:
        """Write how much is done."""
        write_over(f"{tally.files:,} of {self._total:,} files, {tally.problems:,} problems ...")

    def clear(self) -> None:
        """Take the row away."""
        write_over("")


class Progress:
    """Shows the row now and then; with rich installed it is a bar.

    `count_files` counts the files of the run, and is called when the run has become a long one.
    """

    def __init__(self, console: Console, count_files: Callable[[], int], *, is_wanted: bool) -> None:
        self._console = console
        self._count_files = count_files
        self._pace = Pace(is_wanted=is_wanted)
        self._row: PlainRow | Bar | None = None
        self._is_shown = False

    def __enter__(self) -> Progress:
        return self

    def __exit__(self, *_: object) -> None:
        self.clear()

    def show(self, tally: Tally) -> None:
        """Write how much is done, unless that was said a moment ago."""
        if not self._pace.is_due():
            return
        if self._row is None:
            self._row = _row_for(self._count_files())
        self._console.flush()
        self._row.show(tally)
        self._is_shown = True

    def clear(self) -> None:
        """Take the row away."""
        if self._is_shown and self._row is not None:
            self._row.clear()
        self._is_shown = False


def _row_for(total: int) -> PlainRow | Bar:
    try:
        from codeloom.cli.rich_output import Bar
    except ModuleNotFoundError:
        return PlainRow(total)
    return Bar(total)
