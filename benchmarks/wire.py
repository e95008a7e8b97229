"""A client of language servers that waits for one answer at a time: the time until then is the server's."""

import json
import os
import select
import subprocess
import time
from collections.abc import Callable
from contextlib import suppress
from pathlib import Path
from typing import Any

Message = dict[str, Any]

_CAPABILITIES: Message = {
    "general": {"positionEncodings": ["utf-16"]},
    "textDocument": {
        "synchronization": {"dynamicRegistration": False},
        "publishDiagnostics": {"versionSupport": True},
        "documentSymbol": {"hierarchicalDocumentSymbolSupport": True},
    },
    "workspace": {"workspaceFolders": True, "configuration": True},
}


class SilentError(Exception):
    """The server has said nothing in time."""


class Wire:
    """One server with one open text. With `asks` it is asked for diagnostics, else it tells by itself."""

    def __init__(self, command: list[str], folder: Path, *, asks: bool, seconds: float) -> None:
        self._seconds = seconds
        self._asks = asks
        self._buffer = b""
        self._number = 0
        self._version = 0
        self._uri = (folder / "typed.py").as_uri()
        self.document = {"textDocument": {"uri": self._uri}}
        # Answers that came while another message was waited for.
        self._answers: dict[int, Message] = {}
        self._process = subprocess.Popen(
            command, cwd=folder, stdin=subprocess.PIPE, stdout=subprocess.PIPE, stderr=subprocess.DEVNULL
        )
        capabilities = json.loads(json.dumps(_CAPABILITIES))
        if asks:
            capabilities["textDocument"]["diagnostic"] = {}
        self.request(
            "initialize",
            {
                "processId": os.getpid(),
                "rootUri": folder.as_uri(),
                "workspaceFolders": [{"uri": folder.as_uri(), "name": "folder"}],
                "capabilities": capabilities,
                "initializationOptions": {"workspaceDiagnostics": False},
            },
        )
        self._notify("initialized", {})

    def open(self, text: str) -> list[Message]:
        """Open the text; its diagnostics."""
        self._version += 1
        item = {"uri": self._uri, "languageId": "python", "version": self._version, "text": text}
        self._notify("textDocument/didOpen", {"textDocument": item})
        return self._diagnostics()

    def edit(self, start: tuple[int, int], end: tuple[int, int], text: str) -> list[Message]:
        """Replace what is between two places, rows and columns from zero; the diagnostics after that."""
        self._version += 1
        change = {
            "range": {
                "start": {"line": start[0], "character": start[1]},
                "end": {"line": end[0], "character": end[1]},
            },
            "text": text,
        }
        document = {"uri": self._uri, "version": self._version}
        self._notify("textDocument/didChange", {"textDocument": document, "contentChanges": [change]})
        return self._diagnostics()

    def processor_seconds(self) -> float:
        """What the server and its processes have worked until now."""
        return _nanoseconds(self._process.pid) / 1e9

    def begin(self, method: str, params: Message) -> int:
        """Send a request; the number of its answer."""
        self._number += 1
        self._send({"id": self._number, "method": method, "params": params})
        return self._number

    def answer(self, number: int) -> Message:
        """The answer to a request."""
        if number in self._answers:
            return self._answers.pop(number)
        return self._next(lambda one: one.get("id") == number and "method" not in one)

    def request(self, method: str, params: Message) -> Any:
        """What a request gives; RuntimeError for a server's error."""
        answer = self.answer(self.begin(method, params))
        if "error" in answer:
            raise RuntimeError(f"{method}: {answer['error']}")
        return answer["result"]

    def close(self) -> None:
        """End the server."""
        self._process.kill()
        self._process.wait()

    def _diagnostics(self) -> list[Message]:
        if self._asks:
            answer = self.request("textDocument/diagnostic", self.document)
            return list((answer or {}).get("items", []))
        told = self._next(
            lambda one: (
                one.get("method") == "textDocument/publishDiagnostics"
                and one["params"]["uri"] == self._uri
                and one["params"].get("version") in (None, self._version)
            )
        )
        return list(told["params"]["diagnostics"])

    def _notify(self, method: str, params: Message) -> None:
        self._send({"method": method, "params": params})

    def _send(self, message: Message) -> None:
        body = json.dumps({"jsonrpc": "2.0", **message}).encode()
        assert self._process.stdin is not None
        self._process.stdin.write(b"Content-Length: %d\r\n\r\n%s" % (len(body), body))
        self._process.stdin.flush()

    def _next(self, is_wanted: Callable[[Message], bool]) -> Message:
        end = time.monotonic() + self._seconds
        while True:
            message = self._read(end)
            if "method" in message and "id" in message:
                self._send({"id": message["id"], "result": _answer(message)})
            elif is_wanted(message):
                return message
            elif "id" in message:
                self._answers[message["id"]] = message

    def _read(self, end: float) -> Message:
        while (head := self._buffer.find(b"\r\n\r\n")) < 0:
            self._fill(end)
        length = next(
            int(row.partition(b":")[2])
            for row in self._buffer[:head].split(b"\r\n")
            if row.lower().startswith(b"content-length")
        )
        while len(self._buffer) < head + 4 + length:
            self._fill(end)
        body = self._buffer[head + 4 : head + 4 + length]
        self._buffer = self._buffer[head + 4 + length :]
        message: Message = json.loads(body)
        return message

    def _fill(self, end: float) -> None:
        assert self._process.stdout is not None
        descriptor = self._process.stdout.fileno()
        if not select.select([descriptor], [], [], max(end - time.monotonic(), 0))[0]:
            raise SilentError
        data = os.read(descriptor, 1 << 20)
        if not data:
            raise EOFError("the server has ended")
        self._buffer += data


def _nanoseconds(process: int) -> int:
    """What all threads of a process, and of those that it has started, have worked."""
    found = 0
    for task in Path(f"/proc/{process}/task").iterdir():
        with suppress(FileNotFoundError):  # a thread that has ended
            found += int((task / "schedstat").read_text().split()[0])
            found += sum(_nanoseconds(int(child)) for child in (task / "children").read_text().split())
    return found


def _answer(request: Message) -> Any:
    """What a server's own request gets: it has no settings here."""
    if request["method"] == "workspace/configuration":
        return [None for _ in request["params"]["items"]]
    return None
