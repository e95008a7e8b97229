"""The names on some rows, with what each does there and what is recorded of it."""

from collections import defaultdict
from collections.abc import Iterable, Sequence
from itertools import chain
from typing import Any

from codeloom._analysis import Line, Occurrence, Range, Record
from codeloom.cli.excerpt import on_one_row, printable
from codeloom.cli.names_in_words import statements
from codeloom.cli.occurrence_items import where

# Characters of one thing that is said of a name.
_LONGEST_TEXT = 300
_CUT = "..."
# In the place of a role, for a word such as `return` that has records and is no name.
_NO_ROLE = -1


class NamesOfRows:
    """Names by row, each as four numbers, with tables of the texts that they share.

    The numbers are the characters before the name, its length, its role and scope in `facts`, and what is
    recorded of it in `records`.
    """

    def __init__(self) -> None:
        self._facts: dict[tuple[str, str], int] = {}
        self._records: dict[tuple[str, ...], int] = {}
        self._known: dict[tuple[object, ...], int] = {}
        self._by_row: dict[int, list[tuple[int, int, int, int]]] = defaultdict(list)

    def add_line(self, line: Line) -> None:
        """Take in the names of a line."""
        # A record goes to the name that ends where it does: that of `a.b` to the `b`.
        records: dict[tuple[int, int], list[tuple[Range, Record]]] = defaultdict(list)
        for record in line.records:
            if (place := record.range) is not None:
                records[place.end_row, place.end_column].append((place, record))
        for occurrence in line.occurrences:
            place = occurrence.range
            said = records.pop((place.end_row, place.end_column), [])
            self._add(place, self._fact(occurrence), [record for _, record in said])
        for said in records.values():
            self._add(said[0][0], _NO_ROLE, [record for _, record in said])

    def fields(self, rows: Iterable[int]) -> dict[str, Any]:
        """The names of these rows, a list for each, and the tables."""
        return {
            "names": [list(chain.from_iterable(sorted(self._by_row.get(row, ())))) for row in rows],
            "facts": list(self._facts),
            "records": list(self._records),
        }

    def _add(self, place: Range, fact: int, records: Sequence[Record]) -> None:
        if place.row == place.end_row:
            length = place.end_column - place.column
            self._by_row[place.row].append((place.column - 1, length, fact, self._number(records)))

    def _fact(self, occurrence: Occurrence) -> int:
        fact = occurrence.role.value, printable(where(occurrence))
        return self._facts.setdefault(fact, len(self._facts))

    def _number(self, records: Sequence[Record]) -> int:
        key = tuple((each.kind, each.name, each.payload, each.of_argument) for each in records)
        number = self._known.get(key)
        if number is None:
            said = _in_words(list(records))
            number = self._known[key] = self._records.setdefault(said, len(self._records))
        return number


def _in_words(records: list[Record]) -> tuple[str, ...]:
    said = (f"{label} {', '.join(row)}" for label, rows in statements(records) for row in rows)
    return tuple(_shortened(printable(on_one_row(text))) for text in said)


def _shortened(text: str) -> str:
    return text if len(text) <= _LONGEST_TEXT else text[:_LONGEST_TEXT] + _CUT
