"""The folder of an index: Parquet files by table, and a manifest that says which of them count.

    DIR/manifest.jsonl            what was committed, a row each; see below
    DIR/TABLE/00000017.parquet    the rows of that table in part 17
    DIR/.lock                     held by the process that writes

The manifest begins with a row of the settings. Each further row adds a part, may replace earlier ones, or
says that a run has come to its end. It grows by whole rows that are on the disk when a commit returns. A
file that no row names, and a last row that lacks its end, are left from a process that was killed: they
count for nothing, and the next one that writes removes them.
"""

import fcntl
import json
import os
from collections.abc import Iterable, Sequence
from typing import Any

MANIFEST = "manifest.jsonl"
_LOCK = ".lock"
_TEMPORARY = ".tmp"
_SUFFIX = ".parquet"
_FORMAT = 1


class StoreError(Exception):
    """A folder that isn't such an index, or that can't be gone on with."""


class Store:
    """An index in a folder, to be read."""

    def __init__(self, folder: str) -> None:
        """StoreError for what is no index, OSError where it can't be read."""
        self.folder = folder
        self.settings: dict[str, Any] = {}
        self.parts: list[int] = []
        self.is_finished = False
        # Up to the end of the last whole row.
        self._length = 0
        path = os.path.join(folder, MANIFEST)
        if os.path.exists(path):
            with open(path, "rb") as file:
                self._read(file.read())

    @property
    def tables(self) -> Sequence[str]:
        """The names of its tables, `files` last."""
        return (*self.settings["tables"], "files")

    def files_of(self, table: str) -> list[str]:
        """The paths of the Parquet files that hold a table, in their order."""
        return [self.path_of(table, part) for part in self.parts]

    def path_of(self, table: str, part: int) -> str:
        """Where a part of a table is."""
        return os.path.join(self.folder, table, f"{part:08}{_SUFFIX}")

    def _read(self, manifest: bytes) -> None:
        rows = manifest.split(b"\n")
        self._length = len(manifest) - len(rows[-1])
        for text in rows[:-1]:
            try:
                row = json.loads(text)
                self._take(row)
            except (ValueError, KeyError, TypeError):
                raise StoreError(f"{os.path.join(self.folder, MANIFEST)} is damaged") from None

    def _take(self, row: dict[str, Any]) -> None:
        if "settings" in row:
            if row["format"] != _FORMAT:
                raise StoreError(f"the index in {self.folder} has format {row['format']}, not {_FORMAT}")
            self.settings = row["settings"]
        self.is_finished = "finished" in row
        gone = set(row.get("replaces", ()))
        self.parts = [part for part in self.parts if part not in gone]
        if "part" in row:
            self.parts.append(row["part"])


