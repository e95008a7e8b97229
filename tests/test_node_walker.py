"""CNodeWalker as a host sees it: its operations, its fields, its limits, and what odd hosts do to it.

What it records of which line is in the golden files of records/.
"""

import itertools
import re
import sys
from contextlib import suppress

import pytest
from hand_made import DRIVERS, Leaf, Node

from codeloom.records import FormatRecord, RecordsOfLogical
from codeloom.treesift import (
    CArgInfo,
    CAsName,
    CAtom,
    CAtomExpr,
    CClassArgumentPatternNode,
    CExprStmt,
    CFactorExpr,
    CForStmt,
    CImportNamesStmt,
    CNameLiteral,
    CNode,
    CNodeToTextConverterImpl,
    CNodeWalker,
    CNumberLiteral,
    COperatorExpression,
    CPower,
    CSingleUsedArgumentNode,
    CStringLiteral,
    CTrailer,
)
from codeloom.utils import GetLogicalsFromText

VERSION = (3, 11)

OPERATIONS = [name for name in vars(CNodeWalker) if re.match("Walk|_[A-Z]", name)]
FOR_HOSTS = {"_RaiseIfNotInstance", "_AppendSubscriptedEquivNode", "_TypeEquivForOperatorExpression"}

EVERY_KIND = """\
import a.b, c as d
from m import a as b, c
from m import *
global g
nonlocal n
@a.b(c)
def f(a: int, b=-1, *c, d: 'x' = {}, **e) -> bool: pass
def f[T: int, *Ts](a): pass
class C(a, b=c): pass
x = y[i].z = (a, [b, *c]), d = f(1, "s", *e)(k=v)
x: int = 2 ** y
x += not a or b.c < -d
for i, (j, k) in f(x): pass
with a as b, c(d) as e.f: pass
except (A, b.C) as e: pass
return a + 1, b
yield from a
if (n := 1) and f(m := 2) and isinstance(x, (A, B.C)): pass
[a for b in c if d for e in f]
lambda a, b=c: a
match a:
case A(b, c=1) | {"k": [d, *_]} if e: f
"""


def Analyzed(walker, text=EVERY_KIND):
    """The records of each line of a text."""
    logicals = GetLogicalsFromText(text)
    for logical in logicals:
        walker.Walk(DRIVERS["3.8"].ParseToNode(logical, in_async_def=True), logical)
    return [[FormatRecord(record) for record in RecordsOfLogical(logical)] for logical in logicals]


def Tree(text):
    (logical,) = GetLogicalsFromText(text)
    return DRIVERS["3.8"].ParseToNode(logical, in_async_def=True), logical


def test_every_operation_reaches_its_override_and_leaves_the_same_records():
    called = set()

    def Override(name):
        base = getattr(CNodeWalker, name)

        def Called(self, *arguments):
            called.add(name)
            return base(self, *arguments)

        return Called

    walker = type("Walker", (CNodeWalker,), {name: Override(name) for name in OPERATIONS})(VERSION)
    assert Analyzed(walker) == Analyzed(CNodeWalker(VERSION))
    assert called == set(OPERATIONS) - FOR_HOSTS


def test_fields():
    walker = CNodeWalker(VERSION)
    assert (walker._fIncludeExprText, walker._fIncludeOperatorExpressions) == (True, True)
    assert (walker._fMaxOperatorExpressionLength, walker._fPy3) == (120, True)
    assert isinstance(walker._fToText, CNodeToTextConverterImpl) and walker._fToText._fIncludeArgText
    assert [CNodeWalker(version)._fPy3 for version in ((2, 7, 18), (3,), (3, 0))] == [False, False, True]
    walker._fMaxOperatorExpressionLength = 1
    assert Analyzed(walker, "x = a + b")[0][1] == "expression x  a + b"
    with pytest.raises(AttributeError):
        walker._fToText = CNodeToTextConverterImpl()


