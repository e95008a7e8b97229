"""For programs: objects of one schema for all commands, `report-1.schema.json` beside this file.

A document holds `run`, `items` and `summary`; in JSON Lines the same objects follow each other, one a row.
"""

import json
from abc import abstractmethod
from collections.abc import Iterable
from typing import Any

from codeloom import __version__
from codeloom.cli.formats.base import Format, failed_path
from codeloom.cli.items import Item
from codeloom.cli.source import Source, path_fields
from codeloom.cli.tally import Tally

# Of the schema; a field that is added leaves it as it is.
VERSION = 1


class ObjectFormat(Format):
    """Writes objects as they come."""

    NEEDS_FINGERPRINTS = True

    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Write the objects of one file."""
        for item in items:
            for text in item.json():
                self._write(text)

    def add_fact(self, fields: dict[str, Any]) -> None:
        """Write an object that isn't about a source."""
        self._write(json.dumps(fields))

    def add_failure(self, error: OSError) -> None:
        """Write an object for a file that can't be read."""
        reason = error.strerror or str(error)
        self._write(json.dumps({"type": "failure", **path_fields(failed_path(error)), "message": reason}))

    def _run(self) -> str:
        return json.dumps(
            {"type": "run", "version": VERSION, "codeloom": __version__, "command": self._command}
        )

    @abstractmethod
    def _write(self, text: str) -> None:
        """Write one object."""


class JsonLinesFormat(ObjectFormat):
    """An object on each row."""

    def begin(self) -> None:
        """Write what ran."""
        self._write(self._run())

    def end(self, tally: Tally) -> None:
        """Write the summary."""
        self._write(json.dumps(tally.fields()))

    def _write(self, text: str) -> None:
        self._console.print_row(text)


class JsonFormat(ObjectFormat):
    """One document, with each object on a row of its own."""

    _separator = ""

    def begin(self) -> None:
        """Open the document."""
        self._console.write(f'{{"run": {self._run()},\n"items": [')

    def end(self, tally: Tally) -> None:
        """Close the document."""
        self._console.print_row(f'\n],\n"summary": {json.dumps(tally.fields())}}}')

    def _write(self, text: str) -> None:
        self._console.write(f"{self._separator}\n{text}")
        self._separator = ","
