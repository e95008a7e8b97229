"""Files read ahead by threads, and given in the order in which they were found."""

import atexit
from collections import deque
from collections.abc import Iterable, Iterator

from codeloom._analysis import Analysis, FileReader
from codeloom.reading.files import NOTEBOOK_SUFFIX, StandardInput
from codeloom.reading.languages import version_number

TYPE_CHECKING = False  # `typing` takes longer to import than this module
if TYPE_CHECKING:
    from typing import TypeVar

    Found = TypeVar("Found")

# More threads than these would only wait for each other.
_MOST_JOBS = 1024
# How many batches are read ahead for each thread but this one: so many that none is idle while this one is
# at a long file.
_AHEAD_PER_JOB = 16
# The first batches have fewer files, so that the first result comes soon.
_MOST_IN_BATCH = 8


def read_ahead(
    found: "Iterable[Found]",
    *,
    jobs: int,
    python: str,
    false_hints: bool,
    records: bool = False,
    names: bool = False,
) -> "Iterator[tuple[Found, Analysis | None]]":
    """Each path with what its file says, in their order; ahead, in `jobs` threads, this one included.

    With `records` and `names` what these are made of is worked out in the same pass. None goes with what
    takes more to read: notebooks, the standard input, what has to be decoded, what can't be read; and with
    whatever isn't a path.
    """
    jobs = min(jobs, _MOST_JOBS)
    reader = FileReader(jobs, python, version_number(python), false_hints, records, names)
    close = reader.close
    atexit.register(close)  # a thread that doesn't end with the interpreter may be in the midst of it
    ahead: deque[list[Found]] = deque()
    try:
        for count, batch in enumerate(_batches(found)):
            reader.submit([_plain_path(one) for one in batch])
            ahead.append(batch)
            # At first results are taken nearly as soon as they are asked for.
            if len(ahead) > min(count // 2, _AHEAD_PER_JOB * (jobs - 1)):
                yield from zip(ahead.popleft(), reader.take(), strict=True)
        while ahead:
            yield from zip(ahead.popleft(), reader.take(), strict=True)
    finally:
        close()
        atexit.unregister(close)


def _batches(found: "Iterable[Found]") -> "Iterator[list[Found]]":
    """Some of what is found at a time."""
    batch: list[Found] = []
    for count, one in enumerate(found):
        batch.append(one)
        if len(batch) > min(count // _MOST_IN_BATCH, _MOST_IN_BATCH - 1):
            yield batch
            batch = []
    if batch:
        yield batch


def _plain_path(found: object) -> str:
    """The path of what may be plain text, an empty one for anything else."""
    if not isinstance(found, str) or isinstance(found, StandardInput):
        return ""
    return "" if found.lower().endswith(NOTEBOOK_SUFFIX) else found