@pytest.mark.parametrize(
    ("version", "types"),
    [
        ((3, 0), "int: float: str: bytes: str: bool: True"),
        ((2, 7), "int: float: str: bytes: unicode: bool: True"),
    ],
)
def test_literals_without_their_text(version, types):
    walker = CNodeWalker(version)
    walker._fIncludeExprText = False
    lines = Analyzed(walker, "x = 1; x = -1.5; x = 's'; x = b's'; x = u's'; x = True; x = [1]")
    assert " ".join(rows[1].removeprefix("literal x  ") for rows in lines) == f"{types} list: [1]"


# Limits


def test_a_walk_of_too_many_visits_spoils_no_other(capsys):
    most = "+".join(["a"] * 5000)  # the statement's node, the names, and 4999 operators
    lines = Analyzed(CNodeWalker(VERSION), f"{most}\n{most}()\ny = z")
    assert lines == [["get  a"], [], ["set  y", "is   y  z", "get  z"]]
    assert capsys.readouterr().out == (
        "RuntimeError raised in CNodeWalker.Walk: "
        "RuntimeError('Maximum number of calls to _VisitNode exceeded')\n"
    )


def test_a_walk_ends_without_a_standard_output_too(monkeypatch):
    monkeypatch.setattr(sys, "stdout", None)
    assert Analyzed(CNodeWalker(VERSION), "x = 1 if a else " + "[" * 50 + "]" * 50) == [["set  x"]]


def test_a_second_walk_is_refused_and_the_first_goes_on():
    class Walker(CNodeWalker):
        def _ProcessLoadName(self, name):
            for node in (Tree("a")[0], None):
                with pytest.raises(ValueError, match=r"^Only one logical may be walked at a time$"):
                    self.Walk(node, Tree("a")[1])
            super()._ProcessLoadName(name)

    assert Analyzed(Walker(VERSION), "a.b") == [["get  a", "get  a.b"]]


def test_an_error_leaves_the_walker_idle():
    walker = CNodeWalker(VERSION)
    node, logical = Tree("f(a, b for b in c)")
    with pytest.raises(SyntaxError, match=r"^Generator expression must be parenthesized") as caught:
        walker.Walk(node, logical)
    assert (caught.value.lineno, caught.value.offset) == (1, 6)
    assert Analyzed(walker, "d") == [["get  d"]]
    assert walker.Walk(None, logical) is None


def test_an_import_reads_nothing_whatever_was_noted():
    walker = CNodeWalker(VERSION)
    walker._ProcessLoadName("z")
    assert Analyzed(walker, "from a import b\nc") == [["set  b", "from b  a b"], ["get  c"]]


# For hosts


@pytest.mark.parametrize(
    ("text", "subscript", "records"),
    [
        ("b + c", 2, [b":s:", b":e:(b + c)[2]"]),
        ("b.c", -1, [b":s:", b"b.c[*]"]),
        ("f(x)", 0, [b":s:", b"f(x)[0]"]),
        ("[1]", 0, [b":s:"]),
        ("lambda: 0", 0, [b":s:"]),
        (None, 0, [b":s:"]),
    ],
)
def test_an_item_of_a_value(text, subscript, records):
    class Walker(CNodeWalker):
        def _VisitNode(self, node):
            value = None if text is None else Tree(text)[0]
            self._AppendSubscriptedEquivNode(Leaf("a[0]", cls=CNameLiteral), value, subscript)

    node, logical = Tree("x")
    Walker(VERSION).Walk(node, logical)
    assert logical.fTypeEquivs == [(b"a[0]", record) for record in records]


@pytest.mark.parametrize(
    ("text", "equiv"),
    [
        ("1 + x", b"1 + x"),
        ("'a' + f(x) * 2", b"'a' + :e:f(x) * 2"),
        ("not x", b"not x"),
        ("a < b is not c", b"a < b is not c"),
        ("a or (lambda: 0)", None),
        ("[b] + ''", b"[b] + ''"),
    ],
)
def test_operators_over_what_their_operands_stand_for(text, equiv):
    walker, node = CNodeWalker(VERSION), Tree(text)[0]
    assert walker._TypeEquivForOperatorExpression(node) == equiv
    walker._fIncludeOperatorExpressions = False
    assert walker._TypeEquivForOperatorExpression(node) is None


