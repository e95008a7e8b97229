"""Accessors of statements beyond the golden trees: other shapes, failures, overrides."""

import inspect
from contextlib import suppress

import pytest
from hand_made import Leaf, Node, Parse, Tokens

from codeloom import treesift
from codeloom.treesift import (
    CCaseStmt,
    CDelStmt,
    CExceptClause,
    CExprStmt,
    CForStmt,
    CFuncdefStmt,
    CGlobalStmt,
    CNameLiteral,
    CNode,
    CParametersNode,
    CTestListStarExpr,
    CTypeParameter,
    CWithItem,
    CWithTypeParameters,
)

ITSELF = object()

# What each accessor answers, or raises: on a leaf, on an empty list, on eight foreign children.
ODD_NODES = """
CClassdefStmt.GetClassName                          None       None        TypeError
CClassdefStmt.GetBaseClassList                      []         []          TypeError
CFuncdefStmt.GetFunctionName                        None       None        TypeError
CFuncdefStmt.GetParameters                          TypeError  IndexError  TypeError
CFuncdefStmt.GetReturnType                          None       None        TypeError
CFuncdefStmt.GetSuite                               None       None        TypeError
CIfStmt.GetTestExpression                           TypeError  IndexError  TypeError
CMatchStmt.GetTestExpression                        TypeError  IndexError  TypeError
CCaseStmt.GetPattern                                TypeError  IndexError  TypeError
CCaseStmt.GetGuard                                  None       None        TypeError
CCaseStmt.GetBody                                   TypeError  IndexError  TypeError
CDelStmt.GetExpressions                             []         []          []
CSingleDecorator.GetDottedName                      TypeError  IndexError  TypeError
CSingleDecorator.GetUsedArgList                     []         []          TypeError
CGlobalStmt.GetUtf8NameList                         TypeError  []          []
CNonlocalStmt.GetUtf8NameList                       TypeError  []          []
CForStmt.GetTarget                                  TypeError  IndexError  TypeError
CForStmt.GetInExpression                            TypeError  IndexError  TypeError
CForStmt.GetBody                                    TypeError  IndexError  TypeError
CForStmt.GetElseBody                                None       None        TypeError
CWithStmt.GetWithItems                              TypeError  []          []
CWithItem.GetExpression                             TypeError  IndexError  TypeError
CWithItem.GetTarget                                 TypeError  IndexError  TypeError
CExceptClause.GetExceptionType                      None       None        TypeError
CExceptClause.GetTarget                             None       None        TypeError
CExprStmt.GetEqualCount                             TypeError  0           TypeError
CExprStmt.GetAnnotatedAssignNode                    None       None        None
CExprStmt.GetInitialTestExpr                        TypeError  IndexError  TypeError
CExprStmt.GetPostEqualsTestExpr                     TypeError  ValueError  TypeError
CExprStmt.GetAugAssignOp                            None       None        TypeError
CAnnotatedAssignNode.GetTypeHintNode                TypeError  IndexError  TypeError
CAnnotatedAssignNode.GetPostEqualsTestExpr          None       None        TypeError
CReturnStmt.GetValue                                None       None        TypeError
CTypeParameter.GetName                              None       IndexError  TypeError
CTypeParameter.GetPrefix                            None       None        TypeError
CTypeParameter.GetSpecNode                          None       None        TypeError
CWithTypeParameters.GetTypeParameters               TypeError  []          TypeError
CWithTypeParameters.GetTypeParameterScopedStatement TypeError  IndexError  TypeError
CImportNamesStmt.GetAsNameList                      TypeError  IndexError  TypeError
CFromImportStmt.GetFromString                       None       None        TypeError
CFromImportStmt.GetImportStar                       False      False       TypeError
CFromImportStmt.GetAsNameList                       TypeError  IndexError  TypeError
CFromImportStmt._GetImportIndex                     -1         -1          TypeError
CSingleUsedArgumentNode.GetPrefix                   None       None        TypeError
CSingleUsedArgumentNode.GetName                     None       None        TypeError
CSingleUsedArgumentNode.GetValue                    ITSELF     ITSELF      TypeError
CSingleUsedArgumentNode.IsUnparenthesizedGenExpr    False      False       False
CSingleUsedArgumentNode.GetNameAssigned             None       None        TypeError
CSingleUsedArgumentNode.GetNamedRightHandExpression None       None        TypeError
CFunctionParameterDef.GetNestedListNode             None       None        None
CFunctionParameterDef.GetName                       None       None        TypeError
CFunctionParameterDef.GetTypeExpr                   None       None        None
"""
ROWS = [row.split() for row in ODD_NODES.strip().splitlines()]


