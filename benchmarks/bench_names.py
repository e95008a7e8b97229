"""The names of lines against what the interpreter's own parser makes of the same text.

Every figure is a ratio of two things timed in turn in one run on the same text. Run it with `make bench`.

    python benchmarks/bench_names.py [--files N] [--rounds N]
"""

import ast
import symtable

from measuring import LibraryWork, Options, Quietly, Ratio


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
    options = Options(__doc__, files=150, rounds=7)
    work = LibraryWork(options.files)
    print(f"{len(work.texts)} files; times faster than the peer, median (lowest to highest)")

    def ParseAndCollect() -> None:
        for text in work.texts:
            NameCollector().visit(ast.parse(text))

    def MakeSymbolTables() -> None:
        for text in work.texts:
            symtable.symtable(text, "<string>", "exec")

    from_logicals, from_text = Quietly(work.AnalyzePrepared), Quietly(work.AnalyzeTexts)
    for name, peer, ours in [
        ("prepared logicals to records, against ast.parse", work.Parse, from_logicals),
        ("  the same, against ast.parse and a visitor", ParseAndCollect, from_logicals),
        ("text to records, against ast.parse", work.Parse, from_text),
        ("  the same, against ast.parse and a visitor", ParseAndCollect, from_text),
        ("  the same, against symtable.symtable", MakeSymbolTables, from_text),
    ]:
        Ratio(name, peer, ours, options.rounds, before=work.Prepare)


if __name__ == "__main__":
    main()
