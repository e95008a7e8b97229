"""What the command line shows with rich, where that is installed and a person looks."""

from collections.abc import Sequence
from typing import TextIO

from rich.box import SIMPLE_HEAD
from rich.console import Console
from rich.progress import BarColumn, MofNCompleteColumn, Progress, TextColumn, TimeRemainingColumn
from rich.table import Table
from rich.text import Text

from codeloom.cli.tally import Tally


class Bar:
    """A bar on the standard error, with the files done, the problems found and the time left."""

    def __init__(self, total: int) -> None:
        self._total = total
        self._progress: Progress | None = None

    def show(self, tally: Tally) -> None:
        """Write how much is done."""
        if self._progress is None:
            self._progress = _bar()
            self._progress.add_task("", total=self._total, problems=0)
            self._progress.start()
        self._progress.update(self._progress.task_ids[0], completed=tally.files, problems=tally.problems)
        self._progress.refresh()

    def clear(self) -> None:
        """Take the bar away."""
        if self._progress is not None:
            self._progress.stop()
            self._progress = None


def _bar() -> Progress:
    return Progress(
        BarColumn(),
        MofNCompleteColumn(),
        TextColumn("files, {task.fields[problems]:,} problems"),
        TimeRemainingColumn(),
        console=Console(stderr=True),
        auto_refresh=False,
        transient=True,
        redirect_stdout=False,
        redirect_stderr=False,
    )


def print_table(
    stream: TextIO, headings: Sequence[str], rows: Sequence[Sequence[int | str]], *, has_colour: bool
) -> None:
    """Rows of cells beneath headings; numbers go to the right."""
    table = Table(box=SIMPLE_HEAD, pad_edge=False)
    for heading, cell in zip(headings, rows[0], strict=True):
        table.add_column(heading, justify="right" if isinstance(cell, int) else "left")
    for row in rows:
        table.add_row(*(Text(f"{cell:,}" if isinstance(cell, int) else cell) for cell in row))
    Console(file=stream, color_system="auto" if has_colour else None).print(table)
