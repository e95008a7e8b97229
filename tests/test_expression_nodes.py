"""Accessors of expressions beyond the golden trees: other shapes, failures, overrides."""

import pytest
from hand_made import Leaf, Node, Parse, Tokens

from codeloom.treesift import (
    CAtom,
    CAtomExpr,
    CCompForNode,
    CKeywordLiteral,
    CListmakerNode,
    CNameLiteral,
    CNode,
    COperatorExpression,
    CTrailer,
    CYieldArg,
    CYieldExpr,
)


def Name(text):
    return Leaf(text, cls=CNameLiteral)


def Keyword(text):
    return Leaf(text, cls=CKeywordLiteral)


def Chain(depth, cls, *first_children, last):
    """A node in a node in a node, each after the same first children."""
    node = last
    for _ in range(depth):
        node = Node(cls, *first_children, node)
    return node


def test_operators():
    node = Parse("a < b not in c")
    operators = [node.GetOperatorStr(i) for i in (-1, 0, 1, 2, 2**31 - 1)]
    assert operators == [None, "<", "not in", None, None]
    assert node.GetTerm(3) is None and node.GetTerm(2**31 - 1) is None
    assert node.GetTerm(-1).GetStateName() == "comp_op"  # a double step from the end of five children
    prefix = Parse("not x")
    assert Tokens(prefix.GetTerm(7)) == "x"
    assert (prefix.GetOperatorStr(0), prefix.GetOperatorStr(1)) == ("not", None)
    for words in (["not"], ["not", "in", "x"], ["not", None]):
        operator = Node(CNode, *map(Leaf, words))
        assert Node(COperatorExpression, Name("a"), operator, Name("b")).GetOperatorStr(0) is None


def test_lists_of_expressions():
    pair = Parse("a, b")
    with pytest.raises(ValueError, match=r"^Not enough expressions in list$"):
        pair.GetSubExpr(2)
    ellipsis = Parse("a, ...")
    with pytest.raises(ValueError) as caught:
        ellipsis.GetSubExpr(1)
    assert str(caught.value) == (
        f"Elenment 2 of {ellipsis!r} needs to be a CExpression; fChildren = {ellipsis.fChildren!r}"
    )
    generator = Parse("(x for x in y)").GetChild(1)
    assert [generator.GetSubExpr(i) for i in (0, 5, -9)] == [None] * 3


def test_an_index_of_a_list_display_is_doubled_by_the_host():
    items = Parse("[a, b]", "2.7").GetChild(1)
    assert type(items) is CListmakerNode
    assert [Tokens(items.GetSubExpr(i)) for i in (0, 1, True, 2)] == ["a", "b", "b", ""]
    for no_index in (1.0, "1", None, [1], 2**70):
        with pytest.raises(TypeError):
            items.GetSubExpr(no_index)
    with pytest.raises(TypeError, match="CExpression"):
        Node(CListmakerNode, Leaf("..."), Leaf(",")).GetSubExpr(0)


def test_a_result_of_another_class_is_a_type_error():
    with pytest.raises(TypeError, match=r"CExpression, .*CNode"):
        Parse("*..., a").GetSubExpr(0).GetStarredExpression()


def test_yields():
    lone = Node(CYieldArg, Name("a"))
    assert Tokens(lone.GetValue()) == "a" and not lone.IsYieldFrom()
    assert not Node(CYieldArg, Leaf("from"), Name("a")).IsYieldFrom()  # no keyword

    class Argument(CYieldArg):
        def GetValue(self):
            return Name("overridden")

        def IsYieldFrom(self):
            return True

    node = Node(CYieldExpr, Keyword("yield"), Node(Argument))
    assert Tokens(node.GetValue()) == "overridden" and node.IsYieldFrom()


def test_await_is_a_prefix_before_anything_but_a_trailer():
    trailer = Node(CTrailer, Leaf("("), Leaf(")"))
    for children, prefix, atom, count in [
        ([Keyword("await"), Name("x"), trailer], "await", "x", 1),
        ([Keyword("await"), trailer], "", "await", 1),
        ([Name("await"), Name("x")], "", "await", 1),
        ([Keyword("await")], "", "await", 0),
    ]:
        node = Node(CAtomExpr, *children)
        assert Tokens(node.GetPrefix()) == prefix and Tokens(node.GetAtom()) == atom
        assert len(node.GetTrailers()) == count


def test_clauses_in_both_asynchronous_shapes():
    words = ["for", "x", "in", "y", "if"]
    clause = [Keyword(words[0]), Name("x"), Keyword("in"), Name("y"), Name("next")]
    flat = Node(CCompForNode, Keyword("async"), *clause)
    wrapped = Node(CCompForNode, Keyword("async"), Node(CCompForNode, *clause))
    for node in (Node(CCompForNode, *clause), flat, wrapped):
        answers = node.GetTargetNode(), node.GetInNode(), node.GetCompIterNode()
        assert [*map(Tokens, answers)] == ["x", "y", "next"]
    assert flat.IsAsync() and wrapped.IsAsync()
    assert Node(CCompForNode, Keyword("async"), *clause[:4]).GetCompIterNode() is None


def test_odd_trailers():
    for children, dot_name, nested in [
        ("(x)", None, "x"),
        ("{x}", None, ""),
        (".ab", None, ""),
        ("!a", None, ""),
    ]:
        node = Node(CTrailer, *map(Name, children))
        assert node.GetDotName() == dot_name and Tokens(node.GetNestedNode()) == nested
        assert node.GetInitialToken() == children[0]
    assert Node(CTrailer, Leaf("."), Leaf("a")).GetDotName() is None
    assert Node(CTrailer, None, Name("a")).GetDotName() is None
    with pytest.raises(ValueError, match=r"^Trailer node with no children$"):
        Leaf(cls=CTrailer).GetInitialToken()


def test_bottomless_trees_end():
    clause = Node(CCompForNode, *[Keyword(word) for word in ["for", "x", "in", "y"]])
    deep = Chain(10_000, CCompForNode, Keyword("async"), last=clause)
    brackets = Name("x")
    for _ in range(10_000):
        brackets = Node(CAtom, Leaf("["), brackets, Leaf("]"))
    asks = [deep.GetTargetNode, deep.GetInNode, deep.GetCompIterNode, brackets.GetSubExprCount]
    for ask in [*asks, lambda: brackets.GetSubExpr(0)]:
        with pytest.raises(RecursionError):
            ask()
