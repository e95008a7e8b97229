"""Analysis against the interpreter's own parser, on the interpreter's own library.

Every figure is a ratio of two things timed in turn in one run on the same text, since single
times mean little on a shared machine. Run it with `make bench`.

    python benchmarks/bench_analyze.py [--files N] [--rounds N]
"""

import argparse
import ast
import io
import statistics
import subprocess
import sys
import sysconfig
import time
from collections.abc import Callable, Iterable
from contextlib import redirect_stdout
from pathlib import Path

from codeloom.treesift import CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

ANALYZER = CPGenAnalyzerImpl((3, 11, 0))


def Corpus(count: int) -> list[str]:
    """The texts of `count` files of the library that the interpreter itself accepts."""
    texts = []
    for path in sorted(Path(sysconfig.get_path("stdlib")).rglob("*.py")):
        if "site-packages" in path.parts:
            continue
        try:
            text = path.read_text("utf-8")
            ast.parse(text)
        except (SyntaxError, ValueError):
            continue
        texts.append(text)
    step = max(1, len(texts) // count)
    return texts[::step]


def Analyze(logicals: Iterable) -> None:
    analyze = ANALYZER.AnalyzeSingleLogical
    for logical in logicals:
        analyze(logical, logical.fInAsyncDef, logical.fFirstInDef)


def Time(action: Callable[[], object]) -> float:
    start = time.perf_counter()
    action()
    return time.perf_counter() - start


def Ratio(name: str, peer: Callable[[], object], ours: Callable[[], object], rounds: int) -> None:
    """Print how many times faster `ours` is than `peer`: the median of pairs timed in turn."""
    pairs = [(Time(peer), Time(ours)) for _ in range(rounds)]
    ratios = [peer_time / our_time for peer_time, our_time in pairs]
    print(f"{name:58} {statistics.median(ratios):6.2f}  ({min(ratios):.2f} to {max(ratios):.2f})")


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
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--files", type=int, default=150)
    parser.add_argument("--rounds", type=int, default=7)
    options = parser.parse_args()
    texts = Corpus(options.files)
    rows = sum(text.count("\n") for text in texts)
    print(f"{len(texts)} files, {rows} rows; times faster than the peer, median (lowest to highest)")

    def ParseAll() -> None:
        for text in texts:
            ast.parse(text)

    def ReadAndAnalyzeAll() -> None:
        for text in texts:
            Analyze(GetLogicalsFromText(text))

    def ReadAll() -> None:
        for text in texts:
            GetLogicalsFromText(text)

    prepared = [GetLogicalsFromText(text) for text in texts]

    def AnalyzePrepared() -> None:
        for logicals in prepared:
            Analyze(logicals)

    def Unmark() -> None:
        for logicals in prepared:
            for logical in logicals:
                logical.MarkParsed(False)

    with redirect_stdout(io.StringIO()):
        ReadAndAnalyzeAll()  # fills the free lists
    limits = io.StringIO()

    def Quietly(action: Callable[[], None]) -> Callable[[], None]:
        def Run() -> None:
            with redirect_stdout(limits):
                action()

        return Run

    Ratio(
        "text to analysed logicals, against ast.parse", ParseAll, Quietly(ReadAndAnalyzeAll), options.rounds
    )
    Ratio("text to logicals alone, against ast.parse", ParseAll, ReadAll, options.rounds)
    ratios = []
    for _ in range(options.rounds):
        Unmark()
        ratios.append(Time(ParseAll) / Time(Quietly(AnalyzePrepared)))
    print(f"{'prepared logicals analysed, against ast.parse':58} {statistics.median(ratios):6.2f}")

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
