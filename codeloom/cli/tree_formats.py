"""The forms in which `codeloom tree` prints trees. None of them recurses: a tree may be of any depth."""

import json
from abc import ABC, abstractmethod
from collections.abc import Iterator, Mapping
from itertools import pairwise
from typing import Any

from codeloom.cli.console import Colour, Console, PrintablePath
from codeloom.excerpt import Printable
from codeloom.line_trees import LineTree
from codeloom.treesift import CNode


class TreeFormat(ABC):
    """Prints lines one after another, between Begin and End."""

    def __init__(self, console: Console) -> None:
        self._fConsole = console

    def Begin(self) -> None:  # noqa: B027
        """Print what stands in front of all lines."""

    @abstractmethod
    def Add(self, line: LineTree, has_heading: bool) -> None:
        """Print one line; without a heading when the reader knows already which line it is."""

    def End(self) -> None:  # noqa: B027
        """Print what stands behind all lines."""


class TextFormat(TreeFormat):
    """For people: one row for each node, indented."""

    def __init__(self, console: Console) -> None:
        super().__init__(console)
        self._fHasLines = False

    def Add(self, line: LineTree, has_heading: bool) -> None:
        """The line's place and text, and below it the tree, or what is wrong."""
        if self._fHasLines:
            self._fConsole.PrintRow("")
        self._fHasLines = True
        if line.problem is not None:
            self._fConsole.PrintProblem(line.problem)
            return
        if has_heading:
            self._fConsole.PrintRow(self._Heading(line))
        if line.tree is None:
            self._fConsole.PrintRow(self._fConsole.Coloured(Colour.DIM, "no tree"))
            return
        for node, depth in _Nodes(line.tree):
            self._fConsole.PrintRow("  " * depth + self._Row(node))

    def _Heading(self, line: LineTree) -> str:
        place = f"{PrintablePath(line.path)}:{line.row}:{line.column}:"
        return f"{self._fConsole.Coloured(Colour.BOLD, place)} {_FirstRow(line.text)}"

    def _Row(self, node: CNode) -> str:
        words = [(Colour.CYAN, type(node).__name__), (Colour.DIM, str(node.GetStateName()))]
        if node.fText is not None:
            words.append((Colour.GREEN, repr(node.fText)))
        if node.fContext is not None:
            words.append((Colour.DIM, f"@{node.fContext}"))
        return " ".join(self._fConsole.Coloured(colour, word) for colour, word in words)


class JsonFormat(TreeFormat):
    """For programs: a list of lines, on one row for each node."""

    def __init__(self, console: Console) -> None:
        super().__init__(console)
        self._fSeparator = ""

    def Begin(self) -> None:
        """Open the list."""
        self._fConsole.PrintRow("[")

    def Add(self, line: LineTree, has_heading: bool) -> None:
        """An object with the line's place and text, what is wrong, and the tree."""
        problem = line.problem
        head = {
            "path": line.path,
            "row": line.row,
            "column": line.column,
            "text": line.text,
            "error": problem and {"row": problem.row, "column": problem.column, "message": problem.message},
        }
        rows = ["null"] if line.tree is None else _JsonRows(line.tree)
        tree = "\n".join(rows)
        self._fConsole.PrintRow(f'{self._fSeparator}{json.dumps(head)[:-1]}, "tree": {tree}}}')
        self._fSeparator = ","

    def End(self) -> None:
        """Close the list."""
        self._fConsole.PrintRow("]")


class DotFormat(TreeFormat):
    """For Graphviz: a graph with the tree of each line. What is wrong goes to the standard error."""

    def __init__(self, console: Console) -> None:
        super().__init__(console)
        self._fNodeCount = 0

    def Begin(self) -> None:
        """Open the graph."""
        self._fConsole.PrintRow("digraph tree {")
        self._fConsole.PrintRow('  node [fontname="monospace"]; edge [arrowhead=none];')

    def Add(self, line: LineTree, has_heading: bool) -> None:
        """The text of the line, and its tree below it."""
        if line.problem is not None:
            self._fConsole.PrintError(line.problem.Rendered())
        if line.tree is None:
            return
        path = [self._AddNode(f"{line.row}: {_FirstRow(line.text)}", "plaintext")]
        for node, depth in _Nodes(line.tree):
            del path[depth + 1 :]
            is_leaf = node.fText is not None
            label = f"{type(node).__name__}\n{repr(node.fText) if is_leaf else node.GetStateName()}"
            path.append(self._AddNode(label, "box" if is_leaf else "ellipse"))
            self._fConsole.PrintRow(f"  {path[-2]} -> {path[-1]};")

    def End(self) -> None:
        """Close the graph."""
        self._fConsole.PrintRow("}")

    def _AddNode(self, label: str, shape: str) -> str:
        self._fNodeCount += 1
        name = f"n{self._fNodeCount}"
        quoted = label.replace("\\", "\\\\").replace('"', '\\"').replace("\n", "\\n")
        self._fConsole.PrintRow(f'  {name} [shape={shape} label="{quoted}"];')
        return name


FORMATS: Mapping[str, type[TreeFormat]] = {
    "text": TextFormat,
    "json": JsonFormat,
    "dot": DotFormat,
}


def _Nodes(tree: CNode) -> Iterator[tuple[CNode, int]]:
    """The nodes in source order, parents first, each with its depth."""
    pending = [(tree, 0)]
    while pending:
        node, depth = pending.pop()
        yield node, depth
        children = node.fChildren or ()
        pending += [(child, depth + 1) for child in reversed(children) if child is not None]


def _JsonRows(tree: CNode) -> Iterator[str]:
    """The nested object of a tree, a node on each row."""
    nodes = [(_JsonFields(node), depth) for node, depth in _Nodes(tree)]
    for (fields, depth), (_, next_depth) in pairwise([*nodes, ({}, 0)]):
        row = "  " * depth + json.dumps(fields)
        if next_depth > depth:
            yield f'{row[:-1]}, "children": ['
        else:
            yield row + "]}" * (depth - next_depth) + ("," if next_depth else "")


def _JsonFields(node: CNode) -> dict[str, Any]:
    fields = {
        "class": type(node).__name__,
        "rule": node.GetStateName(),
        "text": node.fText,
        "position" if isinstance(node.fContext, tuple) else "token": node.fContext,
    }
    return {name: value for name, value in fields.items() if value is not None}


def _FirstRow(text: str) -> str:
    first_row, _, more = text.partition("\n")
    return Printable(first_row.rstrip()) + (" ..." if more else "")
