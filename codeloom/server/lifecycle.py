"""How a client's session begins, and what it reports of files and settings."""

import os
from typing import TYPE_CHECKING

from lsprotocol import types

from codeloom.server.settings import SETTINGS_FILES

if TYPE_CHECKING:
    from codeloom.server.server import Server


def register(server: "Server") -> None:
    """Take part in the session."""

    @server.feature(types.INITIALIZE)
    def initialize(params: types.InitializeParams) -> None:
        server.begin(params)

    @server.feature(types.TEXT_DOCUMENT_DID_SAVE)
    def did_save(params: types.DidSaveTextDocumentParams) -> None:
        if params.text_document.uri in server.documents:
            server.publisher.settle(server.documents[params.text_document.uri].live)
        if os.path.basename(params.text_document.uri) in SETTINGS_FILES:
            server.settings_changed()

    @server.feature(types.NOTEBOOK_DOCUMENT_DID_SAVE)
    def did_save_notebook(params: types.DidSaveNotebookDocumentParams) -> None:
        server.publisher.settle(server.documents.notebook(params.notebook_document.uri).live)

    @server.feature(types.WORKSPACE_DID_CHANGE_CONFIGURATION)
    def did_change_configuration(params: types.DidChangeConfigurationParams) -> None:
        server.settings_changed()
