"""Names by what they are, for colours; changes since the last answer alone where the client wants that."""

import builtins
import itertools
from bisect import bisect_left, bisect_right
from collections.abc import Iterable, Sequence
from typing import TYPE_CHECKING
from weakref import WeakKeyDictionary

from lsprotocol import types

from codeloom._analysis import Occurrence, Resolution, Role, Scope, ScopeKind
from codeloom.common_start import common_start
from codeloom.server.blocks import start_of
from codeloom.server.document import OpenDocument
from codeloom.server.json_text import JsonText, items_as_json
from codeloom.server.navigation import BINDINGS

if TYPE_CHECKING:
    from codeloom.server.server import Server

_TYPES = (
    "namespace",
    "class",
    "function",
    "method",
    "parameter",
    "typeParameter",
    "variable",
    "property",
)
_MODIFIERS = ("declaration", "readonly", "modification", "defaultLibrary")
_TYPE_NUMBERS = {name: i for i, name in enumerate(_TYPES)}
_BITS = {name: 1 << i for i, name in enumerate(_MODIFIERS)}
_LEGEND = types.SemanticTokensLegend(list(_TYPES), list(_MODIFIERS))

# Five numbers a token.
_WIDTH = 5

_CLASSES = frozenset(name for name, value in vars(builtins).items() if isinstance(value, type))
_ROLE_TYPES = {
    Role.PARAMETER: "parameter",
    Role.KEYWORD: "parameter",
    Role.TYPE_PARAMETER: "typeParameter",
    Role.ORIGIN: "namespace",
    Role.ATTRIBUTE: "property",
    Role.ATTRIBUTE_BIND: "property",
    Role.ATTRIBUTE_AUGMENT: "property",
    Role.ATTRIBUTE_DELETE: "property",
}
_MODIFYING = frozenset({Role.AUGMENT, Role.ATTRIBUTE_BIND, Role.ATTRIBUTE_AUGMENT})


def register(server: "Server") -> None:
    """Answer what asks for the kinds of names."""
    kept = _Kept()

    @server.feature(types.TEXT_DOCUMENT_SEMANTIC_TOKENS_FULL, _LEGEND)
    async def full(params: types.SemanticTokensParams) -> JsonText:
        document = server.documents[params.text_document.uri]
        data, parts = await _tokens(document, document.occurrences)
        return _answer(parts, kept.keep(document, data))

    @server.feature(types.TEXT_DOCUMENT_SEMANTIC_TOKENS_FULL_DELTA, _LEGEND)
    async def delta(params: types.SemanticTokensDeltaParams) -> JsonText | types.SemanticTokensDelta:
        document = server.documents[params.text_document.uri]
        new, parts = await _tokens(document, document.occurrences)
        old = kept.known(document, params.previous_result_id)
        result_id = kept.keep(document, new)
        if old is None:
            return _answer(parts, result_id)
        return types.SemanticTokensDelta(_edits(old, new), result_id)

    @server.feature(types.TEXT_DOCUMENT_SEMANTIC_TOKENS_RANGE, _LEGEND)
    async def in_range(params: types.SemanticTokensRangeParams) -> JsonText:
        document = server.documents[params.text_document.uri]
        return _answer((await _tokens(document, _within(document, params.range)))[1])


def _answer(parts: Sequence[str], result_id: str | None = None) -> JsonText:
    name = f'"resultId":"{result_id}",' if result_id is not None else ""
    return JsonText([f'{{{name}"data":[', ",".join(part for part in parts if part), "]}"])


class _Kept:
    """The last answer for each text that is open, with its name."""

    def __init__(self) -> None:
        self._known: WeakKeyDictionary[OpenDocument, tuple[str, Sequence[int]]] = WeakKeyDictionary()
        self._numbers = itertools.count(1)

    def keep(self, document: OpenDocument, data: Sequence[int]) -> str:
        """Keep an answer, and give its name."""
        result_id = str(next(self._numbers))
        self._known[document] = result_id, data
        return result_id

    def known(self, document: OpenDocument, result_id: str) -> Sequence[int] | None:
        """An answer by its name; None for one that isn't the last."""
        known, data = self._known.get(document, (None, ()))
        return data if known == result_id else None


def _within(document: OpenDocument, range: types.Range) -> Sequence[Occurrence]:
    occurrences = document.analysis.occurrences
    first = bisect_left(occurrences, document.place(range.start), key=start_of)
    return occurrences[first : bisect_right(occurrences, document.place(range.end), key=start_of)]


