"""What the walk for type hints costs, on the interpreter's own library.

Every figure is a ratio of two things timed in turn in one run on the same lines. Lines without a
"type:" comment should pay for one look at the types of their tokens, and for the walk over their
tree. Run it with `make bench`.

    python benchmarks/bench_hints.py [--files N] [--rounds N]
"""

import io
import logging
from contextlib import redirect_stdout

from measuring import ANALYZER, Analyze, Corpus, Options, Quietly, Ratio, Unmark

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


def main() -> None:
    options = Options(__doc__, files=60, rounds=9)
    logging.disable()
    rounds = options.rounds
    texts = Corpus(options.files)
    with redirect_stdout(io.StringIO()):
        lines = [line for text in texts for line in Parsed(text)]
        plain = [(tree, logical) for tree, logical in lines if not isinstance(tree, CFuncdefStmt | CExprStmt)]
    logicals = [logical for _, logical in lines]
    print(f"{len(texts)} files, {len(lines)} lines; how many times as long, median (lowest to highest)")

    Ratio(
        "the walk for hints, against the whole analysis of its lines",
        Quietly(lambda: Walk(WALKER, lines)),
        Quietly(lambda: Analyze(logicals)),
        rounds,
        before=lambda: Unmark(logicals),
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
