"""The Parquet files of a part that an index has already."""

from collections.abc import Iterable, Sequence

import pyarrow
import pyarrow.compute
import pyarrow.parquet

from codeloom.corpus.part import CODEC


def states_of(path: str) -> Iterable[tuple[int, str]]:
    """The number and the state of each file in a part of the table `files`."""
    table = pyarrow.parquet.read_table(path, columns=["file_id", "state"])
    return zip(table["file_id"].to_pylist(), table["state"].to_pylist(), strict=True)


def without(paths: dict[str, str], gone: Sequence[int]) -> dict[str, bytes]:
    """The files of a part, by the names of their tables, without the rows of some sources; none at all when
    no source is left."""
    values = pyarrow.array(gone, pyarrow.int64())
    kept = {}
    for name, path in paths.items():
        table = pyarrow.parquet.read_table(path)
        is_gone = pyarrow.compute.is_in(table["file_id"], value_set=values)
        kept[name] = table.filter(pyarrow.compute.invert(is_gone))
    return {name: _file_of(table) for name, table in kept.items()} if len(kept["files"]) else {}


def _file_of(table: pyarrow.Table) -> bytes:
    sink = pyarrow.BufferOutputStream()
    pyarrow.parquet.write_table(table, sink, compression=CODEC, write_statistics=False)
    data: bytes = sink.getvalue().to_pybytes()
    return data
