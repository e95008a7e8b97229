"""Times of the processor, as ratios of things done in turn in one run: on a shared machine single times say
nothing, and what a clock shows says what others do."""

import resource
import statistics
import subprocess
import sys
import tempfile
import time
from collections.abc import Callable, Iterable
from functools import partial
from pathlib import Path

from corpus import copy_library, files, library, text_of
from workloads import COMMAND, OURS, PEERS, RUFF, read, search_path

from codeloom import analyze, analyze_paths

ROUNDS = 7
IMPORTED = ("codeloom", "codeloom.treesift")
GROWTH = (1_000, 10_000, 100_000, 1_000_000)


def times_faster(ours: str, peer: str) -> float:
    """How many times as long as one of our workloads a peer takes on the same files."""
    sources = read(files())
    return _ratio(lambda: PEERS[peer](sources), lambda: OURS[ours](sources))


def command_against_ruff(count: str) -> float:
    """How many times as long as our command ruff's takes, for so many files of the library at a time."""
    paths = list(map(str, library()[: int(count)]))
    environment = {"RAYON_NUM_THREADS": "1", "PATH": search_path()}
    return _ratio(
        lambda: subprocess.run([*RUFF, *paths], env=environment, check=True),
        lambda: subprocess.run([*COMMAND, *paths], stdout=subprocess.DEVNULL, check=False),
    )


class Growth:
    """What a row costs in longer and longer texts, as times of what it costs in the shortest.

    The same rows are analysed each time, in more pieces or in fewer. A short text again and again would
    tell less: the processor learns it by heart.
    """

    def __init__(self) -> None:
        self._text = text_of(GROWTH[-1])
        self._shortest = 0.0

    def of(self, rows: str) -> float:
        """For texts of so many rows; the shortest is asked for first."""
        texts = _pieces(self._text, int(rows))
        cost = min(_time(partial(_records, texts)) for _ in range(ROUNDS))
        self._shortest = self._shortest or cost
        return cost / self._shortest


def _pieces(text: bytes, row_count: int) -> list[bytes]:
    """A text in pieces of at least so many rows, each begun at a class."""
    pieces, rows = [], [b""]
    for row in text.splitlines(keepends=True):
        if row.startswith(b"class ") and len(rows) > row_count:
            pieces.append(b"".join(rows))
            rows = []
        rows.append(row)
    return [*pieces, b"".join(rows)]


def _records(texts: Iterable[bytes]) -> None:
    for text in texts:
        _ = analyze(text).records


def one_job_against_two(what: str) -> float:
    """How many times as long one job takes as two; other work on the machine makes it less."""
    with tempfile.TemporaryDirectory() as folder:
        run = FOR_JOBS[what](folder)
        return _ratio(lambda: run(1), lambda: run(2), time.perf_counter)


def _large_files(folder: str) -> Callable[[int], None]:
    for i in range(24):
        Path(folder, f"{i:02}.py").write_bytes(text_of(10_000))

    def run(jobs: int) -> None:
        for _ in analyze_paths([folder], jobs=jobs):
            pass

    return run


def _many_files(folder: str) -> Callable[[int], None]:
    copy_library(Path(folder), 10_000)

    def run(jobs: int) -> None:
        command = [*COMMAND, "--jobs", str(jobs), folder]
        subprocess.run(command, stdout=subprocess.DEVNULL, check=False)

    return run


FOR_JOBS = {"24 files of 10,000 rows": _large_files, "codeloom check, 10,000 files": _many_files}


def import_time(module: str) -> float:
    """Milliseconds of the import of a module in a new interpreter, the shortest of some."""
    code = f"import time; start = time.process_time(); import {module}; print(time.process_time() - start)"
    command = [sys.executable, "-P", "-c", code]
    times = (float(subprocess.run(command, capture_output=True, check=True).stdout) for _ in range(ROUNDS))
    return min(times) * 1000


def _spent() -> float:
    """Seconds of the processor, those of child processes included."""
    own, children = (resource.getrusage(who) for who in (resource.RUSAGE_SELF, resource.RUSAGE_CHILDREN))
    return own.ru_utime + own.ru_stime + children.ru_utime + children.ru_stime


def _ratio(
    one: Callable[[], object], other: Callable[[], object], clock: Callable[[], float] = _spent
) -> float:
    one()
    other()
    return statistics.median(_time(one, clock) / _time(other, clock) for _ in range(ROUNDS))


def _time(action: Callable[[], object], clock: Callable[[], float] = _spent) -> float:
    start = clock()
    action()
    return clock() - start
