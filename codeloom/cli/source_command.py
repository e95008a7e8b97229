"""What commands share that go through files and show items of each, such as problems, lines or signatures."""

import argparse
import sys
from abc import abstractmethod
from collections.abc import Iterable, Sequence

from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.formats import FOR_ALL_ITEMS
from codeloom.cli.items import Finding, Item
from codeloom.cli.options import Options, add_source_arguments
from codeloom.cli.run import Run, opened_console, print_facts
from codeloom.cli.source import Source, printable_path

TYPE_CHECKING = False  # it is loaded by those who watch
if TYPE_CHECKING:
    from codeloom.cli.watch import Watch


class SourceCommand(Command):
    """Shows the items of each file as soon as it is read, one file after the other."""

    FORMATS: Sequence[str] = FOR_ALL_ITEMS
    # True when the items are made of records; of occurrences, scopes or signatures.
    NEEDS_RECORDS = False
    NEEDS_NAMES = False

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the arguments that these commands share."""
        add_source_arguments(parser, cls.FORMATS)

    @abstractmethod
    def items(self, source: Source, findings: list[Finding]) -> Iterable[Item]:
        """What to show of a file, given the problems that count."""

    def run(self, options: Options) -> ExitStatus:
        """Show all files; one that can't be read is reported, and the others are shown."""
        if options.verbose:
            print_facts(options)
        if options.watch:
            return self._watch(options)
        return self.run_once(options)

    def run_once(self, options: Options, watch: "Watch | None" = None) -> ExitStatus:
        """Show all files one time."""
        with opened_console(options) as console:
            run = Run(options, console, records=self.NEEDS_RECORDS, names=self.NEEDS_NAMES, watch=watch)
            return self.show(run)

    def show(self, run: Run) -> ExitStatus:
        """Show what a run reads, or the names of its files."""
        options, console = run.options, run.console
        if options.show_files:
            return _show_files(run, console)
        run.format.begin()
        for source, problems in run.sources():
            items = list(self.items(source, problems))
            run.tally.add(source, [item for item in items if isinstance(item, Finding)])
            if options.quiet < 2 or run.format.IS_FOR_PROGRAMS:
                run.format.add(source, items)
            if items:
                console.flush()
        return run.end()

    def _watch(self, options: Options) -> ExitStatus:
        """Run again and again, until the user interrupts it."""
        from codeloom.cli.watch import Watch

        watch = Watch(options)
        while True:
            watch.wait()
            if options.output is None and sys.stdout is not None and sys.stdout.isatty():
                print("\033[H\033[2J\033[3J", end="")
            self.run_once(options, watch)


def _show_files(run: Run, console: Console) -> ExitStatus:
    status = ExitStatus.SOUND
    for path in run.files():
        if isinstance(path, OSError):
            console.print_failure(path)
            status = ExitStatus.FAILURE
        else:
            console.print_row(printable_path(path))
    return status
