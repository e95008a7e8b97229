"""`codeloom check`: which logical lines of the files aren't sound."""

import argparse

from codeloom._analysis import Analysis
from codeloom.cli.command import Command, ExitStatus, add_source_arguments, analyses
from codeloom.cli.console import Console


class Tally:
    """What a run has seen so far."""

    def __init__(self) -> None:
        self.files = 0
        self.faulty_files = 0
        self.unread = 0
        self.problems = 0
        self.lines = 0

    def add(self, analysis: Analysis) -> None:
        """Count one file."""
        self.files += 1
        self.faulty_files += bool(analysis.problems)
        self.problems += len(analysis.problems)
        self.lines += len(analysis.lines)

    def status(self) -> ExitStatus:
        """The exit status: what can't be read wins over problems."""
        if self.unread:
            return ExitStatus.FAILURE
        return ExitStatus.PROBLEMS if self.problems else ExitStatus.SOUND

    def __str__(self) -> str:
        files = _counted(self.files, "file")
        where = f"{self.faulty_files:,} of {files}" if self.problems else files
        text = f"{_counted(self.problems, 'problem')} in {where}"
        text += f", {_counted(self.lines, 'logical line')}"
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
        self._console = Console()
        self._tally = Tally()

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""
        add_source_arguments(parser)

    def run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Check all files; one that can't be read is reported, and the others are checked."""
        for analysis in analyses(arguments, self._on_error):
            self._tally.add(analysis)
            if analysis.problems:
                for problem in analysis.problems:
                    self._console.print_problem(problem)
                self._console.flush()
        self._console.print_row(str(self._tally))
        return self._tally.status()

    def _on_error(self, error: OSError) -> None:
        self._tally.unread += 1
        self._console.print_failure(error)


def _counted(count: int, noun: str) -> str:
    return f"{count:,} {noun}" if count == 1 else f"{count:,} {noun}s"
