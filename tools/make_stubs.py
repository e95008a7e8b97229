"""Write the type stubs of the package from an installed build of it.

    python tools/make_stubs.py

The native modules have stubs, and so have the modules that compute names of theirs while they are
imported. All others are typed where they are.
"""

import ast
import importlib
import inspect
import pathlib
from types import ModuleType

from nanobind.stubgen import StubGen

PACKAGE = pathlib.Path(__file__).parent.parent / "codeloom"
NATIVE_MODULES = ("_analysis", "_neighbours", "treesift")
COMPUTING_MODULES = ("_fastaccess", "logicalline", "symbolinfo")
HEADER = "# Made by tools/make_stubs.py; don't edit.\n"
# What a container of the host holds where a signature doesn't say.
UNTOLD = {"list": "object", "tuple": "object, ...", "dict": "object, object"}
# What comes out where a signature leaves it open, by the name of the member. Nothing is `Any`, since a
# user's checker would check nothing that is made of it.
KNOWN_RESULTS = {
    "AnalyzeSingleLogical": "SyntaxError | None",
    "CreateSyntaxError": "SyntaxError",
    "FindMatchOrCaseType": "str",
    "GetExpLogicals": "tuple[CLogicalLine, ...]",
    "GetLogicalsFromText": "list[CLogicalLine]",
    "GetTypeParameterNodes": "list[CNode]",
    "__str__": "str",
    "_ParseExceptionAt": "Exception",
    "fArgTypeEquivs": "list[tuple[bytes, bytes]] | None",
    "fChildren": "list[CNode] | None",
    "fCls": "type[CNode]",
    "fName": "str | None",
    "fOrigin": "tuple[int, int]",
    "fPositions": "tuple[tuple[int, int], ...]",
    "fText": "str | None",
    "fToks": "tuple[str, ...]",
    "fTokTypes": "tuple[int, ...]",
    "fType": "str",
    "fTypeEquivs": "list[tuple[bytes, bytes]] | None",
    "kClsForState": "dict[str, type[CNode]]",
    "kSupportedRules": "list[str]",
    "number2symbol": "dict[int, str]",
    "symbol2number": "dict[str, int]",
}


class _ItemTypes(ast.NodeTransformer):
    """Gives the containers of annotations the types of their items.

    A boolean, which may be any truth value, stays `bool`, as callers and overrides are to read it.
    """

    def visit_BinOp(self, node: ast.BinOp) -> ast.expr:
        self.generic_visit(node)
        return node.left if ast.unparse(node) == "bool | None" else node

    def visit_Subscript(self, node: ast.Subscript) -> ast.expr:
        node.slice = self.visit(node.slice)
        return node

    def visit_Name(self, node: ast.Name) -> ast.expr:
        items = UNTOLD.get(node.id)
        return node if items is None else ast.parse(f"{node.id}[{items}]", mode="eval").body


class _AnnotationsOnly(ast.NodeTransformer):
    """Does so in annotations, and says of a host object that comes out what is known of it."""

    def visit_arg(self, node: ast.arg) -> ast.AST:
        self.generic_visit(node)
        if node.arg != "self":
            node.annotation = _ItemTypes().visit(node.annotation or ast.Name("object"))
        return node

    def visit_AnnAssign(self, node: ast.AnnAssign) -> ast.AST | None:
        if ast.unparse(node.target) == "__class__":  # as every object has it
            return None
        self.generic_visit(node)
        node.annotation = self._ResultType(ast.unparse(node.target), node.annotation)
        return node

    def visit_FunctionDef(self, node: ast.FunctionDef) -> ast.AST:
        self.generic_visit(node)
        is_setter = bool(node.decorator_list) and ast.unparse(node.decorator_list[0]).endswith(".setter")
        if node.name != "__init__" and not is_setter:
            node.returns = self._ResultType(node.name, node.returns)
        return node

    def _ResultType(self, name: str, node: ast.expr | None) -> ast.expr:
        said = "object" if node is None else ast.unparse(node)
        if name in KNOWN_RESULTS and said in ("object", *UNTOLD):
            return ast.parse(KNOWN_RESULTS[name], mode="eval").body
        known: ast.expr = _ItemTypes().visit(node or ast.Name("object"))
        return known

    def visit_Attribute(self, node: ast.Attribute) -> ast.AST:
        return ast.Name("object") if ast.unparse(node) == "typing.Any" else node

    def visit_Name(self, node: ast.Name) -> ast.AST:
        return ast.Name("object") if node.id == "Any" else node

    def visit_ImportFrom(self, node: ast.ImportFrom) -> ast.AST | None:
        node.names = [alias for alias in node.names if alias.name != "Any"]
        return node if node.names else None


