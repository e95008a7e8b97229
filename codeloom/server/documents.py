"""The texts and notebooks that are open in the client, by their names."""

from collections.abc import Iterable, Sequence
from typing import TYPE_CHECKING

from lsprotocol import types
from pygls.exceptions import JsonRpcInvalidParams
from pygls.uris import to_fs_path

from codeloom.server.document import OpenDocument
from codeloom.server.live_text import LiveText
from codeloom.server.notebook import Cell, OpenNotebook
from codeloom.server.settings import Settings, SettingsByFolder

if TYPE_CHECKING:
    from codeloom._document import Encoding


class Documents:
    """What is open. JsonRpcInvalidParams is raised for what isn't."""

    def __init__(self) -> None:
        self.encoding: Encoding = "utf-16"
        self.settings = SettingsByFolder()
        self._by_uri: dict[str, OpenDocument] = {}
        self._notebooks: dict[str, OpenNotebook] = {}

    def __getitem__(self, uri: str) -> OpenDocument:
        """A text, or the cell of a notebook."""
        document = self._by_uri.get(uri)
        if document is None:
            raise JsonRpcInvalidParams(f"{uri} isn't open")
        return document

    def __contains__(self, uri: str) -> bool:
        return uri in self._by_uri

    def live_texts(self) -> Sequence[LiveText]:
        """All texts and notebooks with their analyses."""
        return list(dict.fromkeys(document.live for document in self._by_uri.values()))

    def is_open(self, path: str) -> bool:
        """True for the path of a text that is open."""
        return any(document.live.path == path for document in self._by_uri.values())

    def analysed_by(self, live: LiveText) -> Sequence[OpenDocument]:
        """The text, or the cells of the notebook, that an analysis is of."""
        return [document for document in self._by_uri.values() if document.live is live]

    def open(self, item: types.TextDocumentItem) -> OpenDocument:
        """Take a text that the client has opened, also in the place of one of the same name."""
        live = LiveText(item.text, item.uri, self.encoding, self._settings_of(item.uri))
        document = self._by_uri[item.uri] = OpenDocument(item, live)
        return document

    def close(self, uri: str) -> OpenDocument:
        """Forget a text."""
        document = self[uri]
        del self._by_uri[uri]
        return document

    def open_notebook(self, params: types.DidOpenNotebookDocumentParams) -> OpenNotebook:
        """Take a notebook that the client has opened, also in the place of one of the same name."""
        given = params.notebook_document
        if given.uri in self._notebooks:
            self.close_notebook(given.uri)
        notebook = OpenNotebook(given.uri, self.encoding, self._settings_of(given.uri))
        self._put(notebook, types.NotebookCellArrayChange(0, 0, given.cells), params.cell_text_documents)
        self._notebooks[given.uri] = notebook
        return notebook

    def change_cells(
        self, notebook: OpenNotebook, change: types.NotebookDocumentCellChangeStructure
    ) -> list[OpenDocument]:
        """Put cells into a notebook and take others away; those that are gone."""
        return self._put(notebook, change.array, change.did_open or ())

    def close_notebook(self, uri: str) -> list[OpenDocument]:
        """Forget a notebook; its cells."""
        notebook = self.notebook(uri)
        del self._notebooks[uri]
        return self._close_cells(notebook)

    def read_settings_anew(self) -> None:
        """Take the settings of all texts as they are now."""
        self.settings.forget()
        for live in self.live_texts():
            live.read_by(self._settings_of(live.uri))

    def notebook(self, uri: str) -> OpenNotebook:
        """A notebook."""
        notebook = self._notebooks.get(uri)
        if notebook is None:
            raise JsonRpcInvalidParams(f"the notebook {uri} isn't open")
        return notebook

    def _put(
        self,
        notebook: OpenNotebook,
        change: types.NotebookCellArrayChange,
        opened: Sequence[types.TextDocumentItem],
    ) -> list[OpenDocument]:
        """Put cells into a notebook; those that are no more in it."""
        before = list(notebook)
        notebook.splice(change, {item.uri: item for item in opened})
        now = {cell.uri: cell for cell in notebook}
        self._by_uri.update(now)
        return self._close_cells(cell for cell in before if cell.uri not in now)

    def _close_cells(self, cells: Iterable[Cell]) -> list[OpenDocument]:
        """Forget those of the cells that weren't closed by themselves."""
        return [self._by_uri.pop(cell.uri) for cell in cells if cell.uri in self._by_uri]

    def _settings_of(self, uri: str) -> Settings:
        return self.settings.of_file(to_fs_path(uri))