def test_classes_are_asked_for():
    walker = CNodeWalker(VERSION)
    assert walker._RaiseIfNotInstance(CAtom(), CNode) is None
    with pytest.raises(ValueError, match=r"^Node is not a <class '.*CAtom'>: <class '.*CNode'>: CNode$"):
        walker._RaiseIfNotInstance(CNode(), CAtom)
    with pytest.raises(AssertionError):
        walker._VisitNamedExpr(CAtom())


def test_without_a_line_nothing_is_recorded():
    walker = CNodeWalker(VERSION)
    assert walker._AddTypeEquiv("a", b"b") is None and walker._AddArgNameDefined(b"a") is None
    for name, equiv in [(None, b""), ("a", None), (1, b"")]:
        with pytest.raises(TypeError):
            walker._AddTypeEquiv(name, equiv)


@pytest.mark.parametrize("arguments", [[1], [()], [[None]], [CArgInfo(), (CArgInfo(),)]])
def test_an_argument_list_holds_arguments(arguments):
    walker = CNodeWalker(VERSION)
    for process in (walker._ProcessDefiningArgList, walker._ProcessLambdaDefiningArgList):
        assert process([CArgInfo(), [CArgInfo()]]) is None
        with pytest.raises(AssertionError):
            process(arguments)
    with pytest.raises((AttributeError, TypeError)):
        walker._ProcessFunctionCall(b"f", arguments)


# Odd hosts

HOST_ERRORS = (
    AssertionError,
    AttributeError,
    IndexError,
    RuntimeError,
    SyntaxError,
    TypeError,
    ValueError,
)

ODD = [
    None,
    1,
    "x",
    b"x",
    [],
    [None],
    [CTrailer()],
    CNode(),
    Leaf("a", cls=CNameLiteral),
    Node(CAtom, Leaf("(", cls=CNode)),
    Node(CExprStmt, Leaf("a", cls=CNameLiteral), Leaf("=", cls=CNode)),
    Node(CFactorExpr, Leaf("-", cls=CNode)),
    Node(COperatorExpression, Leaf("not", cls=CNode)),
    Node(CSingleUsedArgumentNode, Leaf("*", cls=CNode)),
    Node(CTrailer, Leaf("(", cls=CNode)),
    Leaf("", cls=CStringLiteral),
    *(Node(cls) for cls in CNode.__subclasses__()),
]


@pytest.mark.parametrize("name", OPERATIONS)
def test_odd_arguments_end_in_an_exception_at_most(name):
    operation = getattr(CNodeWalker(VERSION), name)
    for count in (1, 2, 3):
        for arguments in itertools.product(ODD, *([ODD[:6]] * (count - 1))):
            with suppress(*HOST_ERRORS):
                operation(*arguments)


def test_the_names_of_a_chain_made_by_hand():
    name, *attributes = (Leaf(text, cls=CNameLiteral) for text in "abc")
    trailers = [Node(CTrailer, Leaf("."), attribute) for attribute in attributes]
    walker = CNodeWalker(VERSION)
    walker._VisitNameLiteral(name, name, trailers, 9)  # beyond the end
    walker._VisitAtomPlusTrailers(Node(CAtom, Leaf("["), CNode(), Leaf("]")), trailers)  # without a text
    assert Analyzed(walker, "d") == [["get  a.b.c", "get  d"]]