@pytest.mark.parametrize("row", ROWS, ids=[row[0] for row in ROWS])
def test_odd_nodes(row):
    class_name, _, accessor = row[0].partition(".")
    cls = getattr(treesift, class_name)
    arguments = [0] if row[0] == "CExprStmt.GetPostEqualsTestExpr" else []
    nodes = Leaf(cls=cls), Node(cls), Node(cls, *range(8))
    for node, answer in zip(nodes, map(eval, row[1:]), strict=True):
        ask = getattr(node, accessor)
        if inspect.isclass(answer):
            with pytest.raises(answer):
                ask(*arguments)
        else:
            assert ask(*arguments) == (node if answer is ITSELF else answer)


def test_the_rows_are_complete():
    told = {tuple(row[0].split(".")) for row in ROWS}
    for class_name in {class_name for class_name, _ in told}:
        for name, value in vars(getattr(treesift, class_name)).items():
            assert name.startswith("__") or not callable(value) or (class_name, name) in told


@pytest.mark.parametrize("row", ROWS, ids=[row[0] for row in ROWS])
def test_short_lists_never_crash(row):
    class_name, _, accessor = row[0].partition(".")
    arguments = [0] if row[0] == "CExprStmt.GetPostEqualsTestExpr" else []
    for child in (None, 1, Leaf("x", cls=CNameLiteral)):
        for count in range(1, 5):
            ask = getattr(Node(getattr(treesift, class_name), *[child] * count), accessor)
            with suppress(TypeError, IndexError, ValueError, AttributeError):
                ask(*arguments)


def test_a_result_of_another_class_is_a_type_error():
    with pytest.raises(TypeError, match=r"CExpression, .*CNode"):
        Parse("if ...: pass").GetTestExpression()
    with pytest.raises(TypeError, match="CExpression"):
        Parse("def f() -> ...: pass").GetReturnType()
    with pytest.raises(TypeError, match="CExpression"):
        Parse("match ...:").GetTestExpression()
    with pytest.raises(TypeError, match="CParametersNode"):
        Node(CFuncdefStmt, Leaf("def"), Leaf("f"), Leaf("(")).GetParameters()
    assert Node(CFuncdefStmt, Leaf("def"), Leaf("f"), None).GetParameters() is None


def test_equals_signs():
    node = Parse("x = y = 1")
    assert [node.GetPostEqualsTestExpr(i).fText for i in (-1, 0, 1)] == ["x", "y", "1"]
    for too_many in (2, 2**31 - 1):
        with pytest.raises(ValueError, match=r"^Not enough ='s$"):
            node.GetPostEqualsTestExpr(too_many)
    with pytest.raises(IndexError):
        node.GetPostEqualsTestExpr(-4)
    with pytest.raises(TypeError):
        node.GetPostEqualsTestExpr(2**70)


def test_augmented_assignments():
    def Operator(text):
        return Node(CExprStmt, Leaf("x"), Leaf(text), Leaf("y")).GetAugAssignOp()

    for text in ("+=", "-=", "*=", "/=", "%=", "&=", ",=", "^=", "<<=", ">>=", "**=", "//="):
        assert Operator(text) == text
    for text in ("|=", "@=", "=", "==", ":=", ",", "+", "é=", ""):
        assert Operator(text) is None


