"""The node base class, the factory and the free lists."""

import io
import sys
from types import SimpleNamespace

import pytest

from codeloom.treesift import (
    CExpression,
    CKeywordLiteral,
    CNameLiteral,
    CNode,
    CNodeClassInfo,
    CNodeFactory,
    CPGenParserImpl,
    FinishedWithNode,
    NotCompiledFinishedWithNode,
)
from codeloom.utils import GetLogicalsFromText

NAME, NEWLINE, EXPR = 1, 4, 7


def MakeFactory(keywords=("if",), classes=None):
    gram = SimpleNamespace(number2symbol={EXPR: "expr"})
    classes = classes or [CNode, CNameLiteral, CNode, CNode, CNode, CNode, CNode, CExpression]
    names = {NAME: "NAME", NEWLINE: "NEWLINE", EXPR: "hidden by the grammar's name"}
    return CNodeFactory(gram, classes, dict.fromkeys(keywords), names, {"->": 6, "odd": "no number"})


def Leaf(text, factory=None):
    return (factory or MakeFactory()).NewNameNode(text, 0)


def Chain(factory, depth):
    """A tree of `depth` levels below its root, each with two children."""
    node = factory.NewNameNode("bottom", 0)
    for level in range(depth):
        node = factory.NewNode(Info(factory), EXPR, None, level, [node, factory.NewNameNode("x", 0)])
    return node


def Info(factory, number=EXPR):
    return factory._fClassInfoList[number]


def FreeNodes(info):
    nodes, node = [], info.fFirstFree
    while node is not None:
        nodes.append(node)
        node = node.fNextFree
    return nodes


def test_children_by_index():
    factory = MakeFactory()
    a, b = factory.NewNameNode("a", 0), factory.NewNameNode("b", 1)
    node = factory.NewNode(Info(factory), 0, None, 0, [a, b])
    assert (node.GetChildCount(), a.GetChildCount()) == (2, 0)
    assert [node.GetChild(i) for i in (0, -1, 2)] == [a, b, None]
    assert [node.GetChildText(i) for i in (1, -2, 5)] == ["b", "a", None]
    assert [node._DoesChildTextMatch(text) for text in "bc"] == [True, False]
    assert a.GetChild(-1) is a.GetChildText(0) is None and not a._DoesChildTextMatch("a")
    for below in (node.GetChild, node.GetChildText):
        with pytest.raises(IndexError):
            below(-3)


def test_the_list_counts_once_the_host_has_it():
    (logical,) = GetLogicalsFromText("f(a, b)")
    node = CPGenParserImpl((3, 11, 0)).ParseToNode(logical)
    assert node.GetChildText(0) == "f" and node.GetTrailers()[0] is node.GetChild(1)
    children = node.fChildren
    assert children is node.fChildren and len(children) == node.GetChildCount() == 2
    children.reverse()
    assert node.GetChildText(1) == "f" and node.GetChildText(-1) == "f"
    children.clear()
    assert node.GetChildCount() == 0 and node.GetChild(0) is None


def test_foreign_children_are_the_hosts_type_error():
    factory = MakeFactory()
    node = factory.NewNode(Info(factory), 0, None, 0, [1, None])
    for access in (node.GetChild, node.GetChildText):
        with pytest.raises(TypeError, match="CNode"):
            access(0)
    with pytest.raises(TypeError):
        node._DoesChildTextMatch("x")
    with pytest.raises(TypeError):
        FinishedWithNode(node)
    with pytest.raises(TypeError, match="list"):
        factory.NewNode(Info(factory), 0, None, 0, (1, 2))


def test_state_names():
    factory = MakeFactory()
    assert Leaf("x", factory).GetStateName() == "NAME"
    assert factory.NewKeywordNode("if", 0).GetStateName() == "KEYWORD"
    assert CExpression().GetStateName() == "CExpression"
    assert Info(factory).fName == "expr" and Info(factory, 2).fName is None
    assert repr(Leaf("x", factory)) == "<class 'codeloom.treesift.CNameLiteral'>: NAME"


