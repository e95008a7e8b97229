"""What users call: texts, files and folders into what they say."""

import os
from collections.abc import Callable, Iterable, Iterator

from codeloom._analysis import Analysis
from codeloom.reading.ahead import read_ahead
from codeloom.reading.files import NOTEBOOK_SUFFIX, find_files, read_file
from codeloom.reading.languages import NEWEST, version_number
from codeloom.reading.source import source_from_bytes, source_from_text

TYPE_CHECKING = False  # `typing` takes longer to import than this module
if TYPE_CHECKING:
    from codeloom.reading.notebooks import Notebook


def analyze(
    source: str | bytes,
    *,
    path: str | os.PathLike[str] = "<string>",
    python: str = NEWEST,
    false_hints: bool = False,
) -> Analysis:
    """What a source text says: its problems, its lines, their records.

    Bytes are decoded as those of a file: by their byte order mark or their coding comment, else as
    UTF-8. `path` is the name of the text, which is in its problems. `python` is the version that the
    text is written in, such as "3.12" or "2.7". With `false_hints` everything that looks like a type
    hint is taken for one.

    It never fails on what the text holds: what can't be read is a problem too. TypeError for an
    argument of a wrong type, ValueError for an unknown version.
    """
    if isinstance(source, str):
        text = source_from_text(source)
    elif isinstance(source, bytes | bytearray | memoryview):
        text = source_from_bytes(bytes(source))
    else:
        raise TypeError(f"source must be str or bytes, not {type(source).__name__}")
    _check_flag("false_hints", false_hints)
    return Analysis(
        text.utf8,
        path_text(path),
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
    name = _file_name(path)
    version_number(python)
    data = read_file(name)
    is_notebook = name.lower().endswith(NOTEBOOK_SUFFIX)
    source = _notebook(data, name).text if is_notebook else data
    return analyze(source, path=name, python=python, false_hints=false_hints)


def read_notebook(path: str | os.PathLike[str]) -> "Notebook":
    """The code cells of a Jupyter notebook as one text; OSError when it can't be read.

    Its `text` is what `analyze` takes, and its `place(row)` gives the cell and the row there, from 1.
    """
    name = _file_name(path)
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

    Of a folder these are the Python files below it, in the order of their names; hidden folders, caches
    and virtual environments are left out, unless they are named themselves. Nothing is read twice.

    `jobs` threads read and analyse files ahead, as many as the machine has processors unless told
    otherwise. They look for problems, and with `records` for records too; otherwise these are made
    when they are first asked for. Notebooks, and what has to be decoded, are read in their turn.

    What can't be read goes to `on_error`, an OSError with the path in `filename`; without `on_error`
    it is raised.
    """
    if isinstance(paths, str | bytes | os.PathLike):
        raise TypeError("paths must be an iterable of paths, not a single one")
    if not isinstance(paths, Iterable):
        raise TypeError(f"paths must be an iterable of paths, not {type(paths).__name__}")
    names = [_file_name(path) for path in paths]
    _check_flag("false_hints", false_hints)
    _check_flag("records", records)
    if on_error is not None and not callable(on_error):
        raise TypeError(f"on_error must be callable, not {type(on_error).__name__}")
    version_number(python)
    if jobs is None:
        jobs = processor_count()
    elif isinstance(jobs, bool) or not isinstance(jobs, int):
        raise TypeError(f"jobs must be an int, not {type(jobs).__name__}")
    elif jobs < 1:
        raise ValueError(f"jobs must be at least 1, not {jobs}")

    def read(path: str | OSError) -> Analysis:
        if isinstance(path, OSError):
            raise path
        return analyze_file(path, python=python, false_hints=false_hints)

    found = find_files(names)
    results = read_ahead(found, jobs=jobs, python=python, false_hints=false_hints, records=records)
    return _without_errors(results, read, on_error)


def _without_errors(
    results: Iterator[tuple[str | OSError, Analysis | None]],
    read: Callable[[str | OSError], Analysis],
    on_error: Callable[[OSError], None] | None,
) -> Iterator[Analysis]:
    """What the results say; `read` is for those that say nothing yet."""
    for path, analysis in results:
        if analysis is None:
            try:
                analysis = read(path)
            except OSError as error:
                if on_error is None:
                    raise
                on_error(error)
                continue
        yield analysis


def processor_count() -> int:
    """How many processors this process may use."""
    return len(os.sched_getaffinity(0)) if hasattr(os, "sched_getaffinity") else os.cpu_count() or 1


def _check_flag(name: str, value: object) -> None:
    if not isinstance(value, bool):
        raise TypeError(f"{name} must be a bool, not {type(value).__name__}")


def _file_name(path: str | os.PathLike[str]) -> str:
    name = path_text(path)
    if "\0" in name:
        raise ValueError(f"path holds a NUL: {name!r}")
    return name


def path_text(path: str | os.PathLike[str]) -> str:
    try:
        return os.fsdecode(path)
    except TypeError:
        raise TypeError(f"path must be a str or a path, not {type(path).__name__}") from None
