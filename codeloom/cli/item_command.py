"""What commands share that show items of each file, such as lines or signatures, in a form that is chosen."""

import argparse
from abc import ABC, abstractmethod
from collections.abc import Mapping
from typing import ClassVar

from codeloom._analysis import Analysis
from codeloom.cli.command import Command, ExitStatus, add_source_arguments, analyses
from codeloom.cli.console import Console


class ItemFormat(ABC):
    """Prints the items of one file after another."""

    def __init__(self, console: Console) -> None:
        self._console = console

    @abstractmethod
    def add(self, analysis: Analysis) -> bool:
        """Print the items of a file; true when none of them is faulty."""


class ItemCommand(Command):
    """Prints the items of each file, one file after the other."""

    FORMATS: ClassVar[Mapping[str, type[ItemFormat]]]
    FORMAT_HELP: ClassVar[str]

    def __init__(self) -> None:
        self._console = Console()
        self._status = ExitStatus.SOUND

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the arguments that these commands share."""
        add_source_arguments(parser)
        parser.add_argument(
            "--format", choices=cls.FORMATS, default="text", help=f"{cls.FORMAT_HELP} (default: %(default)s)"
        )

    def run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Print all files; one that can't be read is reported, and the others are printed."""
        item_format = self.FORMATS[arguments.format](self._console)
        for analysis in analyses(arguments, self._on_error, records=True):
            if not item_format.add(analysis):
                self._status = max(self._status, ExitStatus.PROBLEMS)
            self._console.flush()
        return self._status

    def _on_error(self, error: OSError) -> None:
        self._status = ExitStatus.FAILURE
        self._console.print_failure(error)
