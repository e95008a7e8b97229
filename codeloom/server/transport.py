"""The standard streams: bytes into messages, read as soon as they are there, and answers into bytes.

Whatever has come in is looked at before the next message is handled. So a request that the client has
cancelled meanwhile isn't begun, and nothing is worked out for a text that has changed again.
"""

import json
import os
import select
import sys
from asyncio import AbstractEventLoop
from collections import Counter, deque
from collections.abc import Iterator
from contextlib import contextmanager
from typing import Any

# A client that names a longer message than this isn't speaking the protocol.
_MOST_BYTES = 1 << 30
_LONGEST_HEADER = 1 << 12
_READ_BYTES = 1 << 18
# A client that never stops is listened to again after the next message.
_READS_AT_ONCE = 16
# So many can be written at least when a pipe takes any.
_WRITE_BYTES = select.PIPE_BUF

_CANCEL = "$/cancelRequest"
_CHANGE = "textDocument/didChange"


class Framing:
    """Finds the messages in what is read."""

    def __init__(self) -> None:
        self._buffer = bytearray()
        self._named: int | None = None
        self._has_headers = False
        self._length: int | None = None

    def feed(self, data: bytes) -> Iterator[Any]:
        """The messages that are whole with these bytes; one that is not JSON as a ValueError."""
        self._buffer += data
        while self._length is not None or self._read_headers():
            assert self._length is not None
            if len(self._buffer) < self._length:
                return
            body = bytes(self._buffer[: self._length])
            del self._buffer[: self._length]
            self._length = None
            yield _parsed(body)

    def _read_headers(self) -> bool:
        """True when the headers of a message have ended; an unreadable length is none."""
        while (end := self._buffer.find(b"\n")) >= 0:
            row = bytes(self._buffer[:end])
            del self._buffer[: end + 1]
            name, _, value = row.partition(b":")
            value = value.strip()
            if row.strip():
                self._has_headers = True
                if name.strip().lower() == b"content-length" and value.isdigit() and len(value) < 20:
                    self._named = int(value)
            elif self._has_headers:
                named, self._named, self._has_headers = self._named or 0, None, False
                self._length = named if named <= _MOST_BYTES else 0
                return True
        if len(self._buffer) > _LONGEST_HEADER:
            self._buffer.clear()
        return False


def _parsed(body: bytes) -> Any:
    try:
        return json.loads(body)
    except RecursionError:
        return ValueError("the message is nested too deep")
    except ValueError as error:
        return error


class Inbox:
    """The messages that have been read and aren't handled yet."""

    def __init__(self, descriptor: int) -> None:
        self._descriptor = descriptor
        self._poll = select.poll()
        self._poll.register(descriptor, select.POLLIN)
        self._framing = Framing()
        self._messages: deque[Any] = deque()
        self._waiting: set[int | str] = set()
        self._cancelled: set[int | str] = set()
        self._changes: Counter[str] = Counter()
        self.has_ended = False

    def __len__(self) -> int:
        return len(self._messages)

    def read(self) -> None:
        """Take in all that is there, without waiting for more."""
        for _ in range(_READS_AT_ONCE):
            if self.has_ended or not self._poll.poll(0):
                return
            data = os.read(self._descriptor, _READ_BYTES)
            self.has_ended = not data
            for message in self._framing.feed(data):
                self._add(message)

    def next(self) -> tuple[Any, bool]:
        """The next message, and whether it is a request that was cancelled."""
        message = self._messages.popleft()
        identity, method = _field(message, "id"), _field(message, "method")
        if method == _CHANGE:
            self._changes[_uri(message)] -= 1
        elif method is not None and is_identity(identity):
            self._waiting.discard(identity)
            if identity in self._cancelled:
                self._cancelled.discard(identity)
                return message, True
        return message, False

    def will_change(self, uri: str) -> bool:
        """True when a change of this document has been read and isn't handled yet."""
        return self._changes[uri] > 0

    def _add(self, message: Any) -> None:
        self._messages.append(message)
        identity, method = _field(message, "id"), _field(message, "method")
        if method == _CANCEL:
            cancelled = _field(_field(message, "params"), "id")
            if is_identity(cancelled) and cancelled in self._waiting:
                self._cancelled.add(cancelled)
        elif method == _CHANGE:
            self._changes[_uri(message)] += 1
        elif method is not None and is_identity(identity):
            self._waiting.add(identity)


def _field(message: Any, name: str) -> Any:
    return message.get(name) if isinstance(message, dict) else None


def _uri(message: Any) -> str:
    return str(_field(_field(_field(message, "params"), "textDocument"), "uri"))


def is_identity(value: Any) -> bool:
    """True for what a request can be named by."""
    return isinstance(value, int | str) and not isinstance(value, bool)


class Writer:
    """Writes to the client as it reads: what doesn't fit into the pipe waits without stopping the server."""

    def __init__(self, descriptor: int, loop: AbstractEventLoop) -> None:
        self._descriptor = descriptor
        self._loop = loop
        self._poll = select.poll()
        self._poll.register(descriptor, select.POLLOUT)
        self._left = bytearray()
        self._is_waiting = False

    def write(self, data: bytes) -> None:
        """Write, now or as soon as the client reads; what it doesn't read any more is dropped."""
        self._left += data
        if not self._is_waiting:
            self._write_some()
            if self._left:
                self._is_waiting = True
                self._loop.add_writer(self._descriptor, self._go_on)

    def close(self) -> None:
        """Write what is left, and wait until it is read."""
        while self._left:
            self._poll.poll()
            self._write_some()

    def _go_on(self) -> None:
        self._write_some()
        if not self._left:
            self._is_waiting = False
            self._loop.remove_writer(self._descriptor)

    def _write_some(self) -> None:
        try:
            while self._left and self._poll.poll(0):
                del self._left[: os.write(self._descriptor, self._left[:_WRITE_BYTES])]
        except OSError:
            self._left.clear()  # the end of the client's side ends the reading too


@contextmanager
def standard_streams() -> Iterator[tuple[int, int]]:
    """The descriptors of the streams to the client. Whatever else is printed goes to the standard error."""
    sys.stdout.flush()
    own = os.dup(1)
    os.dup2(2, 1)
    printed, sys.stdout = sys.stdout, sys.stderr
    try:
        yield 0, own
    finally:
        sys.stdout = printed
        os.dup2(own, 1)
        os.close(own)
