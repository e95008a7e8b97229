"""Nodes as text, and what a host overrides.

Golden files in texts/ hold expressions with their texts, each followed by the options that give it.
"""

from pathlib import Path

import pytest
from golden import Cases, Check
from hand_made import Leaf, Node, Parse

from codeloom.symbolinfo import EncodeStringLiteral
from codeloom.treesift import (
    CAtom,
    CAtomExpr,
    CNameLiteral,
    CNode,
    CNodeToTextConverter,
    CNodeToTextConverterImpl,
    COperatorExpression,
    CStringLiteral,
    CTrailer,
)

SHORT = CNodeToTextConverterImpl()
FULL = CNodeToTextConverterImpl(True, True, True)
FORMS = {
    "short": (SHORT, {}),
    "args": (CNodeToTextConverterImpl(include_arg_text=True), {}),
    "brackets": (CNodeToTextConverterImpl(include_bracket_text=[0]), {}),
    "strings": (CNodeToTextConverterImpl(include_string_contents=1), {}),
    "full": (FULL, {}),
    "dotted": (FULL, {"dotted_name_only": True}),
    "literal": (FULL, {"literal_only": True}),
    "operand": (FULL, {"add_parens_if_operator": True}),
    "parens": (FULL, {"discard_simple_parens": False}),
}


def Texts(node):
    """A row for each text, with the forms that give it."""
    forms = {}
    for name, (converter, options) in FORMS.items():
        text = converter.TextForNode(node, **options)
        forms.setdefault("none" if text is None else text.decode(), []).append(name)
    return [f"    {text:<20} {', '.join(names)}" for text, names in forms.items()]


def Output(source):
    rows = ["---"]
    for expression in source.splitlines():
        texts, old_texts = (Texts(Parse(expression, version)) for version in ("3.8", "2.7"))
        rows += [expression, *texts]
        if old_texts != texts:
            rows += ["  2.7", *old_texts]
    return "\n".join(rows)


@pytest.mark.parametrize("case", Cases(Path(__file__).parent / "texts", ".texts"))
def test_texts(case, rewrite):
    Check(case, Output(case.source), rewrite)


def test_options():
    assert FULL._fIncludeArgText is True and SHORT._fIncludeArgText is False
    with pytest.raises(AttributeError):
        SHORT._fIncludeArgText = True
    assert FULL.TextForNode(Parse("[a]"), False, True, True) == b"[a]"  # within brackets it is no matter
    lone = Node(COperatorExpression, Leaf("a", cls=CNameLiteral))
    assert FULL.TextForNode(lone, add_parens_if_operator=True) == b"a"
    assert FULL.TextForNode(Node(CNode), add_parens_if_operator=True) == b"()"


def test_an_atom_and_its_trailers():
    node = Parse("(a).b(c)[d]")
    atom, trailers = node.GetAtom(), node.GetTrailers()
    ToText = FULL.TextForAtomPlusTrailers
    assert ToText(atom, trailers) == b"(a).b(c)[d]"
    assert ToText(atom, trailers[:1]) == b"(a).b"
    assert ToText(atom, []) == b"a"
    assert ToText(atom, [], discard_simple_parens=False) == b"(a)"
    assert ToText(atom, [], literal_only=True) is None
    assert ToText(Leaf("x", cls=CNameLiteral), trailers, dotted_name_only=True) == b"x.b"
    assert ToText(atom, trailers, dotted_name_only=True) is None
    assert SHORT.TextForAtomPlusTrailers(Parse("[1]"), trailers) == b"[].b()[]"


def test_odd_trailers():
    x = Leaf("x", cls=CNameLiteral)

    def Text(*tokens, **options):
        return FULL.TextForAtomPlusTrailers(x, [Node(CTrailer, *map(Leaf, tokens))], **options)

    assert Text(".", "a") == b"x"  # no name after the dot
    assert Text("(", "a", "b", ")") == b"x()"
    for tokens in ("{}", [None, "a"]):
        with pytest.raises(ValueError, match=r"^Bad trailer node$"):
            Text(*tokens)
        assert Text(*tokens, dotted_name_only=True) == b"x"
    with pytest.raises(ValueError, match=r"^Trailer node with no children$"):
        Text()
    for trailers in ([x], [None], [1]):
        with pytest.raises(TypeError, match="CTrailer"):
            FULL.TextForAtomPlusTrailers(x, trailers)