# What a sequence has without its class saying so, by the type of its items.
SEQUENCE_METHODS = """
def __len__(self) -> int: ...
@typing.overload
def __getitem__(self, i: typing.SupportsIndex, /) -> {item}: ...
@typing.overload
def __getitem__(self, i: slice, /) -> typing.Self: ...
def __iter__(self) -> collections.abc.Iterator[{item}]: ...
"""


class _KnownBases(ast.NodeTransformer):
    """Completes classes by what is known of their base: sequences, and enums, whose members need no words."""

    def visit_ClassDef(self, node: ast.ClassDef) -> ast.AST:
        base = ast.unparse(node.bases[0]) if node.bases else ""
        if base == "enum.Enum":
            first, *members = node.body
            node.body = [first, *(part for part in members if isinstance(part, ast.Assign))]
        elif base.startswith("Sequence["):
            item = base.removeprefix("Sequence[").removesuffix("]")
            known = ast.parse(SEQUENCE_METHODS.format(item=item)).body
            names = {part.name for part in known if isinstance(part, ast.FunctionDef)}
            own = [
                part for part in node.body if not (isinstance(part, ast.FunctionDef) and part.name in names)
            ]
            node.body = known + own
        return node


def native_stub(module: ModuleType) -> str:
    generator = StubGen(module=module, include_private=True)
    generator.put(module)
    tree = _KnownBases().visit(_AnnotationsOnly().visit(ast.parse(generator.get())))
    # With them, every name would be taken for one of the module.
    hooks = ("__getattr__", "__dir__")
    tree.body = [part for part in tree.body if getattr(part, "name", None) not in hooks]
    text = ast.unparse(tree) + "\n"
    needed = [name for name in ("collections.abc", "typing") if f"{name}." in text]
    return HEADER + "".join(f"import {name}\n" for name in needed) + text


def reduced(statement: ast.stmt) -> ast.stmt:
    """A definition with its documentation, and with no more of a function than its signature."""
    if isinstance(statement, ast.ClassDef):
        statement.body = [reduced(part) for part in statement.body]
    if isinstance(statement, ast.FunctionDef):
        documentation = statement.body[: ast.get_docstring(statement) is not None]
        statement.body = [*documentation, ast.Expr(ast.Constant(...))]
    return statement


def computing_stub(module: ModuleType) -> str:
    """The definitions as in the source, and for each value that is computed its type."""
    parts = ast.parse(inspect.getsource(module)).body
    imports = [part for part in parts if isinstance(part, ast.Import | ast.ImportFrom)]
    definitions = [part for part in parts if isinstance(part, ast.FunctionDef | ast.ClassDef)]
    known = {alias.name for part in imports for alias in part.names}
    known |= {part.name for part in definitions}
    values = [
        f"{name}: {type(getattr(module, name)).__name__}" for name in module.__all__ if name not in known
    ]
    return "\n".join(
        [
            HEADER.rstrip(),
            *map(ast.unparse, imports),
            f"__all__ = {module.__all__!r}",
            *values,
            *(ast.unparse(reduced(part)) for part in definitions),
            "",
        ]
    )


def all_stubs() -> dict[str, str]:
    """The text of each stub by the name of its file."""
    makers = {name: native_stub for name in NATIVE_MODULES}
    makers |= {name: computing_stub for name in COMPUTING_MODULES}
    return {f"{name}.pyi": make(importlib.import_module(f"codeloom.{name}")) for name, make in makers.items()}


if __name__ == "__main__":
    for file_name, text in all_stubs().items():
        (PACKAGE / file_name).write_text(text, encoding="utf-8")
