"""Does a long run grow memory? Run with `make leaks`.

Analyses the same lines again and again, a million logical lines in all, with errors, embedded
expressions, and analyzers that come and go; then lets hosts look at all there is, or do what nobody should;
then has the commands read them, in small files and in a big one. It fails when the memory in use grows.
"""

import argparse
import gc
import io
import random
import resource
import sys
import tempfile
from collections.abc import Callable
from contextlib import redirect_stderr, redirect_stdout, suppress
from pathlib import Path

from odd_hosts import OddHost

from codeloom import cli
from codeloom.logicalline import CLogicalLine
from codeloom.optpgen import ParseError
from codeloom.treesift import CPGenAnalyzerImpl, CPGenParserImpl
from codeloom.utils import GetLogicalsFromText

TEXT = '''\
@decorated(1)
async def f(a: "int", *b, c=(1, 2), **d) -> list["str"]:
    """A text."""
    x = y = f"{a!r:>{width}} {b
    }" + 'text'  # type: str
    for i, (j, k) in enumerate(x[1:2]): print(i); continue
    return [lambda: i for i in x if i] or {**d, 'a': 1}
else:
x = (1, 2
def broken(:
x = = "
f"{a b}" f"{
with (a as b, c as d): pass
except* E as e:
type X[T: int] = list[T]
match x:
    case [1, *_] if y: pass
'''
COMMANDS = ("check", "names", "hints", "tree")
BIG_FILE_SIZE = 200_000
GROWTH_ALLOWED_KB = 2_000


class Nowhere(io.TextIOBase):
    """A stream that keeps nothing."""

    def write(self, text: str) -> int:
        return len(text)


def AnalyzeOnce(analyzer: CPGenAnalyzerImpl) -> int:
    logicals = GetLogicalsFromText(TEXT)
    for logical in logicals:
        analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)
    return len(logicals)


def Run(lines: int) -> None:
    analyzer = CPGenAnalyzerImpl((3, 11, 0))
    count = rounds = 0
    while count < lines:
        count += AnalyzeOnce(analyzer)
        rounds += 1
        if rounds % 2000 == 0:
            CPGenParserImpl((3, 11, 0))
            analyzer = CPGenAnalyzerImpl((3, 11, 0))
            gc.collect()  # an analyzer's parts refer to each other


def LookAtAll(parser: CPGenParserImpl, logicals: list[CLogicalLine]) -> None:
    """Have the host objects made that stand for native ones."""
    for logical in logicals:
        _ = logical.fTypeEquivs, logical.fArgTypeEquivs, logical.fPositions, logical.fTokTypes
        with suppress(ParseError):
            tree = parser.ParseToNode(logical, logical.fInAsyncDef)
            nodes = [tree]
            while nodes:
                nodes += nodes.pop().fChildren or ()
            parser.DiscardNode(tree)


ODD_HOST = OddHost(random.Random(1))


def RunHosts(rounds: int) -> None:
    analyzer, parser = CPGenAnalyzerImpl((3, 11, 0)), CPGenParserImpl((3, 11, 0))
    for i in range(rounds):
        logicals = GetLogicalsFromText(TEXT)
        for logical in logicals:
            analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)
        LookAtAll(parser, logicals)
        if i % 10 == 0:
            for logical in logicals:
                ODD_HOST.Analyze(logical)
    gc.collect()


def RunCommands(rounds: int, text: str) -> None:
    with tempfile.TemporaryDirectory() as folder:
        path = Path(folder) / "lines.py"
        path.write_text(text, encoding="utf-8")
        for _ in range(rounds):
            for command in COMMANDS:
                cli.main([command, str(path)])
            gc.collect()


def PeakKilobytes() -> int:
    return resource.getrusage(resource.RUSAGE_SELF).ru_maxrss


def Growth(run: Callable[[int], None], count: int) -> int:
    """By how much the peak grows over `count`, once a tenth of it has been run."""
    run(max(count // 10, 1))
    gc.collect()
    warm = PeakKilobytes()
    run(count)
    return PeakKilobytes() - warm


def main() -> int:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--lines", type=int, default=1_000_000)
    lines = parser.parse_args().lines
    big_file = TEXT * (BIG_FILE_SIZE // len(TEXT))
    with redirect_stdout(Nowhere()), redirect_stderr(Nowhere()):
        growths = {
            f"{lines} logical lines": Growth(Run, lines),
            "hosts": Growth(RunHosts, lines // 500),
            "the commands on a file": Growth(lambda rounds: RunCommands(rounds, TEXT), lines // 2_000),
            "the commands on a big file": Growth(lambda rounds: RunCommands(rounds, big_file), 30),
        }
    for name, growth in growths.items():
        print(f"{name}: the peak grew by {growth} KB, {GROWTH_ALLOWED_KB} are allowed")
    return max(growths.values()) > GROWTH_ALLOWED_KB


if __name__ == "__main__":
    sys.exit(main())
