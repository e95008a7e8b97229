"""What every format has."""

import os
from abc import ABC, abstractmethod
from collections.abc import Iterable

from codeloom.cli.console import Console
from codeloom.cli.items import Item
from codeloom.cli.source import Source
from codeloom.cli.tally import Tally


class Format(ABC):
    """Writes a run: `begin`, then each file as soon as it is read, then `end`.

    `command` is the name of the command that runs.
    """

    # True when problems bear fingerprints, which take time to make.
    NEEDS_FINGERPRINTS = False
    # True for what programs read: UTF-8 whatever the terminal takes.
    IS_FOR_PROGRAMS = True
    # True when nothing is written before the end.
    WRITES_AT_END = False

    def __init__(self, console: Console, command: str) -> None:
        self._console = console
        self._command = command
        if self.IS_FOR_PROGRAMS:
            console.use_utf8()

    def begin(self) -> None:  # noqa: B027
        """Write what goes before all files."""

    @abstractmethod
    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Write what is said of one file."""

    def add_failure(self, error: OSError) -> None:  # noqa: B027
        """Write that a file can't be read, which the standard error says too."""

    def end(self, tally: Tally) -> None:  # noqa: B027
        """Write what goes after all files."""


def failed_path(error: OSError) -> str:
    """The path that an error is about."""
    return "" if error.filename is None else os.fsdecode(error.filename)


def portable_path(path: str) -> str:
    """A path relative to the current folder where it lies there, with slashes."""
    path = os.path.normpath(path)
    if os.path.isabs(path):
        below = os.path.relpath(path)
        path = path if below.startswith(os.pardir) else below
    return path.replace(os.sep, "/")
