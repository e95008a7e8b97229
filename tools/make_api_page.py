"""Write the tables of docs/api.md from the annotations and docstrings of what users import.

python tools/make_api_page.py
"""

import ast
import pathlib
import re
from collections.abc import Iterator

ROOT = pathlib.Path(__file__).parent.parent
PAGE = ROOT / "docs/api.md"
# Where the classes are defined that are importable from `codeloom`.
_SOURCES = ("codeloom/_analysis.pyi", "codeloom/_document.py", "codeloom/reading/notebooks.py")
_TABLE = re.compile(r"<!-- table of (?P<name>\w+) -->\n.*?<!-- end -->", re.DOTALL)


def classes() -> dict[str, ast.ClassDef]:
    """The classes by name."""
    trees = (ast.parse((ROOT / source).read_text("utf-8")) for source in _SOURCES)
    return {node.name: node for tree in trees for node in tree.body if isinstance(node, ast.ClassDef)}


def with_tables(page: str) -> str:
    """The page with the text between `<!-- table of NAME -->` and `<!-- end -->` replaced."""
    known = classes()

    def table(match: re.Match[str]) -> str:
        name = match["name"]
        rows = ["| Attribute | Type | |", "| --- | --- | --- |", *_rows_of(known[name])]
        return "\n".join([f"<!-- table of {name} -->", "", *rows, "", "<!-- end -->"])

    return _TABLE.sub(table, page)


def attributes_of(definition: ast.ClassDef) -> Iterator[tuple[str, str, str, str]]:
    """The public attributes of a class: name, arguments of a method, type, meaning."""
    following = [*definition.body[1:], None]
    for node, after in zip(definition.body, following, strict=True):
        if isinstance(node, ast.AnnAssign) and isinstance(node.target, ast.Name):
            if isinstance(after, ast.Expr) and isinstance(after.value, ast.Constant):
                yield node.target.id, "", ast.unparse(node.annotation), str(after.value.value)
        elif isinstance(node, ast.FunctionDef) and not node.name.startswith("_"):
            is_property = any(ast.unparse(each) == "property" for each in node.decorator_list)
            names = ", ".join(each.arg for each in [*node.args.args[1:], *node.args.kwonlyargs])
            returns = ast.unparse(node.returns) if node.returns else "None"
            arguments = "" if is_property else f"({names})"
            yield node.name, arguments, returns.strip("'"), ast.get_docstring(node) or ""


def _rows_of(definition: ast.ClassDef) -> Iterator[str]:
    for name, arguments, kind, meaning in attributes_of(definition):
        shown = kind.replace("|", "\\|")
        yield f"| `{name}{arguments}` | `{shown}` | {' '.join(meaning.split())} |"


if __name__ == "__main__":
    PAGE.write_text(with_tables(PAGE.read_text("utf-8")), "utf-8")