def test_fields_are_read_only():
    leaf = Leaf("x")
    for field in ("fChildren", "fText", "fContext", "fClsInfo", "fNextFree"):
        with pytest.raises(AttributeError):
            setattr(leaf, field, None)


def test_class_info_checks_its_name():
    assert CNodeClassInfo(CNode, 3, None).fName is None
    with pytest.raises(TypeError):
        CNodeClassInfo(CNode, 3, b"x")
    with pytest.raises(TypeError):
        CNodeClassInfo(CNode, 3)


def test_convert_chooses_the_record():
    factory = MakeFactory()
    assert type(factory.ConvertSingleNode(NAME, "if", 0, None)) is CKeywordLiteral
    assert type(factory.ConvertSingleNode(NAME, "x", 0, None)) is CNameLiteral
    for async_or_await in (55, 56):
        assert type(factory.ConvertSingleNode(async_or_await, "x", 0, None)) is CKeywordLiteral
    with pytest.raises(IndexError):
        factory.ConvertSingleNode(99, "x", 0, None)


def test_convert_collapses_a_statement_and_its_newline():
    factory = MakeFactory()
    a = factory.NewNameNode("a", 0)
    newline = factory.ConvertSingleNode(NEWLINE, "\n", 1, None)
    assert factory.ConvertSingleNode(EXPR, None, 0, [a, newline]) is a
    assert Info(factory, NEWLINE).fFirstFree is newline and newline.fText is None
    b = factory.NewNameNode("b", 0)
    assert type(factory.ConvertSingleNode(EXPR, None, 0, [a, b])) is CExpression
    newline = factory.ConvertSingleNode(NEWLINE, "\n", 1, None)
    assert factory.ConvertSingleNode(EXPR, None, 0, [a, b, newline]).GetChildCount() == 3


def test_what_is_asserted():
    factory = MakeFactory()
    for children in ([], [CNode()]):
        with pytest.raises(AssertionError):
            factory.ConvertSingleNode(EXPR, None, 0, children)
    with pytest.raises(AssertionError):
        factory.NewNameNode(b"x", 0)


def test_operator_nodes():
    factory = MakeFactory()
    arrow = factory.CreateOperatorNode("->", 7)
    assert (arrow.fText, arrow.fContext, arrow.fClsInfo) == ("->", 7, Info(factory, 6))
    assert factory.CreateOperatorNode("nonsense", 0) is None
    assert factory.CreateOperatorNode("odd", 0) is None


def test_a_factory_without_keywords():
    factory = MakeFactory(keywords=())
    assert type(factory.ConvertSingleNode(NAME, "if", 0, None)) is CNameLiteral
    with pytest.raises(AttributeError):
        factory.NewKeywordNode("if", 0)
    with pytest.raises(TypeError):
        MakeFactory(classes=[None, None]).NewNameNode("x", 0)


def test_recycling_gives_the_same_objects_again():
    factory = MakeFactory()

    def Nodes(node):
        yield node
        for child in node.fChildren or ():
            yield from Nodes(child)

    tree = Chain(factory, 5)
    first = {id(node) for node in Nodes(tree)}
    FinishedWithNode(tree)
    assert (tree.fText, tree.fContext, tree.fChildren) == (None, None, None)
    assert FreeNodes(Info(factory))[-1] is tree  # deeper nodes stand nearer to the head
    tree = Chain(factory, 5)
    assert {id(node) for node in Nodes(tree)} == first
    NotCompiledFinishedWithNode(tree)
    assert {id(node) for info in factory._fClassInfoList for node in FreeNodes(info)} == first


def test_recycling_stops_below_a_hundred_levels(capsys):
    factory = MakeFactory()
    FinishedWithNode(Chain(factory, 101))
    assert capsys.readouterr().out == "depth too great\n" * 2
    assert len(FreeNodes(Info(factory))) == 101


