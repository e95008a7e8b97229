"""CTypeHintWalker beyond the golden records: its parts, overrides, nodes that go back."""

import gc
import re
import sysconfig
from contextlib import suppress
from pathlib import Path

import pytest
from hand_made import DRIVERS, Leaf, Node

from codeloom.logicalline import CLogicalLine, kComment
from codeloom.symbolinfo import kPrefixLen, kSetPrefix, kTypeHintPrefix
from codeloom.treesift import (
    CFuncdefStmt,
    CNode,
    CNodeClassInfo,
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


def Logical(text, arg_names=""):
    (logical,) = GetLogicalsFromText(text)
    for name in arg_names.split():
        logical.AppendArgTypeEquiv(name.encode(), kSetPrefix)
    return logical


def Tree(logical):
    return None if logical.fType == kComment else DRIVERS["3.8"].ParseToNode(logical)


def Hints(pairs):
    """The hints among records, a row for each."""
    return [
        f"{name.decode()}: {record[kPrefixLen:].decode()}"
        for name, record in pairs or ()
        if record.startswith(kTypeHintPrefix)
    ]


def Walked(text, arg_names="", walker=WALKER):
    """The hints of names and those of arguments."""
    logical = Logical(text, arg_names)
    walker.Walk(Tree(logical), logical, False)
    return Hints(logical.fTypeEquivs), Hints(logical.fArgTypeEquivs)


def test_rewriting():
    for hint, tokens, offsets in [
        (" (int, c) -> b", "( a : int , a : c ) -> b :", "1 2 2 2 5 7 7 7 8 10 13 14"),
        ("(...) -> b", "( ) -> b :", "0 4 6 9 10"),
        ("(é, ..., *c)", "( a : é , a : ... , a : * c ) :", "0 1 1 1 3 5 5 5 8 10 10 10 11 12 13"),
        ("([a], {1, 2})", "( a : [ a ] , a : { 1 , 2 } ) :", "0 1 1 1 2 3 4 6 6 6 7 8 10 11 12 13"),
        ("(...,) -> (b)", "( , ) -> ( a : b ) :", "0 4 5 7 10 11 11 11 12 13"),
    ]:
        toks, utf8_offsets = WALKER._RewriteFuncdefCommentHint(hint)
        assert " ".join(toks) == f"def function {tokens}"
        assert " ".join(map(str, utf8_offsets)) == f"-13 -9 {offsets}"


def test_a_hint_keeps_the_offsets_of_its_comment():
    assert WALKER._GetHintFromComment("#\xa0type:\xa0\u3000é ") == " " * 8 + "\xa0\u3000é"
    assert WALKER._GetHintFromComment("# type: ignored") == " " * 8 + "ignored"


def test_dotted_names_as_hosts_know_them():
    names = [b"", b"a", b"a1", b"a.b", b"a_b", b"_", b"1a", "é".encode()]
    assert [WALKER._IsDottedName(name) for name in names] == [True] * 3 + [False] * 5


@pytest.mark.parametrize(
    ("text", "row_range"), [("x = 1", (0, 1)), ("x = '''\n\n'''", (0, 3)), ("f(\n\n a,\n)", (0, 4))]
)
def test_rows(text, row_range):
    ranges = []
    walker = Overriding("_VisitNode", lambda self, node: ranges.append(self._GetRowRange(node)))
    Walked(text, walker=walker)
    assert ranges == [row_range]


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
OPERATIONS = sorted(
    name
    for name in dir(CTypeHintWalker)
    if callable(getattr(CTypeHintWalker, name)) and not name.startswith("__")
    if name != "_IsDottedName"  # which nothing calls
)


def Overriding(operation, override):
    cls = type("Walker", (CTypeHintWalker,), {operation: override})
    return cls(VERSION, kPy3DefaultGrammar, type("General", (CNodeWalker,), {})(VERSION))


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
    "result", [None, 7, 2**70, "x", (), (1, 2), ([], []), CNode(None), Leaf(), object()], ids=repr
)
@pytest.mark.parametrize("operation", OPERATIONS)
def test_an_override_may_give_anything(operation, result):
    walker = Overriding(operation, lambda self, *args: result)
    for text, arg_names in [*LINES, ("x = 1  # type: a b", ""), ("def f():  # type: )", "")]:
        with suppress(TypeError, ValueError, AttributeError, IndexError, SyntaxError):
            Walked(text, arg_names, walker)
        assert walker._fLogical is None and walker._fCommentHintCount == 0


def test_a_result_of_a_wrong_kind_is_told_as_signatures_write_it():
    with pytest.raises(TypeError, match=r"_GetRowRange must return tuple\[int, int\], not int$"):
        Walked("x = 1  # type: int", walker=Overriding("_GetRowRange", lambda *_: 7))


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
        lambda: Walked("def f(a):  # type: (int) -> str"),  # no records of its arguments
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
    for info in {held for held in gc.get_referents(factory) if isinstance(held, CNodeClassInfo)}:
        node = info.fFirstFree
        while node is not None:
            nodes.append(id(node))
            node = node.fNextFree
    assert len(set(nodes)) == len(nodes)
    return nodes


@pytest.mark.parametrize("failing", ["_ProcessNameAndHintNodes", "_AddSymInfo", "Walk"])
def test_hint_nodes_go_back_on_every_road(failing):
    def Fail(*_):
        raise KeyError

    walker = Overriding("_IsDottedName", Fail)  # which nothing calls
    for line in LINES:
        Walked(*line, walker)
    free = FreeNodes(walker._fHintParser)
    failing_class = type(walker._fGeneralNodeWalker if failing == "Walk" else walker)
    setattr(failing_class, failing, Fail)
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
            for logical in GetLogicalsFromText(text):
                analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)
        free.append(set(FreeNodes(parser)))
    assert len(free[0]) > 20 and free[0] == free[1]


FAULTY_HINT = re.compile(rb"\bdef\b.*type: ignore\[")


def TextsWithHints():
    """The files of the interpreter's library that have hints in comments, all of them sound.

    The nodes of a hint with a fault are dropped, and `ignore[code]` is one on a `def`.
    """
    for path in sorted(Path(sysconfig.get_path("stdlib")).rglob("*.py")):
        data = path.read_bytes()
        if "site-packages" not in path.parts and b"# type: " in data and not FAULTY_HINT.search(data):
            yield data.decode()
