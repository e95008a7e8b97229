"""CTypeHintWalker: the hints recorded, the places of their faults, overrides, nodes that go back."""

import gc
import sysconfig
from contextlib import suppress
from pathlib import Path

import pytest
from hand_made import DRIVERS, Leaf, Node

from codeloom.false_hints import FalseHintRemover
from codeloom.logicalline import CLogicalLine, kComment
from codeloom.symbolinfo import kPrefixLen, kSetPrefix, kTypeHintPrefix
from codeloom.treesift import (
    CFuncdefStmt,
    CNode,
    CNodeFactory,
    CNodeWalker,
    CParametersNode,
    CPGenAnalyzerImpl,
    CTypeHintWalker,
    kPy3DefaultGrammar,
)
from codeloom.utils import GetLogicalsFromText

VERSION = (3, 8, 0)
WALKER = CTypeHintWalker(VERSION, kPy3DefaultGrammar, None)


def Logical(text, arg_names=()):
    (logical,) = GetLogicalsFromText(text)
    for name in arg_names:
        logical.AppendArgTypeEquiv(name.encode(), kSetPrefix)
    return logical


def Tree(logical, version="3.8"):
    if logical.fType == kComment:
        return None
    return DRIVERS[version].ParseToNode(logical, in_async_def=True)


def Hints(pairs):
    """The hints among records, a row for each."""
    return [
        f"{name.decode()}: {record[kPrefixLen:].decode()}"
        for name, record in pairs or ()
        if record.startswith(kTypeHintPrefix)
    ]


def Walked(text, arg_names=(), walker=WALKER, first_in_def=False, version="3.8"):
    """The hints of names and those of arguments."""
    logical = Logical(text, arg_names.split() if arg_names else ())
    walker.Walk(Tree(logical, version), logical, first_in_def)
    return Hints(logical.fTypeEquivs), Hints(logical.fArgTypeEquivs)


@pytest.mark.parametrize(
    ("text", "hints"),
    [
        ("x: int", ["x: int"]),
        ("x: 'Foo' = 1", ["x: Foo"]),
        ("(x): List[ int,str ] = y", ["x: List[int, str]"]),
        ("self.a.b: a.b | None", ["self.a.b: a.b | None"]),
        ("x[0]: int = 1", ["x: int"]),
        ("x: Literal['a b', 'c-d']", ["x: Literal['a b', '']"]),
        ("if a: x: int = 1", ["x: int"]),
        ("x: int = 1  # type: str", ["x: int"]),  # the node of an annotation counts no `=`
        ("x = 1  # type: int", ["x: int"]),
        ("x = y = 1  # type: int", ["x: int"]),
        ("x = 1  #type:int # why", ["x: int"]),
        ("x = 1  ## type: 'a b'", ["x: a b"]),
        ("x = 1  # note type: int", []),
        ("x = 1  # type:ignore", []),
        ("x = 1  # type: ignore # why", []),
        ("x = 1  # type: ignore[a]", ["x: ignore[a]"]),
        ("x = 1  # type:", []),
        ("x = 1  # type: a; b", []),  # two lines are no hint
        ("x = 1  # type: pass", ["x: pass"]),
        ("x = [  # type: int\n  1]", []),  # the comment stands on another row than the end
        ("x = [1,\n  2]  # type: int", ["x: int"]),
        ("x = '''\n\n'''  # type: int", ["x: int"]),
        ("x = a + \\\n  b  # type: int", ["x: int"]),
        ("x += 1  # type: int", []),
        ("x  # type: int", []),
        ("a, b = f()  # type: int, str", ["a: int", "b: str"]),
        ("a, b = f()  # type: int", []),
        ("a, b, c = f()  # type: int, str", ["a: int", "b: str"]),
        ("a, b = f()  # type: int, str, c", ["a: int", "b: str"]),
        ("(a, [b, c.d]), e = f()  # type: (x, (y, z)), w", ["a: x", "b: y", "c.d: z", "e: w"]),
        ("a, *b = f()  # type: int, str", ["a: int"]),
        ("for i in x:  # type: int", ["i: int"]),
        ("async for i, j in x:  # type: int, str", ["i: int", "j: str"]),
        ("for i in x: y: int = 1", []),
        ("with a as b, c as d:  # type: int", ["b: int", "d: int"]),
        ("with (a as b, c,\n d as (e, f)):  # type: int, str", ["b: int, str", "e: int", "f: str"]),
        ("return x  # type: int", []),
    ],
)
def test_hints_of_names(text, hints):
    assert Walked(text) == (hints, [])


