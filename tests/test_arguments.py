"""Parameters and arguments as records, whatever shape the grammar gave them."""

import gc
from contextlib import suppress

import pytest
from hand_made import Leaf, Node, Parse, Tokens
from run_python import RunPython

from codeloom.treesift import (
    CArgInfo,
    CDefiningArglistNode,
    CFunctionParameterDef,
    CNameLiteral,
    CNode,
    CParametersNode,
    CSingleUsedArgumentNode,
    CUsedArglistNode,
    GetDefiningArgInfoList,
    GetTokenEndIndex,
    GetUsedArgInfoList,
)


def Written(arguments):
    """Records as one would write them; a value without a name is after "=" too."""
    return [
        Written(argument)
        if isinstance(argument, list)
        else f"{argument.prefix or ''}{Tokens(argument.name)}"
        f"{': ' + Tokens(argument.type_expr) if argument.type_expr else ''}"
        f"{'=' + Tokens(argument.value) if argument.value else ''}"
        for argument in arguments
    ]


def Parameters(source):
    return Parse(source).GetParameters()


def test_records():
    info = CArgInfo()
    for field in ("name", "value", "prefix", "type_expr"):
        assert getattr(info, field) is None
        with pytest.raises(AttributeError):
            setattr(info, field, None)
    node = Parameters("def f(a): pass")
    first, second = GetDefiningArgInfoList(node), GetDefiningArgInfoList(node)
    assert first is not second and first[0] is not second[0]
    assert first[0].name is second[0].name is node.GetChild(1)


def test_records_are_collected():
    before = len(gc.get_objects())
    for _ in range(1000):
        arguments = GetDefiningArgInfoList(Parameters("def f(a, *b): pass"))
        arguments.append(arguments)
    del arguments
    gc.collect()
    assert len(gc.get_objects()) - before < 500


def test_other_shapes():
    name, comma = Leaf("a", cls=CNameLiteral), Leaf(",")
    assert Written(GetDefiningArgInfoList(Node(CDefiningArglistNode, comma, name, comma))) == ["a"]
    brackets = Leaf("("), name, Leaf(")")
    assert Written(GetDefiningArgInfoList(Node(CDefiningArglistNode, *brackets))) == ["a"]
    plain = name, Leaf(":"), Leaf("int"), Leaf("="), Leaf("1"), comma, name
    assert Written(GetDefiningArgInfoList(Node(CDefiningArglistNode, *plain))) == ["a: int=1", "a"]
    nested = Node(CFunctionParameterDef, Leaf("("), Node(CParametersNode, comma, comma), Leaf(")"))
    assert GetDefiningArgInfoList(nested) == [[]]
    # Between commas of a call a record is made all the same.
    assert Written(GetUsedArgInfoList(Node(CUsedArglistNode, comma, name, comma))) == ["", "=a"]
    assert GetUsedArgInfoList(Node(CUsedArglistNode)) == []
    assert GetUsedArgInfoList(None)[0].value is None


def test_a_child_that_is_no_parameter():
    strange = Leaf("@")
    with pytest.raises(AssertionError) as caught:
        GetDefiningArgInfoList(Node(CDefiningArglistNode, strange))
    assert str(caught.value) == (
        "Text is not ( or ): text = '@', type(child) = <class 'codeloom.treesift.CNode'>"
    )
    with pytest.raises(AssertionError) as caught:
        GetDefiningArgInfoList(strange)
    assert caught.value.args == ((strange, "@"),)


def test_without_assertions_it_is_skipped():
    code = """if True:
        from codeloom.treesift import *
        class Grammar: number2symbol = {}
        factory = CNodeFactory(Grammar, [], {}, {}, {})
        def New(cls, *rest): return factory.NewNode(CNodeClassInfo(cls, 0, ""), 0, *rest)
        strange = New(CNode, "@", 0, None)
        name = New(CNameLiteral, "a", 1, None)
        arguments = GetDefiningArgInfoList(New(CDefiningArglistNode, None, 0, [strange, name]))
        print([argument.name.fText for argument in arguments])
        print(GetDefiningArgInfoList(strange)[0].name is strange)
    """
    assert RunPython(code, "-O") == "['a']\nTrue\n"


@pytest.mark.parametrize("ask", [GetDefiningArgInfoList, GetUsedArgInfoList, GetTokenEndIndex])
def test_odd_trees_end(ask):
    for cls in (CDefiningArglistNode, CUsedArglistNode, CParametersNode, CFunctionParameterDef):
        for children in ([], [1], [None], [1, 2, 3], [Leaf("("), Leaf("("), Leaf(")")]):
            with suppress(TypeError, IndexError, AttributeError, AssertionError):
                ask(Node(cls, *children))
    with pytest.raises(TypeError):
        ask(1)


def test_a_bottomless_tree():
    node = Node(CFunctionParameterDef, Leaf("("), None, Leaf(")"))
    node.fChildren[1] = node
    with pytest.raises(RecursionError):
        GetDefiningArgInfoList(node)


def test_where_a_node_ends():
    assert GetTokenEndIndex(Leaf("x", context=4)) == 5
    assert GetTokenEndIndex(Parse("f(a, b)")) == 6
    assert GetTokenEndIndex(Parse("def f(a): pass")) == 7
    assert GetTokenEndIndex(Node(CNode, Leaf("x", 1), Node(CNode, context=7))) == 8
    for context in ((0, 4), None, "4", 2**80):
        with pytest.raises(TypeError):
            GetTokenEndIndex(Leaf("x", context=context))
    for length in (1, 2, 3):
        nodes = [Node(CNode, Leaf("x"), Leaf("y")) for _ in range(length)]
        for node, child in zip(nodes, nodes[1:] + nodes[:1], strict=True):
            node.fChildren[-1] = child
        with pytest.raises(ValueError, match="contains itself"):
            GetTokenEndIndex(Node(CNode, nodes[0]))


def test_an_override_that_empties_the_list():
    class Argument(CSingleUsedArgumentNode):
        def GetValue(self):
            arguments.fChildren.clear()
            return self

    arguments = Node(CUsedArglistNode, Node(Argument), Leaf(","), Leaf("b"))
    assert len(GetUsedArgInfoList(arguments)) == 1
