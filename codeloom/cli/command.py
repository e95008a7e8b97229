"""What every command has, and the arguments that several share."""

import argparse
from abc import ABC, abstractmethod
from enum import IntEnum
from typing import ClassVar

from codeloom.languages import (
    DEFAULT_LANGUAGE_NAME,
    Language,
    LanguageNamed,
    UnknownLanguageError,
)


class ExitStatus(IntEnum):
    """What the process ends with; a failure wins over problems."""

    SOUND = 0
    PROBLEMS = 1
    FAILURE = 2


class Command(ABC):
    """One command of the command line."""

    NAME: ClassVar[str]
    HELP: ClassVar[str]
    DESCRIPTION: ClassVar[str]

    @staticmethod
    @abstractmethod
    def AddArguments(parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""

    @abstractmethod
    def Run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Do the command's work with the parsed arguments."""


def AddSourceArguments(parser: argparse.ArgumentParser) -> None:
    """Add what every command that reads source has: `paths` and `language`."""
    parser.add_argument(
        "paths",
        nargs="+",
        metavar="FILE-OR-FOLDER",
        help="a file; a folder, with all that is below it; or - for the standard input",
    )
    AddLanguageArgument(parser)


def AddLanguageArgument(parser: argparse.ArgumentParser) -> None:
    """Add `language`."""
    parser.add_argument(
        "--python",
        dest="language",
        type=_Language,
        default=DEFAULT_LANGUAGE_NAME,
        metavar="VERSION",
        help="the version of Python that the source is written in, such as 2.7 or 3.12 "
        "(default: %(default)s)",
    )


def AddFalseHintsArgument(parser: argparse.ArgumentParser) -> None:
    """Add `false_hints`."""
    parser.add_argument(
        "--false-hints",
        action="store_true",
        help="take all that looks like a type hint for one, as the engine itself does: prose behind "
        "`# type:`, error codes behind `# type: ignore`, sentences in quoted annotations",
    )


def _Language(name: str) -> Language:
    try:
        return LanguageNamed(name)
    except UnknownLanguageError as error:
        raise argparse.ArgumentTypeError(str(error)) from None
