"""Reading texts, the growth of time with their length, and what a start costs. Run it with `make bench`.

python benchmarks/bench_analyze.py [--files N] [--rounds N]
"""

import statistics
import subprocess
import sys

from measuring import Analyze, LibraryWork, Options, Ratio, Time

from codeloom.treesift import CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText


def ImportMilliseconds(statement: str) -> float:
    """The median time of `statement` in a fresh interpreter, its own start subtracted."""
    script = f"import time; t = time.perf_counter(); {statement}; print(time.perf_counter() - t)"
    times = [
        float(
            subprocess.run(
                [sys.executable, "-P", "-c", script], capture_output=True, text=True, check=True
            ).stdout
        )
        for _ in range(5)
    ]
    return statistics.median(times) * 1000


def main() -> None:
    options = Options(__doc__, files=150, rounds=7)
    work = LibraryWork(options.files)
    rows = sum(text.count("\n") for text in work.texts)
    print(f"{len(work.texts)} files, {rows} rows; times faster than the peer, median (lowest to highest)")
    Ratio("text to logicals alone, against ast.parse", work.Parse, work.Read, options.rounds)

    line = "x = foo(a, b[1], c.d) + 2  # a line\n"
    small, large = line * 10_000, line * 100_000
    growth = [
        Time(lambda: Analyze(GetLogicalsFromText(large))) / Time(lambda: Analyze(GetLogicalsFromText(small)))
        for _ in range(3)
    ]
    print(f"{'100,000 lines take, as many times as 10,000':58} {statistics.median(growth):6.2f}")

    print(f"import of codeloom.treesift: {ImportMilliseconds('import codeloom.treesift'):.1f} ms")
    made = Time(lambda: CPGenAnalyzerImpl((3, 11, 0)))
    print(f"an analyzer with both grammars: {made * 1000:.1f} ms")


if __name__ == "__main__":
    main()
