"""Names that can be read at a place, also while its line is broken: other lines say what they are."""

import builtins
import re
from collections.abc import Iterable, Iterator
from typing import TYPE_CHECKING

from lsprotocol import types

from codeloom._analysis import Analysis, Occurrence, Role, Scope, ScopeKind, Symbol
from codeloom.reading.languages import language_of
from codeloom.server.blocks import line_at, scope_at
from codeloom.server.document import OpenDocument
from codeloom.server.pieces import pieces_of

if TYPE_CHECKING:
    from codeloom.server.server import Server

# What is typed: the chain before a dot, and the word so far.
_CHAIN = re.compile(r"(?P<object>(?:[^\W\d]\w*\s*\.\s*)*)(?P<word>\w*)$")
# After these comes a name that isn't known yet, or the name of a module.
_NEW_NAME = re.compile(r"\b(?:def|class|as|import|from|global|nonlocal)\s+\w*$|^\s*(?:from|import)\b")
_BUILTINS = [name for name in dir(builtins) if not name.startswith("_")]
_ATTRIBUTES = frozenset({Role.ATTRIBUTE, Role.ATTRIBUTE_BIND, Role.ATTRIBUTE_AUGMENT, Role.ATTRIBUTE_DELETE})
_KINDS = types.CompletionItemKind


def register(server: "Server") -> None:
    """Answer what completes names."""

    @server.feature(types.TEXT_DOCUMENT_COMPLETION, types.CompletionOptions(trigger_characters=["."]))
    async def completion(params: types.CompletionParams) -> types.CompletionList:
        document = server.documents[params.text_document.uri]
        return types.CompletionList(False, await _items(document, document.place(params.position)))


async def _items(document: OpenDocument, place: tuple[int, int]) -> list[types.CompletionItem]:
    row, column = place
    before = document.row(row)[: column - 1]
    typed = _CHAIN.search(before)
    if typed is None or _NEW_NAME.search(before) or _is_text(document.analysis, place):
        return []
    if typed["word"][:1].isdigit():
        return []
    scope = scope_at(document.analysis, place, _indent(before))
    if typed["object"]:
        return await _attributes(document, scope, re.sub(r"\s", "", typed["object"]).rstrip("."), place)
    if before[: typed.start()].rstrip().endswith("."):
        return []
    loops = _names_of_loops(document.analysis, place)
    return [*(_item(name, _KINDS.Variable, "of this line", "0") for name in loops), *_names(document, scope)]


def _indent(before: str) -> int:
    """The indentation of the row so far, tabs as the tokenizer takes them."""
    text = before.expandtabs(8)
    return len(text) - len(text.lstrip())


def _is_text(analysis: Analysis, place: tuple[int, int]) -> bool:
    """True within a string or a comment; a field of an f-string isn't text."""
    line = line_at(analysis, place)
    if line is None:
        return False
    for occurrence in line.occurrences:
        one = occurrence.range
        if (one.row, one.column) <= place <= (one.end_row, one.end_column):
            return False
    for piece in pieces_of(line):
        if piece.start < place and (place < piece.end or (place == piece.end and piece.is_comment)):
            is_field = (
                piece.is_string
                and "f" in piece.text.partition(piece.text.lstrip("rRbBuUfFtT")[:1])[0].lower()
            )
            return (piece.is_string or piece.is_comment) and not is_field
    return False


def _names_of_loops(analysis: Analysis, place: tuple[int, int]) -> Iterator[str]:
    """What is between `for` and `in` on a line with a fault, whose scopes aren't known."""
    line = line_at(analysis, place)
    if line is None or not line.problems:
        return
    is_target = False
    for piece in pieces_of(line):
        is_target = piece.text == "for" or (is_target and piece.text != "in")
        if is_target and piece.text.isidentifier() and piece.text != "for":
            yield piece.text


