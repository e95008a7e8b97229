"""The Parquet files of a part that an index has already."""

from collections.abc import Iterable, Sequence

import pyarrow
import pyarrow.compute
import pyarrow.parquet

from codeloom.corpus.part import PartFiles


def states_of(path: str) -> Iterable[tuple[int, str]]:
    """The number and the state of each file in a part of the table `files`."""
    table = pyarrow.parquet.read_table(path, columns=["file_id", "state"])
    return zip(table["file_id"].to_pylist(), table["state"].to_pylist(), strict=True)


def without(paths: dict[str, str], gone: Sequence[int]) -> dict[str, bytes]:
    """The files of a part, by the names of their tables, without the rows of some sources; none at all when
    no source is left."""
    values = pyarrow.array(gone, pyarrow.int64())
    files = PartFiles()
    has_sources = False
    for name, path in paths.items():
        with pyarrow.parquet.ParquetFile(path) as file:
            for group in range(file.num_row_groups):
                table = file.read_row_group(group)
                is_gone = pyarrow.compute.is_in(table["file_id"], value_set=values)
                kept = table.filter(pyarrow.compute.invert(is_gone))
                has_sources |= name == "files" and len(kept) > 0
                files.add(name, kept)
    made = files.finish()
    return made if has_sources else {}
