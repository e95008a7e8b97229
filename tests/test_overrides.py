"""Host subclasses: overrides are honoured wherever native code calls an operation; super() is the base."""

import gc
import io
import random
import sys
import weakref
from contextlib import redirect_stdout, suppress
from types import SimpleNamespace

import pytest
from collecting import OnCollection
from hand_made import Leaf, Node
from odd_hosts import OddHost

from codeloom import treesift
from codeloom.logicalline import CLogicalLine, kAssignment, kComment
from codeloom.optpgen import ParseError
from codeloom.treesift import (
    CAtomExpr,
    CExceptClause,
    CMatchCaseStatementParser,
    CNameLiteral,
    CNode,
    CNodeFactory,
    CNodeToTextConverterImpl,
    CNodeWalker,
    CNumberLiteral,
    CPGenAnalyzer,
    CPGenAnalyzerImpl,
    CPGenParserImpl,
    CSingleUsedArgumentNode,
    CTestListStarExpr,
    CTrailer,
    GetUsedArgInfoList,
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


@pytest.mark.parametrize(
    ("cls", "arguments"),
    [
        (treesift.CPGenAnalyzer, ()),
        (treesift.CPGenAnalyzerImpl, ()),
        (treesift.CPGenParserImpl, ()),
        (treesift.CExtendedAnalyzer, (VERSION,)),
        (treesift.CExtendedParser, (VERSION,)),
        (treesift.CExtendedMatchCaseParser, (None,)),
        (treesift.CTypeHintWalker, (None,)),
        (treesift.CNodeToTextConverterImpl, ()),
        (CNameLiteral, ()),
    ],
)
def test_the_constructor_of_a_base_makes_no_derived_class(cls, arguments):
    base = cls.__base__

    class Derived(cls):
        def __init__(self):
            base.__init__(self, *arguments)

    for make in (Derived, lambda: base.__init__(cls.__new__(cls), *arguments)):
        with pytest.raises(TypeError, match=rf"^{base.__name__}\.__init__ can't make .*{cls.__name__}"):
            make()


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


EXTREMES = [sys.maxsize, -sys.maxsize - 1, 0]


@pytest.mark.parametrize("start", EXTREMES)
@pytest.mark.parametrize("end", EXTREMES)
def test_indexes_beyond_all_tokens(start, end):
    def Try(operation, *arguments):
        with suppress(IndexError, TypeError, ValueError, SyntaxError, ParseError):
            operation(*arguments)

    class Parser(treesift.CExtendedMatchCaseParser):
        def _ParseCaseStmtImpl(self):
            for kind in ("Pattern", "ClassPattern", "DottedNameValue", "NumberPattern", "SequencePattern"):
                Try(getattr(self, f"_NodeFor{kind}"), start, end)
            Try(self._NodeForMappingPattern, start, end)
            Try(self._NonNestedFindTokenIndex, ",", start, end)

    class Walker(treesift.CTypeHintWalker):
        def _GetRowRange(self, node):
            return start, end

    class Statement(treesift.CExprStmt):
        def GetEqualCount(self):
            return start

    driver = treesift.CExtendedParser(VERSION)
    logical = Logical("case [A(x), *y]:  # type: int")
    toks, places = logical.fToks, logical.fPositions
    Parser(driver).ParseCaseStmt(toks, places)
    Try(driver._NodesForTypeParameters, toks, False, places, start, end, True)
    Try(driver._CreateSingleTypeParameterNode, toks, False, places, start, end, True)
    Try(driver._NonNestedFindTokenIndex, ",", toks, start, end)
    for operation in ("ParenthesizedWith", "ExceptStar", "WithTypeParameter"):
        Try(getattr(driver, f"_ParseSpecialCase{operation}"), toks, False, places, start)
    Try(driver._FindNextNonSkipIndex, toks, start)
    Try(driver._ShouldSkipSlash, start, places)
    Try(logical.GetTokenType, start)
    Walker(VERSION, treesift.kPy3DefaultGrammar, None).Walk(
        Node(treesift.CForStmt, *map(Leaf, "ab")), logical, False
    )
    Try(CNodeWalker(VERSION)._VisitAssignment, Node(Statement, Leaf("a")))
    Try(treesift.CExtendedParser, (2**31 - 1, 2**31 - 1))


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


def Recording(base, *operations):
    """A subclass of `base`, and the list of those of its operations that are called."""
    calls = []

    def Override(name):
        def Operation(self, *arguments):
            calls.append(name)
            return getattr(base, name)(self, *arguments)

        return Operation

    return type(base.__name__, (base,), {name: Override(name) for name in operations}), calls


def Tree(source, **classes):
    """The tree of a line, with a host's node classes in place of those of the same name."""

    class Driver(CPGenParserImpl):
        def _BuildClsForStateList(self):
            return [classes.get(getattr(cls, "__name__", ""), cls) for cls in super()._BuildClsForStateList()]

    return Driver(VERSION).ParseToNode(Logical(source), False)


def test_parts_are_asked_for_in_order():
    chain, calls = Recording(CAtomExpr, "GetAtom", "GetTrailers")
    tree = Tree("a.b", CAtomExpr=chain)
    assert CNodeToTextConverterImpl().TextForNode(tree) == b"a.b"
    assert calls == ["GetAtom", "GetTrailers"]

    argument, calls = Recording(CSingleUsedArgumentNode, "GetPrefix", "GetName", "GetValue")
    tree = Tree("f(a, b=1)", CSingleUsedArgumentNode=argument)
    GetUsedArgInfoList(tree.GetTrailers()[0].GetNestedNode())
    assert calls == ["GetPrefix", "GetName", "GetValue"]

    items, calls = Recording(CTestListStarExpr, "GetSubExprCount")
    assert len(Tree("del a, b", CTestListStarExpr=items).GetExpressions()) == 2
    assert calls == ["GetSubExprCount"]


def test_names_reach_operations_as_the_texts_that_they_are():
    class Walker(CNodeWalker):
        def _AddTypeEquiv(self, name, equiv):
            names.append(name)

        def _AddNodeInfoStr(self, name_node, istr):
            names.append(istr)

    names = []
    walker = Walker(VERSION)
    for source in ("return 1", "(yield)", "yield 1", "from m import *", "except A as e: pass"):
        walker.Walk(Tree(source), Logical(source))
    assert names == ["return", "yield", "*", b"e", "A:", "A"]


def test_accessors_ask_the_overrides_of_what_they_read():
    class Trailer(CTrailer):
        def GetChildCount(self):
            return super().GetChildCount() + self.more

        def GetChildText(self, child_i):
            return self.texts.get(child_i) or super().GetChildText(child_i)

    Trailer.more, Trailer.texts = 0, {}
    dot, call = Tree("a.b(c)", CTrailer=Trailer).GetTrailers()
    assert dot.GetDotName() == "b" and call.GetNestedNode().fText == "c"
    Trailer.more = 1
    assert dot.GetDotName() is None and call.GetNestedNode() is None
    Trailer.more, Trailer.texts = 0, {0: "["}
    assert dot.GetDotName() is None and call.GetNestedNode().fText == "c"
    assert call.GetInitialToken() == "("  # the text of the child itself

    class Except(CExceptClause):
        def GetChild(self, child_i):
            asked.append(child_i)
            return super().GetChild(0)

        def GetChildCount(self):
            return 2**62

    asked = []
    clause = Tree("except A as b: pass", CExceptClause=Except).fChildren[3]
    assert clause.GetExceptionType().fText == "except" and clause.GetTarget() is None and asked == [1]


def test_each_of_adjacent_strings_is_converted():
    converter, calls = Recording(CNodeToTextConverterImpl, "_TextForStringLiteral")
    assert converter().TextForNode(Tree("b'a' 'b' 'c'")) == b"''"
    assert len(calls) == 3


@pytest.mark.parametrize(
    "pattern, order",
    [
        ("(a)", [2, 1, 3]),
        ("[a]", [1, 2, 3]),
        ("-1 + x", [1, 2, 3]),
        ("a.b.", [1, 2, 3]),
        ("a as b", [1, 2, 3]),
    ],
)
def test_tokens_of_a_pattern_are_made_in_order(pattern, order):
    class Parser(CMatchCaseStatementParser):
        def _TokNode(self, tok_i):
            made.append(tok_i)
            return super()._TokNode(tok_i)

    made = []
    logical = Logical(f"case {pattern}:")
    with suppress(ParseError):
        Parser(CPGenParserImpl(VERSION)).ParseCaseStmt(logical.fToks, logical.fPositions)
    assert made[:3] == order


class Undecided:
    def __bool__(self):
        raise ArithmeticError


def test_truth_values_stand_for_booleans():
    logical = Logical("async with a: pass")
    for py3_grammar in (0, None):
        analyzer = CPGenAnalyzerImpl(VERSION, "Python-Grammar-2.7", py3_grammar=py3_grammar)
        assert analyzer.ParseTokenListToNode(["x", "[", "...", "]"], None) is not None
    for analyzer in (CPGenAnalyzerImpl((3, 6)), CPGenParserImpl((3, 6))):
        assert analyzer.ParseToNode(logical, 1) is not None
        with pytest.raises(ParseError):
            analyzer.ParseToNode(logical, None)
        with pytest.raises(ArithmeticError):
            analyzer.ParseToNode(logical, Undecided())
    assert CNodeToTextConverterImpl(1).TextForNode(Tree("(a)"), discard_simple_parens=[]) == b"(a)"
    walker = CNodeWalker(VERSION)
    walker._fPy3 = 0
    assert walker._fPy3 is False
    with pytest.raises(ArithmeticError):
        walker._fPy3 = Undecided()


def test_truth_values_that_overrides_give():
    class Number(CNumberLiteral):
        def IsFloat(self):
            return self.answer

    tree = Tree("-1", CNumberLiteral=Number)
    walker = CNodeWalker(VERSION)
    for Number.answer, equiv in ((None, b":l:int: -1"), ("a", b":l:float: -1")):
        assert walker._TypeEquivForNode(tree) == equiv
    Number.answer = Undecided()
    with pytest.raises(ArithmeticError):
        walker._TypeEquivForNode(tree)


def test_no_tree_to_give_back():
    with pytest.raises(AttributeError, match="fClsInfo"):
        CPGenParserImpl(VERSION).DiscardNode(None)


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


@pytest.mark.parametrize("change", ["ClearDerivedInfo", "AppendTypeEquiv"])
def test_records_may_change_while_their_list_is_made(change):
    logical = Logical("x")
    for i in range(3000):
        logical.AppendTypeEquiv(b"%d" % i, b"y")
    arguments = (b"z", b"z") if change == "AppendTypeEquiv" else ()
    with OnCollection(lambda: getattr(logical, change)(*arguments)):
        records = logical.fTypeEquivs
    assert records[:3000] == [(b"%d" % i, b"y") for i in range(3000)]


def test_a_host_analyzer():
    class Analyzer(CPGenAnalyzer):
        def AnalyzeSingleLogical(self, logical, in_async_def, first_in_def=False):
            return logical

    logical = CLogicalLine(kComment, (), ())
    assert Analyzer().AnalyzeSingleLogical(logical, True) is logical
    with pytest.raises(NotImplementedError):
        CPGenAnalyzer().AnalyzeSingleLogical(logical, True)


def test_odd_hosts_get_exceptions_at_most(seed):
    odd_host = OddHost(random.Random(seed))
    text = "def f(a: int = -1, *b) -> c: pass\nx = [a.b(c)[1], *d]  # type: int\nfrom a import b as c"
    with redirect_stdout(io.StringIO()):
        for logical in GetLogicalsFromText(text) * 10:
            odd_host.Analyze(logical)
    assert CPGenAnalyzerImpl(VERSION).AnalyzeSingleLogical(Logical("x = f(1)"), False) is None


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
