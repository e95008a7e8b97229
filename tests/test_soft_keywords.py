"""`match` and `case`: word of a statement or plain name. The interpreter says which it can be.

One kind of line reads both ways: `case [x]: y` is a case, though it could be an annotation. The price is that
an annotation that can't be a pattern, `case[x + 1]: y`, is taken for a bad case.
"""

import ast
import random
import sysconfig
from itertools import product
from pathlib import Path

import pytest
from hypothesis import given, settings
from hypothesis import strategies as st

from codeloom.logicalline import FindMatchOrCaseType, kCase, kMatch, kUnknown
from codeloom.utils import GetLogicalsFromText

pytestmark = pytest.mark.filterwarnings("ignore")  # of the interpreter, for what it parses here

STATEMENT = {"match": kMatch, "case": kCase}


def Tree(text):
    """The interpreter's tree when the text is one statement."""
    try:
        tree = ast.parse(text)
    except (SyntaxError, ValueError):
        return None
    return tree.body[0] if len(tree.body) == 1 else None


def Readings(text):
    """The logical types that the text of one logical line can have; none for a broken line."""
    word = text.split(maxsplit=1)[0]
    if word == "match":
        statement = isinstance(Tree(f"{text}\n case _: pass"), ast.Match)
    else:
        bodies = ("", "\n  pass")
        trees = [Tree(f"match x:\n {text}{body}") for body in bodies]
        statement = any(isinstance(tree, ast.Match) and len(tree.cases) == 1 for tree in trees)
    name = Tree(text)
    types = [STATEMENT[word]] if statement else []
    return types if name is None or isinstance(name, ast.Match) else [*types, kUnknown]


def IsExpected(text, decision, readings):
    return not readings or decision in readings or (decision == kCase and text.startswith("case ["))


def Decision(toks):
    return FindMatchOrCaseType(toks, 0, len(toks))


def IsBalanced(toks):
    depth = 0
    for tok in toks:
        depth += (tok in "([{") - (tok in ")]}")
        if depth < 0:
            return False
    return depth == 0


@pytest.mark.parametrize(
    ("alphabet", "length"),
    [
        ("x ( ) [ ] : , . * - = lambda not in", 4),
        ("x { } : if else is + ~ ** ... ; 's'", 4),
        ("x [ ] : .", 6),
    ],
)
def test_short_lines(alphabet, length):
    for count in range(length + 1):
        for tail in filter(IsBalanced, product(alphabet.split(), repeat=count)):
            for word in STATEMENT:
                text, decision = " ".join((word, *tail)), Decision((word, *tail))
                readings = Readings(text)
                assert IsExpected(text, decision, readings), (text, decision, readings)


NAMES = st.sampled_from(["x", "match", "case", "f.match", "case.x"])
OPERATORS = st.sampled_from(["+", "-", "*", "/", "|", "and", "or", "in", "is"])
ATOMS = st.one_of(NAMES, st.sampled_from(["1", "-1", "'a'", "None", "...", "()", "[]", "{}", "f'{x}'"]))


def Larger(parts):
    pairs = st.tuples(parts, parts)
    return st.one_of(
        parts.map("({})".format),
        parts.map("[{}]".format),
        pairs.map("({0[0]}, {0[1]})".format),
        pairs.map("{{{0[0]}: {0[1]}}}".format),
        pairs.map("{0[0]}({0[1]}, case={0[1]})".format),
        pairs.map("{0[0]}[{0[1]}]".format),
        pairs.map("{0[0]}.x[{0[1]}:]".format),
        st.tuples(parts, OPERATORS, parts).map(" ".join),
        st.tuples(parts, parts, parts).map("{0[0]} if {0[1]} else {0[2]}".format),
        pairs.map("lambda x={0[0]}: {0[1]}".format),
        pairs.map("{0[0]}, *{0[1]}".format),
        parts.map("not {}".format),
        parts.map("x := {}".format),
    )


