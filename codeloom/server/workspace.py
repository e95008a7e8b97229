"""The files of the workspace that aren't open: looked at in the background, while the client says nothing."""

import asyncio
import os
import time
from collections.abc import Callable, Iterable, Iterator, Mapping, Sequence
from dataclasses import dataclass
from functools import cached_property, partial
from itertools import islice
from typing import TYPE_CHECKING, Any, TypeVar

from lsprotocol import types
from pygls.uris import from_fs_path, to_fs_path

from codeloom._face import analyze_file
from codeloom.cli.source import Source
from codeloom.reading.files import MODULE_SUFFIXES, NOTEBOOK_SUFFIX, find_files
from codeloom.rows import ROW_END
from codeloom.server.diagnostics import diagnostic_of, result_id
from codeloom.server.json_text import Fields, JsonText
from codeloom.server.places import ClosedText
from codeloom.server.settings import SETTINGS_FILES

if TYPE_CHECKING:
    from codeloom.server.document import OpenDocument
    from codeloom.server.server import Server

Result = TypeVar("Result")

# The client's option that turns it off.
_OPTION = "workspaceDiagnostics"
_WATCHED = ("**/*.{py,pyi,pyw}", *(f"**/{name}" for name in SETTINGS_FILES), "**/.gitignore")

# Nothing is begun until the client has said nothing for so many seconds.
_QUIET_SECONDS = 0.1
_FILES_AT_ONCE = 256
# Whoever opens all of a disk as a workspace doesn't want to know all of it.
_MOST_FILES = 50_000


def register(server: "Server") -> None:
    """Look at the files of the workspace, and answer clients that ask for them."""
    workspace = server.closed_files

    @server.feature(types.INITIALIZED)
    def initialized(params: types.InitializedParams) -> None:
        _watch(server)
        workspace.begin()

    @server.feature(types.WORKSPACE_DID_CHANGE_WATCHED_FILES)
    def did_change_watched_files(params: types.DidChangeWatchedFilesParams) -> None:
        names = {os.path.basename(change.uri) for change in params.changes}
        if not names.isdisjoint((*SETTINGS_FILES, ".gitignore")):
            server.settings_changed()
        workspace.look_at(path for change in params.changes if (path := to_fs_path(change.uri)) is not None)

    @server.feature(types.WORKSPACE_DID_CHANGE_WORKSPACE_FOLDERS)
    def did_change_folders(params: types.DidChangeWorkspaceFoldersParams) -> None:
        workspace.begin()

    @server.feature(types.WORKSPACE_DIAGNOSTIC)
    async def diagnostic(params: types.WorkspaceDiagnosticParams) -> JsonText:
        known = {one.uri: one.value for one in params.previous_result_ids}
        return JsonText.of({"items": await workspace.reports(known)})


@dataclass(frozen=True)
class _Known:
    """What was said last of a file."""

    uri: str
    items: Sequence[Fields]
    result_id: str


class _ClosedSource(Source):
    """A source in a thread that gives way to others."""

    @cached_property
    def rows(self) -> list[str]:
        """As the base class does, though not in one step that no other thread can interrupt."""
        text, rows, start = self.analysis.text, [], 0
        for end in ROW_END.finditer(text):
            rows.append(text[start : end.start()])
            start = end.end()
        return [*rows, text[start:]]


