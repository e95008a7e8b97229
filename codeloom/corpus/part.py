"""The Parquet files of a part of an index, made of sources."""

from collections.abc import Iterable, Iterator, Sequence
from contextlib import ExitStack
from hashlib import sha256
from typing import Any

import pyarrow
import pyarrow.parquet
import pyarrow.types

from codeloom import __version__
from codeloom._analysis import SourceBatch, Table
from codeloom.corpus.batch import TABLES, file_id_of, take
from codeloom.corpus.sources import Entry

# Bytes of source that are analysed at once: what a thread needs in memory is some ten times that.
_BATCH_BYTES = 4_000_000
# Of the compressor. From here on names take less as they are than as numbers of a dictionary, since the same
# names follow each other again and again.
_LEVEL = 6
# Whole numbers that grow by little from row to row. Most others have first bytes that are zero, which are
# best put together.
_GROWING = ("line", "row", "end_row", "scope", "home", "signature", "object_row", "object_end_row", "parent")

# Of an index; what it holds is in `settings_of`.
Settings = dict[str, Any]


def settings_of(
    python: str,
    tables: Iterable[str],
    *,
    false_hints: bool,
    text: bool,
    dedup: bool,
    max_bytes: int,
    max_seconds: float,
) -> Settings:
    """What all runs over an index must have in common, so that their rows are of one kind."""
    return {
        "codeloom": __version__,
        "python": python,
        "tables": [name for name in TABLES if name in set(tables)],
        "false_hints": false_hints,
        "text": text,
        "dedup": dedup,
        "max_bytes": max_bytes,
        "max_seconds": max_seconds,
    }


class Hashed:
    """An entry with its hash and its number."""

    __slots__ = ("digest", "entry", "file_id")

    def __init__(self, entry: Entry) -> None:
        self.entry = entry
        self.digest = None if entry.content is None else sha256(entry.content).hexdigest()
        self.file_id = file_id_of(entry.path, self.digest)


class PartFiles:
    """The Parquet files of a part while they grow in memory, by the names of their tables."""

    def __init__(self) -> None:
        self._sinks: dict[str, pyarrow.BufferOutputStream] = {}
        self._writers: dict[str, pyarrow.parquet.ParquetWriter] = {}

    def add(self, name: str, table: pyarrow.Table) -> None:
        """Add rows of a table, as a group."""
        if name not in self._writers:
            self._sinks[name] = pyarrow.BufferOutputStream()
            self._writers[name] = _writer(self._sinks[name], name, table.schema)
        self._writers[name].write_table(table, row_group_size=max(len(table), 1))

    def finish(self) -> dict[str, bytes]:
        """The files. Nothing can be added afterwards."""
        with ExitStack() as stack:
            for writer in self._writers.values():
                stack.callback(writer.close)
        return {name: sink.getvalue().to_pybytes() for name, sink in self._sinks.items()}


def parquet_files(settings: Settings, sources: Sequence[Hashed]) -> dict[str, bytes]:
    """Analyse sources as the settings of an index say: Parquet files by the names of their tables."""
    files = PartFiles()
    for some in _batches(sources):
        for name, table in _analyzed(settings, some).items():
            # pyarrow.table() would do the same, and import pandas, which takes longer than many an index.
            files.add(name, pyarrow.RecordBatchReader.from_stream(table).read_all())
    return files.finish()


def _analyzed(settings: Settings, sources: Sequence[Hashed]) -> dict[str, Table]:
    entries = [one.entry for one in sources]
    batch = SourceBatch(
        [entry.path for entry in entries],
        [entry.content for entry in entries],
        [entry.python for entry in entries],
    )
    for i, one in enumerate(sources):
        take(batch, i, one.digest, settings["python"], settings["max_bytes"], one.entry.mark)
    return batch.analyze(
        settings["tables"], settings["false_hints"], settings["text"], settings["max_seconds"]
    )


def _writer(sink: pyarrow.NativeFile, name: str, schema: pyarrow.Schema) -> pyarrow.parquet.ParquetWriter:
    facts = {"codeloom.table": name, "codeloom.version": __version__, "codeloom.schema": "1"}
    encodings = {field.name: encoding for field in schema if (encoding := _encoding_of(field))}
    return pyarrow.parquet.ParquetWriter(
        sink,
        schema.with_metadata(facts),
        compression="zstd",
        compression_level=_LEVEL,
        use_dictionary=[
            field.name
            for field in schema
            if pyarrow.types.is_dictionary(field.type) and field.name not in encodings
        ],
        column_encoding=encodings,
        write_statistics=["file_id"],
    )


def _encoding_of(field: pyarrow.Field) -> str | None:
    """None for a dictionary, if the column has one, else as it is."""
    if field.name in _GROWING:
        return "DELTA_BINARY_PACKED"
    if pyarrow.types.is_integer(field.type):
        return "BYTE_STREAM_SPLIT"
    return "PLAIN" if field.name == "name" else None


def _batches(sources: Sequence[Hashed]) -> Iterator[Sequence[Hashed]]:
    """Pieces that are analysed at once; one, if an empty one, of no sources."""
    start = size = 0
    for i, one in enumerate(sources):
        length = len(one.entry.content or b"")
        if i > start and size + length > _BATCH_BYTES:
            yield sources[start:i]
            start, size = i, 0
        size += length
    yield sources[start:]
