"""What an index costs: its speed by that of `codeloom check`, its size by that of the source, its memory; and
`analyze_batch` by `ast.parse`.

python benchmarks/index.py --files 10000 --rounds 5
"""

import argparse
import ast
import os
import shutil
import statistics
import subprocess
import sys
import tempfile
import time
import warnings
from contextlib import suppress
from pathlib import Path
from typing import NamedTuple

from corpus import copy_library

TABLES = ("problems", "lines", "records")
# Files whose memory is measured.
MEMORY_OF = (1_000, 5_000, 20_000)
# Bytes of source that are analysed by one call.
BATCH = 16_000_000


class Spent(NamedTuple):
    """What a command took: seconds of a clock, those of processors, and bytes of memory at its peak."""

    clock: float
    processors: float
    memory: int


def run(*arguments: str) -> Spent:
    """Run a command of codeloom with two jobs."""
    command = [sys.executable, "-P", "-m", "codeloom", arguments[0], "--jobs", "2", *arguments[1:]]
    start = time.perf_counter()
    with subprocess.Popen(command, stdout=subprocess.DEVNULL) as process:
        _, _, usage = os.wait4(process.pid, 0)
        process.returncode = 0  # it is waited for
    return Spent(time.perf_counter() - start, usage.ru_utime + usage.ru_stime, usage.ru_maxrss * 1024)


def index(corpus: Path, output: Path) -> Spent:
    """A new index."""
    shutil.rmtree(output, ignore_errors=True)
    return run("index", "--quiet", "-o", str(output), str(corpus))


def size_of(folder: Path) -> int:
    """The bytes of all files below a folder."""
    return sum(path.stat().st_size for path in folder.rglob("*") if path.is_file())


def print_times(corpus: Path, output: Path, rounds: int) -> None:
    """The speed of an index as a share of that of a check, and its size as one of the source."""
    pairs = [(run("check", str(corpus)), index(corpus, output)) for _ in range(rounds)]
    for name in ("clock", "processors"):
        shares = [getattr(check, name) / getattr(new, name) for check, new in pairs]
        print(f"speed of index, of that of check, by {name}: {statistics.median(shares):.2f}", flush=True)
    source = size_of(corpus)
    print(
        f"{', '.join(TABLES)}, of the source: {sum(size_of(output / name) for name in TABLES) / source:.3f}"
    )
    print(f"all tables, of the source: {size_of(output) / source:.3f}", flush=True)


def print_batch(corpus: Path) -> None:
    """How many times as fast `analyze_batch` is as `ast.parse`, each of them alone."""
    from codeloom.corpus import analyze_batch

    sources = [path.read_bytes() for path in sorted(corpus.rglob("*.py"))]
    ours = theirs = 0.0
    for some in _batches(sources):
        table = _Table(some)
        start = time.process_time()
        analyze_batch(table)
        ours += time.process_time() - start
        start = time.process_time()
        for source in some:
            _parse(source)
        theirs += time.process_time() - start
    print(
        f"analyze_batch, times as fast as ast.parse, {len(sources):,} files: {theirs / ours:.1f}", flush=True
    )


class _Table:
    """Sources as a table of pyarrow, which is made before the time begins."""

    def __init__(self, sources: list[bytes]) -> None:
        import pyarrow

        contents = pyarrow.array(sources, pyarrow.large_binary())
        self._table = pyarrow.table({"path": [f"{i}.py" for i in range(len(sources))], "content": contents})

    def __arrow_c_stream__(self, requested_schema: object = None) -> object:
        return self._table.__arrow_c_stream__(requested_schema)


def _batches(sources: list[bytes]) -> list[list[bytes]]:
    batches: list[list[bytes]] = [[]]
    size = 0
    for source in sources:
        if size + len(source) > BATCH and batches[-1]:
            batches.append([])
            size = 0
        batches[-1].append(source)
        size += len(source)
    return batches


def _parse(source: bytes) -> None:
    with warnings.catch_warnings():
        warnings.simplefilter("ignore")
        with suppress(SyntaxError, ValueError, RecursionError):
            ast.parse(source)


def main() -> None:
    """Measure everything in one run."""
    parser = argparse.ArgumentParser(description=__doc__.partition("\n")[0])
    parser.add_argument("--files", type=int, default=10_000)
    parser.add_argument("--rounds", type=int, default=5)
    parser.add_argument("--batch-of", help=argparse.SUPPRESS)  # in a process of its own
    options = parser.parse_args()
    if options.batch_of:
        print_batch(Path(options.batch_of))
        return
    with tempfile.TemporaryDirectory() as name:
        folder = Path(name)
        output = folder / "index"
        corpus = copy_library(folder / "corpus", options.files)
        print_times(corpus, output, options.rounds)
        subprocess.run([sys.executable, "-P", __file__, "--batch-of", str(corpus)], check=True)
        for count in MEMORY_OF:
            memory = index(copy_library(folder / str(count), count), output).memory
            print(f"memory for {count:,} files: {memory / 1e6:.0f} MB", flush=True)


if __name__ == "__main__":
    main()
