"""Where the sources of a corpus come from: folders, trees of git, archives, tables."""

import gzip
import json
import lzma
import os
import subprocess
import tarfile
import zipfile
import zlib
from collections.abc import Callable, Iterable, Iterator
from functools import partial
from typing import IO, Any

from codeloom.corpus.batch import Mark, too_big
from codeloom.reading.exclusion import Exclusion
from codeloom.reading.files import NOTEBOOK_SUFFIX, SOURCE_SUFFIXES, find_files, read_file
from codeloom.reading.notebooks import read_notebook

_TAR_SUFFIXES = (".tar", ".tar.gz", ".tgz", ".tar.bz2", ".tar.xz", ".tar.zst")
_ZIP_SUFFIXES = (".zip", ".whl", ".egg")
_PARQUET_SUFFIXES = (".parquet",)
_JSONL_SUFFIXES = (".jsonl", ".jsonl.gz", ".ndjson")


class Entry:
    """One source: its path, and its bytes or why there are none. `python` is None where it isn't known."""

    __slots__ = ("content", "mark", "path", "python")

    def __init__(
        self, path: str, content: bytes | None, mark: Mark | None = None, python: str | None = None
    ) -> None:
        self.path = path.encode(errors="surrogateescape").decode(errors="backslashreplace")
        self.content = content
        self.mark = mark
        self.python = python


class Columns:
    """The columns of tables that hold sources."""

    def __init__(self, path: str = "path", content: str = "content", python: str = "python") -> None:
        self.path = path
        self.content = content
        self.python = python


