"""What commands print: results on the standard output, failures on the standard error."""

import io
import os
import shutil
import sys
from enum import StrEnum

from codeloom._analysis import Problem
from codeloom.cli.excerpt import excerpt, printable

_INDENT = "    "
_WIDTH_WITHOUT_TERMINAL = 100
_LEAST_WIDTH = 20

_PLAIN = "\033[0m"


class Colour(StrEnum):
    """How a piece of output is set off, in the codes of a terminal."""

    BOLD = "\033[1m"
    DIM = "\033[2m"
    RED = "\033[31m"
    GREEN = "\033[32m"
    CYAN = "\033[36m"


class Console:
    """The standard streams, as the terminal or the pipe behind them wants them.

    `width` is the room for a row after the indentation, in columns of the terminal.
    """

    def __init__(self) -> None:
        if isinstance(sys.stdout, io.TextIOWrapper):
            sys.stdout.reconfigure(errors="backslashreplace")
        columns = shutil.get_terminal_size((_WIDTH_WITHOUT_TERMINAL, 0)).columns
        self.width = max(columns - len(_INDENT), _LEAST_WIDTH)
        self._encoding = getattr(sys.stdout, "encoding", None) or "utf-8"
        self._has_colour = _is_colour_wanted()

    def print_problem(self, problem: Problem) -> None:
        """A problem's place and message, its row of source and a caret under the place."""
        start = problem.range
        message = f"{problem.code} {problem.message}"
        self.print_fault(problem.path, start.row, start.column, message, problem.source_row)

    def print_fault(self, path: str, row: int, column: int, message: str, source_row: str) -> None:
        """The same for any fault; row and column count from 1."""
        place = f"{printable_path(path)}:{row}:{column}:"
        shown, caret = excerpt(source_row, column, self.width, self._encoding)
        print(self.coloured(Colour.BOLD, place), printable(message))
        print(_INDENT + shown)
        print(_INDENT + self.coloured(Colour.RED, caret))

    def print_failure(self, error: OSError) -> None:
        """What can't be read, and why."""
        reason = error.strerror or str(error)
        self.print_error(f"codeloom: can't read {printable_path(error.filename)}: {reason}")

    def print_row(self, row: str) -> None:
        """A row of a command's result."""
        print(row)

    def print_error(self, text: str) -> None:
        """What is no part of the result, after what was printed before."""
        self.flush()
        print(text, file=sys.stderr)

    def flush(self) -> None:
        """Bring what was printed to its reader."""
        if sys.stdout is not None:
            sys.stdout.flush()

    def coloured(self, colour: Colour, text: str) -> str:
        """`text` in a colour, where the output is a terminal that takes it."""
        return f"{colour}{text}{_PLAIN}" if self._has_colour else text


def printable_path(path: str) -> str:
    """`path` as a row of a terminal can show it, whatever bytes it is made of."""
    return printable(os.fsencode(path).decode(errors="backslashreplace"))


def _is_colour_wanted() -> bool:
    return (
        sys.stdout is not None
        and sys.stdout.isatty()
        and not os.environ.get("NO_COLOR")
        and os.environ.get("TERM") != "dumb"
    )
