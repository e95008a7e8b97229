"""For Graphviz: a graph with the tree of each line. What is wrong goes to the standard error."""

from collections.abc import Iterable

from codeloom.cli.formats.base import Format
from codeloom.cli.items import Item
from codeloom.cli.source import Source
from codeloom.cli.tally import Tally
from codeloom.cli.tree_items import TreeItem, nodes_of


class DotFormat(Format):
    """One graph for all lines."""

    _node_count = 0

    def begin(self) -> None:
        """Open the graph."""
        self._console.print_row("digraph tree {")
        self._console.print_row('  node [fontname="monospace"]; edge [arrowhead=none];')

    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Add the trees, each below the text of its line."""
        for item in items:
            if isinstance(item, TreeItem):
                self._add_tree(item)

    def end(self, tally: Tally) -> None:
        """Close the graph."""
        self._console.print_row("}")

    def _add_tree(self, item: TreeItem) -> None:
        for finding in item.findings:
            for row in finding.rows():
                self._console.print_error(row)
        if item.line.tree is None:
            return
        path = [self._add_node(f"{item.line.range.row}: {item.heading}", "plaintext")]
        for node, depth in nodes_of(item.line.tree):
            del path[depth + 1 :]
            is_leaf = node.fText is not None
            label = f"{type(node).__name__}\n{repr(node.fText) if is_leaf else node.GetStateName()}"
            path.append(self._add_node(label, "box" if is_leaf else "ellipse"))
            self._console.print_row(f"  {path[-2]} -> {path[-1]};")

    def _add_node(self, label: str, shape: str) -> str:
        self._node_count += 1
        name = f"n{self._node_count}"
        quoted = label.replace("\\", "\\\\").replace('"', '\\"').replace("\n", "\\n")
        self._console.print_row(f'  {name} [shape={shape} label="{quoted}"];')
        return name
