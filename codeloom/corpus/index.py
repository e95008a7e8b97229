"""Making an index: sources in, Parquet files in a folder out.

Sources are read and hashed one after the other; what the index doesn't hold yet is gathered into parts,
which a pool of workers analyses and writes. A part counts when its files are on the disk, in the order of
the sources.
"""

from collections import deque
from collections.abc import Callable, Iterable, Iterator, Sequence
from concurrent.futures import ThreadPoolExecutor
from typing import Protocol

from codeloom.corpus.part import Hashed, parquet_files
from codeloom.corpus.sources import Entry
from codeloom.corpus.store import WritableStore

# Bytes of source in a part.
PART_BYTES = 16_000_000
_MOST_FILES = 20_000  # in a part, however small they are


class Counts:
    """What became of the sources of a run."""

    def __init__(self) -> None:
        self.files = 0
        self.bytes = 0
        self.unchanged = 0
        self.duplicates = 0
        self.removed = 0


class PoolError(Exception):
    """A part that can't be done. The parts before it are kept, and the run can be gone on with."""


class Pool(Protocol):
    """What analyses parts, several at a time."""

    jobs: int

    def submit(self, part: int, sources: Sequence[Hashed]) -> Callable[[], None]:
        """Begin with a part. The call that is given returns when its files are on the disk, at their
        temporary paths; PoolError when nobody can do it."""

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
        for name, data in parquet_files(self._store.settings, sources).items():
            self._store.write(name, part, data)


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
        if not self._store.parts:
            return
        from codeloom.corpus.part_reader import states_of

        for part in self._store.parts:
            for file_id, state in states_of(self._store.path_of("files", part)):
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
            has_rows = self._copy(old, part, file_ids)
            self._store.commit(part if has_rows else None, replaces=[old])

    def _copy(self, old: int, part: int, gone: Sequence[int]) -> bool:
        """Copy a part without some files; false when no file is left, and then nothing is there."""
        from codeloom.corpus.part_reader import without  # only where something has changed: it takes long

        paths = {name: self._store.path_of(name, old) for name in self._store.tables}
        files = without(paths, gone)
        for name, data in files.items():
            self._store.write(name, part, data)
        return bool(files)
