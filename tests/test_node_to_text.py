"""Nodes as text: every option, under both grammars, and what a host overrides."""

import pytest
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
WITH_ARGS = CNodeToTextConverterImpl(include_arg_text=True)
WITH_BRACKETS = CNodeToTextConverterImpl(include_bracket_text=True)
WITH_STRINGS = CNodeToTextConverterImpl(include_string_contents=True)

# A source, its short and its full text, its dotted name, its text as a literal.
TEXTS = """
a               | a          | a             | a     | -
a.b.c           | a.b.c      | a.b.c         | a.b.c | -
a.b().c         | a.b().c    | a.b().c       | a.b   | -
f(x)            | f()        | f(x)          | f     | -
f(x, y=1, *z)   | f()        | f(x, y=1, *z) | f     | -
f(g(x)[0])      | f()        | f(g(x)[0])    | f     | -
a[i]            | a[]        | a[i]          | a     | -
a[1:2]          | a[]        | a[1: 2]       | a     | -
a[...].b        | a[].b      | a[...].b      | a     | -
a.b ** c        | a.b        | a.b           | a.b   | -
(a)             | a          | a             | a     | -
((a.b))         | a.b        | a.b           | a.b   | -
(a).b           | -          | (a).b         | -     | (a).b
()              | -          | ( )           | -     | ( )
[]              | []         | []            | -     | []
{}              | {}         | {}            | -     | {}
[1]             | []         | [1]           | -     | [1]
[a]             | []         | [a]           | -     | [a]
{1: 2}          | {}         | {1: 2}        | -     | {1: 2}
{1, 2}          | {}         | {1, 2}        | -     | {1, 2}
(a, b)          | -          | (a, b)        | -     | (a, b)
a, b            | -          | a, b          | -     | a, b
1               | 1          | 1             | -     | 1
'ab c'          | ''         | 'ab c'        | -     | 'ab c'
'a;b'           | ''         | ''            | -     | ''
b'x'            | ''         | b'x'          | -     | b'x'
b'a;b'          | ''         | b''           | -     | b''
u'a;b'          | u''        | u''           | -     | u''
ur'x'           | u''        | ur'x'         | -     | ur'x'
r"a\\b"         | ''         | ''            | -     | ''
'a' 'b;'        | ''         | 'a'           | -     | 'a'
'äß٣²'          | ''         | 'äß٣²'        | -     | 'äß٣²'
'→'             | ''         | ''            | -     | ''
'a'.join(x)     | ''.join()  | 'a'.join(x)   | -     | 'a'.join(x)
-a              | -          | -a            | -     | -a
not a           | -          | not a         | -     | not a
a + (b)         | -          | a + b         | -     | a + b
a not in b      | -          | a not in b    | -     | a not in b
a if b else c   | -          | a if b else c | -     | a if b else c
lambda x: x     | -          | lambda x: x   | -     | lambda x: x
[a for b in c]  | []         | [a for b in c] | -    | [a for b in c]
"""
ROWS = [[cell.strip() for cell in row.split("|")] for row in TEXTS.strip().splitlines()]


def Bytes(text):
    return None if text == "-" else text.encode()


@pytest.mark.parametrize("version", ["3.8", "2.7"])
@pytest.mark.parametrize("row", ROWS, ids=[row[0] for row in ROWS])
def test_texts(row, version):
    source, short, full, dotted_name, literal = row
    node = Parse(source, version)
    assert SHORT.TextForNode(node) == Bytes(short)
    assert FULL.TextForNode(node) == Bytes(full)
    assert FULL.TextForNode(node, dotted_name_only=True) == Bytes(dotted_name)
    assert FULL.TextForNode(node, literal_only=True) == Bytes(literal)


def test_each_option_alone():
    node = Parse("f([x], 'y', a[z])['w']")
    assert WITH_ARGS.TextForNode(node) == b"f()[]"  # arguments in a list need the join of what is bracketed
    assert WITH_BRACKETS.TextForNode(node) == b"f()['']"
    assert WITH_STRINGS.TextForNode(node) == b"f()[]"
    assert WITH_ARGS.TextForNode(Parse("f(x)(y.z)")) == b"f(x)(y.z)"
    assert CNodeToTextConverterImpl(1, "", [0])._fIncludeArgText is True
    assert SHORT._fIncludeArgText is False
    with pytest.raises(AttributeError):
        SHORT._fIncludeArgText = True


def test_names_that_are_literals():
    for text in ("None", "True", "False"):
        for version in ("3.8", "2.7"):  # a keyword in one grammar, a name in the other
            assert SHORT.TextForNode(Parse(text, version), literal_only=True) == text.encode()
    assert SHORT.TextForNode(Parse("None", "2.7"), dotted_name_only=True) == b"None"
    assert SHORT.TextForNode(Parse("None"), dotted_name_only=True) is None
    assert FULL.TextForNode(Parse("[a]"), False, True, True) == b"[a]"  # within brackets it is no matter


def test_parentheses():
    group = Parse("(a)")
    assert FULL.TextForNode(group, discard_simple_parens=False) == b"(a)"
    assert SHORT.TextForNode(group, discard_simple_parens=False) is None
    operator = Parse("a + b")
    assert FULL.TextForNode(operator, add_parens_if_operator=True) == b"(a + b)"
    assert FULL.TextForNode(Parse("a.b"), add_parens_if_operator=True) == b"a.b"
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

    assert Text(".", "a") == b"x"  # no name behind the dot
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