async def _tokens(document: OpenDocument, occurrences: Sequence[Occurrence]) -> tuple[list[int], list[str]]:
    """Five numbers a name: rows and columns from the one before, length, type and modifiers; and as JSON."""
    kinds = _Kinds()
    async for scopes in document.live.slices(document.analysis.scopes):
        kinds.add(scopes)
    encoder, parts = _Encoder(document, kinds), []
    async for part in document.live.slices(occurrences):
        before = len(encoder.data)
        for occurrence in part:
            encoder.add(occurrence)
        parts.append(items_as_json(encoder.data[before:]))
    return encoder.data, parts


class _Encoder:
    """Tokens as numbers, one after another."""

    def __init__(self, document: OpenDocument, kinds: "_Kinds") -> None:
        self.data: list[int] = []
        self._document = document
        self._kinds = kinds
        self._row = self._column = 0

    def add(self, occurrence: Occurrence) -> None:
        """Take the next name; none for `*`, or for a name that is within another one's hint."""
        place = occurrence.range
        row, column = self._document.counted(place.row, place.column)
        if place.end_row != place.row or (row, column) < (self._row, self._column):
            return
        name = occurrence.name
        length = len(name)
        if not name.isascii() or place.end_column - place.column != length:
            length = self._document.counted(place.end_row, place.end_column)[1] - column
        number, modifiers = self._kinds.of(occurrence)
        before = self._column if row == self._row else 0
        self.data += (row - self._row, column - before, length, number, modifiers)
        self._row, self._column = row, column


class _Kinds:
    """What the names of a text are."""

    def __init__(self) -> None:
        self._of_symbol: dict[tuple[Scope, str], str] = {}

    def add(self, scopes: Iterable[Scope]) -> None:
        """Take the names of classes and functions by their scopes."""
        for scope in scopes:
            if scope.parent is None or scope.kind not in (ScopeKind.CLASS, ScopeKind.FUNCTION):
                continue
            owner = scope.parent
            if owner.kind is ScopeKind.TYPE_PARAMETERS and owner.parent is not None:
                owner = owner.parent
            kind = "class"
            if scope.kind is ScopeKind.FUNCTION:
                kind = "method" if owner.kind is ScopeKind.CLASS else "function"
            self._of_symbol[owner, scope.name] = kind

    def of(self, occurrence: Occurrence) -> tuple[int, int]:
        """The number of the type and the bits of the modifiers."""
        role = occurrence.role
        modifiers = _BITS["declaration"] if role in BINDINGS else 0
        if role in _MODIFYING:
            modifiers |= _BITS["modification"]
        kind = _ROLE_TYPES.get(role)
        if kind is None:
            kind = self._of_name(occurrence)
            if occurrence.resolution is Resolution.BUILTIN:
                modifiers |= _BITS["defaultLibrary"]
            elif kind == "variable" and occurrence.name.isupper():
                modifiers |= _BITS["readonly"]
        return _TYPE_NUMBERS[kind], modifiers

    def _of_name(self, occurrence: Occurrence) -> str:
        name, home = occurrence.name, occurrence.home
        if home is None:
            if occurrence.resolution is not Resolution.BUILTIN:
                return "variable"
            return "class" if name in _CLASSES else "function"
        key = home, name
        if key not in self._of_symbol:
            self._of_symbol[key] = _of_symbol(home, occurrence)
        return self._of_symbol[key]


def _of_symbol(home: Scope, occurrence: Occurrence) -> str:
    symbol = occurrence.symbol
    if symbol is None or symbol.scope != home:
        symbol = next((one for one in home.symbols if one.name == occurrence.mangled), None)
    if symbol is None:
        return "variable"
    if symbol.is_parameter:
        return "parameter"
    if symbol.is_type_parameter:
        return "typeParameter"
    if symbol.is_imported and not symbol.is_assigned:
        return "namespace"
    return "property" if home.kind is ScopeKind.CLASS else "variable"


def _edits(old: Sequence[int], new: Sequence[int]) -> list[types.SemanticTokensEdit]:
    """What turns one list of tokens into another: the part that differs, in whole tokens."""
    if old == new:
        return []
    first = _whole(common_start(old, new))
    last = _whole(common_start(old[first:][::-1], new[first:][::-1]))
    end = len(new) - last
    return [types.SemanticTokensEdit(first, len(old) - last - first, new[first:end])]


def _whole(count: int) -> int:
    """So many numbers, but no part of a token."""
    return count // _WIDTH * _WIDTH
