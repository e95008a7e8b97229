"""The sources of a table, analysed in one go."""

from collections.abc import Iterable
from functools import cache
from hashlib import sha256
from typing import Any

from codeloom._analysis import SourceBatch, Table, table_kinds
from codeloom.reading.languages import NEWEST, version_named, version_number
from codeloom.reading.source import source_from_bytes, source_from_text

# The names of all tables but `files`, which is always there.
TABLES = tuple(name for name, _, _ in table_kinds())

# Larger files, and files that take longer, are in `files` alone.
MOST_BYTES = 10_000_000
MOST_SECONDS = 10.0

# Why a source has no rows: a state of the table `files`, and the reason.
Mark = tuple[str, str]


def analyze_batch(
    batch: Any,
    tables: Iterable[str] = TABLES,
    *,
    python: str = NEWEST,
    path_column: str = "path",
    content_column: str = "content",
    python_column: str = "python",
    false_hints: bool = False,
    max_bytes: int = MOST_BYTES,
    max_seconds: float = MOST_SECONDS,
) -> dict[str, Table]:
    """What the sources of a table say, as tables by their names; docs/tables.md lists their columns.

    `batch` is anything with `__arrow_c_stream__` or `__arrow_c_array__`: a table or a record batch of
    pyarrow, a data frame of Polars or pandas, a relation of DuckDB. Its column `path_column` names the
    sources, and `content_column` holds them as text or as bytes, which are decoded as those of a file. A
    column `python_column`, if it is there, says for each the version that it is written in, `python`
    where it says nothing.

    The table `files` has a row for each source, in their order, with its hash, its state and, where that
    isn't "ok", the reason. What has more than `max_bytes` bytes, takes more than `max_seconds` seconds of
    a processor, is null, or names an unknown version, has no rows in other tables. Nothing that a source
    holds is an error.

    The sources are analysed without the interpreter's lock, so that threads can each take a batch.

    TypeError for what is no table; ValueError for a column that isn't there or holds no text, for an
    unknown table, and for an unknown version in `python`.
    """
    if isinstance(tables, str):
        raise TypeError("tables must be an iterable of names, not a single one")
    wanted = checked_tables(tables)
    version_number(python)
    sources = SourceBatch(batch, path_column, content_column, python_column)
    for i in range(len(sources)):
        take(sources, i, sources.digest(i, sha256), python, max_bytes)
    return sources.analyze(wanted, false_hints, True, max_seconds)


def checked_tables(names: Iterable[str]) -> list[str]:
    """Each name once; ValueError for a name that no table has."""
    wanted = list(dict.fromkeys(names))
    for name in wanted:
        if name not in TABLES:
            raise ValueError(f"no table is called {name!r}; there are {', '.join(TABLES)}")
    return wanted


def file_id_of(path: str, digest: str | None) -> int:
    """The number by which tables name a file: 64 bits of a hash of its path and the hash of its content."""
    identity = f"{digest or ''}\0{path}".encode("utf-8", "surrogatepass")
    return int.from_bytes(sha256(identity).digest()[:8], "little", signed=True)


def take(
    sources: SourceBatch, i: int, digest: str | None, python: str, max_bytes: int, mark: Mark | None = None
) -> None:
    """Say how a source is to be read. One with a mark has no content."""
    path = sources.path(i) or ""
    named = sources.python(i) or python
    version = _known_version(named)
    sources.take(
        i, file_id_of(path, digest), path, digest, version or named, version_number(version or python)
    )
    size = sources.size(i)
    if size is None:
        sources.mark(*(mark or ("missing", "there is no content")))
    elif version is None:
        sources.mark("unknown version", f"the version {named!r} of Python isn't known")
    elif size > max_bytes:
        sources.mark("too big", too_big(size, max_bytes))
    elif not sources.is_plain(i):
        _decode(sources, i)


def too_big(size: int, max_bytes: int) -> str:
    """The reason why a source of this size isn't analysed."""
    return f"{size:,} bytes are more than the limit of {max_bytes:,}"


@cache
def _known_version(named: str) -> str | None:
    try:
        return version_named(named)
    except ValueError:
        return None


def _decode(sources: SourceBatch, i: int) -> None:
    content = sources.content(i) or b""
    if sources.holds_text:
        source = source_from_text(content.decode(errors="replace"))
    else:
        source = source_from_bytes(content)
    sources.take_decoded(source.utf8, source.faults, source.unreadable)
    if source.faults:
        sources.mark("unreadable", source.faults[0][2])
