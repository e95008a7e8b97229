"""Renaming a name of the file. What can't be sure to mean the same after it is refused in words."""

import keyword
import re
from collections.abc import Iterator, Sequence
from typing import TYPE_CHECKING

from lsprotocol import types
from pygls.exceptions import JsonRpcException

from codeloom._analysis import Analysis, Occurrence, Resolution, Role
from codeloom.reading.languages import language_of
from codeloom.server.blocks import line_at
from codeloom.server.document import OpenDocument
from codeloom.server.json_text import JsonText

if TYPE_CHECKING:
    from codeloom.server.server import Server

# The protocol's number for a request that is right and can't be fulfilled.
_REQUEST_FAILED = -32803

_AS = re.compile(r"\bas\s+$")


class RenameRefusedError(JsonRpcException):
    """Why a name can't be renamed; the message is for the user."""

    CODE = _REQUEST_FAILED


def register(server: "Server") -> None:
    """Answer what renames."""

    @server.feature(types.TEXT_DOCUMENT_PREPARE_RENAME)
    def prepare(params: types.PrepareRenameParams) -> types.PrepareRenamePlaceholder:
        document = server.documents[params.text_document.uri]
        occurrence = _named(document, params.position)
        return types.PrepareRenamePlaceholder(document.range(occurrence.range), occurrence.name)

    @server.feature(types.TEXT_DOCUMENT_RENAME)
    def rename(params: types.RenameParams) -> JsonText:
        document = server.documents[params.text_document.uri]
        occurrence, name = _named(document, params.position), params.new_name
        _check_name(name, document.analysis)
        occurrences = document.analysis.references(occurrence)
        _check_faults(document, occurrence)
        edits = [(one, _replacement(document, one, name)) for one in occurrences]
        _check_meaning(document, edits, name)
        return JsonText.of(document.workspace_edit((one.range, text) for one, text in edits))


def _named(document: OpenDocument, position: types.Position) -> Occurrence:
    """The name at a position, if it can have another one."""
    found = document.occurrence_at(position)
    if found is None:
        raise RenameRefusedError("there is no name here")
    if found.resolution is None:
        raise RenameRefusedError(f"{found.name!r} is {_what(found)}: what it belongs to isn't known")
    if found.resolution is Resolution.BUILTIN:
        raise RenameRefusedError(f"{found.name!r} is a builtin")
    if found.home is None:
        perhaps = found.resolution is Resolution.PERHAPS
        raise RenameRefusedError(
            f"{found.name!r} is bound nowhere in this file"
            + (" for certain: perhaps by an `import *`, or on a line with a fault" if perhaps else "")
        )
    if found.name == "*":
        raise RenameRefusedError("the names that `import *` binds aren't known")
    return found


def _what(occurrence: Occurrence) -> str:
    if occurrence.role is Role.KEYWORD:
        return "a keyword argument"
    return "an imported name" if occurrence.role is Role.ORIGIN else "an attribute"


def _check_name(name: str, analysis: Analysis) -> None:
    keywords = language_of(analysis.text, analysis.python).keywords
    if name in keywords or keyword.iskeyword(name):
        raise RenameRefusedError(f"{name!r} is a keyword")
    if not name.isidentifier():
        raise RenameRefusedError(f"{name!r} isn't a name")


def _check_faults(document: OpenDocument, occurrence: Occurrence) -> None:
    """Names on a line with a fault aren't known, so none may stand there."""
    home = occurrence.home
    assert home is not None
    first, last = (home.range.row, home.range.end_row) if home.parent is not None else (1, document.row_count)
    for problem in document.analysis.problems:
        line = line_at(document.analysis, (problem.range.row, problem.range.column))
        if line is None or line.occurrences:  # its names are known
            continue
        row = line.range.row
        if row <= last and line.range.end_row >= first and _holds_word(line.text, occurrence.name):
            raise RenameRefusedError(
                f"{document.row_in_words(row)} names {occurrence.name!r} and has a fault: mend it first"
            )


def _holds_word(text: str, word: str) -> bool:
    return re.search(rf"\b{re.escape(word)}\b", text) is not None


def _replacement(document: OpenDocument, occurrence: Occurrence, name: str) -> str:
    """What replaces one occurrence: a name that is imported as itself gets an `as`."""
    if occurrence.role is not Role.IMPORT:
        return name
    place = occurrence.range
    row = document.row(place.row)
    if row[place.end_column - 1 :].lstrip().startswith("."):
        raise RenameRefusedError(
            f"the import in {document.row_in_words(place.row)} can bind {occurrence.name!r} by this name only"
        )
    return name if _AS.search(row[: place.column - 1]) else f"{occurrence.name} as {name}"


def _check_meaning(document: OpenDocument, edits: Sequence[tuple[Occurrence, str]], name: str) -> None:
    """Every occurrence must lead where it led, and no other may lead there."""
    places = list(_places_after(edits, name))
    with document.live.trial([(one.range, new) for one, new in edits]) as analysis:
        found = analysis.occurrence_at(*places[0])
        after = analysis.references(found) if found is not None else ()
    if [(one.range.row, one.range.column) for one in after] != places:
        raise RenameRefusedError(f"{name!r} has another meaning here already")


def _places_after(edits: Sequence[tuple[Occurrence, str]], name: str) -> Iterator[tuple[int, int]]:
    row = shift = 0
    for occurrence, new in edits:
        place = occurrence.range
        if place.row != row:
            row, shift = place.row, 0
        yield row, place.column + shift + len(new) - len(name)
        shift += len(new) - (place.end_column - place.column)