class WritableStore(Store):
    """The same for the one process that writes; it is made where there is none."""

    def __init__(self, folder: str, settings: dict[str, Any], *, resume: bool = True) -> None:
        """StoreError for a folder with something else, or with an index made with other settings; without
        `resume` for one whose last run didn't come to its end, too."""
        os.makedirs(folder, exist_ok=True)
        self._lock = _locked(folder)
        try:
            super().__init__(folder)
            self._check(settings, resume)
            if not self.settings:
                self._begin(settings)
            self._remove_leftovers()
        except BaseException:
            self.close()
            raise
        self._next = max(self.parts, default=-1) + 1

    def __enter__(self) -> "WritableStore":
        return self

    def __exit__(self, *_: object) -> None:
        self.close()

    def _check(self, settings: dict[str, Any], resume: bool) -> None:
        if not self.settings and not self._is_barely_begun():
            raise StoreError(f"{self.folder} holds something else than an index")
        if self.settings and self.settings != settings:
            differences = _differences(self.settings, settings)
            raise StoreError(f"the index in {self.folder} was made with other settings: {differences}")
        if self.parts and not self.is_finished and not resume:
            raise StoreError(f"the last run into {self.folder} didn't come to its end: go on with --resume")

    def close(self) -> None:
        """Let others write."""
        os.close(self._lock)

    def next_part(self) -> int:
        """A number for a new part, greater than all before."""
        self._next += 1
        return self._next - 1

    def write(self, table: str, part: int, data: bytes) -> None:
        """Have a part of a table on the disk, before it is committed."""
        with open(self._temporary_path(table, part), "wb") as file:
            file.write(data)
            file.flush()
            os.fsync(file.fileno())

    def _temporary_path(self, table: str, part: int) -> str:
        return self.path_of(table, part) + _TEMPORARY

    def commit(self, part: int | None, replaces: Iterable[int] = ()) -> None:
        """Make a part count whose files are written, synchronised, at their temporary paths.

        The parts that it replaces count no more; without a part these are just dropped.
        """
        replaced = sorted(replaces)
        if part is not None:
            for table in self.tables:
                os.replace(self._temporary_path(table, part), self.path_of(table, part))
            for table in self.tables:
                _synchronise(os.path.join(self.folder, table))
        row: dict[str, Any] = {} if part is None else {"part": part}
        self._append({**row, "replaces": replaced} if replaced else row)
        for old in replaced:
            for table in self.tables:
                os.remove(self.path_of(table, old))

    def finish(self, files: int) -> None:
        """Note that a run has come to its end."""
        self._append({"finished": True, "files": files})

    def begin_run(self) -> None:
        """Note that a run goes on, or begins anew."""
        if self.is_finished:
            self._append({"begun": True})

    def _begin(self, settings: dict[str, Any]) -> None:
        for table in (*settings["tables"], "files"):
            os.makedirs(os.path.join(self.folder, table), exist_ok=True)
        self._append({"format": _FORMAT, "settings": settings})
        _synchronise(self.folder)

    def _append(self, row: dict[str, Any]) -> None:
        data = json.dumps(row).encode() + b"\n"
        with open(os.path.join(self.folder, MANIFEST), "ab") as file:
            if file.tell() > self._length:  # a row that a killed process left without its end
                file.truncate(self._length)
            file.write(data)
            file.flush()
            os.fsync(file.fileno())
        self._length += len(data)
        self._take(row)

    def _is_barely_begun(self) -> bool:
        """True for an empty folder, and for what a process leaves that is killed before its first row is
        whole."""
        names = [name for name in os.listdir(self.folder) if name not in (_LOCK, MANIFEST)]
        paths = [os.path.join(self.folder, name) for name in names]
        return all(os.path.isdir(path) and not os.listdir(path) for path in paths)

    def _remove_leftovers(self) -> None:
        for table in self.tables:
            known = {os.path.basename(path) for path in self.files_of(table)}
            folder = os.path.join(self.folder, table)
            os.makedirs(folder, exist_ok=True)
            for name in os.listdir(folder):
                if name not in known and name.endswith((_SUFFIX, _SUFFIX + _TEMPORARY)):
                    os.remove(os.path.join(folder, name))


def _locked(folder: str) -> int:
    """The lock of a folder, open; StoreError while another process holds it."""
    descriptor = os.open(os.path.join(folder, _LOCK), os.O_RDWR | os.O_CREAT | os.O_CLOEXEC, 0o644)
    try:
        fcntl.flock(descriptor, fcntl.LOCK_EX | fcntl.LOCK_NB)
    except OSError:
        os.close(descriptor)
        raise StoreError(f"another process writes into {folder}") from None
    return descriptor


def _synchronise(folder: str) -> None:
    """Have the names in a folder on the disk."""
    descriptor = os.open(folder, os.O_RDONLY | os.O_DIRECTORY)
    try:
        os.fsync(descriptor)
    finally:
        os.close(descriptor)


def _differences(old: dict[str, Any], new: dict[str, Any]) -> str:
    names = [name for name in {**old, **new} if old.get(name) != new.get(name)]
    return ", ".join(f"{name} {old.get(name)!r}, now {new.get(name)!r}" for name in names)
