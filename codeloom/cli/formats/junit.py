"""For servers of continuous integration: a JUnit report.

Each file is a test suite's case that passes, and each problem a case that fails.
"""

from collections.abc import Iterable
from xml.sax.saxutils import escape, quoteattr

from codeloom.cli.excerpt import printable
from codeloom.cli.formats.base import Format, failed_path
from codeloom.cli.items import Finding, Item
from codeloom.cli.source import Source, printable_path
from codeloom.cli.tally import Tally


class JunitFormat(Format):
    """One test suite, which is written at the end, since its head has the counts."""

    def begin(self) -> None:
        """Nothing is written yet."""
        self._cases: list[str] = []
        self._failures = self._errors = 0

    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Keep the cases of one file."""
        path = printable_path(source.path)
        failures = [self._failure(item) for item in items if isinstance(item, Finding)]
        self._failures += len(failures)
        for name, failure in failures or [("sound", "")]:
            self._add(path, name, failure)

    def add_failure(self, error: OSError) -> None:
        """Keep a case for a file that can't be read."""
        self._errors += 1
        message = quoteattr(printable(error.strerror or str(error)))
        self._add(printable_path(failed_path(error)), "read", f"<error message={message}/>")

    def end(self, tally: Tally) -> None:
        """Write all of it."""
        counts = f'tests="{len(self._cases)}" failures="{self._failures}" errors="{self._errors}"'
        self._console.print_row('<?xml version="1.0" encoding="UTF-8"?>')
        self._console.print_row(f'<testsuites name="codeloom" {counts}>')
        self._console.print_row(f'  <testsuite name="codeloom {self._command}" {counts}>')
        for case in self._cases:
            self._console.print_row(f"    {case}")
        self._console.print_row("  </testsuite>\n</testsuites>")

    def _failure(self, finding: Finding) -> tuple[str, str]:
        place = finding.source.place_fields(finding.range)
        cell = f"cell {place['cell']}, " if "cell" in place else ""
        name = f"{finding.code} at {cell}row {place['row']}, column {place['column']}"
        message = quoteattr(printable(finding.message))
        text = escape("\n".join([*finding.rows(), printable(finding.source_row)]))
        return name, f"<failure type={quoteattr(finding.code)} message={message}>{text}</failure>"

    def _add(self, path: str, name: str, content: str) -> None:
        self._cases.append(
            f"<testcase classname={quoteattr(path)} name={quoteattr(name)}>{content}</testcase>"
        )
