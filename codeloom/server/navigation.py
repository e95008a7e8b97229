"""Where a name is bound, where else it appears, and what of that is on the screen."""

from collections.abc import Sequence
from typing import TYPE_CHECKING

from lsprotocol import types

from codeloom._analysis import Occurrence, Role
from codeloom.server.document import OpenDocument
from codeloom.server.json_text import JsonText

if TYPE_CHECKING:
    from codeloom.server.server import Server

BINDINGS = frozenset({Role.BIND, Role.IMPORT, Role.PARAMETER, Role.TYPE_PARAMETER})
_WRITES = BINDINGS | {Role.AUGMENT, Role.DELETE}


def register(server: "Server") -> None:
    """Answer what asks for places of names."""

    @server.feature(types.TEXT_DOCUMENT_DEFINITION)
    def definition(params: types.DefinitionParams) -> JsonText:
        document = server.documents[params.text_document.uri]
        found = bindings_of(same_names(document, params.position))
        return _locations(document, found)

    @server.feature(types.TEXT_DOCUMENT_REFERENCES)
    def references(params: types.ReferenceParams) -> JsonText:
        document = server.documents[params.text_document.uri]
        found = same_names(document, params.position)
        if not params.context.include_declaration:
            bindings = set(bindings_of(found))
            found = [one for one in found if one not in bindings]
        return _locations(document, found)

    @server.feature(types.TEXT_DOCUMENT_DOCUMENT_HIGHLIGHT)
    def highlight(params: types.DocumentHighlightParams) -> JsonText:
        document = server.documents[params.text_document.uri]
        found = [one for one in same_names(document, params.position) if document.holds(one.range.row)]
        return JsonText.of(
            [{"range": document.range_fields(one.range), "kind": _kind(one).value} for one in found] or None
        )


def _locations(document: OpenDocument, found: Sequence[Occurrence]) -> JsonText:
    return JsonText.of([document.location_fields(one.range) for one in found] or None)


def same_names(document: OpenDocument, position: types.Position) -> Sequence[Occurrence]:
    """All occurrences of the name at a position that mean the same; nothing for an attribute."""
    occurrence = document.occurrence_at(position)
    return document.analysis.references(occurrence) if occurrence is not None else ()


def bindings_of(occurrences: Sequence[Occurrence]) -> list[Occurrence]:
    """Those that bind the name; where nothing else does, those that add to it."""
    found = [one for one in occurrences if one.role in BINDINGS]
    return found or [one for one in occurrences if one.role is Role.AUGMENT]


def _kind(occurrence: Occurrence) -> types.DocumentHighlightKind:
    kinds = types.DocumentHighlightKind
    return kinds.Write if occurrence.role in _WRITES else kinds.Read
