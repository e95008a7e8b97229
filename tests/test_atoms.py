"""Literals and brackets beyond the golden trees, and the questions about nodes of several classes."""

import sys

import pytest
from hand_made import Leaf, Node, Parse

from codeloom.treesift import (
    CAtom,
    CCompForNode,
    CNameLiteral,
    CNode,
    CNumberLiteral,
    CStringLiteral,
    CTestListStarExpr,
    DropSimpleParens,
    IsGenExpression,
    IsSetLiteral,
    IsTupleLiteralNode,
)


def String(text):
    return Leaf(text, cls=CStringLiteral)


def Brackets(brackets, *contents, cls=CAtom):
    return Node(cls, Leaf(brackets[0]), *contents, Leaf(brackets[1]))


def test_odd_numbers():
    for text, value in [
        ("1__0", None),
        ("٣", 3),
        ("", None),
        ("1" * 5000, None),
    ]:  # the host's limit of digits
        assert Leaf(text, cls=CNumberLiteral).GetNumericValue() == value, text

    class Literal(CNumberLiteral):
        def IsFloat(self):
            return True

    assert type(Leaf("7", cls=Literal).GetNumericValue()) is float


def test_odd_strings():
    for text, is_unicode, is_bytes, contents in [
        ("ru'x'", True, False, "x"),
        ("fb'x'", False, False, "x"),
        ("rrb'x'", False, False, "x"),
        ("bFrUbfru'x'", False, True, "x"),
        ("t'x'", False, False, ""),
        ("'abc", False, False, "abc"),
        ("'a\"", False, False, 'a"'),
        ("'''a''", False, False, "a''"),
        ('"""`', False, False, "`"),
        ('"""', False, False, ""),
        ("''''", False, False, ""),
        ("'", False, False, ""),
        ("'\ud800€'", False, False, "\ud800€"),
    ]:
        node = String(text)
        assert (node.IsUnicode(), node.IsBytes(), node.GetStringContents()) == (
            is_unicode,
            is_bytes,
            contents,
        )
    assert not String("").IsUnicode() and String("bfr'a'").GetStringValue() is None
    for ask in (String("r").IsBytes, String("b").GetStringContents, String("").GetStringContents):
        with pytest.raises(IndexError):
            ask()


def test_comprehensions_of_both_shapes():
    clause, x = Node(CCompForNode), Leaf("x")
    for contents, is_comprehension in [
        ([x, clause], True),
        ([x, Leaf(":"), x, clause], True),
        ([clause], False),
        ([x, x, clause], False),
        ([clause, x, x, x, clause], False),
        ([x, 1, 2, 3], False),
    ]:
        atom = Brackets("{}", Node(CNode, *contents))
        assert atom.IsComprehension() is is_comprehension and atom.IsLiteral() is not is_comprehension
    assert not Node(CAtom, Leaf("["), Node(CNode, x, clause)).IsComprehension()


def test_sub_expressions():
    a = Leaf("a", cls=CNameLiteral)
    assert Brackets("[]", Leaf("...")).GetSubExprCount() == 0
    assert Brackets("(]", Node(CTestListStarExpr, a, Leaf(","))).GetSubExprCount() == 1
    assert Brackets("[]", a).GetSubExpr(0) is a and Brackets("[]", a).GetSubExpr(1) is None
    for contents in ("...", "a, ..."):
        with pytest.raises(ValueError, match=r"^Elenment|^Not enough"):
            Parse(f"[{contents}, ...]").GetSubExpr(1)
    with pytest.raises(ValueError, match=r"^Atom node with no children$"):
        Node(CAtom).GetSubExprCount()


def test_two_strings_are_for_hosts_to_tell():
    class Strings(CAtom):
        def IsTwoPlusStringLiterals(self):
            return all(isinstance(child, CStringLiteral) for child in self.fChildren)

    assert not Parse("'a' 'b'").IsTwoPlusStringLiterals()
    assert Node(Strings, String("'a'"), String("'b'")).IsTwoPlusStringLiterals()


def test_questions_about_odd_brackets():
    x = Leaf("x")
    for source, is_tuple in [("a, b", True), ("a", False), ("a + b", False)]:
        node = Parse(source)
        assert IsTupleLiteralNode(node) is is_tuple and DropSimpleParens(node) is node
    flat_generator = Node(CNode, x, Leaf("for"), x, Leaf("in"), x)
    assert IsGenExpression(Brackets("()", flat_generator))
    assert not IsGenExpression(Brackets("[]", flat_generator))
    assert not IsGenExpression(Node(CAtom))  # as it hasn't three children
    assert DropSimpleParens(Brackets("()", Node(CCompForNode))).GetChildCount() == 3
    assert DropSimpleParens(Brackets("(]", x)) is x
    two = Brackets("()", x, x)
    assert DropSimpleParens(two) is two
    if not sys.flags.optimize:
        with pytest.raises(AssertionError):
            IsTupleLiteralNode(two)
    for ask in (IsSetLiteral, IsTupleLiteralNode):
        with pytest.raises(ValueError, match=r"^Atom node with no children$"):
            ask(Node(CAtom))
    for ask in (IsSetLiteral, IsGenExpression):
        with pytest.raises(TypeError):
            ask(x)
    for ask in (DropSimpleParens, IsTupleLiteralNode):
        with pytest.raises(TypeError):
            ask(Brackets("()", 1))


def test_brackets_without_end():
    deep = Leaf("x")
    for _ in range(20_000):
        deep = Brackets("()", deep)
    assert DropSimpleParens(deep).fText == "x" and not IsTupleLiteralNode(deep)
    endless = Brackets("()", None)
    endless.fChildren[1] = endless
    for ask in (DropSimpleParens, IsTupleLiteralNode, CAtom.GetSubExprCount):
        with pytest.raises(RecursionError):
            ask(endless)
    endless.fChildren.clear()
