"""The standard streams: messages are read ahead in a thread of their own, so that a later one counts at once.

What comes in after a message is known before it is handled: a request that the client has cancelled
isn't begun, and nothing is worked out for a text that has changed again.
"""

import json
import os
import sys
import threading
from collections import Counter
from collections.abc import Callable, Iterator
from contextlib import contextmanager
from typing import Any, BinaryIO

# A client that names a longer message than this isn't speaking the protocol.
_MOST_BYTES = 1 << 30
_LONGEST_HEADER = 1 << 12

_CANCEL = "$/cancelRequest"
_CHANGE = "textDocument/didChange"


class Inbox:
    """What has been read and isn't handled yet."""

    def __init__(self) -> None:
        self._lock = threading.Lock()
        self._waiting: set[int | str] = set()
        self._cancelled: set[int | str] = set()
        self._changes: Counter[str] = Counter()

    def add(self, message: Any) -> None:
        """Note a message that was read."""
        identity, method = _field(message, "id"), _field(message, "method")
        with self._lock:
            if method == _CANCEL:
                cancelled = _field(_field(message, "params"), "id")
                if _is_identity(cancelled) and cancelled in self._waiting:
                    self._cancelled.add(cancelled)
            elif method == _CHANGE:
                self._changes[_uri(message)] += 1
            elif method is not None and _is_identity(identity):
                self._waiting.add(identity)

    def take(self, message: Any) -> bool:
        """Note that a message is handled now; True for a request that was cancelled before."""
        identity, method = _field(message, "id"), _field(message, "method")
        with self._lock:
            if method == _CHANGE:
                self._changes[_uri(message)] -= 1
            elif method is not None and _is_identity(identity):
                self._waiting.discard(identity)
                if identity in self._cancelled:
                    self._cancelled.discard(identity)
                    return True
        return False

    def will_change(self, uri: str) -> bool:
        """True when a change of this document has been read and isn't handled yet."""
        return self._changes[uri] > 0


def _field(message: Any, name: str) -> Any:
    return message.get(name) if isinstance(message, dict) else None


def _uri(message: Any) -> str:
    return str(_field(_field(_field(message, "params"), "textDocument"), "uri"))


def _is_identity(value: Any) -> bool:
    return isinstance(value, int | str)


def read_messages(stream: BinaryIO, handle: Callable[[Any], None]) -> None:
    """Hand on each message until the stream ends; one that is no JSON as a ValueError."""
    while (length := _read_headers(stream)) is not None:
        body = stream.read(length) if 0 < length <= _MOST_BYTES else b""
        if len(body) < length <= _MOST_BYTES:
            return
        try:
            handle(json.loads(body))
        except RecursionError:
            handle(ValueError("the message is nested too deep"))
        except ValueError as error:
            handle(error)


def _read_headers(stream: BinaryIO) -> int | None:
    """The length that the headers of a message name, 0 for none; None at the end of the stream."""
    length = 0
    while row := stream.readline(_LONGEST_HEADER):
        name, _, value = row.partition(b":")
        if not row.strip():
            return length
        if name.strip().lower() == b"content-length" and value.strip().isdigit():
            length = int(value[:20])
    return None


class Writer:
    """Writes to the client; what it doesn't read any more is dropped."""

    def __init__(self, stream: BinaryIO) -> None:
        self._stream = stream

    def write(self, data: bytes) -> None:
        """Write and flush."""
        try:
            self._stream.write(data)
            self._stream.flush()
        except (BrokenPipeError, ValueError):
            pass  # the end of the client's side ends the reading too

    def close(self) -> None:
        """Leave the stream open: answers may still be on their way."""


@contextmanager
def standard_streams() -> Iterator[tuple[BinaryIO, BinaryIO]]:
    """The streams to the client. Whatever else is printed goes to the standard error."""
    sys.stdout.flush()
    own = os.dup(1)
    os.dup2(2, 1)
    printed, sys.stdout = sys.stdout, sys.stderr
    # Not `sys.stdin`: the interpreter can't end while a thread still reads from that.
    source = open(os.dup(0), "rb")  # noqa: SIM115
    try:
        with open(own, "wb", closefd=False) as output:
            yield source, output
    finally:
        sys.stdout = printed
        os.dup2(own, 1)
        os.close(own)
