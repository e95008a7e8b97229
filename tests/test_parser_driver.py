"""The parser driver: invented tokens, async rules, backslashes, the peeling of the root, recovery."""

import pytest

from codeloom.logicalline import CLogicalLine, kUnknown
from codeloom.optpgen import ParseError
from codeloom.treesift import (
    CDottedName,
    CExpression,
    CIfElseExpression,
    CNameLiteral,
    CNode,
    COperatorExpression,
    CPGenParserImpl,
    CTestListStarExpr,
    kPy2DefaultGrammar,
)
from codeloom.utils import GetLogicalsFromText

PY38 = CPGenParserImpl((3, 8, 0))
PY35 = CPGenParserImpl((3, 5, 0))
PY27 = CPGenParserImpl((2, 7, 18), kPy2DefaultGrammar, ["print", "exec", "if", "def"], False)


def Shape(node):
    """A tree as nested lists of state names and token texts."""
    if node.fChildren is None:
        return node.fText
    return [node.GetStateName(), *map(Shape, node.fChildren)]


def Parse(text, driver=PY38, in_async_def=False):
    (logical,) = GetLogicalsFromText(text)
    return driver.ParseToNode(logical, in_async_def)


def Refused(text, driver=PY38, in_async_def=False):
    with pytest.raises(ParseError) as caught:
        Parse(text, driver, in_async_def)
    return caught.value.context


@pytest.mark.parametrize(
    ("text", "shape"),
    [
        ("else:", ["if_stmt", "if", "0", ":", "pass", "else", ":", "pass"]),
        ("try: x", ["try_stmt", "try", ":", "x", "finally", ":", "pass"]),
        ("x = (1, # one\n 2)", ["expr_stmt", "x", "=", ["atom", "(", ["testlist_comp", "1", ",", "2"], ")"]]),
        ("x = \\\n 1", ["expr_stmt", "x", "=", "1"]),
    ],
)
def test_shapes_beyond_the_golden_trees(text, shape):
    assert Shape(Parse(text)) == shape


def test_the_class_table():
    table = CPGenParserImpl.kClsForState
    assert (table["test"], table["term"]) == (CIfElseExpression, COperatorExpression)
    assert (table["testlist_comp"], table["dotted_name"]) == (CTestListStarExpr, CDottedName)
    assert table["comp_for"] is table["sync_comp_for"] is table["list_for"]
    classes = PY38._BuildClsForStateList()
    assert classes[1] is CNameLiteral and classes[0] is CNode and classes[-1] is None
    assert CExpression.kSupportedRules == CNode.kSupportedRules == []
    assert all(isinstance(rule, str) for cls in table.values() for rule in cls.kSupportedRules)


def test_token_indexes_are_those_of_the_logical():
    node = Parse("x = (1, # one\n 2)")
    assert [child.fContext for child in node.fChildren] == [0, 1, 2]
    assert [child.fContext for child in node.GetChild(2).GetChild(1).fChildren] == [3, 4, 6]


def test_async_and_await():
    assert Shape(Parse("async def f(): pass")) == [
        "async_stmt",
        "async",
        ["funcdef", "def", "f", ["parameters", "(", ")"], ":", "pass"],
    ]
    assert Shape(Parse("async def f(): pass", PY35))[1] == "async"
    assert Shape(Parse("await x")) == ["atom_expr", "await", "x"]
    assert Refused("await x", PY35) == 1
    assert Shape(Parse("await x", PY35, True)) == ["atom_expr", "await", "x"]
    assert Shape(Parse("async = await", PY35)) == ["expr_stmt", "async", "=", "await"]
    assert Refused("async with x: pass", PY35) == 1
    assert Shape(Parse("async with x: pass", PY35, True))[1] == "async"
    assert Parse("async \\\n def f(): pass", PY35).GetChildText(0) == "async"


def test_an_ellipsis_in_the_older_grammar():
    assert Shape(Parse("x[...]", PY27)) == ["power", "x", ["trailer", "[", ["subscript", ".", ".", "."], "]"]]
    assert Shape(Parse("x = ...")) == ["expr_stmt", "x", "=", "..."]
    assert Refused("x = ...", PY27) == 2


def test_backslashes():
    assert Refused("x = 1 \\ y") == 3
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


def test_logicals_of_no_statement():
    assert PY38.ParseTokenListToNode([]) is None
    removed = CLogicalLine(kUnknown, (None, None), ((0, 0), (0, 1)))
    assert PY38.ParseToNode(removed).fText == "\n"


def test_statements_with_removed_tokens():
    assert Shape(Parse("with (open(a) as f, b):")) == Shape(Parse("with open(a) as f, b:"))
    assert Refused("except*:") == 1
    assert Refused("with (a") == 3
    for name in ("type = 1", "type(x)"):
        assert Parse(name).GetChildCount() in (2, 3)


def test_type_parameters():
    assert Shape(Parse("type X[T] = list[T]").fChildren[1]) == Shape(Parse("X = list[T]"))
    assert Shape(Parse("type X = int")) == Shape(Parse("X = int"))
    assert Parse("def f[](): pass").GetChildCount() == 1
    assert Refused("def f[T(x):") == 2
    assert Refused("class C[1]:") == 3
    assert [
        node.GetChildText(0) for node in PY38.GetTypeParameterNodes(("def", "f", "[", "1", ",", "T", "]"))
    ] == ["T"]
    assert PY38.GetTypeParameterNodes(("x", "=", "1")) == []
    with pytest.raises(ParseError):
        PY38.GetTypeParameterNodes(("def", "f", "[", "T"))
    with pytest.raises(TypeError):
        PY38.GetTypeParameterNodes(("def", "f", "[", "T", ":", "int", "]"))


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
    ],
)
def test_bounds_are_the_same_for_a_host_subclass_which_gets_copies(parameters):
    class Driver(CPGenParserImpl):
        pass

    def Outcome(driver):
        try:
            return Shape(Parse(f"def f[{parameters}](): pass", driver))
        except ParseError as error:
            return error.args

    assert Outcome(PY38) == Outcome(Driver((3, 8, 0)))


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


def test_free_lists_are_balanced():
    driver = CPGenParserImpl((3, 8, 0))

    def Count(node):
        return 1 + sum(map(Count, node.fChildren or ()))

    def Free():
        total = 0
        for info in driver_infos:
            node = info.fFirstFree
            while node is not None:
                total, node = total + 1, node.fNextFree
        return total

    tree = Parse("x = [f(a, b=1) for a in c]", driver)
    driver_infos = {id(n.fClsInfo): n.fClsInfo for n in Nodes(tree)}.values()
    before, count = Free(), Count(tree)
    driver.DiscardNode(tree)
    assert Free() == before + count
    again = Parse("x = [f(a, b=1) for a in c]", driver)
    assert Free() == before and Count(again) == count


def Nodes(node):
    yield node
    for child in node.fChildren or ():
        yield from Nodes(child)


def test_broken_grammars(tmp_path):
    with pytest.raises((OSError, ValueError), match="nowhere"):
        CPGenParserImpl((3, 8, 0), str(tmp_path / "nowhere"))
    broken = tmp_path / "broken"
    broken.write_text("file_input: NAME NEWLINE ENDMARKER\nstmt: (\n")
    with pytest.raises(Exception, match=r"broken.*[23]"):
        CPGenParserImpl((3, 8, 0), str(broken))
    broken.write_text("start: NAME NEWLINE ENDMARKER\n")
    with pytest.raises(KeyError, match="file_input"):
        CPGenParserImpl((3, 8, 0), str(broken))
