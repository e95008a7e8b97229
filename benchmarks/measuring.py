"""What the benchmarks share: texts of the interpreter's library, and ratios of actions timed in turn.

Every figure is a ratio of two things timed in turn in one run, since single times mean little on a shared
machine.
"""

import argparse
import ast
import io
import statistics
import sysconfig
import time
from collections.abc import Callable, Iterable
from contextlib import redirect_stdout
from pathlib import Path

from codeloom.treesift import CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

ANALYZER = CPGenAnalyzerImpl((3, 11, 0))

Action = Callable[[], object]


def Options(description: str | None, files: int, rounds: int) -> argparse.Namespace:
    """`files`, a number of files of the library, and `rounds`, how often an action is timed."""
    parser = argparse.ArgumentParser(description=(description or "").partition("\n")[0])
    parser.add_argument("--files", type=int, default=files)
    parser.add_argument("--rounds", type=int, default=rounds)
    return parser.parse_args()


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


def Unmark(logicals: Iterable) -> None:
    """Has the logicals analysed again."""
    for logical in logicals:
        logical.MarkParsed(False)
        logical.ClearDerivedInfo()


def Quietly(action: Action) -> Action:
    """The same action, without the lines that walks print which hit a limit."""

    def Run() -> None:
        with redirect_stdout(io.StringIO()):
            action()

    return Run


def Time(action: Action) -> float:
    start = time.perf_counter()
    action()
    return time.perf_counter() - start


def Nothing() -> None:
    """What is done before a pair of actions that need nothing."""


def Ratio(name: str, one: Action, other: Action, rounds: int, before: Action = Nothing) -> None:
    """Print how many times as long as `other` `one` takes: the median of pairs timed in turn."""
    ratios = []
    for _ in range(rounds):
        before()
        ratios.append(Time(one) / Time(other))
    print(f"{name:66} {statistics.median(ratios):6.2f}  ({min(ratios):.2f} to {max(ratios):.2f})")


class LibraryWork:
    """What is done with the texts of the library, as it stands and in logicals prepared beforehand."""

    def __init__(self, count: int) -> None:
        self.texts = Corpus(count)
        self._fPrepared = [logical for text in self.texts for logical in GetLogicalsFromText(text)]
        Quietly(self.AnalyzeTexts)()  # fills the free lists

    def Parse(self) -> None:
        """The interpreter's own parser on each text."""
        for text in self.texts:
            ast.parse(text)

    def Read(self) -> None:
        """Each text into logicals."""
        for text in self.texts:
            GetLogicalsFromText(text)

    def AnalyzeTexts(self) -> None:
        """Each text into logicals, and these analysed."""
        for text in self.texts:
            Analyze(GetLogicalsFromText(text))

    def AnalyzePrepared(self) -> None:
        """The prepared logicals analysed, after `Prepare`."""
        Analyze(self._fPrepared)

    def Prepare(self) -> None:
        """Has the prepared logicals analysed again."""
        Unmark(self._fPrepared)
