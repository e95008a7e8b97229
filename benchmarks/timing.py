"""Times, as ratios of things done in turn in one run: single times say nothing on a shared machine."""

import statistics
import subprocess
import tempfile
import time
from collections.abc import Callable
from functools import partial
from pathlib import Path

from corpus import files, text_of
from workloads import COMMAND, OURS, PEERS, RUFF, read, search_path

from codeloom import analyze, analyze_paths

ROUNDS = 7
GROWTH = (1_000, 10_000, 100_000, 1_000_000)


def times_faster(ours: str, peer: str) -> float:
    """How many times as long as one of our workloads a peer takes on the same files."""
    sources = read(files())
    return _ratio(lambda: PEERS[peer](sources), lambda: OURS[ours](sources))


def ruff_on_files() -> None:
    """One run of ruff's command, on one thread."""
    subprocess.run([*RUFF, *files()], env={"RAYON_NUM_THREADS": "1", "PATH": search_path()}, check=True)


def command_on_files() -> None:
    """One run of our command."""
    subprocess.run([*COMMAND, *files()], stdout=subprocess.DEVNULL, check=True)


def command_against_ruff() -> float:
    """How many times as long as our command ruff's takes."""
    return _ratio(ruff_on_files, command_on_files)


def growth() -> dict[str, float]:
    """What a row costs in longer and longer texts, as times of what it costs in the shortest."""
    per_row = {}
    for rows in GROWTH:
        text = text_of(rows)
        repeats = max(3, 200_000 // rows)
        best = min(_time(partial(_records, text)) for _ in range(repeats))
        per_row[f"{rows:,} rows"] = best / rows
    shortest = next(iter(per_row.values()))
    return {rows: cost / shortest for rows, cost in per_row.items()}


def _records(text: bytes) -> object:
    return analyze(text).records


def one_thread_against_two() -> float:
    """How many times as long one thread takes as two, on files big enough to matter."""
    with tempfile.TemporaryDirectory() as folder:
        for i in range(24):
            Path(folder, f"{i:02}.py").write_bytes(text_of(10_000))

        def run(jobs: int) -> None:
            for _ in analyze_paths([folder], jobs=jobs):
                pass

        return _ratio(lambda: run(1), lambda: run(2))


def _ratio(one: Callable[[], object], other: Callable[[], object]) -> float:
    one()
    other()
    return statistics.median(_time(one) / _time(other) for _ in range(ROUNDS))


def _time(action: Callable[[], object]) -> float:
    start = time.perf_counter()
    action()
    return time.perf_counter() - start
