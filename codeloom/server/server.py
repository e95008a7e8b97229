"""The server: its documents, what it reports by itself, and the features."""

from collections.abc import Iterable
from typing import Any

from lsprotocol import types
from pygls.lsp.server import LanguageServer
from pygls.protocol import default_converter

import codeloom
from codeloom.server.diagnostics import Publisher
from codeloom.server.documents import Documents, OpenDocument
from codeloom.server.protocol import Protocol
from codeloom.server.units import Units
from codeloom.server.workspace import ClosedFiles


class Server(LanguageServer):
    """One client's server."""

    protocol: Protocol

    def __init__(self) -> None:
        super().__init__(
            "codeloom",
            codeloom.__version__,
            protocol_cls=Protocol,
            converter_factory=default_converter,
            max_workers=1,
        )
        self.documents = Documents()
        self.publisher = Publisher(self)
        self.closed_files = ClosedFiles(self)

    def begin(self, params: types.InitializeParams) -> None:
        """Take what the client has said of itself."""
        encoding = self.workspace.position_encoding or types.PositionEncodingKind.Utf16
        self.documents.units = Units(types.PositionEncodingKind(encoding).value)
        self.closed_files.take_options(params.initialization_options)

    def opened(self, item: types.TextDocumentItem) -> None:
        """The client has opened a text."""
        document = self.documents.open(item)
        self.closed_files.opened(document)
        self._report_faults([document])
        self.publisher.show(document)

    def changed(self, params: types.DidChangeTextDocumentParams) -> None:
        """The client has changed a text; what comes after a wrong change of it isn't taken."""
        document = self.documents[params.text_document.uri]
        try:
            for change in params.content_changes:
                document.edit(change)
            document.version = params.text_document.version
        finally:
            if not self.protocol.inbox.will_change(document.uri):
                self.publisher.show(document)

    def closed(self, uri: str) -> None:
        """The client has closed a text."""
        document = self.documents.close(uri)
        self.publisher.clear(document)
        self.closed_files.look_at([document.path])

    def settings_changed(self) -> None:
        """A file of settings has changed, or may have."""
        self.documents.read_settings_anew()
        self._report_faults(self.documents)
        self.closed_files.begin()
        for document in self.documents:
            self.publisher.show(document)

    def report_server_error(self, error: Exception, source: Any) -> None:
        """Write into the client's log what nobody waits for; requests get their answers."""
        if source is not None and source.__name__ == "FeatureRequestError":
            return
        self.log(str(error), types.MessageType.Error)

    def log(self, text: str, kind: types.MessageType = types.MessageType.Info) -> None:
        """Write into the client's log."""
        self.window_log_message(types.LogMessageParams(kind, text))

    def _report_faults(self, documents: Iterable[OpenDocument]) -> None:
        """Show why settings aren't taken, each time once."""
        for fault in dict.fromkeys(document.settings.fault for document in documents):
            if fault is not None:
                self.window_show_message(types.ShowMessageParams(types.MessageType.Error, fault))
