"""What commands print: results on the standard output, failures on the standard error."""

import io
import os
import shutil
import sys

from codeloom.check import Problem
from codeloom.excerpt import Excerpt, Printable

_INDENT = "    "
_WIDTH_WITHOUT_TERMINAL = 100
_LEAST_WIDTH = 20

_BOLD = "\033[1m"
_RED = "\033[31m"
_PLAIN = "\033[0m"


class Console:
    """The standard streams, as the terminal or the pipe behind them wants them."""

    def __init__(self) -> None:
        if isinstance(sys.stdout, io.TextIOWrapper):
            sys.stdout.reconfigure(errors="backslashreplace")
        columns = shutil.get_terminal_size((_WIDTH_WITHOUT_TERMINAL, 0)).columns
        self._fWidth = max(columns - len(_INDENT), _LEAST_WIDTH)
        self._fHasColour = _IsColourWanted()

    def PrintProblem(self, problem: Problem) -> None:
        """The problem's place and message, its row of source and a caret under the place."""
        place = f"{PrintablePath(problem.path)}:{problem.row}:{problem.column}:"
        row, caret = Excerpt(problem.source_row, problem.column, self._fWidth)
        print(self._Coloured(_BOLD, place), Printable(problem.message))
        print(_INDENT + row)
        print(_INDENT + self._Coloured(_RED, caret))

    def PrintFailure(self, path: str, error: OSError) -> None:
        """What can't be read, and why."""
        # What was found before stands before it, if both go to one place.
        self.Flush()
        reason = error.strerror or str(error)
        print(f"codeloom: can't read {PrintablePath(path)}: {reason}", file=sys.stderr)

    def PrintSummary(self, text: str) -> None:
        """The last row of a command's output."""
        print(text)

    def Flush(self) -> None:
        """Bring what was printed to its reader."""
        if sys.stdout is not None:
            sys.stdout.flush()

    def _Coloured(self, colour: str, text: str) -> str:
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
