"""Problems as the client shows them: published by the server, or asked for by the client."""

import asyncio
from collections.abc import Sequence
from functools import cache
from importlib.resources import files
from typing import TYPE_CHECKING, Any

from lsprotocol import types

from codeloom.cli.items import Finding
from codeloom.server.documents import OpenDocument
from codeloom.server.patience import SECONDS
from codeloom.server.places import PlacedText

if TYPE_CHECKING:
    from codeloom.server.server import Server

SOURCE = "codeloom"
_SEVERITIES = {"error": types.DiagnosticSeverity.Error, "warning": types.DiagnosticSeverity.Warning}


def register(server: "Server") -> None:
    """Answer clients that ask for diagnostics."""

    @server.feature(
        types.TEXT_DOCUMENT_DIAGNOSTIC,
        types.DiagnosticOptions(
            inter_file_dependencies=False, workspace_diagnostics=False, identifier=SOURCE
        ),
    )
    def diagnostic(params: types.DocumentDiagnosticParams) -> types.DocumentDiagnosticReport:
        document = server.documents[params.text_document.uri]
        items = diagnostics_of(document, server.publisher.due(document))
        identity = result_id(items)
        if identity == params.previous_result_id:
            return types.RelatedUnchangedDocumentDiagnosticReport(identity)
        return types.RelatedFullDocumentDiagnosticReport(items, result_id=identity)


class Publisher:
    """Publishes problems to clients that don't ask."""

    def __init__(self, server: "Server") -> None:
        self._server = server
        self._is_asked: bool | None = None
        # Of each text with problems that wait.
        self._timers: dict[str, asyncio.TimerHandle] = {}

    @property
    def is_asked(self) -> bool:
        """True when the client asks for the diagnostics of a text."""
        if self._is_asked is None:
            of_text = self._server.client_capabilities.text_document
            self._is_asked = of_text is not None and of_text.diagnostic is not None
        return self._is_asked

    def show(self, document: OpenDocument) -> None:
        """Publish the problems of a text."""
        if not self.is_asked:
            self.publish(document.uri, diagnostics_of(document, self.due(document)), document.version)

    def due(self, document: OpenDocument) -> Sequence[Finding]:
        """The problems to show now; where others wait, they are shown when nobody types any more."""
        findings, due = document.findings, document.due
        if len(due) == len(findings) or not self._can_wait():
            return findings
        if (timer := self._timers.get(document.uri)) is not None:
            timer.cancel()
        loop = asyncio.get_running_loop()
        self._timers[document.uri] = loop.call_later(SECONDS, self.settle, document)
        return due

    def settle(self, document: OpenDocument) -> None:
        """Show what has waited: nobody types any more."""
        if (timer := self._timers.pop(document.uri, None)) is None:
            return
        timer.cancel()
        document.patience.settle()
        if self.is_asked:
            self._server.workspace_diagnostic_refresh(None)
        else:
            self.show(document)

    def _can_wait(self) -> bool:
        """False for a client that asks, and can't be made to ask again."""
        of_workspace = self._server.client_capabilities.workspace
        of_diagnostics = of_workspace.diagnostics if of_workspace is not None else None
        return not self.is_asked or bool(of_diagnostics is not None and of_diagnostics.refresh_support)

    def clear(self, document: OpenDocument) -> None:
        """Take back the problems of a text."""
        if (timer := self._timers.pop(document.uri, None)) is not None:
            timer.cancel()
        self.publish(document.uri, [])

    def publish(self, uri: str, items: Sequence[types.Diagnostic], version: int | None = None) -> None:
        """Publish the diagnostics of any text, unless the client asks for them."""
        if self.is_asked:
            return
        self._server.text_document_publish_diagnostics(types.PublishDiagnosticsParams(uri, items, version))


def diagnostics_of(document: OpenDocument, findings: Sequence[Finding]) -> list[types.Diagnostic]:
    """Problems of a text."""
    return [diagnostic_of(document, finding) for finding in findings]


def diagnostic_of(text: PlacedText, finding: Finding) -> types.Diagnostic:
    """One problem, with its hint after the message."""
    hint = f" (hint: {finding.hint})" if finding.hint else ""
    return types.Diagnostic(
        range=text.range(finding.range),
        message=finding.message + hint,
        severity=_SEVERITIES[finding.severity],
        code=finding.code,
        code_description=types.CodeDescription(_page(finding.code)),
        source=SOURCE,
        related_information=[
            types.DiagnosticRelatedInformation(text.location(place), said) for place, said in finding.related
        ]
        or None,
    )


def result_id(items: Sequence[types.Diagnostic]) -> str:
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
