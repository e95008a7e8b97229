"""What a name stands for: where it is bound, what the records say of it, its documentation."""

import inspect
from collections.abc import Iterator, Sequence
from typing import TYPE_CHECKING

from lsprotocol import types

from codeloom._analysis import Analysis, Line, LineKind, Occurrence, Resolution, Role, Scope, ScopeKind
from codeloom._literals import EvaluateStringLiteral
from codeloom.cli.names_in_words import statements
from codeloom.server.blocks import line_index, start_of
from codeloom.server.document import OpenDocument
from codeloom.server.navigation import bindings_of

if TYPE_CHECKING:
    from codeloom.server.server import Server

# What is shown of a text and of its bindings at most.
_MOST_ROWS = 12
_MOST_BINDINGS = 5

_ROLES = {
    Role.PARAMETER: "a parameter",
    Role.IMPORT: "an import",
    Role.TYPE_PARAMETER: "a type parameter",
}
_WITHOUT_SCOPE = {
    Role.KEYWORD: "the name of an argument",
    Role.ORIGIN: "what an import takes from",
}
_RESOLUTIONS = {
    Resolution.BUILTIN: "a builtin",
    Resolution.PERHAPS: "bound perhaps by an `import *`, or on a line with a fault",
    Resolution.UNKNOWN: "bound nowhere in this file",
}


def register(server: "Server") -> None:
    """Answer what asks for the meaning of a name."""

    @server.feature(types.TEXT_DOCUMENT_HOVER)
    def hover(params: types.HoverParams) -> types.Hover | None:
        document = server.documents[params.text_document.uri]
        occurrence = document.occurrence_at(params.position)
        if occurrence is None:
            return None
        text = "\n\n".join(_paragraphs(document, occurrence))
        content = types.MarkupContent(types.MarkupKind.Markdown, text)
        return types.Hover(content, document.range(occurrence.range))


def _paragraphs(document: OpenDocument, occurrence: Occurrence) -> Iterator[str]:
    analysis = document.analysis
    bindings = bindings_of(analysis.references(occurrence))
    definitions = [one for one in bindings if one.is_definition]
    said = list(dict.fromkeys(fact for one in definitions or bindings for fact in _facts(one)))
    if said:
        yield _as_code(said[:_MOST_BINDINGS])
    yield f"`{occurrence.name}`: {_meaning(document, occurrence, bindings)}"
    if len(definitions) == 1 and (documentation := _documentation(analysis, definitions[0].line)):
        yield documentation


def _meaning(document: OpenDocument, occurrence: Occurrence, bindings: Sequence[Occurrence]) -> str:
    if occurrence.resolution is None:
        return _WITHOUT_SCOPE.get(occurrence.role, "an attribute")
    home = occurrence.home
    if home is None:
        return _RESOLUTIONS[occurrence.resolution]
    roles = {one.role for one in bindings}
    role = next((_ROLES[one] for one in _ROLES if one in roles), "a name")
    rows = sorted({one.range.row for one in bindings})
    shown = [document.row_in_words(row) for row in rows[:_MOST_BINDINGS]]
    more = ["..."] if len(rows) > _MOST_BINDINGS else []
    return f"{role} of {_scope_in_words(home)}, bound in {', '.join([*shown, *more])}"


def _scope_in_words(scope: Scope) -> str:
    if scope.kind is ScopeKind.MODULE:
        return "the module"
    return f"the {scope.kind.value} `{scope.name}`" if scope.name else f"a {scope.kind.value}"


def _facts(binding: Occurrence) -> Iterator[str]:
    """The header of a definition, or what the records of the line say of the name."""
    line = binding.line
    if binding.is_definition:
        yield inspect.cleandoc(line.text)
        return
    if binding.role is Role.IMPORT:
        yield line.text
        return
    records = [one for one in line.records if one.name == binding.name]
    for label, rows in statements(records):
        if label in ("binds", "takes", "knows"):
            yield from (item for row in rows for item in row)


def _as_code(texts: Sequence[str]) -> str:
    rows = [row for text in texts for row in text.splitlines()]
    if len(rows) > _MOST_ROWS:
        rows = [*rows[:_MOST_ROWS], "..."]
    fence = "```"
    while any(fence in row for row in rows):
        fence += "`"
    return "\n".join([f"{fence}python", *rows, fence])


def _documentation(analysis: Analysis, header: Line) -> str | None:
    """The string that a body begins with."""
    i = line_index(analysis, start_of(header)) + 1
    line = analysis.lines[i] if i < len(analysis.lines) else None
    if line is None or line.kind is not LineKind.STRING_EXPRESSION:
        return None
    if line.indent is not None and line.indent <= (header.indent or 0):
        return None
    value = EvaluateStringLiteral(line.text)
    return inspect.cleandoc(value) if isinstance(value, str) else None