@pytest.mark.parametrize(
    ("text", "arg_names", "hints"),
    [
        ("def f(a: int, *b: 'B c', c: C[1] = 3, **d) -> None: pass", "", ["a: int", "b: B c", "c: C[1]",
                                                                       "return: None"]),
        ("async def f(a) -> 'x': pass", "", ["return: x"]),
        ("def f[T](a: T): pass", "", ["a: T"]),
        ("def f(a): x: int = 1", "", []),
        ("def f(a, b):  # type: (int, Dict[str, int]) -> str", "a b",
         ["a: int", "b: Dict[str, int]", "return: str"]),
        ("def f(a, b):  # type: (...) -> int", "a b", ["return: int"]),
        ("def f(a, b):  # type: (int, str)", "a b", ["a: int", "b: str"]),
        ("def f(a):  # type: ([int], List[str,]) -> T[()]", "a",
         ["a: [int]", ":a:1: List[str,]", "return: T[( )]"]),
        ("def f(a):  # type: () -> int", "", ["return: int"]),
        ("def f(\n  a, b\n):  # type: (int, int) -> int", "a b", ["a: int", "b: int", "return: int"]),
        ("def f(a):\\\n  # type: (int) -> int", "a", ["a: int", "return: int"]),
        # A comment for each argument.
        ("def f(a,  # type: int\n  b=(1),  # type: str\n  *c,  # type: d\n): pass", "",
         ["a: int", "b: str", "c: d"]),
        ("def f(a  # type: int\n): pass", "", ["a: int"]),
        ("def f(a: int,  # type: str\n b=2  # type: (b)\n): pass", "", ["a: int", "b: b"]),
        ("def f(a,\n  # type: int\n b): pass", "", ["a: int"]),
        ("def f(a,  # type: int\n b):  # type: str", "", ["a: int", "b: str"]),
        ("def f(a,  # type: int\n b):  # type: (...) -> str", "", ["a: int", "return: str"]),
        ("def f(*, a,  # type: int\n b): pass", "", ["a: int"]),
    ],
)  # fmt: skip
def test_hints_of_arguments(text, arg_names, hints):
    assert Walked(text, arg_names) == ([], hints)


def test_a_tuple_of_parameters_is_passed_over():
    text = "def f(a, (b, c), d):  # type: (int, str) -> e"
    assert Walked(text, "a b c d", version="2.7") == ([], ["a: int", "b: str", "return: e"])


def test_a_comment_of_its_own_row_counts_first_in_a_def():
    comment = "# type: (int, *str) -> bool".replace("*", "")
    assert Walked(comment, first_in_def=True) == ([":a:0: int", ":a:1: str", "return: bool"], [])
    assert Walked(comment) == Walked("# note type: int", first_in_def=True) == ([], [])


def test_a_def_without_records_of_its_arguments_fails():
    with pytest.raises(TypeError, match="no records of its arguments"):
        Walked("def f(a):  # type: (int) -> str")
    assert Walked("def f():  # type: (...) -> str") == ([], ["return: str"])


@pytest.mark.parametrize(
    ("text", "place"),
    [
        ("x = 1  # type: List[", (1, 20)),  # at the end: the last token
        ("x = 1  # type: a b", (1, 18)),
        ("é = 1  #\té type: 1", None),
        ("é = 'é'  #\ttype:\t'é' é", (1, 25)),
        ("x = (1 + \\\n  2)  # type: List[a b]", (2, 22)),
        ("é = \\\n  é  # type: é é", (2, 18)),
        ("with a as b: pass  # type: )", (1, 28)),
        ("def f(a):  # type: (int] -> str", (1, 24)),
        ("def f(é):  # type: (é, List[é é]) -> str", (1, 34)),
        ("def f(a):  # type: (int", (1, 24)),
        ("def f(a):  # type: int", (1, 20)),
        ("def f(a):  # type: (*int) -> str", (1, 21)),
        ("def f(a):  # type: () -> ", (1, 25)),
        ("def f(a,  # type: int\n  b,\n\té,  # type: s[\n): pass", (3, 16)),
        ("def f(\n  é, b=[\n\t'é'],  # type: é é\n): pass", (3, 21)),
    ],
)
def test_places_of_faults(text, place):
    """Rows and columns in UTF-8 bytes, both from 1."""
    if place is None:
        assert Walked(text) == ([], [])
        return
    with pytest.raises(SyntaxError) as caught:
        Walked(text)
    assert (caught.value.lineno, caught.value.offset, caught.value.msg) == (*place, "invalid syntax")
    assert Walked("x = 1  # type: int") == (["x: int"], [])


