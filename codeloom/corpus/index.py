"""Making an index: sources in, Parquet files in a folder out.

Sources are read and hashed one after the other; what the index doesn't hold yet is gathered into parts,
which a pool of workers analyses and writes. A part counts when its files are on the disk, in the order of
the sources.
"""

import os
from collections import deque
from collections.abc import Callable, Iterable, Iterator, Sequence
from concurrent.futures import ThreadPoolExecutor
from hashlib import sha256
from typing import Any, Protocol

import pyarrow
import pyarrow.compute
import pyarrow.parquet

from codeloom import __version__
from codeloom._analysis import SourceBatch
from codeloom.corpus.batch import TABLES, file_id_of, take
from codeloom.corpus.sources import Entry
from codeloom.corpus.store import WritableStore

# Bytes of source in a part, and in what is analysed at once: what a thread needs in memory is some ten times
# the second.
PART_BYTES = 16_000_000
BATCH_BYTES = 4_000_000
_MOST_FILES = 20_000  # in a part, however small they are

_CONTENT = pyarrow.large_binary()
# What makes these columns smaller than a dictionary does: from row to row they grow by little, or they have
# bytes that are nearly always the same.
_GROWING = ("line", "row", "end_row", "scope", "home", "signature", "object_row", "object_end_row", "parent")
_SMALL = ("column", "end_column", "object_column", "object_end_column")
_ENCODINGS = {**dict.fromkeys(_GROWING, "DELTA_BINARY_PACKED"), **dict.fromkeys(_SMALL, "BYTE_STREAM_SPLIT")}


# Of an index; what it holds is in `settings_of`.
Settings = dict[str, Any]


class Counts:
    """What became of the sources of a run."""

    def __init__(self) -> None:
        self.files = 0
        self.bytes = 0
        self.unchanged = 0
        self.duplicates = 0
        self.removed = 0


class Hashed:
    """An entry with its hash and its number."""

    __slots__ = ("digest", "entry", "file_id")

    def __init__(self, entry: Entry) -> None:
        self.entry = entry
        self.digest = None if entry.content is None else sha256(entry.content).hexdigest()
        self.file_id = file_id_of(entry.path, self.digest)


def write_tables(settings: Settings, sources: Sequence[Hashed], sink_of: Callable[[str], Any]) -> list[str]:
    """Analyse sources as the settings of an index say, and write each table to the sink for its name.

    A sink is a path or a stream of pyarrow. Gives the names.
    """
    with _Writers(sink_of) as writers:
        for batch in _batches(sources):
            for name, table in _analyzed(settings, batch).items():
                writers.add(name, pyarrow.table(table))
        return writers.names


def _analyzed(settings: Settings, sources: Sequence[Hashed]) -> dict[str, Any]:
    batch = pyarrow.record_batch(
        {
            "path": [one.entry.path for one in sources],
            "content": pyarrow.array([one.entry.content for one in sources], _CONTENT),
            "python": pyarrow.array([one.entry.python for one in sources], pyarrow.string()),
        }
    )
    native = SourceBatch(batch, "path", "content", "python")
    for i, one in enumerate(sources):
        take(native, i, one.digest, settings["python"], settings["max_bytes"], one.entry.mark)
    return native.analyze(settings["tables"], settings["false_hints"], settings["max_seconds"])


class _Writers:
    """The Parquet files of a part while they are written."""

    def __init__(self, sink_of: Callable[[str], Any]) -> None:
        self._sink_of = sink_of
        self._writers: dict[str, pyarrow.parquet.ParquetWriter] = {}

    def __enter__(self) -> "_Writers":
        return self

    def __exit__(self, *_: object) -> None:
        for writer in self._writers.values():
            writer.close()

    @property
    def names(self) -> list[str]:
        return list(self._writers)

    def add(self, name: str, table: pyarrow.Table) -> None:
        """Add rows of a table as a row group."""
        if name not in self._writers:
            self._writers[name] = _writer(self._sink_of(name), name, table.schema)
        self._writers[name].write_table(table, row_group_size=max(len(table), 1))


class Pool(Protocol):
    """What analyses parts, several at a time."""

    jobs: int

    def submit(self, part: int, sources: Sequence[Hashed]) -> Callable[[], None]:
        """Begin with a part. The call that is given returns when its files are on the disk, at their
        temporary paths."""

    def close(self) -> None:
        """Begin no more parts."""


class Threads:
    """Threads of this process."""

    def __init__(self, store: WritableStore, jobs: int) -> None:
        self.jobs = jobs
        self._store = store
        self._pool = ThreadPoolExecutor(jobs, "codeloom")

    def submit(self, part: int, sources: Sequence[Hashed]) -> Callable[[], None]:
        """As the protocol says."""
        return self._pool.submit(self._write, part, sources).result

    def close(self) -> None:
        """As the protocol says."""
        self._pool.shutdown(cancel_futures=True)

    def _write(self, part: int, sources: Sequence[Hashed]) -> None:
        for name in write_tables(
            self._store.settings, sources, lambda name: self._store.temporary_path(name, part)
        ):
            self._store.synchronise(name, part)