class Finder:
    """Goes through what is named, lazily. What can't be read at all goes to `on_error`."""

    def __init__(
        self,
        on_error: Callable[[OSError], None],
        *,
        exclusion: Exclusion | None = None,
        columns: Columns | None = None,
        max_bytes: int,
        use_git: bool = False,
    ) -> None:
        self._on_error = on_error
        self._exclusion = exclusion
        self._columns = columns or Columns()
        self._max_bytes = max_bytes
        self._use_git = use_git

    def entries(self, paths: Iterable[str]) -> Iterator[Entry]:
        """The sources that the paths hold, in their order."""
        for path in paths:
            try:
                yield from self._entries_of(path)
            except OSError as error:
                error.filename = error.filename or path
                self._on_error(error)

    def _entries_of(self, path: str) -> Iterator[Entry]:
        if os.path.isdir(path):
            paths = _tracked_by_git(path) if self._use_git else find_files([path], self._exclusion)
            yield from self._files(paths)
            return
        read = self._reader_of(path.lower())
        if read is None:
            yield from self._files(iter([path]))
            return
        os.stat(path)  # the error of the system where it isn't there
        try:
            yield from read(path)
        except (
            tarfile.TarError,
            zipfile.BadZipFile,
            zlib.error,
            lzma.LZMAError,
            EOFError,
            ValueError,
        ) as error:
            raise OSError(0, f"it can't be read to its end: {error}", path) from None

    def _reader_of(self, name: str) -> Callable[[str], Iterator[Entry]] | None:
        readers = (
            (_TAR_SUFFIXES, self._tar),
            (_ZIP_SUFFIXES, self._zip),
            (_PARQUET_SUFFIXES, self._parquet),
            (_JSONL_SUFFIXES, self._jsonl),
        )
        return next((read for suffixes, read in readers if name.endswith(suffixes)), None)

    def _files(self, paths: Iterator[str | OSError]) -> Iterator[Entry]:
        for path in paths:
            if isinstance(path, OSError):
                self._on_error(path)
                continue
            try:
                size = os.stat(path).st_size
                content = None if size > self._max_bytes else read_file(path)
            except OSError as error:
                yield Entry(path, None, ("missing", error.strerror or str(error)))
            else:
                yield self._entry(path, content, size)

    def _entry(self, path: str, content: bytes | None, size: int) -> Entry:
        if content is None or size > self._max_bytes:
            return Entry(path, None, ("too big", too_big(size, self._max_bytes)))
        if not path.lower().endswith(NOTEBOOK_SUFFIX):
            return Entry(path, content)
        try:
            return Entry(path, read_notebook(content, path).text.encode(errors="surrogatepass"))
        except OSError as error:
            return Entry(path, None, ("missing", error.strerror or str(error)))

    def _member(self, path: str, size: int, opened: Callable[[], IO[bytes] | None]) -> Entry:
        """A file of an archive, which may be longer than it says."""
        if size > self._max_bytes:
            return self._entry(path, None, size)
        stream = opened()
        if stream is None:
            return Entry(path, None, ("missing", "the archive doesn't hold it"))
        with stream:
            content = stream.read(self._max_bytes + 1)
        return self._entry(path, content, max(size, len(content)))

    def _tar(self, path: str) -> Iterator[Entry]:
        with tarfile.open(path, "r|*") as archive:
            while (member := archive.next()) is not None:
                if member.isfile() and member.name.lower().endswith(SOURCE_SUFFIXES):
                    opened = partial(archive.extractfile, member)
                    yield self._member(f"{path}/{member.name}", member.size, opened)
                archive.members = []  # type: ignore[attr-defined]  # all of them would be kept

    def _zip(self, path: str) -> Iterator[Entry]:
        with zipfile.ZipFile(path) as archive:
            for member in archive.infolist():
                if member.is_dir() or not member.filename.lower().endswith(SOURCE_SUFFIXES):
                    continue
                name = f"{path}/{member.filename}"
                try:
                    yield self._member(name, member.file_size, partial(archive.open, member))
                except (zipfile.BadZipFile, zlib.error, RuntimeError, NotImplementedError, EOFError) as error:
                    yield Entry(name, None, ("missing", str(error)))

    def _parquet(self, path: str) -> Iterator[Entry]:
        import pyarrow.parquet

        columns = self._columns
        with pyarrow.parquet.ParquetFile(path) as file:
            names = [
                name
                for name in (columns.path, columns.content, columns.python)
                if name in file.schema_arrow.names
            ]
            if columns.content not in names:
                raise ValueError(
                    f"it has no column {columns.content!r}, but {', '.join(file.schema_arrow.names)}"
                )
            row = 0
            for batch in file.iter_batches(64, columns=names):
                for fields in batch.to_pylist():
                    row += 1
                    yield self._of_row(path, row, fields)

    def _jsonl(self, path: str) -> Iterator[Entry]:
        opened: Any = gzip.open if path.lower().endswith(".gz") else open
        with opened(path, "rb") as stream:
            for row, text in enumerate(stream, 1):
                try:
                    fields = json.loads(text) if text.strip() else None
                except ValueError as error:
                    yield Entry(f"{path}/{row}", None, ("missing", f"the row isn't JSON: {error}"))
                    continue
                if isinstance(fields, dict):
                    yield self._of_row(path, row, fields)

    def _of_row(self, path: str, row: int, fields: dict[str, Any]) -> Entry:
        name = fields.get(self._columns.path)
        name = f"{path}/{name if isinstance(name, str) and name else row}"
        content = fields.get(self._columns.content)
        if isinstance(content, str):
            content = content.encode(errors="surrogatepass")
        if not isinstance(content, bytes):
            return Entry(name, None, ("missing", f"there is no text in {self._columns.content!r}"))
        entry = self._entry(name, content, len(content))
        python = fields.get(self._columns.python)
        entry.python = python if isinstance(python, str) else None
        return entry


def _tracked_by_git(folder: str) -> Iterator[str | OSError]:
    """The Python files below a folder that git tracks, in the order of their names."""
    command = ["git", "-C", folder, "ls-files", "-z", "--", "."]
    try:
        done = subprocess.run(command, capture_output=True, check=True)
    except FileNotFoundError:
        raise OSError(0, "git isn't there to list its files", folder) from None
    except subprocess.CalledProcessError as error:
        reason = error.stderr.decode(errors="replace").strip().partition("\n")[0]
        raise OSError(0, f"git lists no files: {reason}", folder) from None
    for name in sorted(set(filter(None, done.stdout.split(b"\0")))):
        path = os.path.join(folder, os.fsdecode(name))
        if path.lower().endswith(SOURCE_SUFFIXES) and os.path.lexists(path) and not os.path.isdir(path):
            yield path