def test_a_fault_on_the_first_row_of_a_def():
    logical = Logical("  # type: (int, a b) -> str")
    error = CPGenAnalyzerImpl(VERSION).AnalyzeSingleLogical(logical, False, True)
    assert (error.lineno, error.offset) == (1, 19)


@pytest.mark.parametrize(
    ("hint", "tokens", "offsets"),
    [
        (" (int, c) -> b", "def function ( a : int , a : c ) -> b :", "-13 -9 1 2 2 2 5 7 7 7 8 10 13 14"),
        ("(...) -> b", "def function ( ) -> b :", "-13 -9 0 4 6 9 10"),
        ("(..., c)", "def function ( , a : c ) :", "-13 -9 0 4 6 6 6 7 8"),
        ("([é], {1, 2}, *é)", "def function ( a : [ é ] , a : { 1 , 2 } , a : * é ) :", None),
        ("(a) -> (b, c)", "def function ( a : a ) -> ( a : b , a : c ) :", None),
        ("((a, b), c)", "def function ( ( a , b ) , a : c ) :", None),
        ("", "def function :", "-13 -9 0"),
    ],
)  # fmt: skip
def test_rewriting(hint, tokens, offsets):
    toks, utf8_offsets = WALKER._RewriteFuncdefCommentHint(hint)
    assert " ".join(toks) == tokens and len(utf8_offsets) == len(toks)
    assert offsets is None or utf8_offsets == [int(offset) for offset in offsets.split()]


def test_a_hint_keeps_the_offsets_of_its_comment():
    for comment, hint in [
        ("# type: int  # why", " " * 8 + "int"),
        ("#\xa0type:\xa0\u3000é ", " " * 8 + "\xa0\u3000é"),
        ("# type:", ""),
        ("# type: ignore", None),
        ("# type: ignored", " " * 8 + "ignored"),
        ("# é type: int", None),
        ("int", None),
    ]:
        assert WALKER._GetHintFromComment(comment) == hint


def test_dotted_names_as_hosts_know_them():
    names = [b"", b"a", b"a1", b"a.b", b"a_b", b"_", b"1a", "é".encode()]
    assert [WALKER._IsDottedName(name) for name in names] == [True] * 3 + [False] * 5


def test_rows():
    for text, row_range in [("x = 1", (0, 1)), ("x = '''\n\n'''", (0, 3)), ("f(\n\n a,\n)", (0, 4))]:
        logical = Logical(text)
        ranges = []

        class Walker(CTypeHintWalker):
            def _VisitNode(self, node, ranges=ranges):
                ranges.append(self._GetRowRange(node))

        Walker(VERSION, kPy3DefaultGrammar, None).Walk(Tree(logical), logical, False)
        assert ranges == [row_range]


# Names that hints use


def test_the_general_walker_gets_the_hints_of_comments():
    class General(CNodeWalker):
        def Walk(self, node, logical):
            texts.append((WALKER._fHintConv.TextForNode(node), logical))

    walker = CTypeHintWalker(VERSION, kPy3DefaultGrammar, General(VERSION))
    for text, expected in [
        ("x: a = 1", []),
        ("a, b = f()  # type: c, d", [b"c, d"]),
        ("def f(a, b):  # type: (c, d) -> e", [b"c", b"d", b"e"]),
        ("def f(a,  # type: c\n b): pass", [b"c"]),
    ]:
        texts = []
        logical = Logical(text, ["a", "b"])
        walker.Walk(Tree(logical), logical, False)
        assert texts == [(text, logical) for text in expected]


# Overrides