class ClosedFiles:
    """What is wrong in the files that aren't open.

    Reading and analysing are done in a thread, all else in the server's loop.
    """

    def __init__(self, server: "Server") -> None:
        self._server = server
        self._by_path: dict[str, _Known] = {}
        self._is_wanted = True
        self._scan: asyncio.Task[None] | None = None
        self._looks: set[asyncio.Task[None]] = set()
        self._waiting: list[asyncio.Future[None]] = []

    def take_options(self, options: Any) -> None:
        """Take what the client has asked for at its start."""
        if isinstance(options, Mapping):
            self._is_wanted = options.get(_OPTION) is not False

    def begin(self) -> None:
        """Look at all files, from the first one again if that is under way."""
        if self._scan is not None:
            self._scan.cancel()
        if self._is_wanted:
            self._scan = asyncio.ensure_future(self._look_at_all())

    def look_at(self, paths: Iterable[str]) -> None:
        """Look at files that have changed or are no more."""
        wanted = [path for path in paths if path.lower().endswith(MODULE_SUFFIXES)]
        if self._is_wanted and wanted:
            task = asyncio.ensure_future(self._look_at_some(wanted))
            self._looks.add(task)
            task.add_done_callback(self._looks.discard)

    def opened(self, document: "OpenDocument") -> None:
        """A file is open now, and its problems are published as such."""
        known = self._by_path.pop(document.live.path, None)
        if known is not None and known.uri != document.uri and known.items:
            self._server.publisher.publish(known.uri, [])

    async def reports(self, known: Mapping[str, str]) -> list[Fields]:
        """What has changed since the client has known of the files; waits until something has."""
        if self._scan is not None:
            await asyncio.wait([self._scan])
        while True:
            reports, has_news = self._reports(known)
            if has_news or not known:
                return reports
            change = asyncio.get_running_loop().create_future()
            self._waiting.append(change)
            await change

    def _reports(self, known: Mapping[str, str]) -> tuple[list[Fields], bool]:
        reports: list[Fields] = []
        has_news = False
        for one in self._by_path.values():
            name = {"uri": one.uri, "version": None, "resultId": one.result_id}
            if known.get(one.uri) == one.result_id:
                reports.append({**name, "kind": "unchanged"})
            elif one.items or one.uri in known:
                has_news = True
                reports.append({**name, "kind": "full", "items": one.items})
        return reports, has_news

    # In the background

    async def _look_at_all(self) -> None:
        count = 0
        for folder in self._folders():
            found = find_files([folder], self._server.documents.settings.of_folder(folder).exclusion)
            while batch := await self._in_background(partial(_some, found)):
                for path in batch:
                    if isinstance(path, str) and not path.lower().endswith(NOTEBOOK_SUFFIX):
                        await self._look_at_one(path)
                count += len(batch)
                if count >= _MOST_FILES:
                    self._server.log(f"more than {_MOST_FILES} files: the others aren't looked at")
                    return

    async def _look_at_some(self, paths: Sequence[str]) -> None:
        for path in paths:
            await self._look_at_one(path)

    async def _look_at_one(self, path: str) -> None:
        uri = from_fs_path(path)
        if uri is None or self._server.documents.is_open(path):
            return
        known = await self._in_background(lambda: self._look(path, uri))
        if not self._server.documents.is_open(path):
            self._take(path, known)

    async def _in_background(self, work: "Callable[[], Result]") -> "Result":
        """What `work` gives, done in a thread as soon as the client is quiet."""
        while (seconds := self._seconds_to_wait()) > 0:
            await asyncio.sleep(seconds)
        return await asyncio.get_running_loop().run_in_executor(self._server.thread_pool, work)

    def _seconds_to_wait(self) -> float:
        """Until the client has been quiet for long enough."""
        return self._server.protocol.last_message + _QUIET_SECONDS - time.monotonic()

    # In the thread

    def _look(self, path: str, uri: str) -> _Known:
        items = []
        for item in self._diagnostics(path, uri):
            while (seconds := self._seconds_to_wait()) > 0:  # give way to whoever types again
                time.sleep(seconds)
            items.append(item)
        return _Known(uri, items, result_id(items))

    def _diagnostics(self, path: str, uri: str) -> Iterator[Fields]:
        documents = self._server.documents
        settings = documents.settings.of_file(path)
        try:
            analysis = analyze_file(path, python=settings.python, false_hints=settings.false_hints)
        except OSError:  # it is no more, or nobody may read it
            return
        source = _ClosedSource(path, analysis)
        text = ClosedText(uri, source, documents.encoding)
        yield from (diagnostic_of(text, finding) for finding in settings.passed(source))

    # In the loop again

    def _take(self, path: str, new: _Known) -> None:
        old = self._by_path.get(path)
        if old is not None and old.result_id == new.result_id:
            return
        self._by_path[path] = new
        if new.items or old is not None:
            self._server.publisher.publish(new.uri, new.items)
            waiting, self._waiting = self._waiting, []
            for change in waiting:
                if not change.done():
                    change.set_result(None)

    def _folders(self) -> list[str]:
        uris = [folder.uri for folder in self._server.workspace.folders.values()]
        root = self._server.workspace.root_uri
        paths = [to_fs_path(uri) for uri in uris or ([root] if root else [])]
        return [path for path in paths if path is not None]


def _some(found: "Iterator[str | OSError]") -> list[str | OSError]:
    return list(islice(found, _FILES_AT_ONCE))


def _watch(server: "Server") -> None:
    """Ask the client to report files that change, if it can be asked."""
    of_workspace = server.client_capabilities.workspace
    watching = of_workspace.did_change_watched_files if of_workspace is not None else None
    if watching is None or not watching.dynamic_registration:
        return
    options = types.DidChangeWatchedFilesRegistrationOptions(
        [types.FileSystemWatcher(pattern) for pattern in _WATCHED]
    )
    registration = types.Registration("codeloom-files", types.WORKSPACE_DID_CHANGE_WATCHED_FILES, options)
    server.client_register_capability(types.RegistrationParams([registration]))
