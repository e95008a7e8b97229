"""The Parquet files of a part of an index, made of sources."""

from base64 import b64encode
from collections.abc import Iterable, Iterator, Sequence
from functools import cache, partial
from hashlib import sha256
from typing import Any

import pyarrow

from codeloom import __version__
from codeloom._analysis import ParquetPart, SourceBatch
from codeloom.corpus.batch import TABLES, file_id_of, take
from codeloom.corpus.sources import Entry

CODEC = "zstd"
# Bytes of source that are analysed at once: what a thread needs in memory is some ten times that.
_BATCH_BYTES = 4_000_000
_FACTS = {"codeloom.version": __version__, "codeloom.schema": "1"}

# Of an index; what it holds is in `settings_of`.
Settings = dict[str, Any]


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


class Hashed:
    """An entry with its hash and its number."""

    __slots__ = ("digest", "entry", "file_id")

    def __init__(self, entry: Entry) -> None:
        self.entry = entry
        self.digest = None if entry.content is None else sha256(entry.content).hexdigest()
        self.file_id = file_id_of(entry.path, self.digest)


def parquet_files(settings: Settings, sources: Sequence[Hashed]) -> dict[str, bytes]:
    """Analyse sources as the settings of an index say: Parquet files by the names of their tables."""
    compress = partial(pyarrow.Codec(CODEC).compress, asbytes=True)
    names = settings["tables"]
    notes = {name: _notes_of(name) for name in (*names, "files")}
    part = ParquetPart(names, settings["false_hints"], settings["max_seconds"], notes, compress)
    for some in _batches(sources):
        part.add(_taken(settings, some))
    return part.finish()


def _taken(settings: Settings, sources: Sequence[Hashed]) -> SourceBatch:
    entries = [one.entry for one in sources]
    batch = SourceBatch(
        [entry.path for entry in entries],
        [entry.content for entry in entries],
        [entry.python for entry in entries],
    )
    for i, one in enumerate(sources):
        take(batch, i, one.digest, settings["python"], settings["max_bytes"], one.entry.mark)
    return batch


@cache
def _notes_of(name: str) -> dict[str, str]:
    """What the file of a table says of itself; its types too, so that dictionaries are read as such."""
    nothing = SourceBatch([], [], []).analyze([] if name == "files" else [name], False, 1.0)
    facts = {**_FACTS, "codeloom.table": name}
    schema = pyarrow.RecordBatchReader.from_stream(nothing[name]).schema.with_metadata(facts)
    return {**facts, "ARROW:schema": b64encode(schema.serialize()).decode()}


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
