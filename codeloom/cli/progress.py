"""How far a long run is, on a standard error that is a terminal."""

import sys
import time

from codeloom.cli.console import Console
from codeloom.cli.tally import Tally

# Seconds before a run counts as long, and between two updates.
_PATIENCE = 1.0
_INTERVAL = 0.1


class Progress:
    """A row that is written over again and again, and gone when there is something else to show."""

    def __init__(self, console: Console, *, is_wanted: bool) -> None:
        self._console = console
        self._is_wanted = is_wanted and sys.stderr is not None and sys.stderr.isatty()
        self._next = time.monotonic() + _PATIENCE
        self._is_shown = False

    def __enter__(self) -> "Progress":
        return self

    def __exit__(self, *_: object) -> None:
        self.clear()

    def show(self, tally: Tally) -> None:
        """Write how much is done, unless that was said a moment ago."""
        if not self._is_wanted or time.monotonic() < self._next:
            return
        self._next = time.monotonic() + _INTERVAL
        self._console.flush()
        print(
            f"\r\033[K{tally.files:,} files, {tally.problems:,} problems ...",
            end="",
            file=sys.stderr,
            flush=True,
        )
        self._is_shown = True

    def clear(self) -> None:
        """Take the row away."""
        if self._is_shown:
            print("\r\033[K", end="", file=sys.stderr, flush=True)
            self._is_shown = False
