"""`codeloom names`: every appearance of a name, or what each logical line says of names."""

import argparse
from collections import deque
from collections.abc import Iterable, Iterator

from codeloom._analysis import Line, Occurrence, Range
from codeloom.cli.command import ExitStatus
from codeloom.cli.items import Finding, Item
from codeloom.cli.names_items import LimitItem, LineNames
from codeloom.cli.options import Options, WrongUseError
from codeloom.cli.source import Source
from codeloom.cli.source_command import SourceCommand


class NamesCommand(SourceCommand):
    """Shows the names of each logical line."""

    NAME = "names"
    DESCRIPTION = (
        "Show every appearance of a name, line by line: what the name does there, and the scope that binds "
        "it. With --records what each line says of names instead: what it reads, binds and calls, and what a "
        "name stands for. A broken line is shown with its fault. "
        "The exit status is 0 if there is no problem, 1 if there are some, 2 for wrong use or a file "
        "that can't be read."
    )
    EXAMPLES = (
        "codeloom names src/a.py",
        "codeloom names --unused --undefined src",
        "codeloom names --records --format jsonl src |",
        "    jq -r 'select(.kind == \"from\").payload' | sort | uniq -c",
    )

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""
        group = parser.add_argument_group("which names")
        group.add_argument(
            "--records", action="store_true", help="the records of each logical line, not its occurrences"
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
        self._shows_findings = options.unused or options.undefined
        if options.records and self._shows_findings:
            raise WrongUseError("--records doesn't go with --unused and --undefined")
        self.NEEDS_RECORDS = options.records
        self.NEEDS_NAMES = not options.records
        return super().run(options)

    def items(self, source: Source, findings: list[Finding]) -> Iterator[Item]:
        """What is to be shown and the problems, in the order of the file."""
        if self._shows_findings:
            return self._findings(source, findings)
        made = self._lines if self._options.records else self._occurrences
        return made(source, findings)

    def _findings(self, source: Source, findings: list[Finding]) -> Iterator[Item]:
        from codeloom.cli.occurrence_items import OccurrenceItem

        analysis, options = source.analysis, self._options
        found: list[tuple[Range, Item]] = [(finding.range, finding) for finding in findings]
        about: dict[str, tuple[Occurrence, ...]] = {
            "unused": analysis.unused() if options.unused else (),
            "undefined": analysis.undefined() if options.undefined else (),
        }
        for finding, occurrences in about.items():
            found += [(each.range, OccurrenceItem(source, each, finding)) for each in occurrences]
        found.sort(key=lambda placed: (placed[0].row, placed[0].column))
        return (item for _, item in found)

    def _occurrences(self, source: Source, findings: list[Finding]) -> Iterator[Item]:
        from codeloom.cli.occurrence_items import LineOccurrences

        for line, before in _with_findings(source.analysis.lines, findings):
            yield from before
            if line is not None and len(line.occurrences):
                yield LineOccurrences(source, line)

    def _lines(self, source: Source, findings: list[Finding]) -> Iterator[Item]:
        limits = {limit.line: limit for limit in source.analysis.limits}
        for line, before in _with_findings(source.analysis.lines, findings):
            yield from before
            if line is None:
                continue
            records = list(line.records)
            limit = limits.get(line) if limits else None
            if records or limit is not None:
                yield LineNames(source, line, records)
            if limit is not None:
                yield LimitItem(source, limit)


def _with_findings(
    lines: Iterable[Line], findings: Iterable[Finding]
) -> Iterator[tuple[Line | None, list[Finding]]]:
    """Each line with the findings up to its end, and what comes after the last one with None."""
    waiting = deque(findings)
    for line in lines:
        before = []
        while waiting and _starts_before_end(waiting[0].range, line.range):
            before.append(waiting.popleft())
        yield line, before
    yield None, list(waiting)


def _starts_before_end(place: Range, line: Range) -> bool:
    return (place.row, place.column) <= (line.end_row, line.end_column)
