"""The outline: classes and functions with what lies in them, and the names that a module or a class binds."""

from typing import TYPE_CHECKING

from lsprotocol import types

from codeloom._analysis import Line, LineKind, Range, Role, Scope, ScopeKind
from codeloom.server.blocks import scope_of_header
from codeloom.server.document import OpenDocument

if TYPE_CHECKING:
    from codeloom.server.server import Server

_BINDING_LINES = frozenset({LineKind.ASSIGNMENT, LineKind.TYPE})
_HEADERS = frozenset({LineKind.DEF, LineKind.CLASS})
_CONSTRUCTORS = ("__init__", "__new__")

# An outline is made in a loop; what is deeper than this stays out of it.
_DEEPEST = 100


def register(server: "Server") -> None:
    """Answer what asks for an outline."""

    @server.feature(types.TEXT_DOCUMENT_DOCUMENT_SYMBOL)
    async def document_symbol(params: types.DocumentSymbolParams) -> list[types.DocumentSymbol]:
        document = server.documents[params.text_document.uri]
        outline = _Outline(document)
        async for lines in document.live.slices(document.lines):
            for line in lines:
                outline.add(line)
        return outline.symbols


class _Outline:
    """The symbols of a text, line by line."""

    def __init__(self, document: OpenDocument) -> None:
        self.symbols: list[types.DocumentSymbol] = []
        self._document = document
        # The open blocks of classes and functions: their indentation, scope and symbol.
        self._open: list[tuple[int, Scope, types.DocumentSymbol]] = []
        self._seen: set[tuple[int, str]] = set()

    def add(self, line: Line) -> None:
        """Take the next line."""
        if line.kind is LineKind.COMMENT:
            return
        if line.indent is not None:
            while self._open and self._open[-1][0] >= line.indent:
                self._open.pop()
        if line.kind in _HEADERS:
            self._add_header(line)
        elif line.kind in _BINDING_LINES and not self._is_in_function():
            for occurrence in line.occurrences:
                if occurrence.role is Role.BIND and occurrence.scope.kind is not ScopeKind.TYPE_PARAMETERS:
                    self._add_name(occurrence.name, occurrence.range, line)

    def _add_header(self, line: Line) -> None:
        scope = scope_of_header(self._document.analysis, line)
        if scope is None or len(self._open) >= _DEEPEST:
            return
        kind = types.SymbolKind.Class
        if scope.kind is ScopeKind.FUNCTION:
            kind = types.SymbolKind.Method if self._is_in_class() else types.SymbolKind.Function
            if scope.name in _CONSTRUCTORS and self._is_in_class():
                kind = types.SymbolKind.Constructor
        name = next(
            (one.range for one in line.occurrences if one.is_definition), _first_row(scope.range, line.range)
        )
        symbol = types.DocumentSymbol(
            name=scope.name or "?",
            kind=kind,
            range=self._document.range(scope.range),
            selection_range=self._document.range(name),
            children=[],
        )
        self._append(symbol)
        self._open.append((line.indent or 0, scope, symbol))

    def _add_name(self, name: str, place: Range, line: Line) -> None:
        owner = id(self._open[-1][2]) if self._open else 0
        if (owner, name) in self._seen:
            return
        self._seen.add((owner, name))
        kind = types.SymbolKind.Field if self._is_in_class() else types.SymbolKind.Variable
        if name.isupper():
            kind = types.SymbolKind.Constant
        self._append(
            types.DocumentSymbol(
                name, kind, self._document.range(line.range), self._document.range(place), children=[]
            )
        )

    def _append(self, symbol: types.DocumentSymbol) -> None:
        children = self._open[-1][2].children if self._open else self.symbols
        assert isinstance(children, list)
        children.append(symbol)

    def _is_in_class(self) -> bool:
        return bool(self._open) and self._open[-1][1].kind is ScopeKind.CLASS

    def _is_in_function(self) -> bool:
        return bool(self._open) and self._open[-1][1].kind is ScopeKind.FUNCTION


def _first_row(scope: Range, line: Range) -> Range:
    """The header's part of a scope, for one whose name isn't known."""
    return Range(scope.row, scope.column, line.end_row, line.end_column)
