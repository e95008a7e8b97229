"""How far an index is, on a standard error that is a terminal: files, their rate, and the time left."""

import sys
import time
from collections.abc import Callable

# Seconds before a run counts as long, and between two updates.
_PATIENCE = 1.0
_INTERVAL = 0.1


class IndexProgress:
    """A row that is written over again and again.

    `count_files` gives the number of all files, or None where that isn't known; it is called when the run
    has become a long one.
    """

    def __init__(self, count_files: Callable[[], int | None], *, is_wanted: bool) -> None:
        self._count_files = count_files
        self._is_wanted = is_wanted and sys.stderr is not None and sys.stderr.isatty()
        self._began = time.monotonic()
        self._next = self._began + _PATIENCE
        self._total: int | None = None
        self._is_counted = False
        self._is_shown = False

    def show(self, files: int) -> None:
        """Write that so many files are done, unless something was said a moment ago."""
        now = time.monotonic()
        if not self._is_wanted or now < self._next:
            return
        if not self._is_counted:
            self._total = self._count_files()
            self._is_counted = True
        self._next = now + _INTERVAL
        row = progress_row(files, self._total, now - self._began)
        print(f"\r\033[K{row}", end="", file=sys.stderr, flush=True)
        self._is_shown = True

    def clear(self) -> None:
        """Take the row away."""
        if self._is_shown:
            print("\r\033[K", end="", file=sys.stderr, flush=True)
            self._is_shown = False


def progress_row(files: int, total: int | None, seconds: float) -> str:
    """How far a run is after so many seconds; `total` is None where it isn't known."""
    rate = files / seconds if seconds > 0 else 0.0
    if total is None:
        return f"{files:,} files, {rate:,.0f} a second ..."
    left = f", {max(total - files, 0) / rate:,.0f} s left" if rate > 0 else ""
    return f"{files:,} of {total:,} files, {rate:,.0f} a second{left} ..."
