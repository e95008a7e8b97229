"""Reading trees: our nodes by their accessors, against the interpreter's `ast` nodes by their fields.

The peer is a walk over `ast` trees of the same text that reads every field of every node. Ours reads every
node by all accessors that take no index, from Python, and then natively, by the walker that looks for names.
Rates are objects per second, as times of the peer's, measured in turn in one run.

    python benchmarks/bench_accessors.py [--files N] [--rounds N]
"""

import argparse
import ast
import io
import statistics
from collections.abc import Callable, Iterator
from contextlib import redirect_stdout

from bench_analyze import Corpus, Time

from codeloom import treesift
from codeloom.logicalline import CLogicalLine
from codeloom.optpgen import ParseError
from codeloom.treesift import CNode, CNodeWalker, CPGenParserImpl
from codeloom.utils import GetLogicalsFromText

VERSION = (3, 11, 0)

Trees = list[tuple[CNode, CLogicalLine]]


def Accessors(cls: type[CNode]) -> list[Callable[[CNode], object]]:
    """What a class and its bases below CNode can be asked without an index."""
    return [
        operation
        for declaring in cls.__mro__[: cls.__mro__.index(CNode)]
        for name, operation in vars(declaring).items()
        if not name.startswith("_") and callable(operation) and "self)" in operation.__nb_signature__[0][0]
    ]


ACCESSORS = {
    cls: Accessors(cls) for cls in vars(treesift).values() if isinstance(cls, type) and issubclass(cls, CNode)
}


def ReadNodes(trees: Trees) -> tuple[int, int]:
    """Ask every node all it can be asked; the numbers of nodes and of answers."""
    nodes = answers = 0
    pending = [tree for tree, _ in trees]
    while pending:
        node = pending.pop()
        nodes += 1
        for ask in ACCESSORS[type(node)]:
            try:
                ask(node)
            except TypeError:  # an ellipsis where an expression is declared
                continue
            answers += 1
        if node.fChildren is not None:
            pending += node.fChildren
    return nodes, answers


def ReadAstNodes(modules: list[ast.AST]) -> tuple[int, int]:
    """The same of `ast` nodes and their fields."""
    nodes = answers = 0
    pending = list(modules)
    while pending:
        node = pending.pop()
        nodes += 1
        for field in node._fields:
            value = getattr(node, field)
            answers += 1
            if isinstance(value, ast.AST):
                pending.append(value)
            elif isinstance(value, list):
                pending += [item for item in value if isinstance(item, ast.AST)]
    return nodes, answers


class CountingWalker(CNodeWalker):
    """Counts the nodes that the walker reads."""

    visits = 0

    def _VisitNode(self, node: CNode) -> None:
        self.visits += 1
        super()._VisitNode(node)


def Parsed(texts: list[str]) -> Iterator[tuple[CNode, CLogicalLine]]:
    parser = CPGenParserImpl(VERSION)
    for text in texts:
        for logical in GetLogicalsFromText(text):
            try:
                tree = parser.ParseToNode(logical, logical.fInAsyncDef)
            except ParseError:
                continue
            if tree is not None:
                yield tree, logical


def Walk(walker: CNodeWalker, trees: Trees) -> None:
    with redirect_stdout(io.StringIO()):  # where a walk tells of its limits
        for tree, logical in trees:
            walker.Walk(tree, logical)


def Show(name: str, objects: int, rates: list[tuple[float, float]]) -> None:
    ratios = [rate / peer_rate for rate, peer_rate in rates]
    print(
        f"{name:52} {objects:10,} {statistics.median(rate for rate, _ in rates):12,.0f}"
        f" {statistics.median(ratios):6.2f}  ({min(ratios):.2f} to {max(ratios):.2f})"
    )


def main() -> None:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--files", type=int, default=30)
    parser.add_argument("--rounds", type=int, default=5)
    options = parser.parse_args()
    texts = Corpus(options.files)
    modules: list[ast.AST] = [ast.parse(text) for text in texts]
    trees = list(Parsed(texts))
    counting, walker = CountingWalker(VERSION), CNodeWalker(VERSION)
    Walk(counting, trees)
    ast_nodes, ast_answers = ReadAstNodes(modules)
    nodes, answers = ReadNodes(trees)

    peer, ours, native = [], [], []
    for _ in range(options.rounds):
        peer.append(Time(lambda: ReadAstNodes(modules)))
        ours.append(Time(lambda: ReadNodes(trees)))
        for _, logical in trees:
            logical.ClearDerivedInfo()
        native.append(Time(lambda: Walk(walker, trees)))

    def Rates(count: int, times: list[float], peer_count: int) -> list[tuple[float, float]]:
        return [(count / t, peer_count / peer_t) for t, peer_t in zip(times, peer, strict=True)]

    print(f"{len(texts)} files; objects, objects a second, times the peer's rate")
    Show("ast nodes, from Python", ast_nodes, Rates(ast_nodes, peer, ast_nodes))
    Show("our nodes, from Python", nodes, Rates(nodes, ours, ast_nodes))
    Show("fields of ast nodes, from Python", ast_answers, Rates(ast_answers, peer, ast_answers))
    Show("answers of our nodes, from Python", answers, Rates(answers, ours, ast_answers))
    Show(
        "our nodes, by the native walker with its records",
        counting.visits,
        Rates(counting.visits, native, ast_nodes),
    )


if __name__ == "__main__":
    main()
