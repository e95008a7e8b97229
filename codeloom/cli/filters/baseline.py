"""Problems that an earlier report doesn't hold.

A problem is known again by its fingerprint: of its file, its code, its message and the text of its row. So it
may move with its row. Equal ones of a file count.
"""

import hashlib
import json
import os
from collections import Counter
from collections.abc import Sequence

from codeloom.cli.items import Finding
from codeloom.cli.source import Source


class Baseline:
    """The problems of a report that `--format json` or `jsonl` has written."""

    def __init__(self, path: str) -> None:
        """Read the report; OSError when it can't be read, ValueError when it isn't one."""
        with open(path, encoding="utf-8") as file:
            text = file.read()
        try:
            items = _items_of(text)
            self._known = {item["fingerprint"] for item in items if item["type"] == "problem"}
        except (ValueError, KeyError, TypeError, RecursionError):
            raise ValueError(f"{path} isn't a report of codeloom in the format json or jsonl") from None

    def __call__(self, source: Source, findings: Sequence[Finding]) -> Sequence[Finding]:
        """The findings that are new."""
        return [finding for finding in findings if finding.fingerprint not in self._known]


def add_fingerprints(findings: Sequence[Finding], root: str) -> None:
    """Give each problem of a file its fingerprint; paths count from `root`."""
    seen: Counter[str] = Counter()
    for finding in findings:
        path = os.path.relpath(finding.source.path, root).replace(os.sep, "/")
        key = "\0".join((path, finding.code, finding.message, finding.source_row.strip()))
        seen[key] += 1
        text = f"{key}\0{seen[key]}"
        finding.fingerprint = hashlib.sha256(text.encode("utf-8", "surrogateescape")).hexdigest()[:32]


def _items_of(text: str) -> list[dict[str, str]]:
    if text.startswith('{"run"'):
        items: list[dict[str, str]] = json.loads(text)["items"]
        return items
    run, *items = [json.loads(row) for row in text.splitlines()]
    if run["type"] != "run":
        raise ValueError
    return items
