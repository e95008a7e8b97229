"""The outline: classes and functions with what lies in them, and the names that a module or a class binds."""

from collections.abc import Sequence
from typing import TYPE_CHECKING

from lsprotocol import types

from codeloom._analysis import Line, LineKind, Range, Role, Scope, ScopeKind
from codeloom.server.blocks import scope_of_header
from codeloom.server.document import OpenDocument
from codeloom.server.json_text import Fields, JsonText, items_as_json

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
    async def document_symbol(params: types.DocumentSymbolParams) -> JsonText:
        document = server.documents[params.text_document.uri]
        outline = _Outline(document)
        async for lines in document.live.slices(document.lines):
            for line in lines:
                outline.add(line)
        return JsonText.of_list(outline.end())


class _Outline:
    """The symbols of a text as JSON, line by line."""

    def __init__(self, document: OpenDocument) -> None:
        # The symbols of the module that are complete, and the one that isn't.
        self._parts: list[str] = []
        self._last: list[Fields] = []
        self._document = document
        # The open blocks of classes and functions: their indentation, scope and symbol.
        self._open: list[tuple[int, Scope, Fields]] = []
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

    def end(self) -> Sequence[str]:
        """The symbols of the module, in parts."""
        self._complete()
        return self._parts

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
        symbol = self._append(scope.name or "?", kind, scope.range, name)
        self._open.append((line.indent or 0, scope, symbol))

    def _add_name(self, name: str, place: Range, line: Line) -> None:
        owner = id(self._open[-1][2]) if self._open else 0
        if (owner, name) in self._seen:
            return
        self._seen.add((owner, name))
        kind = types.SymbolKind.Field if self._is_in_class() else types.SymbolKind.Variable
        if name.isupper():
            kind = types.SymbolKind.Constant
        self._append(name, kind, line.range, place)

    def _append(self, name: str, kind: types.SymbolKind, whole: Range, place: Range) -> Fields:
        symbol: Fields = {
            "name": name,
            "kind": kind.value,
            "range": self._document.range_fields(whole),
            "selectionRange": self._document.range_fields(place),
            "children": [],
        }
        if self._open:
            self._open[-1][2]["children"].append(symbol)
        else:
            self._complete()
            self._last.append(symbol)
        return symbol

    def _complete(self) -> None:
        if self._last:
            self._parts.append(items_as_json(self._last))
            self._last.clear()

    def _is_in_class(self) -> bool:
        return bool(self._open) and self._open[-1][1].kind is ScopeKind.CLASS

    def _is_in_function(self) -> bool:
        return bool(self._open) and self._open[-1][1].kind is ScopeKind.FUNCTION


def _first_row(scope: Range, line: Range) -> Range:
    """The header's part of a scope, for one whose name isn't known."""
    return Range(scope.row, scope.column, line.end_row, line.end_column)
