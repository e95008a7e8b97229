"""Quick fixes: what may mend a problem is tried on the text.

It is offered when the problem is gone and none has come.
"""

from collections import Counter
from collections.abc import Iterator, Sequence
from typing import TYPE_CHECKING

from lsprotocol import types

from codeloom._analysis import Analysis
from codeloom.cli.items import Finding
from codeloom.server.diagnostics import diagnostic_of
from codeloom.server.document import OpenDocument
from codeloom.server.json_text import Fields, JsonText
from codeloom.server.remedies import Remedy, remedies_for

if TYPE_CHECKING:
    from codeloom.server.server import Server

# How many problems of a selection are looked at.
_MOST_FINDINGS = 20


def register(server: "Server") -> None:
    """Answer what asks for fixes."""

    @server.feature(types.TEXT_DOCUMENT_CODE_ACTION, types.CodeActionOptions([types.CodeActionKind.QuickFix]))
    async def code_action(params: types.CodeActionParams) -> JsonText:
        wanted = params.context.only
        if wanted is not None and not any(_covers(kind, types.CodeActionKind.QuickFix) for kind in wanted):
            return JsonText.of([])
        document = server.documents[params.text_document.uri]
        actions: list[Fields] = []
        async for findings in document.live.slices(_findings_in(document, params.range), 1):
            for finding in findings:
                actions += [_action(document, finding, one) for one in sound_remedies(document, finding)]
        return JsonText.of(actions)


def sound_remedies(document: OpenDocument, finding: Finding) -> Iterator[Remedy]:
    """What mends a problem: of several edits to the same end the first one that does."""
    before = _counts(document.analysis)
    seen = set()
    for remedy in remedies_for(document, finding):
        if remedy.title in seen:
            continue
        with document.live.trial(remedy.edits) as analysis:
            after = _counts(analysis)
        key = finding.code, finding.message
        if after[key] < before[key] and after <= before:
            seen.add(remedy.title)
            yield remedy


def _counts(analysis: Analysis) -> Counter[tuple[str, str]]:
    return Counter((problem.code, problem.message) for problem in analysis.problems)


def _findings_in(document: OpenDocument, range: types.Range) -> Sequence[Finding]:
    """The problems on the rows of a range."""
    first, last = (edge.line + 1 + document.rows_before for edge in (range.start, range.end))
    found = [one for one in document.live.findings if one.range.row <= last and one.range.end_row >= first]
    return [one for one in found if document.holds(one.range.row)][:_MOST_FINDINGS]


def _covers(kind: str | types.CodeActionKind, narrower: types.CodeActionKind) -> bool:
    name = kind.value if isinstance(kind, types.CodeActionKind) else kind
    return name == "" or f"{narrower.value}.".startswith(f"{name}.")


def _action(document: OpenDocument, finding: Finding, remedy: Remedy) -> Fields:
    preferred = {"isPreferred": True} if remedy.is_sure else {}
    return {
        "title": remedy.title,
        "kind": types.CodeActionKind.QuickFix.value,
        "diagnostics": [diagnostic_of(document, finding)],
        **preferred,
        "edit": document.workspace_edit(remedy.edits),
    }