def test_odd_nodes():
    assert SHORT.TextForNode(CNode()) is FULL.TextForNode(CNode()) is None
    assert FULL.TextForNode(Node(CNode, Leaf("a"), Node(CNode))) == b"a"
    assert FULL.TextForNode(Node(CNode, Leaf("a"), CNode())) is None
    assert FULL.TextForNode(Node(CAtomExpr, Node(CAtom, Leaf("["), CNode(), Leaf("]")))) is None
    for children in ([1], [None]):
        with pytest.raises((TypeError, AttributeError)):
            FULL.TextForNode(Node(CNode, *children))
    with pytest.raises(ValueError, match=r"^Atom node with no children$"):
        FULL.TextForNode(Node(CAtom))
    with pytest.raises(AttributeError):
        FULL.TextForNode(Leaf(cls=CAtomExpr))
    with pytest.raises(TypeError):
        FULL.TextForNode(None)


def test_texts_of_odd_strings():
    String = FULL._TextForStringLiteral
    for text in ("", "'", "'a,b._ \"'", "x"):
        assert String(Leaf(text, cls=CStringLiteral)) == EncodeStringLiteral(text)
    for text, expected in [("'\ud800'", b"''"), ("bu'\n'", b"b''"), ("rU'\n'", b"u''")]:
        assert String(Leaf(text, cls=CStringLiteral)) == expected
    assert SHORT._TextForStringLiteral(Leaf(cls=CStringLiteral)) == b"''"
    with pytest.raises(TypeError):
        String(Leaf(cls=CStringLiteral))


def test_names_with_lone_surrogates():
    assert SHORT.TextForNode(Leaf("\udc80", cls=CNameLiteral)) == b"\xed\xb2\x80"


def test_deep_trees_end():
    def Nest(depth, brackets):
        node = Leaf("x", cls=CNameLiteral)
        for _ in range(depth):
            node = Node(CAtom, Leaf(brackets[0]), node, Leaf(brackets[1]))
        return node

    assert FULL.TextForNode(Nest(10_000, "()")) == b"x"
    assert FULL.TextForNode(Nest(100, "[]")) == b"[" * 100 + b"x" + b"]" * 100
    with pytest.raises(RecursionError):
        FULL.TextForNode(Nest(10_000, "[]"))
    assert SHORT.TextForNode(Nest(10_000, "[]")) == b"[]"


def test_overrides_are_called_at_every_depth():
    class Converter(CNodeToTextConverterImpl):
        def TextForNode(self, node, *options):
            calls.append(node.fText)
            return super().TextForNode(node, *options)

        def _TextForStringLiteral(self, node):
            return b"<string>"

        def TextForAtomPlusTrailers(self, atom, trailers, *options):
            chain = super().TextForAtomPlusTrailers(atom, trailers, *options)
            return b"<" + chain + b">"

    calls = []
    node = Parse("a + b.c('d', [e])")
    assert Converter(True, True, True).TextForNode(node) == b"a + <b.c(<string>, [e])>"
    assert calls.count(None) == 4 and {"a", "+", "b", "'d'", "e"} <= {*calls}
    del Converter.TextForAtomPlusTrailers
    assert Converter(True, True, True).TextForNode(node) == b"a + b.c(<string>, [e])"
    Converter._TextForStringLiteral = lambda self, node: 5
    with pytest.raises(TypeError):
        Converter(True, True, True).TextForNode(node)
    Converter.TextForNode = lambda self, *_: None
    assert Converter(True, True, True).TextForAtomPlusTrailers(node, []) is None


def test_the_interface_renders_nothing():
    assert CNodeToTextConverter().TextForNode(Parse("a")) is None
    assert issubclass(CNodeToTextConverterImpl, CNodeToTextConverter)
