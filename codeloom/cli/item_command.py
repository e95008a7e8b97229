"""What commands share that show items of each file, such as lines or signatures, in a form that is chosen."""

import argparse
from abc import ABC, abstractmethod
from collections.abc import Iterable, Mapping
from typing import ClassVar, Generic, Protocol, TypeVar

from codeloom.check import Problem
from codeloom.cli.command import AddFalseHintsArgument, AddSourceArguments, Command, ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.files import ReadFiles
from codeloom.languages import Language


class Item(Protocol):
    """What stands in a file; its line may be faulty."""

    @property
    def problem(self) -> Problem | None:
        """The fault of the line."""


ItemT = TypeVar("ItemT", bound=Item)


class ItemFormat(ABC, Generic[ItemT]):
    """Prints items one after another."""

    def __init__(self, console: Console) -> None:
        self._fConsole = console

    @abstractmethod
    def Add(self, item: ItemT, /) -> None:
        """Print one item."""


class ItemCommand(Command, Generic[ItemT]):
    """Prints the items of each file, one file after the other."""

    FORMATS: ClassVar[Mapping[str, type[ItemFormat]]]  # type: ignore[type-arg]
    FORMAT_HELP: ClassVar[str]

    def __init__(self) -> None:
        self._fConsole = Console()
        self._fStatus = ExitStatus.SOUND

    @abstractmethod
    def Items(self, data: bytes, language: Language, path: str, false_hints: bool) -> Iterable[ItemT]:
        """The items of the bytes of a file."""

    @classmethod
    def AddArguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the arguments that these commands share."""
        AddSourceArguments(parser)
        AddFalseHintsArgument(parser)
        parser.add_argument(
            "--format", choices=cls.FORMATS, default="text", help=f"{cls.FORMAT_HELP} (default: %(default)s)"
        )

    def Run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Print all files; one that can't be read is told, and the others are printed."""
        item_format = self.FORMATS[arguments.format](self._fConsole)
        for path, data in ReadFiles(arguments.paths, self._OnFailure):
            for item in self.Items(data, arguments.language, path, arguments.false_hints):
                item_format.Add(item)
                if item.problem is not None:
                    self._fStatus = max(self._fStatus, ExitStatus.PROBLEMS)
            self._fConsole.Flush()
        return self._fStatus

    def _OnFailure(self, path: str, error: OSError) -> None:
        self._fStatus = ExitStatus.FAILURE
        self._fConsole.PrintFailure(path, error)
