"""Whole files of the interpreter's own library: nothing sound is refused, and nodes are reused."""

import ast
import gc
import random
import sys
import warnings
from contextlib import redirect_stdout
from io import StringIO

import pytest
from library import library_files

from codeloom import treesift
from codeloom.logicalline import kComment
from codeloom.optpgen import ParseError
from codeloom.treesift import CExtendedAnalyzer, CNode, CPGenParserImpl
from codeloom.utils import GetLogicalsFromText

VERSION = (*sys.version_info[:2], 0)

# Lines that the engine parses by hand, with nodes of their own.
HAND_PARSED = {"match", "case", "type", "@"}


def LibraryTexts(count=None, seed=None):
    """(path, text, tree) of the library's files that the interpreter accepts; `count` random ones."""
    paths = library_files()
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


def IsExpected(error):
    """True when what looks like a hint isn't an expression: in quotes, or after `def ...:  # type:`."""
    if error.text.endswith("]") and "# type: ignore[" in error.text:
        return True
    return error.msg == "invalid syntax in stringified type hint" and not _Compiles(error.text)


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


SAMPLE_OR_ALL = pytest.mark.parametrize(
    "count", [pytest.param(60, id="sample"), pytest.param(None, id="all", marks=pytest.mark.slow)]
)


@SAMPLE_OR_ALL
def test_no_sound_line_is_refused(count, no_swallowing, seed):
    analyzer = CExtendedAnalyzer(VERSION)
    refused = [
        (seed, str(path), logical.fFirstLine + error.lineno, error.text)
        for path, text, _ in LibraryTexts(count, seed)
        for logical, error in Analyze(analyzer, GetLogicalsFromText(text))
        if error is not None and not IsExpected(error)
    ]
    assert not refused


def Shape(node):
    """What a walker sees of a tree, from the root down."""
    nodes = [node]
    while nodes:
        node = nodes.pop()
        children = node.fChildren
        yield type(node), node.fText, node.fContext, children and len(children)
        nodes += children or ()


@SAMPLE_OR_ALL
def test_the_newer_grammar_keeps_the_shape_of_every_tree(count, seed):
    older, extended = (CPGenParserImpl(VERSION, f"Python-Grammar-{version}") for version in ("3.8", "3.14"))
    for path, text, _ in LibraryTexts(count, seed):
        for logical in GetLogicalsFromText(text):
            try:
                tree = logical.fType != kComment and older.ParseToNode(logical, logical.fInAsyncDef)
            except ParseError:
                continue
            if tree:
                same = extended.ParseToNode(logical, logical.fInAsyncDef)
                assert list(Shape(tree)) == list(Shape(same)), (seed, path, logical.fFirstLine)
                older.DiscardNode(tree)
                extended.DiscardNode(same)


def test_a_second_pass_makes_no_nodes():
    analyzer = CExtendedAnalyzer(VERSION)
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
