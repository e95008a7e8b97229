"""`codeloom names`: what each logical line reads and binds, and what it says of these names."""

import argparse

from codeloom.cli.command import AddFalseHintsArgument, AddSourceArguments, Command, ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.files import ReadFiles
from codeloom.cli.names_formats import FORMATS
from codeloom.line_names import NamesInBytes


class NamesCommand(Command):
    """Prints the names of each logical line, one file after the other."""

    NAME = "names"
    HELP = "show what each logical line reads and binds, and what it says of these names"
    DESCRIPTION = (
        "Show what each logical line reads and binds, and what it says of these names. Lines that "
        "say nothing of names are left out; a line that isn't sound stands in its place with its "
        "fault. The exit status is 0 when all are sound, 1 when some aren't, 2 on wrong use or when "
        "a file can't be read."
    )

    def __init__(self) -> None:
        self._fConsole = Console()
        self._fStatus = ExitStatus.SOUND

    @staticmethod
    def AddArguments(parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""
        AddSourceArguments(parser)
        AddFalseHintsArgument(parser)
        parser.add_argument(
            "--format",
            choices=FORMATS,
            default="text",
            help="text; or jsonl, with an object for each record on a row (default: %(default)s)",
        )

    def Run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Print all files; one that can't be read is told, and the others are printed."""
        names_format = FORMATS[arguments.format](self._fConsole)
        for path, data in ReadFiles(arguments.paths, self._OnFailure):
            for line in NamesInBytes(data, arguments.language, path, false_hints=arguments.false_hints):
                names_format.Add(line)
                if line.problem is not None:
                    self._fStatus = max(self._fStatus, ExitStatus.PROBLEMS)
            self._fConsole.Flush()
        return self._fStatus

    def _OnFailure(self, path: str, error: OSError) -> None:
        self._fStatus = ExitStatus.FAILURE
        self._fConsole.PrintFailure(path, error)
