"""The forms in which `codeloom tree` prints trees. None of them recurses: a tree may be of any depth."""

import json
from abc import ABC, abstractmethod
from collections.abc import Iterator, Mapping
from itertools import pairwise
from typing import TYPE_CHECKING, Any

from codeloom.cli.console import Colour, Console, printable_path
from codeloom.cli.excerpt import printable

if TYPE_CHECKING:  # they load the engine
    from codeloom.line_trees import LineTree
    from codeloom.treesift import CNode


class TreeFormat(ABC):
    """Prints lines one after another, between begin and end."""

    def __init__(self, console: Console) -> None:
        self._console = console

    def begin(self) -> None:  # noqa: B027
        """Print what stands in front of all lines."""

    @abstractmethod
    def add(self, line: "LineTree", has_heading: bool) -> None:
        """Print one line; without a heading when the reader knows already which line it is."""

    def end(self) -> None:  # noqa: B027
        """Print what stands behind all lines."""


class TextFormat(TreeFormat):
    """For people: one row for each node, indented."""

    def __init__(self, console: Console) -> None:
        super().__init__(console)
        self._has_lines = False

    def add(self, line: "LineTree", has_heading: bool) -> None:
        """The line's place and text, and below it the tree, or what is wrong."""
        if self._has_lines:
            self._console.print_row("")
        self._has_lines = True
        if line.fault is not None:
            fault = line.fault
            self._console.print_fault(fault.path, fault.row, fault.column, fault.message, fault.source_row)
            return
        if has_heading:
            self._console.print_row(self._heading(line))
        if line.tree is None:
            self._console.print_row(self._console.coloured(Colour.DIM, "no tree"))
            return
        for node, depth in _nodes(line.tree):
            self._console.print_row("  " * depth + self._row(node))

    def _heading(self, line: "LineTree") -> str:
        place = f"{printable_path(line.path)}:{line.row}:{line.column}:"
        return f"{self._console.coloured(Colour.BOLD, place)} {_first_row(line.text)}"

    def _row(self, node: "CNode") -> str:
        words = [(Colour.CYAN, type(node).__name__), (Colour.DIM, str(node.GetStateName()))]
        if node.fText is not None:
            words.append((Colour.GREEN, repr(node.fText)))
        if node.fContext is not None:
            words.append((Colour.DIM, f"@{node.fContext}"))
        return " ".join(self._console.coloured(colour, word) for colour, word in words)


class JsonFormat(TreeFormat):
    """For programs: a list of lines, on one row for each node."""

    def __init__(self, console: Console) -> None:
        super().__init__(console)
        self._separator = ""

    def begin(self) -> None:
        """Open the list."""
        self._console.print_row("[")

    def add(self, line: "LineTree", has_heading: bool) -> None:
        """An object with the line's place and text, what is wrong, and the tree."""
        fault = line.fault
        head = {
            "path": line.path,
            "row": line.row,
            "column": line.column,
            "text": line.text,
            "error": fault and {"row": fault.row, "column": fault.column, "message": fault.message},
        }
        rows = ["null"] if line.tree is None else _json_rows(line.tree)
        tree = "\n".join(rows)
        self._console.print_row(f'{self._separator}{json.dumps(head)[:-1]}, "tree": {tree}}}')
        self._separator = ","

    def end(self) -> None:
        """Close the list."""
        self._console.print_row("]")


class DotFormat(TreeFormat):
    """For Graphviz: a graph with the tree of each line. What is wrong goes to the standard error."""

    def __init__(self, console: Console) -> None:
        super().__init__(console)
        self._node_count = 0

    def begin(self) -> None:
        """Open the graph."""
        self._console.print_row("digraph tree {")
        self._console.print_row('  node [fontname="monospace"]; edge [arrowhead=none];')

    def add(self, line: "LineTree", has_heading: bool) -> None:
        """The text of the line, and its tree below it."""
        fault = line.fault
        if fault is not None:
            place = f"{printable_path(fault.path)}:{fault.row}:{fault.column}:"
            self._console.print_error(f"{place} {printable(fault.message)}")
        if line.tree is None:
            return
        path = [self._add_node(f"{line.row}: {_first_row(line.text)}", "plaintext")]
        for node, depth in _nodes(line.tree):
            del path[depth + 1 :]
            is_leaf = node.fText is not None
            label = f"{type(node).__name__}\n{repr(node.fText) if is_leaf else node.GetStateName()}"
            path.append(self._add_node(label, "box" if is_leaf else "ellipse"))
            self._console.print_row(f"  {path[-2]} -> {path[-1]};")

    def end(self) -> None:
        """Close the graph."""
        self._console.print_row("}")

    def _add_node(self, label: str, shape: str) -> str:
        self._node_count += 1
        name = f"n{self._node_count}"
        quoted = label.replace("\\", "\\\\").replace('"', '\\"').replace("\n", "\\n")
        self._console.print_row(f'  {name} [shape={shape} label="{quoted}"];')
        return name


FORMATS: Mapping[str, type[TreeFormat]] = {
    "text": TextFormat,
    "json": JsonFormat,
    "dot": DotFormat,
}


def _nodes(tree: "CNode") -> Iterator[tuple["CNode", int]]:
    """The nodes in source order, parents first, each with its depth."""
    pending = [(tree, 0)]
    while pending:
        node, depth = pending.pop()
        yield node, depth
        children = node.fChildren or ()
        pending += [(child, depth + 1) for child in reversed(children) if child is not None]


def _json_rows(tree: "CNode") -> Iterator[str]:
    """The nested object of a tree, a node on each row."""
    nodes = [(_json_fields(node), depth) for node, depth in _nodes(tree)]
    for (fields, depth), (_, next_depth) in pairwise([*nodes, ({}, 0)]):
        row = "  " * depth + json.dumps(fields)
        if next_depth > depth:
            yield f'{row[:-1]}, "children": ['
        else:
            yield row + "]}" * (depth - next_depth) + ("," if next_depth else "")


def _json_fields(node: "CNode") -> dict[str, Any]:
    fields = {
        "class": type(node).__name__,
        "rule": node.GetStateName(),
        "text": node.fText,
        "position" if isinstance(node.fContext, tuple) else "token": node.fContext,
    }
    return {name: value for name, value in fields.items() if value is not None}


def _first_row(text: str) -> str:
    first_row, _, more = text.partition("\n")
    return printable(first_row.rstrip()) + (" ..." if more else "")
