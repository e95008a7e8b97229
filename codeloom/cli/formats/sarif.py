"""For code scanning: SARIF 2.1.0.

GitHub takes 25,000 results of a run and no more, so that what is beyond is left out, with a notification
in the report and a word on the standard error.
"""

import json
import os
from collections.abc import Iterable
from typing import Any
from urllib.parse import quote

from codeloom import __version__
from codeloom.cli.formats.base import Format, failed_path, portable_path
from codeloom.cli.items import Finding, Item
from codeloom.cli.source import Source
from codeloom.cli.tally import Tally
from codeloom.explanations import explanations

MOST_RESULTS = 25_000
_SCHEMA = "https://json.schemastore.org/sarif-2.1.0.json"
# The name that fingerprints are known by; another way to make them gets another number.
_FINGERPRINT = "codeloom/v1"


class SarifFormat(Format):
    """One run, whose rules come after its results."""

    NEEDS_FINGERPRINTS = True
    _separator = ""
    _count = 0

    def begin(self) -> None:
        """Open the document."""
        self._rules: dict[str, int] = {}
        self._notifications: list[dict[str, Any]] = []
        self._console.write(f'{{"$schema": "{_SCHEMA}", "version": "2.1.0", "runs": [{{"results": [')

    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Write the problems of one file."""
        for item in items:
            if not isinstance(item, Finding):
                continue
            self._count += 1
            if self._count <= MOST_RESULTS:
                self._console.write(f"{self._separator}\n{json.dumps(self._result(source, item))}")
                self._separator = ","

    def add_failure(self, error: OSError) -> None:
        """Keep a notification of a file that can't be read."""
        self._notify(f"can't be read: {error.strerror or error}", failed_path(error))

    def end(self, tally: Tally) -> None:
        """Close the document."""
        if self._count > MOST_RESULTS:
            text = f"{self._count - MOST_RESULTS:,} more problems are left out: GitHub takes {MOST_RESULTS:,}"
            self._notify(text)
            self._console.say(text)
        rest = {
            "tool": {
                "driver": {
                    "name": "codeloom",
                    "version": __version__,
                    "semanticVersion": __version__,
                    "rules": [_rule(code) for code in self._rules],
                }
            },
            "columnKind": "unicodeCodePoints",
            "invocations": [
                {"executionSuccessful": not tally.unread, "toolExecutionNotifications": self._notifications}
            ],
        }
        self._console.print_row(f"\n],\n{json.dumps(rest)[1:-1]}}}]}}")

    def _result(self, source: Source, finding: Finding) -> dict[str, Any]:
        rule_i = self._rules.setdefault(finding.code, len(self._rules))
        hint = f" ({finding.hint})" if finding.hint else ""
        row = source.place_fields(finding.range)
        result: dict[str, Any] = {
            "ruleId": finding.code,
            "ruleIndex": rule_i,
            "level": finding.severity,
            "message": {"text": finding.message + hint},
            "locations": [_location(source.path, row, {"snippet": {"text": finding.source_row}})],
            "partialFingerprints": {_FINGERPRINT: finding.fingerprint},
        }
        if finding.related:
            result["relatedLocations"] = [
                {"id": i, "message": {"text": text}, **_location(source.path, source.place_fields(place))}
                for i, (place, text) in enumerate(finding.related, 1)
            ]
        return result

    def _notify(self, text: str, path: str | None = None) -> None:
        notification: dict[str, Any] = {"level": "error", "message": {"text": text}}
        if path is not None:
            artifact = {"artifactLocation": {"uri": _uri(path)}}
            notification["locations"] = [{"physicalLocation": artifact}]
        self._notifications.append(notification)


def _rule(code: str) -> dict[str, Any]:
    known = explanations().get(code)
    if known is None:
        return {"id": code}
    short, full = {"text": known.title}, {"text": known.meaning}
    return {"id": code, "shortDescription": short, "fullDescription": full, "help": full}


def _location(path: str, place: dict[str, int], more: dict[str, Any] | None = None) -> dict[str, Any]:
    """A place; one in a notebook counts in its cell, which is a logical location."""
    region = {
        "startLine": place["row"],
        "startColumn": place["column"],
        "endLine": place["end_row"],
        "endColumn": place["end_column"],
    }
    location: dict[str, Any] = {
        "physicalLocation": {"artifactLocation": {"uri": _uri(path)}, "region": {**region, **(more or {})}}
    }
    if "cell" in place:
        location["logicalLocations"] = [{"name": f"cell {place['cell']}", "kind": "module"}]
    return location


def _uri(path: str) -> str:
    """The path of a file as a reference, whatever bytes it is made of."""
    uri = quote(os.fsencode(portable_path(path)))
    return f"file://{uri}" if uri.startswith("/") else uri