LINES = [
    ("def f(a: x,  # type: y\n b,  # type: int\n):  # type: (...) -> c", "a b"),
    ("def f(a, b=1):  # type: (int, str) -> c", "a b"),
    ("for i in x:  # type: int", ""),
    ("with a as b:  # type: int", ""),
    ("a, b = 1  # type: int, str", ""),
    ("x: a.b = 1", ""),
    ("f(a)[b]", ""),
]
OPERATIONS = [
    "Walk", "_VisitNode", "_VisitFuncdefStmt", "_RewriteFuncdefCommentHint", "_ProcessFuncdefComment",
    "_ProcessArgSpecificComment", "_VisitForStmt", "_VisitWithStmt", "_VisitExprStmt", "_ProcessTarget",
    "_ProcessNameAndHintNodes", "_FindEndingTypeComment", "_GetHintFromComment", "_GetRowRange",
    "_FindComment", "_GetHintInfoStr", "_AddSymInfo", "_ParseHint", "_RaiseHintSyntaxError",
    "_ParseFuncdefCommentHint",
]  # fmt: skip


def Overriding(operation, override):
    cls = type("Walker", (CTypeHintWalker,), {operation: override})
    return cls(VERSION, kPy3DefaultGrammar, CNodeWalker(VERSION))


@pytest.mark.parametrize("operation", OPERATIONS)
def test_an_override_is_called_and_may_leave_all_to_its_base(operation):
    calls = []

    def Override(self, *args):
        calls.append(args)
        return getattr(super(type(self), self), operation)(*args)

    walker = Overriding(operation, Override)
    assert [Walked(*line, walker) for line in LINES] == [Walked(*line) for line in LINES]
    with pytest.raises(SyntaxError):
        Walked("x = 1  # type: a b", walker=walker)
    assert calls


@pytest.mark.parametrize(
    "result", [None, 7, "x", (), (1, 2), ([], []), CNode(None), Leaf(), object()], ids=repr
)
@pytest.mark.parametrize("operation", OPERATIONS)
def test_an_override_may_give_anything(operation, result):
    walker = Overriding(operation, lambda self, *args: result)
    for text, arg_names in [*LINES, ("x = 1  # type: a b", ""), ("def f():  # type: )", "")]:
        with suppress(TypeError, ValueError, AttributeError, IndexError, SyntaxError):
            Walked(text, arg_names, walker)
        assert walker._fLogical is None and walker._fCommentHintCount == 0


def test_a_visit_that_wants_the_children_gets_them():
    def Override(self, node):
        super(type(self), self)._VisitForStmt(node)
        return "yes"

    text = "for i in x: y: int = 1  # type: str"
    assert Walked(text) == (["i: str"], [])
    assert Walked(text, walker=Overriding("_VisitForStmt", Override)) == (["i: str", "y: int"], [])


def test_a_change_of_the_dictionary_is_honoured():
    walker = CTypeHintWalker(VERSION, kPy3DefaultGrammar, None)
    visits = walker._fDispatchDict
    visit = visits[CFuncdefStmt]
    visits[CFuncdefStmt] = False
    assert Walked("def f(a: int): pass", walker=walker) == ([], [])
    visits[CFuncdefStmt] = lambda walker, node: visit(walker, node)
    assert Walked("def f(a: int): pass", walker=walker) == ([], ["a: int"])
    with pytest.raises(TypeError):
        visit(walker, Leaf())


def test_a_second_walk_is_refused_and_the_first_goes_on():
    def Override(self, node):
        for other in (Logical("x = 1  # type: a"), Logical("# type: (a) -> b")):
            with pytest.raises(ValueError, match="Only one logical"):
                self.Walk(Tree(other), other, True)
        return super(type(self), self)._VisitExprStmt(node)

    assert Walked("x = 1  # type: int", walker=Overriding("_VisitExprStmt", Override)) == (["x: int"], [])


