"""What the walk for type hints costs, on the interpreter's own library.

Every figure is a ratio of two things timed in turn in one run on the same lines. Lines without a
"type:" comment should pay for one look at the types of their tokens, and for the walk over their
tree. Run it with `make bench`.

    python benchmarks/bench_hints.py [--files N] [--rounds N]
"""

import argparse
import io
import logging
import statistics
from collections.abc import Callable
from contextlib import redirect_stdout

from bench_analyze import ANALYZER, Analyze, Corpus, Time

from codeloom.logicalline import CLogicalLine, kComment
from codeloom.treesift import CDispatchWalker, CExprStmt, CForStmt, CFuncdefStmt, CNode, CWithStmt
from codeloom.utils import GetLogicalsFromText

WALKER = ANALYZER._fTypeHintWalker
# It visits the same nodes as the walker for hints, and neither looks at tokens nor at hints.
BARE_WALKER = CDispatchWalker(
    {**WALKER._fDispatchDict, **dict.fromkeys((CFuncdefStmt, CExprStmt, CForStmt, CWithStmt), False)}
)

Lines = list[tuple[CNode, CLogicalLine]]


def Parsed(text: str) -> Lines:
    """The sound lines of a text with their trees."""
    lines = []
    for logical in GetLogicalsFromText(text):
        if logical.fType == kComment or ANALYZER.AnalyzeSingleLogical(logical, logical.fInAsyncDef, False):
            continue
        tree = ANALYZER.ParseToNode(logical, logical.fInAsyncDef)
        if tree is not None:
            lines.append((tree, logical))
    return lines


def Walk(walker: CDispatchWalker, lines: Lines) -> None:
    walk = walker.Walk
    for tree, logical in lines:
        walk(tree, logical, False)


def Ratio(name: str, ours: Callable[[], object], other: Callable[[], object], rounds: int) -> None:
    """Print how many times as long as `other` `ours` takes: the median of pairs timed in turn."""
    ratios = [Time(ours) / Time(other) for _ in range(rounds)]
    print(f"{name:64} {statistics.median(ratios):6.2f}  ({min(ratios):.2f} to {max(ratios):.2f})")


def main() -> None:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--files", type=int, default=60)
    parser.add_argument("--rounds", type=int, default=9)
    options = parser.parse_args()
    logging.disable()
    rounds = options.rounds
    texts = Corpus(options.files)
    with redirect_stdout(io.StringIO()):
        lines = [line for text in texts for line in Parsed(text)]
        plain = [(tree, logical) for tree, logical in lines if not isinstance(tree, CFuncdefStmt | CExprStmt)]
    logicals = [logical for _, logical in lines]
    print(f"{len(texts)} files, {len(lines)} lines; how many times as long, median (lowest to highest)")

    def Again() -> None:
        for logical in logicals:
            logical.MarkParsed(False)

    ratios = []
    with redirect_stdout(io.StringIO()):
        for _ in range(rounds):
            Again()
            ratios.append(Time(lambda: Walk(WALKER, lines)) / Time(lambda: Analyze(logicals)))
    print(
        f"{'the walk for hints, against the whole analysis of its lines':64} {statistics.median(ratios):6.2f}"
    )
    with redirect_stdout(io.StringIO()):
        Walk(WALKER, plain)
    Ratio(
        "lines without hints: the walk, against the walk over the tree alone",
        lambda: Walk(WALKER, plain),
        lambda: Walk(BARE_WALKER, plain),
        rounds,
    )
    for name, comment in [("a plain comment", "# an int"), ("a hint in a comment", "# type: int")]:
        with_comment = Parsed(f"x = f(a, b[1])  {comment}\n" * 5_000)
        without = Parsed("x = f(a, b[1])\n" * 5_000)
        Ratio(
            f"an assignment with {name}, against the same without",
            lambda lines=with_comment: Walk(WALKER, lines),
            lambda lines=without: Walk(WALKER, lines),
            rounds,
        )


if __name__ == "__main__":
    main()
