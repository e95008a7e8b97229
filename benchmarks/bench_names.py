"""The names of lines against what the interpreter's own parser makes of the same text.

Every figure is a ratio of two things timed in turn in one run on the same text. Run it with `make bench`.

    python benchmarks/bench_names.py [--files N] [--rounds N]
"""

import argparse
import ast
import io
import statistics
import symtable
from collections.abc import Callable
from contextlib import redirect_stdout

from bench_analyze import Analyze, Corpus, Time

from codeloom.utils import GetLogicalsFromText


class NameCollector(ast.NodeVisitor):
    """Collects what the records tell of plain names: which are read, bound and called."""

    def __init__(self) -> None:
        self.read: set[str] = set()
        self.bound: set[str] = set()
        self.called: set[str] = set()

    def visit_Name(self, node: ast.Name) -> None:
        (self.bound if isinstance(node.ctx, ast.Store) else self.read).add(node.id)

    def visit_FunctionDef(self, node: ast.FunctionDef) -> None:
        self.bound.add(node.name)
        self.generic_visit(node)

    def visit_ClassDef(self, node: ast.ClassDef) -> None:
        self.bound.add(node.name)
        self.generic_visit(node)

    def visit_arg(self, node: ast.arg) -> None:
        self.bound.add(node.arg)
        self.generic_visit(node)

    def visit_alias(self, node: ast.alias) -> None:
        self.bound.add(node.asname or node.name)

    def visit_Call(self, node: ast.Call) -> None:
        if isinstance(node.func, ast.Name):
            self.called.add(node.func.id)
        self.generic_visit(node)


def main() -> None:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--files", type=int, default=150)
    parser.add_argument("--rounds", type=int, default=7)
    options = parser.parse_args()
    texts = Corpus(options.files)
    print(f"{len(texts)} files; times faster than the peer, median (lowest to highest)")

    def Parse() -> None:
        for text in texts:
            ast.parse(text)

    def ParseAndCollect() -> None:
        for text in texts:
            NameCollector().visit(ast.parse(text))

    def MakeSymbolTables() -> None:
        for text in texts:
            symtable.symtable(text, "<string>", "exec")

    def FromText() -> None:
        for text in texts:
            Analyze(GetLogicalsFromText(text))

    prepared = [GetLogicalsFromText(text) for text in texts]

    def Unmark() -> None:
        for logicals in prepared:
            for logical in logicals:
                logical.MarkParsed(False)
                logical.ClearDerivedInfo()

    def FromLogicals() -> None:
        for logicals in prepared:
            Analyze(logicals)

    def Ratio(name: str, peer: Callable[[], None], ours: Callable[[], None]) -> None:
        ratios = []
        for _ in range(options.rounds):
            Unmark()
            ratios.append(Time(peer) / Time(ours))
        print(f"{name:58} {statistics.median(ratios):6.2f}  ({min(ratios):.2f} to {max(ratios):.2f})")

    limits = io.StringIO()
    with redirect_stdout(limits):
        FromText()  # fills the free lists
    told = len(limits.getvalue().splitlines())
    print(f"{told} walks hit a limit in the whole of it")

    def Quietly(action: Callable[[], None]) -> Callable[[], None]:
        def Run() -> None:
            with redirect_stdout(limits):
                action()

        return Run

    from_logicals, from_text = Quietly(FromLogicals), Quietly(FromText)
    Ratio("prepared logicals to records, against ast.parse", Parse, from_logicals)
    Ratio("  the same, against ast.parse and a visitor", ParseAndCollect, from_logicals)
    Ratio("text to records, against ast.parse", Parse, from_text)
    Ratio("  the same, against ast.parse and a visitor", ParseAndCollect, from_text)
    Ratio("  the same, against symtable.symtable", MakeSymbolTables, from_text)


if __name__ == "__main__":
    main()