def _names(document: OpenDocument, scope: Scope) -> Iterator[types.CompletionItem]:
    """The names of the scopes from the innermost outwards, builtins and keywords."""
    seen: set[str] = set()
    analysis = document.analysis
    kinds = _definition_kinds(analysis)
    for distance, around in enumerate(_scopes_outwards(scope)):
        for symbol in around.symbols:
            if symbol.name not in seen and symbol.is_local:
                seen.add(symbol.name)
                kind = kinds.get((around, symbol.name)) or _kind(symbol)
                yield _item(symbol.name, kind, _where(around), f"{distance}")
    keywords = language_of(analysis.text, analysis.python).keywords
    for name in (one for one in _BUILTINS if one not in seen and one not in keywords):
        is_class = isinstance(getattr(builtins, name), type)
        yield _item(name, _KINDS.Class if is_class else _KINDS.Function, "builtin", "x")
    for word in keywords:
        yield _item(word, _KINDS.Keyword, None, "y")


def _scopes_outwards(scope: Scope) -> Iterator[Scope]:
    """The scopes that a name is looked up in: that of a class counts right in its body alone."""
    around: Scope | None = scope
    while around is not None:
        if around == scope or around.kind is not ScopeKind.CLASS:
            yield around
        around = around.parent


async def _attributes(
    document: OpenDocument, scope: Scope, chain: str, place: tuple[int, int]
) -> list[types.CompletionItem]:
    """What the text says of an object: the names of a class, and what hangs on the same words elsewhere."""
    analysis = document.analysis
    owner = _class_of(analysis, scope, chain)
    names: dict[str, types.CompletionItemKind] = {}
    if owner is not None:
        kinds = _definition_kinds(analysis)
        for symbol in owner.symbols:
            if symbol.is_local:
                names[symbol.name] = kinds.get((owner, symbol.name)) or _KINDS.Field
    async for occurrences in document.live.slices(analysis.occurrences):
        for name in _written_attributes(document, chain, place, occurrences):
            names.setdefault(name, _KINDS.Property)
    return [
        _item(name, kind, f"of {chain}", "1" if name.startswith("_") else "0") for name, kind in names.items()
    ]


def _class_of(analysis: Analysis, scope: Scope, chain: str) -> Scope | None:
    """The class whose name a chain is, or whose method's first parameter it is."""
    around: Scope | None = scope
    while around is not None:
        for symbol in around.symbols:
            if symbol.name == chain and symbol.is_local:
                parent = around.parent
                is_first = symbol.is_parameter and around.symbols[0].name == chain
                if is_first and parent is not None and parent.kind is ScopeKind.CLASS:
                    return parent
                return _class_named(analysis, around, chain)
        around = around.parent
    return None


def _class_named(analysis: Analysis, owner: Scope, name: str) -> Scope | None:
    for scope in analysis.scopes:
        if scope.kind is ScopeKind.CLASS and scope.name == name and scope.parent == owner:
            return scope
    return None


def _written_attributes(
    document: OpenDocument, chain: str, place: tuple[int, int], occurrences: Iterable[Occurrence]
) -> Iterator[str]:
    for occurrence in occurrences:
        if occurrence.role not in _ATTRIBUTES:
            continue
        whole, one = occurrence.object, occurrence.range
        if whole is None or (one.end_row, one.end_column) == place or whole.row != whole.end_row:
            continue
        if document.row(whole.row)[whole.column - 1 : whole.end_column - 1] == chain:
            yield occurrence.name


def _definition_kinds(analysis: Analysis) -> dict[tuple[Scope, str], types.CompletionItemKind]:
    found = {}
    for scope in analysis.scopes:
        owner = scope.parent
        if owner is not None and owner.kind is ScopeKind.TYPE_PARAMETERS:
            owner = owner.parent
        if owner is not None and scope.kind is ScopeKind.CLASS:
            found[owner, scope.name] = _KINDS.Class
        elif owner is not None and scope.kind is ScopeKind.FUNCTION:
            found[owner, scope.name] = _KINDS.Method if owner.kind is ScopeKind.CLASS else _KINDS.Function
    return found


def _kind(symbol: Symbol) -> types.CompletionItemKind:
    if symbol.is_imported:
        return _KINDS.Module
    if symbol.is_type_parameter:
        return _KINDS.TypeParameter
    return _KINDS.Constant if symbol.name.isupper() else _KINDS.Variable


def _where(scope: Scope) -> str:
    return f"of {scope.kind.value} {scope.name}".rstrip() if scope.parent is not None else "of the module"


def _item(name: str, kind: types.CompletionItemKind, detail: str | None, rank: str) -> types.CompletionItem:
    return types.CompletionItem(name, kind=kind, detail=detail, sort_text=f"{rank}{name}")
