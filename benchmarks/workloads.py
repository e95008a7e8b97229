"""What is measured: each workload takes the bytes of source files. Run one with

python benchmarks/workloads.py NAME FILE...
"""

import os
import sys
from collections.abc import Callable, Iterable
from pathlib import Path

Workload = Callable[[Iterable[bytes]], object]


def split(sources: Iterable[bytes]) -> None:
    """Texts into logical lines, as a host gets them."""
    from codeloom.utils import GetLogicalsFromText

    for source in sources:
        GetLogicalsFromText(source.decode())


def line_by_line(sources: Iterable[bytes]) -> None:
    """Each logical line analysed by a call of its own, as a host does it."""
    from codeloom.treesift import CExtendedAnalyzer
    from codeloom.utils import GetLogicalsFromText

    analyze = CExtendedAnalyzer((3, 14, 0)).AnalyzeSingleLogical
    for source in sources:
        for logical in GetLogicalsFromText(source.decode()):
            analyze(logical, logical.fInAsyncDef, logical.fFirstInDef)


def problems(sources: Iterable[bytes]) -> None:
    """What is wrong with texts."""
    from codeloom import analyze

    for source in sources:
        _ = analyze(source).problems


def records(sources: Iterable[bytes]) -> None:
    """What texts say of names, and where."""
    from codeloom import analyze

    for source in sources:
        _ = analyze(source).records


def occurrences(sources: Iterable[bytes]) -> None:
    """Every appearance of a name, with its role, its place and its scope."""
    from codeloom import analyze

    for source in sources:
        _ = analyze(source).occurrences


def objects(sources: Iterable[bytes]) -> None:
    """The same, each record an object whose name, kind and place are looked at."""
    from codeloom import analyze

    for source in sources:
        for record in analyze(source).records:
            _ = record.name, record.kind, record.range


def ast_parse(sources: Iterable[bytes]) -> None:
    """The interpreter's own parser."""
    import ast

    for source in sources:
        ast.parse(source)


def symbol_tables(sources: Iterable[bytes]) -> None:
    """The interpreter's own tables of names, which make no tree of objects."""
    import symtable

    for source in sources:
        symtable.symtable(source.decode(), "<string>", "exec")


def tree_sitter(sources: Iterable[bytes]) -> None:
    """A parser that recovers, made for editors."""
    import tree_sitter
    import tree_sitter_python

    parser = tree_sitter.Parser(tree_sitter.Language(tree_sitter_python.language()))
    for source in sources:
        parser.parse(source)


def parso(sources: Iterable[bytes]) -> None:
    """A parser that recovers, in Python."""
    from parso.grammar import load_grammar

    grammar = load_grammar()
    for source in sources:
        grammar.parse(source.decode())


def libcst(sources: Iterable[bytes]) -> None:
    """A concrete syntax tree for tools that rewrite."""
    import libcst

    for source in sources:
        libcst.parse_module(source)


OURS: dict[str, Workload] = {
    "split": split,
    "line by line": line_by_line,
    "problems": problems,
    "records": records,
    "occurrences": occurrences,
    "objects": objects,
}
PEERS: dict[str, Workload] = {
    "ast.parse": ast_parse,
    "symtable": symbol_tables,
    "tree-sitter": tree_sitter,
    "parso": parso,
    "libcst": libcst,
}

# Whole programs, with the files after their arguments.
COMMAND = [sys.executable, "-P", "-m", "codeloom", "check"]
RUFF = ["ruff", "check", "--select=E9", "--isolated", "--no-cache", "--quiet", "--exit-zero"]


def search_path() -> str:
    """Where programs are looked for: beside this interpreter first."""
    return f"{Path(sys.executable).parent}:{os.environ['PATH']}"


def read(paths: Iterable[str]) -> list[bytes]:
    """The bytes of files, with as little else as can be."""
    sources = []
    for path in paths:
        with open(path, "rb") as file:
            sources.append(file.read())
    return sources


if __name__ == "__main__":
    name, *paths = sys.argv[1:]
    (OURS | PEERS)[name](read(paths))
