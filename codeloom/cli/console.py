"""What commands print: results on the output, failures on the standard error."""

from __future__ import annotations

import io
import os
import sys
from collections.abc import Iterable, Sequence
from enum import StrEnum

from codeloom.cli.excerpt import Mark, excerpt, fits, printable, wrapped
from codeloom.cli.source import printable_path
from codeloom.cli.terminal import terminal_width

TYPE_CHECKING = False  # `typing` takes long to import
if TYPE_CHECKING:
    from typing import TextIO

_WIDTH_WITHOUT_TERMINAL = 100
_LEAST_WIDTH = 20
# The room before a row of source: its number, blanks and a bar.
_GUTTER = 8

_PLAIN = "\033[0m"
# Before what goes on of a message.
_CONTINUATION = " " * 4


class Colour(StrEnum):
    """How a piece of output is set off, in the codes of a terminal."""

    BOLD = "\033[1m"
    DIM = "\033[2m"
    RED = "\033[31m"
    GREEN = "\033[32m"
    YELLOW = "\033[33m"
    CYAN = "\033[36m"


class Console:
    """The output, as the terminal, the pipe or the file that takes it wants it.

    `width` is the room for a row after the indentation, in columns of the terminal. `colour` is "auto",
    "always" or "never".
    """

    def __init__(self, stream: TextIO | None = None, colour: str = "auto") -> None:
        self._stream = sys.stdout if stream is None else stream
        if isinstance(self._stream, io.TextIOWrapper):
            self._stream.reconfigure(errors="backslashreplace")
        columns = terminal_width(_WIDTH_WITHOUT_TERMINAL)
        self.width = max(columns - 4, _LEAST_WIDTH)
        self._columns = columns
        self._source_width = max(columns - _GUTTER, _LEAST_WIDTH)
        self._encoding = getattr(self._stream, "encoding", None) or "utf-8"
        self._has_colour = _is_colour_wanted(self._stream, colour)

    @property
    def is_terminal(self) -> bool:
        """True when a person looks at the output as it is written."""
        return self._stream is not None and self._stream.isatty()

    def room_after(self, text: str) -> int:
        """The columns of a row that a text and a blank leave."""
        return max(self._columns - len(text) - 1, _LEAST_WIDTH)

    def use_utf8(self) -> None:
        """Write UTF-8 whatever the terminal takes, for programs that expect it."""
        if isinstance(self._stream, io.TextIOWrapper):
            self._stream.reconfigure(encoding="utf-8")
            self._encoding = "utf-8"

    def print_source(self, number: int, source_row: str, marks: list[Mark], said: str = "") -> None:
        """A row of source with its number, and below it its marks and what is said of them."""
        shown, marked = excerpt(source_row, marks, self._source_width, self._encoding)
        self.print_row(self._gutter(number) + shown)
        if said and len(marked) + 1 + len(said) <= self._source_width:
            marked, said = f"{marked} {printable(said)}", ""
        colour = Colour.RED if "^" in marked else Colour.CYAN
        self.print_row(self._gutter(None) + self.coloured(colour, marked))
        if said:
            self.print_row(self._gutter(None) + self.coloured(colour, printable(said)))

    def print_gap(self) -> None:
        """What parts rows of source that aren't neighbours."""
        self.print_row(self.coloured(Colour.DIM, "  ..."))

    def fits(self, source_row: str) -> bool:
        """True when a row of source needn't be cut."""
        return fits(source_row, self._source_width, self._encoding)

    def print_failure(self, error: OSError) -> None:
        """What can't be read, and why."""
        reason = error.strerror or str(error)
        path = "?" if error.filename is None else printable_path(os.fsdecode(error.filename))
        self.say(f"can't read {path}: {reason}")

    def print_message(self, words: Sequence[tuple[Colour, str]], text: str, indent: str = "") -> None:
        """A row of words in colours and a text; on a terminal the text is broken between words."""
        head = indent + " ".join(self.coloured(colour, word) for colour, word in words)
        used = len(indent) + sum(len(word) + 1 for _, word in words)
        first, *others = self._broken(text, used, len(_CONTINUATION))
        self.print_row(f"{head} {first}".rstrip())
        for row in others:
            self.print_row(_CONTINUATION + row)

    def print_paragraph(self, text: str) -> None:
        """A text of some sentences, likewise."""
        for row in self._broken(text):
            self.print_row(row)

    def _broken(self, text: str, used: int = 0, indent: int = 0) -> list[str]:
        """`text` on rows of the terminal; in the first one some columns are used already."""
        text = printable(text)
        if not self.is_terminal:
            return [text]
        return list(wrapped(text, self._columns - used, self._columns - indent))

    def print_row(self, row: str) -> None:
        """A row of a command's result."""
        print(row, file=self._stream)

    def print_table(self, headings: Sequence[str], rows: Iterable[Sequence[int | str]]) -> None:
        """Rows of cells; beneath headings where a person looks and rich is installed."""
        cells = list(rows)
        if cells and self.is_terminal:
            try:
                from codeloom.cli.rich_output import print_table
            except ModuleNotFoundError:
                pass
            else:
                return print_table(self._stream, headings, cells, has_colour=self._has_colour)
        for row in cells:
            self.print_row("  ".join(f"{cell:>7,}" if isinstance(cell, int) else cell for cell in row))

    def write(self, text: str) -> None:
        """A piece of a command's result."""
        if self._stream is not None:
            self._stream.write(text)

    def say(self, text: str) -> None:
        """A message of the program, on the standard error."""
        self.print_error(f"codeloom: {text}")

    def print_error(self, text: str) -> None:
        """What isn't part of the result, on the standard error and after what was printed before."""
        self.flush()
        print_error(text)

    def flush(self) -> None:
        """Bring what was printed to its reader."""
        if self._stream is not None:
            self._stream.flush()

    def coloured(self, colour: Colour, text: str) -> str:
        """`text` in a colour, where the output is a terminal that takes it."""
        return f"{colour}{text}{_PLAIN}" if self._has_colour else text

    def _gutter(self, number: int | None) -> str:
        return self.coloured(Colour.DIM, f"{'' if number is None else number:>5} |") + " "


def say(text: str) -> None:
    """Print a message of the program on the standard error."""
    print_error(f"codeloom: {text}")


def print_error(text: str) -> None:
    """Print a row on the standard error, if it takes one."""
    if sys.stderr is None:
        return
    try:
        print(text, file=sys.stderr, flush=True)
    except OSError:
        discard(sys.stderr)


def discard(stream: TextIO) -> None:
    """Send what is left in a stream's buffers nowhere, so that the interpreter can end quietly."""
    with open(os.devnull, "wb") as nowhere:
        os.dup2(nowhere.fileno(), stream.fileno())


def _is_colour_wanted(stream: TextIO | None, colour: str) -> bool:
    """What the option says, else the environment, else whether a terminal is there to show it."""
    if colour != "auto":
        return colour == "always"
    if os.environ.get("NO_COLOR"):
        return False
    if os.environ.get("FORCE_COLOR"):
        return True
    return stream is not None and stream.isatty() and os.environ.get("TERM") != "dumb"
