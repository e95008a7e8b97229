"""`codeloom names`: what each logical line reads and binds, and what it says of these names."""

from collections.abc import Iterator

from codeloom._analysis import Range
from codeloom.cli.items import Finding, Item
from codeloom.cli.names_items import LimitItem, LineNames
from codeloom.cli.source import Source
from codeloom.cli.source_command import SourceCommand


class NamesCommand(SourceCommand):
    """Shows the names of each logical line."""

    NAME = "names"
    DESCRIPTION = (
        "Show what each logical line reads and binds, and what it says of these names. Lines that "
        "say nothing of names are left out; a line that isn't sound is shown with its fault. The exit "
        "status is 0 when all are sound, 1 when some aren't, 2 on wrong use or when a file can't be read."
    )
    EXAMPLES = (
        "codeloom names src/a.py",
        "codeloom names --format jsonl src | jq -r 'select(.kind == \"from\").payload' | sort | uniq -c",
    )
    NEEDS_RECORDS = True

    def items(self, source: Source, findings: list[Finding]) -> Iterator[Item]:
        """The lines that say something and the problems, in the order of the file."""
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
