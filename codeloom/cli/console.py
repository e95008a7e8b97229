"""What commands print: results on the standard output, failures on the standard error."""

import io
import os
import shutil
import sys
from enum import StrEnum

from codeloom.check import Problem
from codeloom.excerpt import Excerpt, Printable

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

    `width` is the room for a row behind the indentation, in columns of the terminal.
    """

    def __init__(self) -> None:
        if isinstance(sys.stdout, io.TextIOWrapper):
            sys.stdout.reconfigure(errors="backslashreplace")
        columns = shutil.get_terminal_size((_WIDTH_WITHOUT_TERMINAL, 0)).columns
        self.width = max(columns - len(_INDENT), _LEAST_WIDTH)
        self._fHasColour = _IsColourWanted()

    def PrintProblem(self, problem: Problem) -> None:
        """The problem's place and message, its row of source and a caret under the place."""
        place = f"{PrintablePath(problem.path)}:{problem.row}:{problem.column}:"
        row, caret = Excerpt(problem.source_row, problem.column, self.width)
        print(self.Coloured(Colour.BOLD, place), Printable(problem.message))
        print(_INDENT + row)
        print(_INDENT + self.Coloured(Colour.RED, caret))

    def PrintFailure(self, path: str, error: OSError) -> None:
        """What can't be read, and why."""
        reason = error.strerror or str(error)
        self.PrintError(f"codeloom: can't read {PrintablePath(path)}: {reason}")

    def PrintSummary(self, text: str) -> None:
        """The last row of a command's output."""
        print(text)

    def PrintRow(self, row: str) -> None:
        """A row of a command's result."""
        print(row)

    def PrintError(self, text: str) -> None:
        """What is no part of the result, behind what was printed before."""
        self.Flush()
        print(text, file=sys.stderr)

    def Flush(self) -> None:
        """Bring what was printed to its reader."""
        if sys.stdout is not None:
            sys.stdout.flush()

    def Coloured(self, colour: Colour, text: str) -> str:
        """`text` in a colour, where the output is a terminal that takes it."""
        return f"{colour}{text}{_PLAIN}" if self._fHasColour else text


def PrintablePath(path: str) -> str:
    """`path` as a row of a terminal can show it, whatever bytes it is made of."""
    return Printable(os.fsencode(path).decode(errors="backslashreplace"))


def _IsColourWanted() -> bool:
    return (
        sys.stdout is not None
        and sys.stdout.isatty()
        and not os.environ.get("NO_COLOR")
        and os.environ.get("TERM") != "dumb"
    )
