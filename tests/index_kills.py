"""Kills an index at random moments, goes on with it, and compares its rows with those of an undisturbed one.

python tests/index_kills.py --kills 100 --files 2000
"""

import argparse
import random
import shutil
import subprocess
import sys
import sysconfig
import tempfile
import time
from pathlib import Path

import pyarrow.parquet

from codeloom.corpus.store import Store

LIBRARY = Path(sysconfig.get_path("stdlib"))


def RowsOf(folder):
    """All rows of an index by table, in an order of their own."""
    store = Store(str(folder))
    assert store.is_finished
    rows = {}
    for name in store.tables:
        tables = [pyarrow.parquet.read_table(path) for path in store.files_of(name)]
        table = pyarrow.concat_tables([Plain(table) for table in tables])
        rows[name] = table.sort_by([(column, "ascending") for column in table.column_names])
    return rows


def Plain(table):
    """Without dictionaries, which are those of each part."""
    fields = [
        field.with_type(field.type.value_type) if pyarrow.types.is_dictionary(field.type) else field
        for field in table.schema
    ]
    return table.cast(pyarrow.schema(fields))


def Leftovers(folder):
    """Files in the folder of a table that belong to no part."""
    store = Store(str(folder))
    known = {path for name in store.tables for path in store.files_of(name)}
    return [path for path in Path(folder).glob("*/*") if str(path) not in known]


class Corpus:
    """Some files of the interpreter's library, and how to index them."""

    def __init__(self, folder, count, part_size):
        self.sources = folder / "sources"
        self.part_size = part_size
        files = sorted(path for path in LIBRARY.rglob("*.py") if path.stat().st_size < 100_000)
        for i, path in enumerate(files[:count]):
            copy = self.sources / f"{i % 10}" / f"{i:05}_{path.name}"
            copy.parent.mkdir(parents=True, exist_ok=True)
            shutil.copyfile(path, copy)

    def Command(self, folder):
        return [
            *(sys.executable, "-P", "-m", "codeloom", "index", "--resume", "--jobs", "2", "--quiet"),
            *("--part-size", str(self.part_size), "-o", str(folder), str(self.sources)),
        ]

    def Index(self, folder):
        subprocess.run(self.Command(folder), check=True)

    def IndexAndKill(self, folder, seconds):
        """True when the process was killed before it came to its end."""
        with subprocess.Popen(self.Command(folder)) as process:
            try:
                process.wait(seconds)
            except subprocess.TimeoutExpired:
                process.kill()
                return True
        return False


def KillAndCompare(folder, *, files, kills, part_size, seed):
    """How often a process was killed; AssertionError where that left a trace."""
    chance = random.Random(seed)
    corpus = Corpus(folder, files, part_size)
    began = time.monotonic()
    corpus.Index(folder / "whole")
    seconds = time.monotonic() - began
    expected = RowsOf(folder / "whole")
    killed = 0
    while killed < kills:
        index = folder / "index"
        shutil.rmtree(index, ignore_errors=True)
        while killed < kills and corpus.IndexAndKill(index, chance.uniform(0, seconds)):
            killed += 1
        corpus.Index(index)
        assert RowsOf(index) == expected, f"seed {seed}: other rows after {killed} kills"
        assert not Leftovers(index), f"seed {seed}: leftovers after {killed} kills"
    return killed


def main():
    parser = argparse.ArgumentParser(description=__doc__.partition("\n")[0])
    parser.add_argument("--kills", type=int, default=100)
    parser.add_argument("--files", type=int, default=2000)
    parser.add_argument("--part-size", type=float, default=1.0, help="megabytes")
    parser.add_argument("--seed", type=int, default=random.randrange(1_000_000))
    options = parser.parse_args()
    print(f"seed {options.seed}", flush=True)
    with tempfile.TemporaryDirectory() as folder:
        killed = KillAndCompare(
            Path(folder),
            files=options.files,
            kills=options.kills,
            part_size=options.part_size,
            seed=options.seed,
        )
    print(f"killed {killed} times: the rows are those of an undisturbed run, each time")


if __name__ == "__main__":
    main()
