"""Problems as the client shows them: told by the server, or asked for by the client."""

from collections.abc import Sequence
from functools import cache
from importlib.resources import files
from typing import TYPE_CHECKING, Any

from lsprotocol import types

from codeloom.cli.items import Finding
from codeloom.server.documents import OpenDocument
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
        items = diagnostics_of(document)
        identity = result_id(items)
        if identity == params.previous_result_id:
            return types.RelatedUnchangedDocumentDiagnosticReport(identity)
        return types.RelatedFullDocumentDiagnosticReport(items, result_id=identity)


class Publisher:
    """Tells clients that don't ask."""

    def __init__(self, server: "Server") -> None:
        self._server = server
        self._is_asked: bool | None = None

    @property
    def is_asked(self) -> bool:
        """True when the client asks for the diagnostics of a text."""
        if self._is_asked is None:
            of_text = self._server.client_capabilities.text_document
            self._is_asked = of_text is not None and of_text.diagnostic is not None
        return self._is_asked

    def show(self, document: OpenDocument) -> None:
        """Tell the problems of a text."""
        if not self.is_asked:
            self.tell(document.uri, diagnostics_of(document), document.version)

    def clear(self, document: OpenDocument) -> None:
        """Tell that a text has none any more."""
        self.tell(document.uri, [])

    def tell(self, uri: str, items: Sequence[types.Diagnostic], version: int | None = None) -> None:
        """Tell the diagnostics of any text."""
        if self.is_asked:
            return
        self._server.text_document_publish_diagnostics(types.PublishDiagnosticsParams(uri, items, version))


def diagnostics_of(document: OpenDocument) -> list[types.Diagnostic]:
    """The problems of a text."""
    return [diagnostic_of(document, finding) for finding in document.findings]


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
