"""What `codeloom tree` shows: the tree of a line. Nothing here recurses: a tree may be of any depth."""

import json
from collections.abc import Iterator
from itertools import pairwise
from typing import TYPE_CHECKING, Any

from codeloom.cli.console import Colour, Console
from codeloom.cli.excerpt import printable
from codeloom.cli.items import Finding, Item, show_items
from codeloom.cli.source import Source

if TYPE_CHECKING:  # they load the engine
    from codeloom.line_trees import LineTree
    from codeloom.treesift import CNode

_INDENT = "  "


class TreeItem(Item):
    """A line with what is wrong with it, and with its tree.

    Without a heading when the reader knows already which line it is.
    """

    def __init__(self, source: Source, line: "LineTree", has_heading: bool, is_first: bool) -> None:
        self.line = line
        self._source = source
        self._has_heading = has_heading
        self._is_first = is_first
        self.findings = [Finding.of(source, problem) for problem in line.problems]

    @property
    def heading(self) -> str:
        """The first row of the line."""
        first_row, _, more = self.line.text.partition("\n")
        return printable(first_row.rstrip()) + (" ..." if more else "")

    def show(self, console: Console) -> None:
        """What is wrong; the line's place and text, and below it a row for each node, indented."""
        if not self._is_first:
            console.print_row("")
        show_items(self.findings, console)
        if self.findings and self.line.tree is None:
            return
        if self._has_heading:
            console.print_row(
                f"{console.coloured(Colour.BOLD, self._source.label(self.line.range))} {self.heading}"
            )
        if self.line.tree is None:
            console.print_row(console.coloured(Colour.DIM, "no tree"))
            return
        for node, depth in nodes_of(self.line.tree):
            console.print_row(_INDENT * depth + _node_row(node, console))

    def rows(self) -> Iterator[str]:
        """What is wrong with the line, and its place and text when it has a tree."""
        for finding in self.findings:
            yield from finding.rows()
        if self.line.tree is not None or not self.findings:
            yield f"{self._source.label(self.line.range)} {self.heading}"

    def fields(self) -> Iterator[dict[str, Any]]:
        """All but the tree."""
        yield {
            "type": "tree",
            **self._source.fields(self.line.range),
            "text": self.line.text,
            "problems": [fields for finding in self.findings for fields in finding.fields()],
        }

    def json(self) -> Iterator[str]:
        """With the tree as nested objects."""
        for fields in self.fields():
            tree = "null" if self.line.tree is None else "".join(_json_pieces(self.line.tree))
            yield f'{json.dumps(fields)[:-1]}, "tree": {tree}}}'


def nodes_of(tree: "CNode") -> Iterator[tuple["CNode", int]]:
    """The nodes in source order, parents first, each with its depth."""
    pending = [(tree, 0)]
    while pending:
        node, depth = pending.pop()
        yield node, depth
        children = node.fChildren or ()
        pending += [(child, depth + 1) for child in reversed(children) if child is not None]


def _node_row(node: "CNode", console: Console) -> str:
    words = [(Colour.CYAN, type(node).__name__), (Colour.DIM, str(node.GetStateName()))]
    if node.fText is not None:
        words.append((Colour.GREEN, repr(node.fText)))
    if node.fContext is not None:
        words.append((Colour.DIM, f"@{node.fContext}"))
    return " ".join(console.coloured(colour, word) for colour, word in words)


def _json_pieces(tree: "CNode") -> Iterator[str]:
    """The text of a tree's nested object."""
    nodes = [(_json_fields(node), depth) for node, depth in nodes_of(tree)]
    for (fields, depth), (_, next_depth) in pairwise([*nodes, ({}, 0)]):
        text = json.dumps(fields)
        if next_depth > depth:
            yield f'{text[:-1]}, "children": ['
        else:
            yield text + "]}" * (depth - next_depth) + (", " if next_depth else "")


def _json_fields(node: "CNode") -> dict[str, Any]:
    fields = {
        "class": type(node).__name__,
        "rule": node.GetStateName(),
        "text": node.fText,
        "position" if isinstance(node.fContext, tuple) else "token": node.fContext,
    }
    return {name: value for name, value in fields.items() if value is not None}
