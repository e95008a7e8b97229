"""Accessors of statements beyond the golden trees: other shapes, failures, overrides."""

import pytest
from hand_made import Leaf, Node, Parse, Tokens

from codeloom import treesift
from codeloom.treesift import (
    CDelStmt,
    CExceptClause,
    CExprStmt,
    CForStmt,
    CFuncdefStmt,
    CGlobalStmt,
    CNameLiteral,
    CNode,
    CTestListStarExpr,
    CTypeParameter,
    CWithItem,
    CWithTypeParameters,
)


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
    for source, accessor, count in [
        ("a.b[0]", "GetTrailers", 2),
        ("global a, b", "GetUtf8NameList", 2),
        ("with a as b:", "GetWithItems", 1),
        ("del a, b", "GetExpressions", 2),
        ("class A(B):", "GetBaseClassList", 1),
        ("@a", "GetUsedArgList", 0),
        ("def f[T](): pass", "GetTypeParameters", 1),
    ]:
        ask = getattr(Parse(source), accessor)
        first = ask()
        first.append(None)
        assert len(ask()) == count and ask() is not ask()


def test_names_are_name_literals():
    a, keyword = Leaf("a", cls=CNameLiteral), Leaf("None", cls=treesift.CKeywordLiteral)
    assert Node(CGlobalStmt, a, a, keyword, Leaf("b"), a).GetUtf8NameList() == ["a", "a"]


def test_type_parameters_without_a_statement():
    parameter = Node(CTypeParameter, Leaf("T"))
    node = Node(CWithTypeParameters, parameter, None)
    assert node.GetTypeParameters() == [parameter]
    assert node.GetTypeParameterScopedStatement() is None