EXPRESSIONS = st.recursive(ATOMS, Larger, max_leaves=6)
TAILS = st.one_of(
    EXPRESSIONS.map(" {}:".format),
    st.tuples(EXPRESSIONS, EXPRESSIONS).map(" {0[0]}: {0[1]}".format),
    st.tuples(EXPRESSIONS, EXPRESSIONS).map(" {0[0]} if {0[1]}: pass".format),
    st.tuples(EXPRESSIONS, EXPRESSIONS).map(" {0[0]} = {0[1]}".format),
    st.tuples(EXPRESSIONS, EXPRESSIONS).map(".x[{0[0]}]: x = {0[1]}".format),
    st.tuples(st.sampled_from(["=", "+=", "==", "-", "in", ":", "not in"]), EXPRESSIONS).map(
        " {0[0]} {0[1]}".format
    ),
    EXPRESSIONS.map("({})".format),
    EXPRESSIONS.map("[{}] = 1".format),
    EXPRESSIONS.map("({}).x: int = 1".format),
)


@settings(max_examples=1000)
@given(st.sampled_from(list(STATEMENT)), TAILS)
def test_generated_lines(word, tail):
    text = f"{word}{tail}"
    (logical,) = GetLogicalsFromText(text)
    assert IsExpected(text, Decision(logical.fToks), Readings(text))


@pytest.mark.parametrize(
    ("text", "type"),
    [
        ("match \\\n x:  # one", kMatch),
        ("match (x,  # one\n  y):  # two", kMatch),
        ("case [x,  # lambda\n  *y] \\\n : pass  # three", kCase),
        ("match (x)  # one :", kUnknown),
        ("match: int = 3", kUnknown),
        ("match lambda: 0", kUnknown),
        ("match lambda: lambda x=1: 0:", kMatch),
        ("case [x]: y", kCase),
        ("case [x].y: z", kUnknown),
        ("match [x]: y", kUnknown),
        ("match x: pass", kMatch),  # broken, but surely no name
        ("match (x): pass", kMatch),
        ("match x", kUnknown),
        ("match '\ud800':", kMatch),
        ("matches x:", kUnknown),
    ],
)
def test_lines_with_rows_and_comments(text, type):
    (logical,) = GetLogicalsFromText(text)
    assert Decision(logical.fToks) == type


def test_ranges_of_tokens():
    toks = ("x", None, "match", "", "x", ":", "y")
    assert FindMatchOrCaseType(toks, 1, 6) == FindMatchOrCaseType(toks, 2, 99) == kMatch
    for start, end in [(0, 6), (2, 5), (3, 6), (9, 9), (2, 2), (-1, 6)]:
        assert FindMatchOrCaseType(toks, start, end) == kUnknown
    with pytest.raises(TypeError):
        FindMatchOrCaseType(("match", 1), 0, 2)


# Whole files


def LinesOf(path):
    """Each logical line that begins with one of the words, and its true type."""
    text = path.read_text("utf-8")
    true_types = {
        (node.lineno - 1, node.col_offset): kMatch if isinstance(node, ast.Match) else kUnknown
        for node in ast.walk(ast.parse(text))
        if isinstance(node, ast.stmt)
    }
    for logical in GetLogicalsFromText(text):
        if logical.fToks[0] in STATEMENT:
            place = (logical.fFirstLine, logical.fPositions[0][1])
            yield logical, true_types.get(place, kCase)


LIBRARY = Path(sysconfig.get_path("stdlib"))


def LibraryFiles(count):
    paths = [path for path in sorted(LIBRARY.rglob("*.py")) if "site-packages" not in path.parts]
    for path in random.sample(paths, count or len(paths)):
        source = path.read_bytes()
        if b"match" in source or b"case" in source:
            try:
                ast.parse(source.decode())
            except (SyntaxError, ValueError):
                continue
            yield path


@pytest.mark.parametrize(
    "count", [pytest.param(40, id="sample"), pytest.param(None, id="all", marks=pytest.mark.slow)]
)
def test_library(count):
    for path in LibraryFiles(count):
        for logical, true_type in LinesOf(path):
            assert Decision(logical.fToks) == true_type, (path, logical.fToks)
