"""The parser driver: async rules, backslashes, searches, type parameters, what isn't seen in a tree.

Invented tokens and the peeling of the root are in the golden trees.
"""

import pytest
from hand_made import DRIVERS, Parse, Tokens

from codeloom.logicalline import CLogicalLine, kUnknown
from codeloom.optpgen import ParseError
from codeloom.treesift import CCompForNode, CNameLiteral, CNode, CPGenParserImpl
from codeloom.utils import GetLogicalsFromText

PY38, PY27 = DRIVERS["3.8"], DRIVERS["2.7"]
PY35 = CPGenParserImpl((3, 5, 0))


def Refused(text, driver, in_async_def=False):
    """The context of the token that is refused; None when all is taken."""
    (logical,) = GetLogicalsFromText(text)
    try:
        driver.ParseToNode(logical, in_async_def)
    except ParseError as error:
        return error.context
    return None


def test_the_class_table():
    table = CPGenParserImpl.kClsForState
    assert table["comp_for"] is table["sync_comp_for"] is table["list_for"] is CCompForNode
    classes = PY38._BuildClsForStateList()
    assert (classes[0], classes[1], classes[-1]) == (CNode, CNameLiteral, None)
    assert CNode.kSupportedRules == []
    assert all(isinstance(rule, str) for cls in table.values() for rule in cls.kSupportedRules)


@pytest.mark.parametrize(
    ("text", "outside", "inside"),
    [
        ("async def f(): pass", None, None),
        ("async \\\n def f(): pass", None, None),
        ("async with x: pass", 1, None),
        ("await x", 1, None),
        ("async = await", None, 1),
    ],
)
def test_async_and_await_before_they_were_keywords(text, outside, inside):
    """Outside and inside of an `async def`: the token that is refused."""
    for in_async_def, refused in ((False, outside), (True, inside)):
        assert Refused(text, PY35, in_async_def) == refused


def test_an_ellipsis_in_the_older_grammar():
    assert Tokens(Parse("x[...]", driver=PY27)) == "x [ . . . ]"
    assert Refused("x = ...", PY27) == 2


def test_backslashes():
    for positions, skipped in [
        (None, True),
        ((), False),
        (((0, 0),), True),
        (((0, 0), (0, 1)), False),
        (((0, 0), (1, 0)), True),
    ]:
        assert PY38._ShouldSkipSlash(0, positions) is skipped
    logical = CLogicalLine(kUnknown, ("x", "\\"), ((0, 0), (0, 2)))
    assert PY38.ParseToNode(logical, False).fText == "x"
    assert PY38.ParseTokenListToNode(["x", "\\", "=", "1"]).GetChildCount() == 3


@pytest.mark.parametrize("text", ["x = f ( 1 )", "@ a", "else : x", "\n x"])
def test_all_nodes_of_a_parse_go_back(text):
    class Driver(CPGenParserImpl):
        def convert(self, *arguments):
            made.append(super().convert(*arguments))
            return made[-1]

    driver, passes = Driver((3, 8, 0)), []
    for _ in range(2):
        made = []
        if tree := driver.ParseTokenListToNode(text.split(" ")):
            driver.DiscardNode(tree)
        passes.append(made)
    assert set(map(id, passes[0])) == set(map(id, passes[1]))


def test_logicals_of_no_statement():
    assert PY38.ParseTokenListToNode([]) is PY38.ParseTokenListToNode(["\n", "x"]) is None
    removed = CLogicalLine(kUnknown, (None, None), ((0, 0), (0, 1)))
    assert PY38.ParseToNode(removed).fText == "\n"


@pytest.mark.parametrize(
    ("text", "outcome"),
    [
        ("def f [ 1 , T , * , ** P", ParseError),
        ("def f [ T : int ]", TypeError),  # without positions no bound can be parsed
        ("def f [ 1 , T , U V , * , ** P ]", ["T", "** P"]),
        ("async #x class \\ A [ T ] ( B ) :", ["T"]),
        ("type X [ ] = T", []),
        ("x = 1", []),
        ("def f ( T ) :", []),
        ("def 1 [ T ]", []),
        ("async", []),
        ("type", []),
        ("class A", []),
        ("", []),
    ],
)
def test_type_parameters_without_their_statement(text, outcome):
    try:
        found = list(map(Tokens, PY38.GetTypeParameterNodes(tuple(text.split()))))
    except (ParseError, TypeError) as error:
        found = type(error)
    assert found == outcome


@pytest.mark.parametrize(
    "parameters",
    [
        "T: int, *U, V: (a, b)",
        "T: # c\n int # d\n, U: \\\n x \\\n",
        "T: type, U: lambda: 0",
        "T: a b",
        "T: x, U: with",
        "T: async x",
        "T: @",
        "T: else",
        "T: ...",
        "T: x \\ , U",  # the last token of its bound, as if it went on in the next row
    ],
)
def test_bounds_are_the_same_for_a_host_subclass_which_gets_copies(parameters):
    def Outcome(driver):
        try:
            return Tokens(Parse(f"def f[{parameters}](): pass", driver=driver))
        except ParseError as error:
            return error.args

    host_class = type("Driver", (CPGenParserImpl,), {})
    assert Outcome(PY38) == Outcome(host_class((3, 8, 0)))


def test_token_indexes():
    toks = (None, "", "# x", "\\", "f", "(", ")", ")", "x")
    assert PY38._FindNextNonSkipIndex(toks, -1) == 4
    assert PY38._FindNextNonSkipIndex(toks, 8) == 9
    find = PY38._NonNestedFindTokenIndex
    assert find(")", toks, 4, 9) == 7
    assert find("x", toks, 4, 9) == -1  # the depth is below zero there
    assert find("x", toks, 8, 9) == 8 and find("x", toks, 8, 8) == -1
    with pytest.raises(TypeError):
        find("x", toks, 0, 9)


@pytest.mark.parametrize(
    ("grammar", "failure", "words"),
    [
        (None, OSError, "Grammar"),
        ("file_input: NAME NEWLINE ENDMARKER\nstmt: (\n", ValueError, r"Grammar:\d: "),
        ("start: NAME NEWLINE ENDMARKER\n", KeyError, "file_input"),
    ],
)
def test_broken_grammars(tmp_path, grammar, failure, words):
    path = tmp_path / "Grammar"
    if grammar is not None:
        path.write_text(grammar)
    with pytest.raises(failure, match=words):
        CPGenParserImpl((3, 8, 0), str(path))