def test_what_no_line_of_source_has():
    class Walker(CNodeWalker):
        def _VisitExprStmt(self, node):
            a, b, c, d, e = (Leaf(text, cls=CNameLiteral) for text in "abcde")
            self._VisitForStmt(Node(CForStmt, Leaf("for"), a, Leaf("in"), b, Leaf(":"), c, Leaf("else"), d))
            self._VisitPatternNode(Node(CClassArgumentPatternNode, e))
            self._AddNodeInfoStr(e, "")
            self._AddTypeEquiv("f", self._TypeEquivForNode(Node(CAtom, Leaf("["), Leaf("]")), b""))
            with pytest.raises(TypeError):
                self._TypeEquivForNode(Node(CAtom, CNode()), b"[0]")

    (records,) = Analyzed(Walker(VERSION), "x = 1")
    assert records == [
        "set  a",
        "is   a  b[*]",
        "set  e",
        "literal f  list: []",
        "get  b",
        "get  c",
        "get  d",
    ]


@pytest.mark.parametrize("cls", [CAtomExpr, CPower])
def test_a_chain_that_contains_itself(cls):
    node = Node(cls, None)
    node.fChildren[0] = node
    with pytest.raises(RecursionError):
        CNodeWalker(VERSION)._VisitCall(node, [], Leaf("x"))


def test_a_tree_that_changes_below_the_walk():
    class Walker(CNodeWalker):
        def _ProcessLoadName(self, name):
            super()._ProcessLoadName(name)
            for children in lists:
                children.clear()

    for text in ("a.b(c, d)[e].f = g, h", "a + b + c", "f(a)(b)(c)", "[a for b in c]", "a = b = c, d"):
        node, logical = Tree(text)
        lists, open_nodes = [], [node]
        while open_nodes:
            children = open_nodes.pop().fChildren
            if children is not None:
                lists.append(children)
                open_nodes.extend(children)
        with suppress(*HOST_ERRORS):
            Walker(VERSION).Walk(node, logical)


def test_an_operator_that_answers_differently_each_time():
    class Factor(CFactorExpr):
        def GetUnaryOperator(self):
            return answers.pop(0)

    class Number(CNumberLiteral):
        def IsFloat(self):
            node.fChildren.clear()
            return True

    answers = ["-", None, None]
    node = Node(Factor, Leaf("-"), Leaf("1", cls=Number))
    assert CNodeWalker(VERSION)._TypeEquivForNode(node) == b":l:float: -1"
    assert answers == [None, None]


def test_an_imported_name_that_goes_while_it_is_recorded():
    class Import(CImportNamesStmt):
        def GetAsNameList(self):
            name = CAsName()
            name.module_name, name.as_name = "a.b", "c"
            names.append(name)
            return names

    class Walker(CNodeWalker):
        def _AddNameDefined(self, name):
            super()._AddNameDefined(name)
            names.clear()

    names = []
    _, logical = Tree("import a")
    Walker(VERSION).Walk(Node(Import), logical)
    assert [FormatRecord(record) for record in RecordsOfLogical(logical)] == [
        "set  c",
        "import c  a.b",
        "as   c  c",
    ]


def test_a_chain_that_is_visited_again_while_its_text_is_made():
    class Trailer(CTrailer):
        def GetInitialToken(self):
            if walker.visits < 5:
                walker.visits += 1
                walker._VisitNameLiteral(name, name, trailers, 0)
            return super().GetInitialToken()

    walker = type("Walker", (CNodeWalker,), {"visits": 0})(VERSION)
    name, *attributes = (Leaf(text, cls=CNameLiteral) for text in "abc")
    trailers = [Node(Trailer, Leaf("."), attribute) for attribute in attributes]
    walker._VisitAtomPlusTrailers(name, trailers)
    assert Analyzed(walker, "d") == [["get  a", "get  a.b", "get  a.b.c", "get  d"]]


def test_names_of_an_odd_kind():
    class Name(str):
        def __eq__(self, other):
            raise KeyError

        def __hash__(self):
            raise KeyError

    class Walker(CNodeWalker):
        def _ProcessLoadName(self, name):
            super()._ProcessLoadName(Name(name))
            if name == "none":
                super()._ProcessLoadName(None)

    assert Analyzed(Walker(VERSION), "a + a + é") == [["get  a", "get  é"]]
    with pytest.raises(AssertionError):
        Analyzed(Walker(VERSION), "none")
