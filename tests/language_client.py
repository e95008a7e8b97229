"""An editor for tests: it talks to `codeloom serve` over the wire, and holds every answer to the protocol."""

import contextlib
import json
import os
import queue
import subprocess
import sys
import threading
from pathlib import Path

from lsprotocol import converters, types

CONVERTER = converters.get_converter()
SECONDS = 30
COMMAND = (sys.executable, "-P", "-m", "codeloom", "serve")

PULL = {"textDocument": {"diagnostic": {}}}


class Refused(Exception):
    """The server's error."""

    def __init__(self, code, message):
        super().__init__(message)
        self.code = code


class Client:
    """One session with a server, which begins with `initialize` unless told otherwise."""

    def __init__(self, folder, *, encodings=None, capabilities=None, options=None, starts=True):
        self.folder = Path(folder)
        self.process = subprocess.Popen(
            COMMAND, stdin=subprocess.PIPE, stdout=subprocess.PIPE, stderr=subprocess.PIPE, cwd=folder
        )
        self._incoming = queue.Queue()
        self._notes = []
        self._next_id = 0
        self.versions = {}
        for stream, reader in ((self.process.stdout, self._read), (self.process.stderr, self._drain)):
            threading.Thread(target=reader, args=(stream,), daemon=True).start()
        self.errors = b""
        if starts:
            self.initialize(encodings, capabilities, options)

    def initialize(self, encodings=None, capabilities=None, options=None):
        general = {"general": {"positionEncodings": encodings}} if encodings else {}
        params = {
            "processId": os.getpid(),
            "rootUri": self.folder.as_uri(),
            "capabilities": {**general, **(capabilities or {})},
            "workspaceFolders": [{"uri": self.folder.as_uri(), "name": "folder"}],
            "initializationOptions": {"workspaceDiagnostics": False, **(options or {})},
        }
        self.capabilities = self.request("initialize", params).capabilities
        self.notify("initialized", {})

    def __enter__(self):
        return self

    def __exit__(self, *_):
        if self.process.poll() is None:
            self.process.kill()
        self.process.wait(SECONDS)
        with contextlib.suppress(BrokenPipeError):
            self.process.stdin.close()

    # Messages

    def write(self, body):
        """Bytes as they are."""
        self.process.stdin.write(b"Content-Length: %d\r\n\r\n%s" % (len(body), body))
        self.process.stdin.flush()

    def send(self, message):
        self.write(json.dumps({"jsonrpc": "2.0", **message}).encode())

    def notify(self, method, params):
        self.send({"method": method, "params": params})

    def begin(self, method, params):
        """Send a request, and give its number."""
        self._next_id += 1
        self.send({"id": self._next_id, "method": method, "params": params})
        return self._next_id

    def answer(self, identity, method=None):
        """What the server says to a request."""
        message = self.next(lambda one: one.get("id") == identity and "method" not in one)
        if "error" in message:
            raise Refused(message["error"]["code"], message["error"]["message"])
        if method is None:
            return message["result"]
        return CONVERTER.structure(message, types.METHOD_TO_TYPES[method][1]).result

    def request(self, method, params):
        return self.answer(self.begin(method, params), method)

    def note(self, method, wanted=lambda params: True):
        """The next notification or request of the server's own."""
        message = self.next(lambda one: one.get("method") == method and wanted(one.get("params")))
        return CONVERTER.structure(message, types.METHOD_TO_TYPES[method][0]).params

    def next(self, wanted):
        for i, message in enumerate(self._notes):
            if wanted(message):
                return self._notes.pop(i)
        while True:
            message = self._incoming.get(timeout=SECONDS)
            if message is None:
                raise EOFError(self.errors.decode())
            if wanted(message):
                return message
            self._notes.append(message)

    def _read(self, stream):
        while header := stream.readline():
            name, _, length = header.partition(b": ")
            assert name == b"Content-Length", header  # nothing else is on the wire
            while stream.readline().strip():
                pass
            self._incoming.put(json.loads(stream.read(int(length))))
        self._incoming.put(None)

    def _drain(self, stream):
        for row in stream:
            self.errors += row

    # Documents

    def uri(self, name):
        return (self.folder / name).as_uri()

    def open(self, text, name="a.py"):
        """Open a text, and give what tells it."""
        self.versions[name] = 1
        item = {"uri": self.uri(name), "languageId": "python", "version": 1, "text": text}
        self.notify("textDocument/didOpen", {"textDocument": item})
        return {"textDocument": {"uri": self.uri(name)}}

    def change(self, *edits, name="a.py"):
        """Edits one after the other; each a text, or start, end and text."""
        self.versions[name] += 1
        changes = [
            {"text": edit} if isinstance(edit, str) else {"range": range_of(*edit[:2]), "text": edit[2]}
            for edit in edits
        ]
        document = {"uri": self.uri(name), "version": self.versions[name]}
        self.notify("textDocument/didChange", {"textDocument": document, "contentChanges": changes})

    def diagnostics(self, name="a.py"):
        """What the server tells of the newest version."""
        uri, version = self.uri(name), self.versions.get(name)
        told = self.note(
            "textDocument/publishDiagnostics",
            lambda params: params["uri"] == uri and params.get("version") == version,
        )
        return list(told.diagnostics)

    def at(self, line, character, name="a.py"):
        """Parameters of a request about a position."""
        return {
            "textDocument": {"uri": self.uri(name)},
            "position": {"line": line, "character": character},
        }


def range_of(start, end):
    return {
        "start": {"line": start[0], "character": start[1]},
        "end": {"line": end[0], "character": end[1]},
    }


def shown(place):
    """A range as text."""
    start, end = place.start, place.end
    return f"{start.line}:{start.character}-{end.line}:{end.character}"


def apply(text, edits):
    """A text after edits with positions in characters."""
    rows = text.splitlines(keepends=True)
    starts = [0]
    for row in rows:
        starts.append(starts[-1] + len(row))

    def Offset(position):
        return min(starts[min(position.line, len(rows))] + position.character, len(text))

    for edit in sorted(edits, key=lambda one: Offset(one.range.start), reverse=True):
        text = text[: Offset(edit.range.start)] + edit.new_text + text[Offset(edit.range.end) :]
    return text
