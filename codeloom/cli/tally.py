"""What a run has seen so far."""

from collections import Counter
from collections.abc import Iterator, Sequence

from codeloom.cli.command import ExitStatus
from codeloom.cli.items import Finding
from codeloom.cli.source import Source


class Tally:
    """Counts of files, logical lines and problems."""

    def __init__(self) -> None:
        self.files = 0
        self.faulty_files = 0
        self.unread = 0
        self.problems = 0
        self.lines = 0
        self.by_code: Counter[str] = Counter()
        self._messages: dict[str, str] = {}

    def add(self, source: Source, findings: Sequence[Finding]) -> None:
        """Count one file and its problems."""
        self.files += 1
        self.faulty_files += bool(findings)
        self.lines += len(source.analysis.lines)
        self.count(findings)

    def count(self, findings: Sequence[Finding]) -> None:
        """Count problems."""
        self.problems += len(findings)
        for finding in findings:
            self.by_code[finding.code] += 1
            self._messages.setdefault(finding.code, finding.message)

    def status(self) -> ExitStatus:
        """The exit status: what can't be read wins over problems."""
        if self.unread:
            return ExitStatus.FAILURE
        return ExitStatus.PROBLEMS if self.problems else ExitStatus.SOUND

    def statistics(self) -> Iterator[tuple[int, str, str]]:
        """How often each code was reported, the most frequent first, and the first of its messages."""
        for code, count in sorted(self.by_code.items(), key=lambda pair: (-pair[1], pair[0])):
            yield count, code, self._messages[code]

    def fields(self) -> dict[str, object]:
        """All of it for programs."""
        return {
            "type": "summary",
            "files": self.files,
            "faulty_files": self.faulty_files,
            "unread": self.unread,
            "lines": self.lines,
            "problems": self.problems,
            "by_code": dict(sorted(self.by_code.items())),
        }

    def __str__(self) -> str:
        files = _counted(self.files, "file")
        where = f"{self.faulty_files:,} of {files}" if self.problems else files
        text = f"{_counted(self.problems, 'problem')} in {where}"
        text += f", {_counted(self.lines, 'logical line')}"
        return f"{text}; {self.unread:,} not read" if self.unread else text


def _counted(count: int, noun: str) -> str:
    return f"{count:,} {noun}" if count == 1 else f"{count:,} {noun}s"
