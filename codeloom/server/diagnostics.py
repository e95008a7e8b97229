"""Problems as the client shows them: published by the server, or asked for by the client."""

import asyncio
from collections.abc import Sequence
from functools import cache
from importlib.resources import files
from typing import TYPE_CHECKING, Any

from lsprotocol import types

from codeloom.cli.items import Finding
from codeloom.server.document import OpenDocument
from codeloom.server.json_text import Fields, JsonText
from codeloom.server.live_text import LiveText
from codeloom.server.patience import SECONDS
from codeloom.server.places import PlacedText

if TYPE_CHECKING:
    from codeloom.server.server import Server

SOURCE = "codeloom"
_SEVERITIES = {
    "error": types.DiagnosticSeverity.Error.value,
    "warning": types.DiagnosticSeverity.Warning.value,
}


def register(server: "Server") -> None:
    """Answer clients that ask for diagnostics."""

    @server.feature(
        types.TEXT_DOCUMENT_DIAGNOSTIC,
        types.DiagnosticOptions(
            inter_file_dependencies=False, workspace_diagnostics=False, identifier=SOURCE
        ),
    )
    def diagnostic(params: types.DocumentDiagnosticParams) -> JsonText:
        document = server.documents[params.text_document.uri]
        items = diagnostics_of(document, server.publisher.due(document.live))
        identity = result_id(items)
        if identity == params.previous_result_id:
            return JsonText.of({"kind": "unchanged", "resultId": identity})
        return JsonText.of({"kind": "full", "items": items, "resultId": identity})


class Publisher:
    """Publishes problems to clients that don't ask."""

    def __init__(self, server: "Server") -> None:
        self._server = server
        self._is_asked: bool | None = None
        # Of each text with problems that wait.
        self._timers: dict[LiveText, asyncio.TimerHandle] = {}
        # What was said last of each text, and of which version.
        self._said: dict[str, tuple[int, Sequence[Fields]]] = {}

    @property
    def is_asked(self) -> bool:
        """True when the client asks for the diagnostics of a text."""
        if self._is_asked is None:
            of_text = self._server.client_capabilities.text_document
            self._is_asked = of_text is not None and of_text.diagnostic is not None
        return self._is_asked

    def show(self, live: LiveText) -> None:
        """Publish the problems of a text, or of those cells of a notebook that have other ones now."""
        documents = self._server.documents.analysed_by(live)
        if self.is_asked and len(documents) == 1:
            return
        due, has_news = self.due(live), False
        for document in documents:
            said = document.version, diagnostics_of(document, due)
            version, items = self._said.get(document.uri, (None, ()))
            has_news = has_news or (version == said[0] and items != said[1])
            if (version, items) != said:
                self._said[document.uri] = said
                self.publish(document.uri, said[1], document.version)
        if has_news:
            self._ask_to_ask()

    def due(self, live: LiveText) -> Sequence[Finding]:
        """The problems to show now; where others wait, they are shown when nobody types any more."""
        findings, due = live.findings, live.due
        if len(due) == len(findings) or (self.is_asked and not self._can_be_made_to_ask):
            return findings
        self._stop_timer(live)
        self._timers[live] = asyncio.get_running_loop().call_later(SECONDS, self.settle, live)
        return due

    def settle(self, live: LiveText) -> None:
        """Show what has waited: nobody types any more."""
        if self._stop_timer(live):
            live.patience.settle()
            self._ask_to_ask()
            self.show(live)

    def clear(self, document: OpenDocument) -> None:
        """Take back the problems of a text."""
        self._stop_timer(document.live)
        self._said.pop(document.uri, None)
        self.publish(document.uri, [])

    @property
    def _can_be_made_to_ask(self) -> bool:
        of_workspace = self._server.client_capabilities.workspace
        of_diagnostics = of_workspace.diagnostics if of_workspace is not None else None
        return bool(of_diagnostics is not None and of_diagnostics.refresh_support)

    def _ask_to_ask(self) -> None:
        """Have a client that asks for diagnostics do so again."""
        if self.is_asked and self._can_be_made_to_ask:
            self._server.workspace_diagnostic_refresh(None)

    def _stop_timer(self, live: LiveText) -> bool:
        timer = self._timers.pop(live, None)
        if timer is not None:
            timer.cancel()
        return timer is not None

    def publish(self, uri: str, items: Sequence[Fields], version: int | None = None) -> None:
        """Publish the diagnostics of any text, unless the client asks for them."""
        if not self.is_asked:
            known = {"version": version} if version is not None else {}
            params = {"uri": uri, **known, "diagnostics": items}
            self._server.protocol.notify_by_fields(types.TEXT_DOCUMENT_PUBLISH_DIAGNOSTICS, params)


def diagnostics_of(document: OpenDocument, findings: Sequence[Finding]) -> list[Fields]:
    """Those of the problems that are in a text."""
    return [diagnostic_of(document, finding) for finding in findings if document.holds(finding.range.row)]


def diagnostic_of(text: PlacedText, finding: Finding) -> Fields:
    """One problem, with its hint after the message."""
    hint = f" (hint: {finding.hint})" if finding.hint else ""
    fields = {
        "range": text.range_fields(finding.range),
        "message": finding.message + hint,
        "severity": _SEVERITIES[finding.severity],
        "code": finding.code,
        "codeDescription": {"href": _page(finding.code)},
        "source": SOURCE,
    }
    if finding.related:
        fields["relatedInformation"] = [
            {"location": text.location_fields(place), "message": said} for place, said in finding.related
        ]
    return fields


def result_id(items: Sequence[Fields]) -> str:
    """What is the same for the same diagnostics."""
    import hashlib

    return hashlib.sha256(repr(items).encode("utf-8", "surrogatepass")).hexdigest()[:32]


@cache
def _page(code: str) -> str:
    """Where the code is explained: the row of a page that comes with the package."""
    page: Any = files("codeloom").joinpath("explanations.txt")
    text = page.read_text("utf-8")
    row = text[: max(text.find(f"== {code} "), 0)].count("\n") + 1
    return f"{page.as_uri()}#L{row}"
