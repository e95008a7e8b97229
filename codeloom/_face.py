"""What users call: texts, files and folders into what they say."""

import os
from collections import deque
from collections.abc import Callable, Iterable, Iterator
from functools import partial
from itertools import chain, islice

from codeloom._analysis import Analysis
from codeloom.reading.files import NOTEBOOK_SUFFIX, StandardInput, find_files, read_file
from codeloom.reading.languages import NEWEST, version_number
from codeloom.reading.source import source_from_bytes, source_from_text

TYPE_CHECKING = False  # `typing` takes longer to import than this module
if TYPE_CHECKING:
    from typing import TypeVar

    from codeloom.reading.notebooks import Notebook

    Result = TypeVar("Result")

# How many files are read ahead for each thread.
_AHEAD_PER_JOB = 4


def analyze(
    source: str | bytes,
    *,
    path: str | os.PathLike[str] = "<string>",
    python: str = NEWEST,
    false_hints: bool = False,
) -> Analysis:
    """What a source text says: its problems, its lines, their records.

    Bytes are decoded as those of a file: by their byte order mark or their coding comment, else as
    UTF-8. `path` is the name that problems bear. `python` is the version that the text is written in,
    such as "3.12" or "2.7". With `false_hints` all that looks like a type hint is taken for one.

    It never fails on what the text holds: what can't be read is a problem too.
    """
    if isinstance(source, str):
        text = source_from_text(source)
    elif isinstance(source, bytes | bytearray | memoryview):
        text = source_from_bytes(bytes(source))
    else:
        raise TypeError(f"source must be str or bytes, not {type(source).__name__}")
    if not isinstance(false_hints, bool):
        raise TypeError(f"false_hints must be a bool, not {type(false_hints).__name__}")
    return Analysis(
        text.utf8,
        _path_text(path),
        python,
        version_number(python),
        false_hints,
        text.faults,
        text.unreadable,
    )


def analyze_file(
    path: str | os.PathLike[str], *, python: str = NEWEST, false_hints: bool = False
) -> Analysis:
    """The same for a file; OSError when it can't be read.

    Of a notebook it is the text of its code cells; `read_notebook` gives the cell of each row.
    """
    name = _path_text(path)
    version_number(python)
    data = read_file(name)
    is_notebook = name.lower().endswith(NOTEBOOK_SUFFIX)
    source = _notebook(data, name).text if is_notebook else data
    return analyze(source, path=name, python=python, false_hints=false_hints)


def read_notebook(path: str | os.PathLike[str]) -> "Notebook":
    """The code cells of a Jupyter notebook as one text; OSError when it can't be read.

    Its `text` is what `analyze` takes, and its `place(row)` gives the cell and the row there, from 1.
    """
    name = _path_text(path)
    return _notebook(read_file(name), name)


def _notebook(data: bytes, name: str) -> "Notebook":
    from codeloom.reading.notebooks import read_notebook as read  # it loads a parser of JSON

    return read(data, name)


def analyze_paths(
    paths: Iterable[str | os.PathLike[str]],
    *,
    python: str = NEWEST,
    false_hints: bool = False,
    records: bool = False,
    jobs: int | None = None,
    on_error: Callable[[OSError], None] | None = None,
) -> Iterator[Analysis]:
    """The same for many files, lazily and in their order.

    A folder stands for the Python files below it, in the order of their names; hidden folders, caches
    and virtual environments are left out, unless they are named themselves. Nothing is read twice.

    `jobs` threads read and analyse files ahead, as many as the machine has processors unless told
    otherwise. They look for problems, and with `records` for records too; otherwise these are made
    when they are first asked for.

    What can't be read goes to `on_error`, an OSError with the path in `filename`; without `on_error`
    it is raised.
    """
    if isinstance(paths, str | bytes | os.PathLike):
        raise TypeError("paths must be an iterable of paths, not a single one")
    names = [_path_text(path) for path in paths]
    version_number(python)
    if jobs is None:
        jobs = processor_count()
    elif isinstance(jobs, bool) or not isinstance(jobs, int):
        raise TypeError(f"jobs must be an int, not {type(jobs).__name__}")
    elif jobs < 1:
        raise ValueError(f"jobs must be at least 1, not {jobs}")

    def read(name: str) -> Analysis:
        analysis = analyze_file(name, python=python, false_hints=false_hints)
        _ = analysis.records if records else analysis.problems  # worked out now, in this thread
        return analysis

    return read_all(find_files(names), read, jobs, on_error)


def read_all(
    found: Iterator[str | OSError],
    read: "Callable[[str], Result]",
    jobs: int,
    on_error: Callable[[OSError], None] | None,
) -> "Iterator[Result]":
    """What `read` makes of each path, in their order, ahead and in `jobs` threads."""
    for result in _results(found, read, jobs):
        try:
            value = result()
        except OSError as error:
            if on_error is None:
                raise
            on_error(error)
        else:
            yield value


def _results(
    found: Iterator[str | OSError], read: "Callable[[str], Result]", jobs: int
) -> "Iterator[Callable[[], Result]]":
    """For each path a call that gives, or raises, what came of it."""
    first = list(islice(found, 2))
    if jobs == 1 or len(first) < 2:  # one file is nothing to share
        for path in chain(first, found):
            yield partial(_read_one, read, path)
        return
    from concurrent.futures import ThreadPoolExecutor

    pool = ThreadPoolExecutor(jobs, "codeloom")
    ahead: deque[Callable[[], Result]] = deque()
    try:
        for path in chain(first, found):
            if isinstance(path, StandardInput):  # can't be read ahead: it may be a terminal
                ahead.append(partial(_read_one, read, path))
            else:
                ahead.append(pool.submit(_read_one, read, path).result)
            if len(ahead) > _AHEAD_PER_JOB * jobs:
                yield ahead.popleft()
        while ahead:
            yield ahead.popleft()
    finally:
        pool.shutdown(cancel_futures=True)


def _read_one(read: "Callable[[str], Result]", path: str | OSError) -> "Result":
    if isinstance(path, OSError):
        raise path
    return read(path)


def processor_count() -> int:
    """How many processors this process may use."""
    return len(os.sched_getaffinity(0)) if hasattr(os, "sched_getaffinity") else os.cpu_count() or 1


def _path_text(path: str | os.PathLike[str]) -> str:
    try:
        return os.fsdecode(path)
    except TypeError:
        raise TypeError(f"path must be a str or a path, not {type(path).__name__}") from None
