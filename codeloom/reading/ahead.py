"""Files read ahead by threads, and given in the order in which they were found."""

from collections import deque
from collections.abc import Callable, Iterable, Iterator
from functools import partial
from itertools import chain, islice

from codeloom.reading.files import StandardInput

TYPE_CHECKING = False  # `typing` takes longer to import than this module
if TYPE_CHECKING:
    from typing import TypeVar

    Result = TypeVar("Result")

# How many batches are read ahead for each thread.
_AHEAD_PER_JOB = 4
# A batch costs the interpreter's lock once. The first ones are small, so that the first result comes soon.
_MOST_IN_BATCH = 8


def read_ahead(
    found: Iterator[str | OSError],
    read_plain: "Callable[[list[str]], Iterable[Result | None]]",
    read: "Callable[[str], Result]",
    jobs: int,
) -> "Iterator[Result | OSError]":
    """What comes of each path, an OSError for what can't be read, in their order; ahead, in `jobs` threads.

    `read_plain` takes many files at a time, and gives None for each that it leaves to `read`.
    """
    read_batch = partial(_read_batch, read_plain, read)
    first = list(islice(found, 2))
    batches = _batches(chain(first, found))
    if jobs == 1 or len(first) < 2:  # one file is nothing to share
        for batch in batches:
            yield from read_batch(batch)
        return
    from concurrent.futures import ThreadPoolExecutor

    pool = ThreadPoolExecutor(jobs, "codeloom")
    ahead: deque[Callable[[], list[Result | OSError]]] = deque()
    try:
        for batch in batches:
            if isinstance(batch[0], StandardInput):  # can't be read ahead: it may be a terminal
                ahead.append(partial(read_batch, batch))
            else:
                ahead.append(pool.submit(read_batch, batch).result)
            if len(ahead) > _AHEAD_PER_JOB * jobs:
                yield from ahead.popleft()()
        while ahead:
            yield from ahead.popleft()()
    finally:
        pool.shutdown(cancel_futures=True)


def _batches(found: Iterable[str | OSError]) -> Iterator[list[str | OSError]]:
    """Some paths at a time; the standard input is alone."""
    batch: list[str | OSError] = []
    for count, path in enumerate(found):
        if batch and (isinstance(path, StandardInput) or isinstance(batch[0], StandardInput)):
            yield batch
            batch = []
        batch.append(path)
        if len(batch) > min(count // _MOST_IN_BATCH, _MOST_IN_BATCH - 1):
            yield batch
            batch = []
    if batch:
        yield batch


def _read_batch(
    read_plain: "Callable[[list[str]], Iterable[Result | None]]",
    read: "Callable[[str], Result]",
    batch: list[str | OSError],
) -> "list[Result | OSError]":
    plain = iter(read_plain([path for path in batch if isinstance(path, str)]))
    results: list[Result | OSError] = []
    for path in batch:
        if isinstance(path, OSError):
            results.append(path)
        else:
            result = next(plain)
            results.append(_read_one(read, path) if result is None else result)
    return results


def _read_one(read: "Callable[[str], Result]", path: str) -> "Result | OSError":
    try:
        return read(path)
    except OSError as error:
        return error
