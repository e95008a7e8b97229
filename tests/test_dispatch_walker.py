"""CDispatchWalker: the dictionary's say, the limits, and a walker that is idle again whatever happens."""

import pytest
from hand_made import Leaf, Node, Parse

from codeloom.treesift import CAtom, CAtomExpr, CDispatchWalker, CNameLiteral, CNode, CTrailer
from codeloom.utils import GetLogicalsFromText

(LOGICAL,) = GetLogicalsFromText("x")


def Seen(dispatch, node):
    """The tokens of the nodes that reach the visits, for visits that are mapped to their results."""
    seen = []

    def Visit(result):
        def Run(walker, node):
            seen.append(node.fText or type(node).__name__)
            return result

        return Run

    visits = {cls: result if result in (False, None) else Visit(result) for cls, result in dispatch.items()}
    CDispatchWalker(visits).Walk(node, LOGICAL, False)
    return seen


@pytest.mark.parametrize(
    ("dispatch", "seen"),
    [
        ({}, []),
        ({CNameLiteral: 1}, ["a", "b", "c"]),
        ({CNameLiteral: 1, CTrailer: False}, ["a"]),  # neither called nor entered
        ({CNameLiteral: 1, CTrailer: ""}, ["a", "CTrailer", "CTrailer"]),  # called, not entered
        ({CNameLiteral: 1, CTrailer: [0]}, ["a", "CTrailer", "b", "CTrailer", "c"]),
        ({CNameLiteral: 1, CTrailer: None}, ["a", "b", "c"]),
        ({CNode: 1, CAtom: 1}, [".", "(", ")"]),  # the exact class counts, not its bases
        ({CAtomExpr: ()}, ["CAtomExpr"]),
    ],
)
def test_the_dictionary_decides(dispatch, seen):
    assert Seen(dispatch, Parse("a.b(c)")) == seen


def test_a_change_of_the_dictionary_counts_at_once():
    seen = []

    def Visit(walker, node):
        seen.append(node.fText)
        if node.fText == "b":
            walker._fDispatchDict[CNameLiteral] = False
        return True

    walker = CDispatchWalker({CNameLiteral: Visit})
    for _ in range(2):
        walker.Walk(Parse("a, b, c, d"), LOGICAL, False)
    walker._fDispatchDict[CNameLiteral] = Visit
    walker.Walk(Parse("e"), LOGICAL, False)
    assert seen == ["a", "b", "e"]


def test_a_visit_sees_the_line_and_its_parents():
    def Visit(walker, node):
        assert walker._fLogical is LOGICAL
        parents.append([type(parent).__name__ for parent in walker._fNodeStack])

    parents = []
    walker = CDispatchWalker({CNameLiteral: Visit})
    walker.Walk(Parse("f(a)"), LOGICAL, True)
    assert parents == [["CAtomExpr", "CNameLiteral"], ["CAtomExpr", "CTrailer", "CNameLiteral"]]
    assert walker._fLogical is None and walker._fNodeStack == []


def Nested(depth):
    node = Leaf("x")
    for _ in range(depth - 1):
        node = Node(CNode, node)
    return node


@pytest.mark.parametrize(
    ("tree", "complaint"),
    [
        (Nested(40), ""),
        (Nested(41), "recurse count in"),
        (Node(CNode, *[Leaf("x")] * 9_999), ""),
        (Node(CNode, *[None] * 9_999), ""),  # none counts like a node
        (Node(CNode, *[None] * 10_000), "number of calls to"),
    ],
)
def test_limits_end_a_walk_with_a_printed_line(tree, complaint, capfd):
    walker = CDispatchWalker(None)
    for _ in range(2):  # each walk counts anew
        walker.Walk(tree, LOGICAL, False)
        printed = capfd.readouterr().out
        if complaint:
            message = f"RuntimeError('Maximum {complaint} _VisitNode exceeded')"
            assert printed == f"RuntimeError raised in CNodeWalker.Walk: {message}\n"
        else:
            assert printed == ""


def test_failures_leave_the_walker_idle():
    def Visit(walker, node):
        with pytest.raises(ValueError, match="Only one logical may be walked at a time"):
            walker.Walk(node, LOGICAL, False)
        raise KeyError(node.fText)

    walker = CDispatchWalker({CNameLiteral: Visit})
    for _ in range(2):
        with pytest.raises(KeyError):
            walker.Walk(Parse("a.b"), LOGICAL, False)
        assert walker._fLogical is None and walker._fNodeStack == []


def test_an_override_sees_every_node_and_may_go_on_after_a_failure():
    class Walker(CDispatchWalker):
        def _VisitNode(self, node):
            visited.append(node)
            try:
                super()._VisitNode(node)
            except KeyError:
                failures.append(node.fText)

    def Visit(walker, node):
        raise KeyError

    visited, failures = [], []
    Walker({CNameLiteral: Visit}).Walk(Parse("a.b(c, 1)"), LOGICAL, False)
    assert failures == ["a", "b", "c"] and len(visited) == 12


class NotItself(CDispatchWalker):
    def _VisitNode(self, node):
        try:
            super()._VisitNode(node)
        except RuntimeError:
            if node.fText != "x":
                raise


def test_odd_arguments():
    for dispatch in ([], 7, "x"):
        with pytest.raises(TypeError, match="expected dict"):
            CDispatchWalker(dispatch)
    walker = CDispatchWalker({CNameLiteral: 7})
    for tree, failure in [(Parse("a"), TypeError), (Node(CNode, "x"), TypeError)]:
        with pytest.raises(failure):
            walker.Walk(tree, LOGICAL, False)
    with pytest.raises(TypeError):
        walker.Walk(None, None, False)
    cyclic = Node(CNode)
    cyclic.fChildren.append(cyclic)
    walker.Walk(cyclic, LOGICAL, False)
    with pytest.raises(AssertionError):  # what an override hides leaves its node on the stack
        NotItself(None).Walk(Nested(41), LOGICAL, False)


def test_a_walk_over_children_that_vanish():
    def Visit(walker, node):
        walker._fNodeStack[0].fChildren.clear()
        return True

    tree = Parse("a, b, c")
    CDispatchWalker({CNameLiteral: Visit}).Walk(tree, LOGICAL, False)
    assert tree.fChildren == []