class Indexer:
    """Brings an index to what the sources are now."""

    def __init__(self, store: WritableStore, pool: Pool, *, part_bytes: int = PART_BYTES) -> None:
        self.counts = Counts()
        self._store = store
        self._pool = pool
        self._part_bytes = part_bytes
        self._removes_duplicates = store.settings["dedup"]
        # Of each file that the index holds the part, twice, and one more for a duplicate.
        self._known: dict[int, int] = {}
        # Files that are to go, by their parts.
        self._gone: dict[int, list[int]] = {}
        self._read_known_files()
        # Hashes of the contents of this run, when duplicates are left out.
        self._contents: dict[bytes, str] = {}

    def run(self, entries: Iterable[Entry]) -> Iterator[Counts]:
        """Index the sources, and give the counts again and again."""
        self._store.begin_run()
        pending: deque[tuple[int, Callable[[], None]]] = deque()
        for sources in self._parts(entries):
            part = self._store.next_part()
            pending.append((part, self._pool.submit(part, sources)))
            while len(pending) > self._pool.jobs:
                self._commit(*pending.popleft())
            yield self.counts
        while pending:
            self._commit(*pending.popleft())
            yield self.counts
        self._drop_what_is_gone()
        if not self._store.parts:  # each table is there, if with no rows
            part = self._store.next_part()
            self._commit(part, self._pool.submit(part, []))
        self._store.finish(self.counts.files)
        yield self.counts

    def _read_known_files(self) -> None:
        """A file that two parts have, since a process was killed between two commits, stays in the later."""
        for part in self._store.parts:
            path = self._store.path_of("files", part)
            table = pyarrow.parquet.read_table(path, columns=["file_id", "state"])
            states = table["state"].to_pylist()
            for file_id, state in zip(table["file_id"].to_pylist(), states, strict=True):
                if file_id in self._known:
                    self._gone.setdefault(self._known[file_id] >> 1, []).append(file_id)
                self._known[file_id] = part * 2 + (state == "duplicate")

    def _commit(self, part: int, wait: Callable[[], None]) -> None:
        wait()
        self._store.commit(part)

    def _parts(self, entries: Iterable[Entry]) -> Iterator[list[Hashed]]:
        """What is to be analysed, in lists of bounded size."""
        part: list[Hashed] = []
        size = 0
        done: set[int] = set()
        for entry in entries:
            one = Hashed(entry)
            if one.file_id in done:
                continue
            done.add(one.file_id)
            self.counts.files += 1
            length = len(entry.content or b"")
            self.counts.bytes += length
            if self._is_kept(one):
                self.counts.unchanged += 1
                continue
            part.append(one)
            size += length
            if size >= self._part_bytes or len(part) >= _MOST_FILES:
                yield part
                part, size = [], 0
        if part:
            yield part

    def _is_kept(self, one: Hashed) -> bool:
        """True for what the index holds as it would be made now; otherwise what it holds of it will go."""
        is_duplicate = self._removes_duplicates and self._mark_duplicate(one)
        known = self._known.get(one.file_id)
        if known is None or bool(known & 1) != is_duplicate:
            return False
        del self._known[one.file_id]
        return True

    def _mark_duplicate(self, one: Hashed) -> bool:
        if one.digest is None:
            return False
        first = self._contents.setdefault(bytes.fromhex(one.digest), one.entry.path)
        if first == one.entry.path:
            return False
        self.counts.duplicates += 1
        one.entry.content = None
        one.entry.mark = ("duplicate", f"its content is that of {first}")
        return True

    def _drop_what_is_gone(self) -> None:
        """Write parts anew without the files that aren't there any more, or were made anew."""
        for file_id, known in self._known.items():
            self._gone.setdefault(known >> 1, []).append(file_id)
        for old, file_ids in sorted(self._gone.items()):
            self.counts.removed += len(file_ids)
            part = self._store.next_part()
            has_rows = self._copy(old, part, pyarrow.array(file_ids, pyarrow.int64()))
            self._store.commit(part if has_rows else None, replaces=[old])

    def _copy(self, old: int, part: int, gone: pyarrow.Array) -> bool:
        """Copy a part without some files; false when no file is left, and then nothing is there."""
        has_rows = False
        with _Writers(lambda name: self._store.temporary_path(name, part)) as writers:
            for name in self._store.tables:
                with pyarrow.parquet.ParquetFile(self._store.path_of(name, old)) as file:
                    for group in range(file.num_row_groups):
                        table = file.read_row_group(group)
                        is_gone = pyarrow.compute.is_in(table["file_id"], value_set=gone)
                        table = table.filter(pyarrow.compute.invert(is_gone))
                        has_rows |= name == "files" and len(table) > 0
                        writers.add(name, table)
        for name in self._store.tables:
            if has_rows:
                self._store.synchronise(name, part)
            else:
                os.remove(self._store.temporary_path(name, part))
        return has_rows


def settings_of(
    python: str, tables: Iterable[str], *, false_hints: bool, dedup: bool, max_bytes: int, max_seconds: float
) -> Settings:
    """What all runs over an index must have in common, so that their rows are of one kind."""
    return {
        "codeloom": __version__,
        "python": python,
        "tables": [name for name in TABLES if name in set(tables)],
        "false_hints": false_hints,
        "dedup": dedup,
        "max_bytes": max_bytes,
        "max_seconds": max_seconds,
    }


def _batches(sources: Sequence[Hashed]) -> Iterator[Sequence[Hashed]]:
    """Pieces that are analysed at once; one, if an empty one, of no sources."""
    start = size = 0
    for i, one in enumerate(sources):
        length = len(one.entry.content or b"")
        if i > start and size + length > BATCH_BYTES:
            yield sources[start:i]
            start, size = i, 0
        size += length
    yield sources[start:]


def _writer(sink: Any, name: str, schema: pyarrow.Schema) -> pyarrow.parquet.ParquetWriter:
    encodings = {name: encoding for name, encoding in _ENCODINGS.items() if name in schema.names}
    facts = {"codeloom.table": name, "codeloom.version": __version__, "codeloom.schema": "1"}
    return pyarrow.parquet.ParquetWriter(
        sink,
        schema.with_metadata(facts),
        compression="zstd",
        compression_level=3,
        use_dictionary=[column for column in schema.names if column not in encodings],
        column_encoding=encodings,
        write_statistics=["file_id"],
    )
