"""What every command has."""

import argparse
from abc import ABC, abstractmethod
from collections.abc import Sequence
from enum import IntEnum

from codeloom.cli.options import Options


class ExitStatus(IntEnum):
    """What the process ends with; a failure wins over problems."""

    SOUND = 0
    PROBLEMS = 1
    FAILURE = 2


class Command(ABC):
    """One command of the command line."""

    NAME: str
    DESCRIPTION: str
    EXAMPLES: Sequence[str] = ()
    FORMATS: Sequence[str] = ()
    # True when the last row for people counts files and problems.
    HAS_SUMMARY = False

    @classmethod
    @abstractmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the command's arguments."""

    @abstractmethod
    def run(self, options: Options) -> ExitStatus:
        """Do the command's work."""
