"""The server: its documents, what it reports by itself, and the features."""

from collections.abc import Iterable
from typing import Any

from lsprotocol import types
from pygls.lsp.server import LanguageServer

import codeloom
from codeloom.server.diagnostics import Publisher
from codeloom.server.documents import Documents
from codeloom.server.live_text import LiveText
from codeloom.server.notebook import SYNC
from codeloom.server.protocol import Protocol, strict_converter
from codeloom.server.workspace import ClosedFiles


class Server(LanguageServer):
    """One client's server."""

    protocol: Protocol

    def __init__(self) -> None:
        super().__init__(
            "codeloom",
            codeloom.__version__,
            protocol_cls=Protocol,
            converter_factory=strict_converter,
            max_workers=1,
            notebook_document_sync=SYNC,
        )
        self.documents = Documents()
        self.publisher = Publisher(self)
        self.closed_files = ClosedFiles(self)

    def begin(self, params: types.InitializeParams) -> None:
        """Take what the client has said of itself."""
        encoding = self.workspace.position_encoding or types.PositionEncodingKind.Utf16
        self.documents.encoding = types.PositionEncodingKind(encoding).value
        self.closed_files.take_options(params.initialization_options)

    def opened(self, item: types.TextDocumentItem) -> None:
        """The client has opened a text."""
        document = self.documents.open(item)
        self.closed_files.opened(document)
        self._begin(document.live)

    def changed(self, params: types.DidChangeTextDocumentParams) -> None:
        """The client has changed a text; what comes after a wrong change of it isn't taken."""
        document = self.documents[params.text_document.uri]
        try:
            document.change(params.content_changes, params.text_document.version)
        finally:
            if not self.protocol.inbox.will_change(document.uri):
                self.publisher.show(document.live)

    def closed(self, uri: str) -> None:
        """The client has closed a text."""
        document = self.documents.close(uri)
        self.publisher.clear(document)
        self.closed_files.look_at([document.live.path])

    def notebook_opened(self, params: types.DidOpenNotebookDocumentParams) -> None:
        """The client has opened a notebook."""
        self._begin(self.documents.open_notebook(params).live)

    def notebook_changed(self, params: types.DidChangeNotebookDocumentParams) -> None:
        """The client has changed the cells of a notebook, or which they are."""
        notebook, change = self.documents.notebook(params.notebook_document.uri), params.change.cells
        if change is None:
            return
        try:
            if change.structure is not None:
                for cell in self.documents.change_cells(notebook, change.structure):
                    self.publisher.clear(cell)
            for one in change.text_content or ():
                notebook.cell(one.document.uri).change(one.changes, one.document.version)
        finally:
            self.publisher.show(notebook.live)

    def notebook_closed(self, uri: str) -> None:
        """The client has closed a notebook."""
        for cell in self.documents.close_notebook(uri):
            self.publisher.clear(cell)

    def settings_changed(self) -> None:
        """A file of settings has changed, or may have."""
        self.documents.read_settings_anew()
        lives = self.documents.live_texts()
        self._report_faults(lives)
        self.closed_files.begin()
        for live in lives:
            self.publisher.show(live)

    def report_server_error(self, error: Exception, source: Any) -> None:
        """Write into the client's log what nobody waits for; requests get their answers."""
        if source is not None and source.__name__ == "FeatureRequestError":
            return
        self.log(str(error), types.MessageType.Error)

    def log(self, text: str, kind: types.MessageType = types.MessageType.Info) -> None:
        """Write into the client's log."""
        self.window_log_message(types.LogMessageParams(kind, text))

    def _begin(self, live: LiveText) -> None:
        self._report_faults([live])
        self.publisher.show(live)

    def _report_faults(self, lives: Iterable[LiveText]) -> None:
        """Show why settings aren't taken, each time once."""
        for fault in dict.fromkeys(live.settings.fault for live in lives):
            if fault is not None:
                self.window_show_message(types.ShowMessageParams(types.MessageType.Error, fault))
