"""`codeloom check`: which logical lines of the files aren't sound."""

import argparse
from dataclasses import dataclass

from codeloom.check import CheckBytes, Report
from codeloom.cli.command import AddFalseHintsArgument, AddSourceArguments, Command, ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.files import ReadFiles


@dataclass
class Tally:
    """What a run has seen so far."""

    files: int = 0
    faulty_files: int = 0
    unread: int = 0
    problems: int = 0
    logicals: int = 0

    def Add(self, report: Report) -> None:
        """Count one file."""
        self.files += 1
        self.faulty_files += bool(report.problems)
        self.problems += len(report.problems)
        self.logicals += report.logical_count

    def Status(self) -> ExitStatus:
        """The exit status: what can't be read wins over problems."""
        if self.unread:
            return ExitStatus.FAILURE
        return ExitStatus.PROBLEMS if self.problems else ExitStatus.SOUND

    def __str__(self) -> str:
        files = _Counted(self.files, "file")
        where = f"{self.faulty_files:,} of {files}" if self.problems else files
        text = f"{_Counted(self.problems, 'problem')} in {where}"
        text += f", {_Counted(self.logicals, 'logical line')}"
        return f"{text}; {self.unread:,} not read" if self.unread else text


class CheckCommand(Command):
    """Prints the problems of each file as soon as it is checked, and a summary at the end."""

    NAME = "check"
    HELP = "show every logical line that isn't sound, with the place of its fault"
    DESCRIPTION = (
        "Show every logical line that isn't sound, with the place of its fault. The exit status is "
        "0 when all are sound, 1 when some aren't, 2 on wrong use or when a file can't be read."
    )

    def __init__(self) -> None:
        self._fConsole = Console()
        self._fTally = Tally()

    @staticmethod
    def AddArguments(parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""
        AddSourceArguments(parser)
        AddFalseHintsArgument(parser)

    def Run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Check all files; one that can't be read is told, and the others are checked."""
        for path, data in ReadFiles(arguments.paths, self._OnFailure):
            report = CheckBytes(data, arguments.language, path, false_hints=arguments.false_hints)
            self._fTally.Add(report)
            for problem in report.problems:
                self._fConsole.PrintProblem(problem)
            self._fConsole.Flush()
        self._fConsole.PrintSummary(str(self._fTally))
        return self._fTally.Status()

    def _OnFailure(self, path: str, error: OSError) -> None:
        self._fTally.unread += 1
        self._fConsole.PrintFailure(path, error)


def _Counted(count: int, noun: str) -> str:
    return f"{count:,} {noun}" if count == 1 else f"{count:,} {noun}s"
