"""Lines of great depth and length, read in a thread with a small stack."""

import sys

import pytest

from codeloom.treesift import (
    CMatchCaseStatementParser,
    CNodeToTextConverterImpl,
    CPGenAnalyzerImpl,
    CPGenParserImpl,
)
from codeloom.utils import GetLogicalsFromText

VERSION = (3, 12, 0)
DEPTH = 10_000
ANALYZER = CPGenAnalyzerImpl(VERSION)
DRIVER = CPGenParserImpl(VERSION)


def Analyze(text):
    return [
        error
        for logical in GetLogicalsFromText(text)
        if (error := ANALYZER.AnalyzeSingleLogical(logical, False, False)) is not None
    ]


# Head, what opens a level, the middle, what closes it, tail.
@pytest.mark.parametrize(
    "head, open_, middle, close, tail",
    [
        ("v = ", "([{", "x", "}])", ""),
        ("v = ", "f(", "x", ")", ""),
        ("v = ", "a[", "x", "]", ""),
        ("v = ", "- ", "x", "", ""),
        ("v = ", "not ", "x", "", ""),
        ("v = ", "lambda a=", "x", ": x", ""),
        ("v = ", "a if b else ", "c", "", ""),
        ("v = ", "x ** ", "x", "", ""),
        ("v = ", "[x for x in ", "y", "]", ""),
        ("v = a" + ".b" * 1000, "", "", "(0)", ""),
        ("v = ", "a + ", "a", "", ""),
        ("v = ", "v = ", "1", "", ""),
        ("f(", "a, ", "b", "", ")"),
        ("v = {", "1: 2, ", "", "", "}"),
        ("v = '", "s" * 100, "", "", "'"),
        ("v = f'", "{a:{b}}", "", "", "'"),
        ("v = f'{", "(", "x", ")", "}'"),
        ("case ", "(", "x", ")", ": pass"),
        ("case ", "[1, ", "x", "]", ": pass"),
        ("case ", "{1: ", "x", "}", ": pass"),
        ("case ", "a.A(x, b=", "x", ")", ": pass"),
        ("case ", "(1 | ", "x", " as y)", ": pass"),
        ("match ", "(", "x", ",)", ":"),
        ("def f[", "T: int, ", "", "", "](): pass"),
        ("def f[T: ", "a[", "x", "]", "](): pass"),
        ("@", "f(", "x", ")", ""),
        ("with (", "a as b, ", "c", "", "): pass"),
        ("v: '", "a[", "x", "]", "' = 1"),
        ("from a import ", "b as c, ", "d", "", ""),
    ],
)
def test_deep_and_long_lines(in_small_thread, capsys, head, open_, middle, close, tail):
    text = head + open_ * DEPTH + middle + close * DEPTH + tail
    assert in_small_thread(lambda: Analyze(text)) == []
    (error,) = in_small_thread(lambda: Analyze(text + " ?"))
    assert error.offset >= len(text) or text.endswith(": pass")  # places in a body count from its start
    printed = capsys.readouterr().out.splitlines()
    assert all(line.startswith(("RuntimeError raised", "depth too great")) for line in printed)


def test_nested_strings_need_no_stack(in_small_thread):
    def Fields(logicals):
        return sum(1 + Fields(logical.GetExpLogicals()) for logical in logicals) if logicals else 0

    for depth in (160, 161):
        text = "f'{" * depth + "x" + "}'" * depth
        assert Fields(in_small_thread(lambda text=text: GetLogicalsFromText(text), kib=64)) == 161


def test_recursion_ends_before_the_stack_does(in_small_thread):
    class Parser(CMatchCaseStatementParser):
        pass

    def DeepPattern():
        logical = GetLogicalsFromText("case " + "[" * DEPTH + "x" + "]" * DEPTH + ":")[0]
        return Parser(DRIVER).ParseCaseStmt(logical.fToks, logical.fPositions)

    def DeepText():
        (logical,) = GetLogicalsFromText("[" * DEPTH + "]" * DEPTH)
        return CNodeToTextConverterImpl(True, True, True).TextForNode(DRIVER.ParseToNode(logical, False))

    old_limit = sys.getrecursionlimit()
    try:
        sys.setrecursionlimit(1_000_000)
        for function in (DeepPattern, DeepText):
            with pytest.raises(RecursionError, match="stack is too small"):
                in_small_thread(function)
    finally:
        sys.setrecursionlimit(old_limit)
    with pytest.raises(RecursionError, match="maximum recursion depth"):
        DeepPattern()


def test_a_tree_is_dropped_without_recursion(in_small_thread):
    (logical,) = GetLogicalsFromText("(" * DEPTH + "x" + ")" * DEPTH)

    def LookAtAll(node):
        while node.fChildren is not None:
            node = node.fChildren[1]
        return node.fText

    def Drop(look):
        CPGenParserImpl(VERSION).ParseToNode(logical)
        return look(CPGenParserImpl(VERSION).ParseToNode(logical))

    assert in_small_thread(lambda: Drop(LookAtAll)) == "x"
    assert in_small_thread(lambda: Drop(lambda node: node.GetChildCount())) == 3