def test_none_is_no_tree():
    factory = MakeFactory()
    with pytest.raises(AttributeError, match="fClsInfo"):
        FinishedWithNode(None)
    with pytest.raises(AttributeError, match="fClsInfo"):
        factory.DiscardNodes(factory.NewNode(Info(factory), 0, None, 0, [CNode(), None]))
    with pytest.raises(TypeError):
        NotCompiledFinishedWithNode(None)


def test_odd_trees_of_the_host_end():
    factory = MakeFactory()
    children = []
    node = factory.NewNode(Info(factory), 0, None, 0, children)
    children += [node, node, CNode()]
    FinishedWithNode(node)  # contains itself
    assert factory.NewNode(Info(factory), 0, None, 0, None) is node


def test_a_tree_that_is_given_back_twice_is_free_once():
    driver = CPGenParserImpl((3, 11, 0))
    (logical,) = GetLogicalsFromText("a = b + c")
    tree = driver.ParseToNode(logical)
    driver.DiscardNode(tree)
    driver.DiscardNode(tree)
    assert driver.ParseToNode(logical) is not driver.ParseToNode(logical)


@pytest.mark.parametrize("place", ["text", "context"])
def test_host_code_that_runs_while_a_tree_is_given_back(place):
    """It finds on the free list what nothing is left of, and may do what it likes with it."""

    class Dropped(str):
        def __del__(self):
            FinishedWithNode(root)
            taken.append(factory.NewNode(Info(factory), EXPR, None, 0, [Leaf("b", factory), CNode()]))
            FinishedWithNode(taken[-1])

    taken = []
    factory = MakeFactory()
    root = factory.NewNode(Info(factory), EXPR, None, 0, [])
    dropped = {place: Dropped("x")}
    leaves = [factory.NewNameNode(dropped.get("text", "x"), dropped.get("context", 0)) for _ in range(3)]
    root.fChildren.extend(leaves)
    del leaves, dropped
    FinishedWithNode(root)
    assert len(taken) == 1
    assert FreeNodes(Info(factory)) == [root] and len(FreeNodes(Info(factory, NAME))) == 3


def test_host_code_that_runs_while_it_is_told_that_a_tree_is_too_deep(monkeypatch):
    class Output(io.StringIO):
        def write(self, text):
            taken.append([factory.NewNode(Info(factory), EXPR, None, 0, None) for _ in range(200)])
            return len(text)

    taken = []
    factory = MakeFactory()
    tree = Chain(factory, 110)
    monkeypatch.setattr(sys, "stdout", Output())
    FinishedWithNode(tree)
    monkeypatch.undo()
    nodes = {id(node) for nodes in taken for node in nodes}
    assert tree in taken[0] and len(nodes) == sum(map(len, taken))
    assert all(node.fChildren is node.fText is None for nodes in taken for node in nodes)


def test_recursive_convert():
    factory = MakeFactory()
    line = EXPR, None, 1, [(NAME, "b", 1, None), (NEWLINE, "\n", 2, None)]
    node = factory.RecursiveConvert((EXPR, None, 0, [(NAME, "a", 0, None), line]))
    assert [child.fText for child in node.fChildren] == ["a", "b"]
    for broken, error in [
        ((1, "a", 0), ValueError),
        ((EXPR, None, 0, [1, 2]), TypeError),
        ((EXPR, None, 0, ((NAME, "a", 0, None),) * 2), TypeError),
        (("x", None, 0, None), TypeError),
    ]:
        with pytest.raises(error):
            factory.RecursiveConvert(broken)


def test_recursive_convert_of_a_bottomless_tree():
    raw = (NAME, "a", 0, None)
    for _ in range(100_000):
        raw = (EXPR, None, 0, [raw, (NAME, "b", 0, None)])
    with pytest.raises(RecursionError):
        MakeFactory().RecursiveConvert(raw)


def test_a_long_free_list_is_dropped_without_recursion():
    factory = MakeFactory()
    FinishedWithNode(factory.NewNode(Info(factory), 0, None, 0, [Leaf("x", factory) for _ in range(200_000)]))
    del factory
