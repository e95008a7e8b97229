"""What the accessors of all node classes do with nodes that no parser makes: they answer, or raise."""

import inspect
from contextlib import suppress

import pytest
from hand_made import Leaf, Node

from codeloom import treesift
from codeloom.treesift import CCompForNode, CKeywordLiteral, CNameLiteral, CNode

INDEXED = {"GetSubExpr", "GetTerm", "GetOperatorStr", "CExprStmt.GetPostEqualsTestExpr"}
CLASSES = filter(inspect.isclass, vars(treesift).values())
NODE_CLASSES = [cls for cls in CLASSES if issubclass(cls, CNode) and cls is not CNode]
ACCESSORS = [
    (cls, name)
    for cls in NODE_CLASSES
    for name, value in vars(cls).items()
    if callable(value) and not name.startswith("__")
]


def OddNodes(cls):
    yield Leaf(cls=cls)
    yield Node(cls)
    yield Node(cls, *range(8))
    leaves = Leaf("x", cls=CNameLiteral), Leaf("async", cls=CKeywordLiteral), Node(CCompForNode)
    for child in (None, 1, *leaves):
        for count in range(1, 5):
            yield Node(cls, *[child] * count)


@pytest.mark.parametrize(
    ("cls", "name"), ACCESSORS, ids=[f"{cls.__name__}.{name}" for cls, name in ACCESSORS]
)
def test_odd_nodes_never_crash(cls, name):
    indexes = [0] if {name, f"{cls.__name__}.{name}"} & INDEXED else []
    for node in OddNodes(cls):
        with suppress(TypeError, IndexError, ValueError, AttributeError):
            getattr(node, name)(*indexes)


def test_all_accessors_are_asked():
    assert len(ACCESSORS) > 95
