"""`codeloom names`: what each logical line reads and binds, and what it says of these names."""

import argparse
from collections.abc import Iterator

from codeloom._analysis import Occurrence, Range
from codeloom.cli.command import ExitStatus
from codeloom.cli.items import Finding, Item
from codeloom.cli.names_items import LimitItem, LineNames
from codeloom.cli.options import Options
from codeloom.cli.source import Source
from codeloom.cli.source_command import SourceCommand


class NamesCommand(SourceCommand):
    """Shows the names of each logical line."""

    NAME = "names"
    DESCRIPTION = (
        "List what each logical line reads and binds, and what it says about these names. Lines without "
        "names are left out; a broken line is shown with its fault. --roles lists every appearance of a "
        "name instead. "
        "The exit status is 0 if there is no problem, 1 if there are some, 2 for wrong use or a file "
        "that can't be read."
    )
    EXAMPLES = (
        "codeloom names src/a.py",
        "codeloom names --unused --undefined src",
        "codeloom names --format jsonl src |",
        "    jq -r 'select(.kind == \"from\").payload' | sort | uniq -c",
    )
    NEEDS_RECORDS = True

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""
        group = parser.add_argument_group("which names")
        group.add_argument(
            "--roles",
            action="store_true",
            help="every appearance of a name, what it does there and its scope",
        )
        group.add_argument(
            "--unused", action="store_true", help="imports and local names that nothing in the file reads"
        )
        group.add_argument(
            "--undefined",
            action="store_true",
            help="names that are read and that nothing in the file binds, but for builtins",
        )
        super().add_arguments(parser)

    def run(self, options: Options) -> ExitStatus:
        """Show the lines, or the appearances of names that are asked for."""
        self._options = options
        self._shows_occurrences = options.roles or options.unused or options.undefined
        self.NEEDS_RECORDS = not self._shows_occurrences
        return super().run(options)

    def items(self, source: Source, findings: list[Finding]) -> Iterator[Item]:
        """What is to be shown and the problems, in the order of the file."""
        return (
            self._occurrences(source, findings) if self._shows_occurrences else self._lines(source, findings)
        )

    def _occurrences(self, source: Source, findings: list[Finding]) -> Iterator[Item]:
        from codeloom.cli.occurrence_items import OccurrenceItem

        analysis, options = source.analysis, self._options
        found: list[tuple[Range, Item]] = [(finding.range, finding) for finding in findings]
        about: dict[str, tuple[Occurrence, ...]] = {
            "unused": analysis.unused() if options.unused else (),
            "undefined": analysis.undefined() if options.undefined else (),
        }
        for finding, occurrences in about.items():
            found += [(each.range, OccurrenceItem(source, each, finding)) for each in occurrences]
        if options.roles:
            found += [(each.range, OccurrenceItem(source, each)) for each in analysis.occurrences]
        found.sort(key=lambda placed: (placed[0].row, placed[0].column))
        return (item for _, item in found)

    def _lines(self, source: Source, findings: list[Finding]) -> Iterator[Item]:
        limits = {limit.line: limit for limit in source.analysis.limits}
        waiting = iter(findings)
        finding = next(waiting, None)
        for line in source.analysis.lines:
            place = line.range
            while finding is not None and _starts_before_end(finding.range, place):
                yield finding
                finding = next(waiting, None)
            records = list(line.records)
            limit = limits.get(line) if limits else None
            if records or limit is not None:
                yield LineNames(source, line, records)
            if limit is not None:
                yield LimitItem(source, limit)
        if finding is not None:
            yield finding
        yield from waiting


def _starts_before_end(place: Range, line: Range) -> bool:
    return (place.row, place.column) <= (line.end_row, line.end_column)
