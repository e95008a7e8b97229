"""Literals and brackets beyond the golden trees, and the questions about nodes of several classes."""

import sys

import pytest
from hand_made import Leaf, Node, Parse, Tokens

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


def Number(text):
    return Leaf(text, cls=CNumberLiteral)


def String(text):
    return Leaf(text, cls=CStringLiteral)


def Brackets(brackets, *contents, cls=CAtom):
    return Node(cls, Leaf(brackets[0]), *contents, Leaf(brackets[1]))


def test_numbers():
    for text, is_float, value in [
        ("1.", True, 1.0),
        (".5e-3", True, 0.0005),
        ("1_0.0", True, 10.0),
        ("1__0", False, None),
        ("1.5j", True, None),
        ("0xE0", True, None),
        ("0o7", False, None),
        ("٣", False, 3),
        ("", False, None),
        ("1" * 5000, False, None),  # the host refuses to convert so many digits
        ("1e999", True, float("inf")),
    ]:
        node = Number(text)
        assert node.IsFloat() is is_float, text
        assert (node.GetNumericValue(), type(node.GetNumericValue())) == (value, type(value)), text


def test_the_kind_of_a_string():
    for text, is_unicode, is_bytes in [
        ("u'x'", True, False),
        ("U'x'", True, False),
        ("ru'x'", True, False),
        ("br'x'", False, True),
        ("RB'x'", False, True),
        ("fb'x'", False, False),
        ("rrb'x'", False, False),
        ("'b'", False, False),
        ("", False, False),
    ]:
        assert (String(text).IsUnicode(), String(text).IsBytes()) == (is_unicode, is_bytes), text
    with pytest.raises(IndexError):
        String("r").IsBytes()


def test_the_contents_of_a_string():
    for text, contents in [
        ("'abc", "abc"),
        ('"""`', "`"),
        ('"""', ""),
        ("''''", ""),
        ("'", ""),
        ("''", ""),
        ("'a\"", 'a"'),
        ("'''a''", "a''"),
        ("bFrUbfru'x'", "x"),
        ("t'x'", ""),
        ("b", IndexError),
        ("", IndexError),
        ("'\ud800€'", "\ud800€"),
    ]:
        if contents is IndexError:
            with pytest.raises(IndexError):
                String(text).GetStringContents()
        else:
            assert String(text).GetStringContents() == contents, text


def test_the_value_of_a_string():
    for text, value in [
        ("'a\\n'", "a\n"),
        ("rb'a\\n'", b"a\\n"),
        ("F'{a}'", None),
        ("rf'a'", None),
        ("bfr'a'", None),
        ("'f'", "f"),
    ]:
        assert String(text).GetStringValue() == value, text


def test_the_text_of_an_override_counts():
    class Literal(CNumberLiteral):
        def IsFloat(self):
            return True

    assert type(Leaf("7", cls=Literal).GetNumericValue()) is float


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


@pytest.mark.parametrize("version", ["3.8", "2.7"])
def test_questions_about_brackets(version):
    for source, is_set, is_tuple, dropped in [
        ("{a}", True, False, "{ a }"),
        ("{a, b}", True, False, "{ a , b }"),
        ("{a for a in b}", True, False, "{ a for a in b }"),
        ("{a: b}", False, False, "{ a : b }"),
        ("{}", False, False, "{ }"),
        ("[a, b]", False, False, "[ a , b ]"),
        ("()", False, True, "( )"),
        ("(a)", False, False, "a"),
        ("((a))", False, False, "a"),
        ("((a, b))", False, True, "( a , b )"),
        ("((()))", False, True, "( )"),
        ("(a,)", False, True, "( a , )"),
        ("(a for a in b)", False, False, "( a for a in b )"),
        ("((yield))", False, False, "yield"),
        ("([a])", False, False, "[ a ]"),
    ]:
        node = Parse(source, version)
        assert IsSetLiteral(node) is is_set, source
        assert IsTupleLiteralNode(node) is is_tuple, source
        assert IsGenExpression(node) is False, source
        assert Tokens(DropSimpleParens(node)) == dropped, source
    for source, is_tuple in [("a, b", True), ("a", False), ("a + b", False)]:
        assert IsTupleLiteralNode(Parse(source, version)) is is_tuple
        assert DropSimpleParens(Parse(source, version)).GetChildCount() != 1


def test_questions_about_odd_brackets():
    x = Leaf("x")
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
