"""What every command has, and the arguments that several share."""

import argparse
import sys
from abc import ABC, abstractmethod
from collections.abc import Callable, Iterator
from enum import IntEnum

from codeloom._analysis import Analysis
from codeloom._face import analyze, analyze_file, processor_count, read_all
from codeloom.reading.files import StandardInput, find_files
from codeloom.reading.languages import NEWEST, version_number


class ExitStatus(IntEnum):
    """What the process ends with; a failure wins over problems."""

    SOUND = 0
    PROBLEMS = 1
    FAILURE = 2


class Command(ABC):
    """One command of the command line."""

    NAME: str
    HELP: str
    DESCRIPTION: str

    @classmethod
    @abstractmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""

    @abstractmethod
    def run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Do the command's work with the parsed arguments."""


def add_source_arguments(parser: argparse.ArgumentParser) -> None:
    """Add what every command that reads source has: `paths`, `python` and `false_hints`."""
    parser.add_argument(
        "paths",
        nargs="+",
        metavar="FILE-OR-FOLDER",
        help="a file; a folder, with all that is below it; or - for the standard input",
    )
    add_python_argument(parser)
    parser.add_argument(
        "--false-hints",
        action="store_true",
        help="take all that looks like a type hint for one, as the engine itself does: prose after "
        "`# type:`, error codes after `# type: ignore`, sentences in quoted annotations",
    )


def add_python_argument(parser: argparse.ArgumentParser) -> None:
    """Add `python`."""
    parser.add_argument(
        "--python",
        type=_version,
        default=NEWEST,
        metavar="VERSION",
        help="the version of Python that the source is written in, such as 2.7 or 3.12 "
        "(default: %(default)s)",
    )


def analyses(
    arguments: argparse.Namespace, on_error: Callable[[OSError], None], *, records: bool = False
) -> Iterator[Analysis]:
    """The analyses of the files that the arguments name, in their order."""

    def read(path: str) -> Analysis:
        analysis = read_path(path, arguments)
        _ = analysis.records if records else analysis.problems  # worked out now, in this thread
        return analysis

    return read_all(
        find_files([as_named(path) for path in arguments.paths]), read, processor_count(), on_error
    )


def read_path(path: str, arguments: argparse.Namespace) -> Analysis:
    """The analysis of one file, or of the standard input."""
    options = {"python": arguments.python, "false_hints": getattr(arguments, "false_hints", False)}
    if not isinstance(path, StandardInput):
        return analyze_file(path, **options)
    if sys.stdin is None:
        raise OSError(0, "there is no standard input", "-")
    return analyze(sys.stdin.buffer.read(), path="<stdin>", **options)


def as_named(path: str) -> str:
    """A path as it is meant on the command line, where - is the standard input."""
    return StandardInput() if path == StandardInput.NAME else path


def _version(name: str) -> str:
    try:
        version_number(name)
    except ValueError as error:
        raise argparse.ArgumentTypeError(str(error).removeprefix("python: ")) from None
    return name
