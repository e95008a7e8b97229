"""For GitLab's code quality reports: an array of issues."""

import json
import os
from collections.abc import Iterable

from codeloom.cli.formats.base import Format, failed_path, portable_path
from codeloom.cli.items import Finding, Item
from codeloom.cli.source import Source
from codeloom.cli.tally import Tally


class GitlabFormat(Format):
    """An issue for each problem; a broken line is a critical one."""

    NEEDS_FINGERPRINTS = True
    _separator = ""

    def begin(self) -> None:
        """Open the array."""
        self._console.write("[")

    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Write the problems of one file."""
        for item in items:
            if isinstance(item, Finding):
                place = source.place_fields(item.range)
                cell = f"cell {place['cell']}, row {place['row']}: " if "cell" in place else ""
                hint = f" ({item.hint})" if item.hint else ""
                rows = {"begin": 1} if cell else {"begin": place["row"], "end": place["end_row"]}
                severity = "critical" if item.severity == "error" else "minor"
                message = cell + item.message + hint
                self._add(item.code, severity, message, item.fingerprint, source.path, rows)

    def add_failure(self, error: OSError) -> None:
        """Write an issue for a file that can't be read."""
        path = failed_path(error)
        message = f"can't be read: {error.strerror or error}"
        self._add("failure", "critical", message, os.fsencode(path).hex(), path, {"begin": 1})

    def end(self, tally: Tally) -> None:
        """Close the array."""
        self._console.print_row("\n]")

    def _add(
        self, check: str, severity: str, message: str, fingerprint: str, path: str, rows: dict[str, int]
    ) -> None:
        issue = {
            "description": message,
            "check_name": check,
            "fingerprint": fingerprint,
            "severity": severity,
            "location": {
                "path": os.fsencode(portable_path(path)).decode(errors="replace"),
                "lines": rows,
            },
        }
        self._console.write(f"{self._separator}\n{json.dumps(issue)}")
        self._separator = ","
