"""Does a long run grow memory? Run with `make leaks`.

Analyses the same lines again and again, a million logical lines in all, with errors, embedded
expressions, and analyzers that come and go, and fails when the memory in use grows.
"""

import argparse
import gc
import io
import resource
import sys
from contextlib import redirect_stdout

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
GROWTH_ALLOWED_KB = 2_000


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


def PeakKilobytes() -> int:
    return resource.getrusage(resource.RUSAGE_SELF).ru_maxrss


def main() -> int:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--lines", type=int, default=1_000_000)
    lines = parser.parse_args().lines
    with redirect_stdout(io.StringIO()):
        Run(lines // 10)
        gc.collect()
        warm = PeakKilobytes()
        Run(lines)
    growth = PeakKilobytes() - warm
    print(f"{lines} logical lines: the peak grew by {growth} KB, {GROWTH_ALLOWED_KB} are allowed")
    return growth > GROWTH_ALLOWED_KB


if __name__ == "__main__":
    sys.exit(main())