def test_what_is_deleted():
    def Deleted(child):
        return [Tokens(node) for node in Node(CDelStmt, Leaf("del"), child).GetExpressions()]

    a, b = Leaf("a", cls=CNameLiteral), Leaf("b", cls=CNameLiteral)
    assert Deleted(a) == ["a"] and Deleted(Node(CNode, a, b)) == ["a b"]
    assert Deleted(Node(CTestListStarExpr, a, Leaf(","), b)) == ["a", "b"]
    with pytest.raises(ValueError) as caught:
        Deleted(Node(CTestListStarExpr, Leaf("..."), Leaf(",")))
    assert str(caught.value).startswith("Elenment 0 of <class 'codeloom.treesift.CTestListStarExpr'>")

    class List(CTestListStarExpr):
        def GetSubExprCount(self):
            return 1

    assert Deleted(Node(List, a, Leaf(","), b)) == ["a"]


def test_for_has_an_else_body_with_eight_children_only():
    for count in range(10):
        children = [Leaf(str(i)) for i in range(count)]
        assert Tokens(Node(CForStmt, *children).GetElseBody()) == ("7" if count == 8 else "")


def test_except_targets():
    for words, target in [
        ("except A as b", "b"),
        ("except A , b", "b"),
        ("except A . b", ""),
        ("as b", ""),
        ("except as b", "b"),
    ]:
        node = Node(CExceptClause, *map(Leaf, words.split()))
        assert Tokens(node.GetTarget()) == target


def test_with_items_of_subclasses():
    class Item(CWithItem):
        pass

    node = Parse("with a as b, c: pass")
    item = Node(Item, Leaf("c"))
    node.fChildren[3] = item
    assert node.GetWithItems() == [node.GetChild(1), item]


def test_new_lists():
    for source, accessor in [
        ("global a, b", "GetUtf8NameList"),
        ("with a as b:", "GetWithItems"),
        ("del a, b", "GetExpressions"),
        ("class A(B):", "GetBaseClassList"),
        ("@a", "GetUsedArgList"),
        ("def f[T](): pass", "GetTypeParameters"),
    ]:
        ask = getattr(Parse(source), accessor)
        first = ask()
        assert isinstance(first, list)
        first.clear()
        assert len(ask()) == (0 if source == "@a" else len(ask())) and ask() is not ask()


def test_names_are_name_literals():
    a, keyword = Leaf("a", cls=CNameLiteral), Leaf("None", cls=treesift.CKeywordLiteral)
    assert Node(CGlobalStmt, a, a, keyword, Leaf("b"), a).GetUtf8NameList() == ["a", "a"]


def test_type_parameters_without_a_statement():
    parameter = Node(CTypeParameter, Leaf("T"))
    node = Node(CWithTypeParameters, parameter, None)
    assert node.GetTypeParameters() == [parameter]
    assert node.GetTypeParameterScopedStatement() is None


def test_type_parameters():
    for words, answers in [
        ("T", ("T", None, "")),
        ("* T", ("T", "*", "")),
        ("** T", ("T", "**", "")),
        ("T : int", ("T", None, "int")),
        ("* T : int", ("T", "*", "int")),
    ]:
        node = Node(CTypeParameter, *map(Leaf, words.split()))
        assert (node.GetName(), node.GetPrefix(), Tokens(node.GetSpecNode())) == answers


def test_case_guards():
    for words, guard, body in [
        ("case a :", "", ""),
        ("case a : b", ":", "b"),
        ("case a b :", "b", ""),
        ("case a b : c", "b", "c"),
    ]:
        node = Node(CCaseStmt, *map(Leaf, words.split()))
        assert (Tokens(node.GetGuard()), Tokens(node.GetBody())) == (guard, body)


def test_overrides_reach_every_caller():
    class Funcdef(CFuncdefStmt):
        def GetParameters(self):
            return super().GetParameters() or Node(CParametersNode)

    empty = Node(Funcdef, Leaf("def"), Leaf("f"), None)
    assert type(empty.GetParameters()) is CParametersNode
    # The base operation stays what it is.
    assert CFuncdefStmt.GetParameters(empty) is None
