"""Import statements as records."""

import pytest
from hand_made import Leaf, Node

from codeloom import treesift
from codeloom.treesift import CAsName, CFromImportStmt, CImportNamesStmt, CNode


def Names(node):
    return [(name.module_name, name.as_name) for name in node.GetAsNameList()]


def test_statements_are_no_cstmt():
    assert CImportNamesStmt.__base__ is CFromImportStmt.__base__ is CNode


def test_a_from_without_import():
    node = Node(CFromImportStmt, Leaf("from"), Leaf("a"), Leaf("*"))
    assert (node._GetImportIndex(), node.GetFromString(), node.GetImportStar()) == (-1, None, True)
    assert Names(node) == [("from", None)]
    assert Node(CFromImportStmt, Leaf("from"), Leaf("import")).GetFromString() is None


def test_module_functions():
    tree = Node(CNode, Leaf("a"), Node(CNode, Leaf("."), Leaf(None), Leaf("b")), Leaf("as"))
    assert treesift._TextForImportName([tree, Leaf("c")]) == "a.bas" + "c"
    assert treesift._TextForImportName([]) == ""
    assert treesift._GetMatchingChildToken(tree, "as") == 2
    assert treesift._GetMatchingChildToken(tree, "b") == -1
    assert treesift._GetMatchingChildToken(Leaf("as"), "as") == -1
    single = treesift._ProcessSingleModuleNameAs(Node(CNode, Leaf("a"), Leaf("as"), Node(CNode)))
    assert (single.module_name, single.as_name) == ("a", None)
    names = treesift._ProcessAsNamesList(Node(CNode, Leaf("a"), Leaf(","), Leaf(",")))
    assert [name.module_name for name in names] == ["a"]


def test_odd_arguments():
    for ask in (treesift._ProcessSingleModuleNameAs, treesift._ProcessAsNamesList):
        with pytest.raises(AttributeError):
            ask(None)
    for odd in (1, [1], [None], (Leaf("a"),), None):
        with pytest.raises(TypeError):
            treesift._TextForImportName(odd)
    bottomless = Node(CNode)
    bottomless.fChildren.append(bottomless)
    with pytest.raises(RecursionError):
        treesift._TextForImportName([bottomless])


def test_records_are_open():
    name = CAsName()
    assert (name.module_name, name.as_name) == (None, None)
    name.module_name, name.as_name = "a.b", 1
    assert (name.module_name, name.as_name) == ("a.b", 1)
    with pytest.raises(TypeError):
        name.module_name = 1
    name.module_name = None
    assert name.module_name is None
