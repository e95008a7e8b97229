"""Host subclasses: overrides are honoured wherever native code calls an operation; super() is the base."""

import gc
import weakref
from types import SimpleNamespace

import pytest

from codeloom.logicalline import CLogicalLine, kAssignment, kComment
from codeloom.treesift import (
    CNameLiteral,
    CNode,
    CNodeFactory,
    CNodeWalker,
    CPGenAnalyzer,
    CPGenAnalyzerImpl,
    CPGenParserImpl,
)
from codeloom.utils import GetLogicalsFromText

VERSION = (3, 8, 0)


def Logical(text):
    (logical,) = GetLogicalsFromText(text)
    return logical


class RecordingWalker(CNodeWalker):
    def __init__(self):
        super().__init__(VERSION)
        self.visited = []

    def _VisitNode(self, node):
        self.visited.append(node.fText)
        return super()._VisitNode(node)


def test_every_level_of_a_recursion_calls_the_override_once():
    logical = Logical("(1, (2, 3)) < [-4]")
    tree = CPGenParserImpl(VERSION).ParseToNode(logical)
    walker = RecordingWalker()
    walker.Walk(tree, logical)

    def Texts(node):
        return [node.fText, *(text for child in node.fChildren or () for text in Texts(child))]

    assert walker.visited == Texts(tree)


def test_an_override_assigned_later_is_honoured():
    class Walker(RecordingWalker):
        pass

    walker, logical = Walker(), Logical("a + b")
    tree = CPGenParserImpl(VERSION).ParseToNode(logical)
    Walker._VisitChildren = lambda self, node: None
    walker.Walk(tree, logical)
    assert walker.visited == [None]
    del Walker._VisitChildren
    walker.Walk(tree, logical)
    assert walker.visited == [None, None, "a", "+", "b"]


def test_overrides_within_a_constructor():
    class Driver(CPGenParserImpl):
        def _BuildClsForStateList(self):
            self.built = super()._BuildClsForStateList()
            return self.built

    driver = Driver(VERSION)
    assert driver.built[1] is CNameLiteral and driver.built[-1] is None


def test_an_override_that_raises_within_a_constructor_leaves_a_harmless_object():
    kept = []

    class Driver(CPGenParserImpl):
        def _BuildClsForStateList(self):
            kept.append(self)
            raise KeyError("no classes")

    with pytest.raises(KeyError):
        Driver(VERSION)
    with pytest.raises(AttributeError):
        kept[0].ParseToNode(Logical("x"), False)


def test_a_subclass_without_the_base_constructor():
    class Driver(CPGenParserImpl):
        def __init__(self):
            pass

    with pytest.warns(RuntimeWarning, match="uninitialized"), pytest.raises(TypeError):
        Driver().ParseToNode(Logical("x"), False)


def test_the_driver_calls_its_overrides():
    calls, converted = [], []

    class Driver(CPGenParserImpl):
        def convert(self, grammar, type, value, context, children):
            converted.append(value)
            return super().convert(grammar, type, value, context, children)

        def ParseToksToNode(self, toks, in_async_def, positions):
            calls.append((toks, positions))
            return super().ParseToksToNode(toks, in_async_def, positions)

        def _ShouldSkipSlash(self, tok_i, positions):
            calls.append(("slash", tok_i, positions))
            return super()._ShouldSkipSlash(tok_i, positions)

    node = Driver(VERSION).ParseToNode(Logical("x = \\\n y"), False)
    assert [child.fText for child in node.fChildren] == ["x", "=", "y"]
    positions = ((0, 0), (0, 2), (0, 4), (1, 1))
    assert calls[0] == (("x", "=", "\\", "y"), positions)
    assert ("slash", 2, positions) in calls
    assert converted == ["x", "=", "y", None, "\n", None, None, None]


def test_what_an_override_returns():
    class Driver(CPGenParserImpl):
        def ParseToksToNode(self, toks, in_async_def, positions):
            return self.result()

    driver = Driver(VERSION)
    driver.result = str
    with pytest.raises(TypeError, match=r"^Driver\.ParseToksToNode must return CNode, not str$"):
        driver.ParseToNode(Logical("x"), False)
    driver.result = lambda: None
    assert driver.ParseToNode(Logical("x"), False) is None
    driver.result = CNode  # a new one, which nobody else holds
    assert type(driver.ParseToNode(Logical("x"), False)) is CNode


def test_host_node_classes_are_made_and_asked():
    class Name(CNameLiteral):
        pass

    class Driver(CPGenParserImpl):
        def _BuildClsForStateList(self):
            classes = super()._BuildClsForStateList()
            classes[1] = Name
            return classes

    node = Driver(VERSION).ParseToNode(Logical("x"), False)
    assert type(node) is Name and node.GetStateName() == "NAME"


def test_factory_overrides_reach_native_callers():
    class Factory(CNodeFactory):
        def NewNode(self, clsinfo, type, text, context, children):
            seen.append(text)
            return super().NewNode(clsinfo, type, text, context, children)

    seen = []
    factory = Factory(SimpleNamespace(number2symbol={}), [CNode, CNameLiteral], {"if": None}, {}, {"+": 0})
    factory.NewNameNode("a", 0)
    factory.NewKeywordNode("if", 0)
    factory.CreateOperatorNode("+", 0)
    factory.RecursiveConvert((1, "b", 0, None))
    assert seen == ["a", "if", "+", "b"]


def test_a_logical_of_the_host():
    class Logical(CLogicalLine):
        def ClearDerivedInfo(self):
            calls.append("clear")
            super().ClearDerivedInfo()

        def MarkParsed(self, parsed):
            calls.append(parsed)
            super().MarkParsed(parsed)

    calls = []
    logical = Logical(kAssignment, ("x", "=", "1"), ((0, 0), (0, 2), (0, 4)))
    assert CPGenAnalyzerImpl(VERSION).AnalyzeSingleLogical(logical, False) is None
    assert calls == [True, "clear"] and logical.fParsed


def test_a_host_analyzer():
    class Analyzer(CPGenAnalyzer):
        def AnalyzeSingleLogical(self, logical, in_async_def, first_in_def=False):
            return logical

    logical = CLogicalLine(kComment, (), ())
    assert Analyzer().AnalyzeSingleLogical(logical, True) is logical
    with pytest.raises(NotImplementedError):
        CPGenAnalyzer().AnalyzeSingleLogical(logical, True)


def test_everything_is_collected():
    class Driver(CPGenParserImpl):
        pass

    class Analyzer(CPGenAnalyzerImpl):
        pass

    analyzer, driver = Analyzer(VERSION), Driver(VERSION)
    analyzer.AnalyzeSingleLogical(Logical("x = f(1)"), False)
    driver.DiscardNode(driver.ParseToNode(Logical("x = f(1)"), False))
    analyzer.itself, driver.itself = analyzer, driver
    gone = []
    weakref.finalize(analyzer, gone.append, "analyzer")
    weakref.finalize(driver, gone.append, "driver")
    del analyzer, driver
    gc.collect()
    assert sorted(gone) == ["analyzer", "driver"]