@pytest.mark.parametrize(
    "call",
    [
        lambda: CTypeHintWalker(VERSION, kPy3DefaultGrammar, 7),
        lambda: CTypeHintWalker(VERSION, None, None),
        lambda: WALKER.Walk(None, None, False),
        lambda: WALKER._ProcessArgSpecificComment(Leaf()),
        lambda: WALKER._VisitExprStmt(Leaf()),
        lambda: WALKER._AddSymInfo(b"x", None, False),
        lambda: WALKER._AddSymInfo(b"x", b"y", False),  # between walks
        lambda: WALKER._ParseHint("a b", 0, True),
        lambda: WALKER._GetRowRange(Leaf("x")),
        lambda: WALKER._FindComment(0),
        lambda: WALKER._FindComment(0, CLogicalLine(kComment, ("#",), ((0,),), 0, (), (202,)))
        and WALKER._FindComment(0, CLogicalLine(kComment, ("#",), (7,), 0, (), (202,))),
        lambda: WALKER._VisitFuncdefStmt(Node(CFuncdefStmt, Leaf(), Leaf(), Leaf())),
        lambda: WALKER._VisitFuncdefStmt(Node(CFuncdefStmt, Leaf(), Leaf(), Node(CParametersNode, Leaf()))),
    ],
)  # fmt: skip
def test_odd_arguments(call):
    with pytest.raises((TypeError, AttributeError, IndexError, AssertionError)):
        call()


def test_logicals_made_by_hand():
    toks = ("x", "=", None, "1", "# type: int")
    logical = CLogicalLine("assignment", toks, tuple((0, 2 * i) for i in range(5)))
    WALKER.Walk(DRIVERS["3.8"].ParseToNode(logical), logical, False)
    assert Hints(logical.fTypeEquivs) == ["x: int"]


# Nodes go back


def FreeNodes(parser):
    """The ids of all nodes on the free lists of a parser."""
    (factory,) = [held for held in gc.get_referents(parser) if isinstance(held, CNodeFactory)]
    nodes = []
    for info in {
        *factory._fClassInfoList,
        *(x for x in gc.get_referents(factory) if hasattr(x, "fFirstFree")),
    }:
        node = info.fFirstFree
        while node is not None:
            nodes.append(id(node))
            node = node.fNextFree
    assert len(set(nodes)) == len(nodes)
    return nodes


class Failing(CTypeHintWalker):
    """Its operations, and its walker for names, fail when they are told to."""

    failing = None

    def __init__(self):
        super().__init__(VERSION, kPy3DefaultGrammar, FailingGeneral(VERSION))

    def _ProcessNameAndHintNodes(self, name_node, hint_node, is_arg=False):
        self._Fail("pairing")
        super()._ProcessNameAndHintNodes(name_node, hint_node, is_arg)

    def _AddSymInfo(self, name, istr, is_arg):
        self._Fail("recording")
        super()._AddSymInfo(name, istr, is_arg)

    @classmethod
    def _Fail(cls, road):
        if cls.failing == road:
            raise KeyError


class FailingGeneral(CNodeWalker):
    def Walk(self, node, logical):
        Failing._Fail("names")
        super().Walk(node, logical)


@pytest.mark.parametrize("road", ["pairing", "recording", "names"])
def test_hint_nodes_go_back_on_every_road(road, monkeypatch):
    walker = Failing()
    for line in LINES:
        Walked(*line, walker)
    free = FreeNodes(walker._fHintParser)
    monkeypatch.setattr(Failing, "failing", road)
    for line in LINES[:1] + LINES[2:5]:
        with pytest.raises(KeyError):
            Walked(*line, walker)
    assert len(free) > 20 and set(FreeNodes(walker._fHintParser)) == set(free)


def test_the_hint_parser_makes_no_nodes_in_a_second_run_over_the_library():
    analyzer = CPGenAnalyzerImpl(VERSION)
    parser = analyzer._fTypeHintWalker._fHintParser
    free = []
    for _ in range(2):
        for text in TextsWithHints():
            false_hints = FalseHintRemover(text)
            for logical in GetLogicalsFromText(text):
                analyzed = false_hints.Without(logical) or logical
                error = analyzer.AnalyzeSingleLogical(analyzed, logical.fInAsyncDef, logical.fFirstInDef)
                assert error is None or "type:" not in error.text
        free.append(set(FreeNodes(parser)))
    assert len(free[0]) > 20 and free[0] == free[1]


def TextsWithHints():
    """The files of the interpreter's library that have hints in comments."""
    for path in sorted(Path(sysconfig.get_path("stdlib")).rglob("*.py")):
        if "site-packages" not in path.parts and b"# type: " in (data := path.read_bytes()):
            yield data.decode()
