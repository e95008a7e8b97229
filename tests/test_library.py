"""Whole files of the interpreter's own library: nothing sound is refused, and nodes are reused."""

import ast
import gc
import random
import sysconfig
import warnings
from contextlib import redirect_stdout
from io import StringIO
from pathlib import Path

import pytest

from codeloom import treesift
from codeloom.logicalinspect import TextFromTokens
from codeloom.treesift import CNode, CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

# The forms newer than the grammar file that the library and its tests use.
NEWER_FORMS = {
    "walrus in a subscript": lambda node: (
        isinstance(node, ast.Subscript)
        and any(isinstance(part, ast.NamedExpr) for part in _Parts(node.slice))
    ),
    "starred in a subscript": lambda node: (
        isinstance(node, ast.Subscript) and any(isinstance(part, ast.Starred) for part in _Parts(node.slice))
    ),
    "starred annotation of *args": lambda node: (
        isinstance(node, ast.arg) and isinstance(node.annotation, ast.Starred)
    ),
    "walrus in a set": lambda node: (
        isinstance(node, ast.Set) and any(isinstance(part, ast.NamedExpr) for part in node.elts)
    ),
    "starred in the iterable of a for": lambda node: (
        isinstance(node, ast.For) and any(isinstance(part, ast.Starred) for part in _Parts(node.iter))
    ),
}

# Lines that the engine parses by hand, with nodes of their own, or can't parse yet.
HAND_PARSED = {"match", "case", "type", "@"}


def _Parts(node):
    return node.elts if isinstance(node, ast.Tuple) else [node]


def LibraryTexts(count=None, seed=None):
    """(path, text, tree) of the library's files that the interpreter accepts; `count` random ones."""
    library = Path(sysconfig.get_path("stdlib"))
    paths = [path for path in sorted(library.rglob("*.py")) if "site-packages" not in path.parts]
    if count is not None:
        paths = random.Random(seed).sample(paths, count)
    for path in paths:
        try:
            text = path.read_text("utf-8")
            with warnings.catch_warnings():
                warnings.simplefilter("ignore")
                yield path, text, ast.parse(text)
        except (SyntaxError, ValueError):
            continue


def IsExpected(error, logical, tree):
    """True when a line is refused for a form that is newer than the grammar, or for a hint in prose."""
    if error.msg == "invalid syntax in stringified type hint":
        return not _Compiles(error.text)
    first = logical.fFirstLine + 1
    rows = range(first, first + TextFromTokens(logical).count("\n") + 1)
    if logical.fToks[0] == "@":
        return True  # only names and calls of names are decorators of the grammar
    if logical.fToks[0] == "case":
        return logical.fToks[1:3] == ("(", ")") or "," in logical.fToks  # empty and open sequences
    return any(
        getattr(node, "lineno", 0) in rows and any(test(node) for test in NEWER_FORMS.values())
        for node in ast.walk(tree)
    )


def _Compiles(hint):
    try:
        ast.parse(f"({hint}\n)", mode="eval")
    except SyntaxError:
        return False
    return True


def Analyze(analyzer, logicals):
    with redirect_stdout(StringIO()):
        for logical in logicals:
            yield logical, analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)


@pytest.fixture
def no_swallowing(monkeypatch):
    swallowed = []
    monkeypatch.setattr(
        treesift.reflect, "ReportCurrentException", lambda **_: swallowed.append(True), raising=True
    )
    yield
    assert not swallowed


@pytest.mark.parametrize(
    "count", [pytest.param(120, id="sample"), pytest.param(None, id="all", marks=pytest.mark.slow)]
)
def test_no_sound_line_is_refused(count, no_swallowing):
    seed = random.randrange(1 << 30)
    analyzer = CPGenAnalyzerImpl((3, 11, 0))
    refused = [
        (seed, str(path), logical.fFirstLine + error.lineno, error.text)
        for path, text, tree in LibraryTexts(count, seed)
        for logical, error in Analyze(analyzer, GetLogicalsFromText(text))
        if error is not None and not IsExpected(error, logical, tree)
    ]
    assert not refused


def test_a_second_pass_makes_no_nodes():
    analyzer = CPGenAnalyzerImpl((3, 11, 0))
    texts = [text for _, text, _ in LibraryTexts(40, 1)]

    def Pass():
        for text in texts:
            # Lines that fail leave their nodes to the collector; pseudo nodes are made anew.
            lines = [logical for logical in GetLogicalsFromText(text) if logical.fToks[0] not in HAND_PARSED]
            assert all(error is None for _, error in Analyze(analyzer, lines))

    def NodeCount():
        gc.collect()
        return sum(isinstance(thing, CNode) for thing in gc.get_objects())

    Pass()
    before = NodeCount()
    identities = {id(thing) for thing in gc.get_objects() if isinstance(thing, CNode)}
    Pass()
    assert NodeCount() == before
    assert {id(thing) for thing in gc.get_objects() if isinstance(thing, CNode)} == identities
