"""How far an index is, on a standard error that is a terminal: files, their rate, and the time left."""

import time
from collections.abc import Callable

from codeloom.cli.progress import Pace, write_over


class IndexProgress:
    """A row that is written over again and again.

    `count_files` gives the number of all files, or None where that isn't known; it is called when the run
    has become a long one.
    """

    def __init__(self, count_files: Callable[[], int | None], *, is_wanted: bool) -> None:
        self._count_files = count_files
        self._pace = Pace(is_wanted=is_wanted)
        self._began = time.monotonic()
        self._total: int | None = None
        self._is_counted = False
        self._is_shown = False

    def show(self, files: int) -> None:
        """Write that so many files are done, unless something was said a moment ago."""
        if not self._pace.is_due():
            return
        if not self._is_counted:
            self._total = self._count_files()
            self._is_counted = True
        write_over(progress_row(files, self._total, time.monotonic() - self._began))
        self._is_shown = True

    def clear(self) -> None:
        """Take the row away."""
        if self._is_shown:
            write_over("")
            self._is_shown = False


def progress_row(files: int, total: int | None, seconds: float) -> str:
    """How far a run is after so many seconds; `total` is None where it isn't known."""
    rate = files / seconds if seconds > 0 else 0.0
    if total is None:
        return f"{files:,} files, {rate:,.0f} a second ..."
    left = f", {max(total - files, 0) / rate:,.0f} s left" if rate > 0 else ""
    return f"{files:,} of {total:,} files, {rate:,.0f} a second{left} ..."
