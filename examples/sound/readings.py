# Python 3.8: assignment expressions, parameters by position only, self-documenting fields.
from __future__ import annotations

import re
from typing import Iterator, NamedTuple

ROW = re.compile(r"(?P<station>\w+)\s+(?P<celsius>-?\d+(?:\.\d+)?)")


class Reading(NamedTuple):
    station: str
    celsius: float


def parse(rows: "Iterator[str]", /, *, strict: bool = False) -> Iterator[Reading]:
    for number, row in enumerate(rows, start=1):
        if (match := ROW.match(row)) is None:
            if strict:
                raise ValueError(f"row {number}: {row!r:.40} isn't a reading")
            continue
        yield Reading(match["station"], float(match["celsius"]))


def coldest(readings):  # type: (Iterator[Reading]) -> Reading
    best = min(readings, key=lambda reading: reading.celsius)
    print(f"{best.station=} {best.celsius = :+.1f}")
    return best
