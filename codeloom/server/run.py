"""The server's process: one thread reads, the loop handles, whatever else runs waits for both."""

import asyncio
import logging
import sys
import threading
from typing import Any, BinaryIO

from codeloom.server import (
    completion,
    diagnostics,
    fixes,
    folding,
    hover,
    lifecycle,
    navigation,
    rename,
    selection,
    symbols,
    tokens,
    workspace,
)
from codeloom.server.server import Server
from codeloom.server.transport import Writer, read_messages, standard_streams

_FEATURES = (
    lifecycle,
    diagnostics,
    fixes,
    symbols,
    hover,
    navigation,
    rename,
    tokens,
    folding,
    selection,
    completion,
    workspace,
)

# A thread that works in the background gives way to a message after so many seconds.
_SWITCH_SECONDS = 0.0005


def serve() -> int:
    """Serve the client at the standard streams until it ends; the exit status."""
    # What matters goes to the client; a thread that ends with the process may find no stream left.
    logging.getLogger("pygls").setLevel(logging.CRITICAL)
    sys.setswitchinterval(_SWITCH_SECONDS)
    with standard_streams() as (source, sink):
        return asyncio.run(_serve(make_server(), source, sink))


def make_server() -> Server:
    """A server with all its features."""
    server = Server()
    for feature in _FEATURES:
        feature.register(server)
    return server


async def _serve(server: Server, source: BinaryIO, sink: BinaryIO) -> int:
    loop = asyncio.get_running_loop()
    protocol = server.protocol
    protocol.ended = loop.create_future()
    protocol.set_writer(Writer(sink))

    def handle(message: Any) -> None:
        protocol.inbox.add(message)
        loop.call_soon_threadsafe(protocol.take, message)

    def read() -> None:
        try:
            read_messages(source, handle)
        finally:
            loop.call_soon_threadsafe(protocol.lsp_exit)

    threading.Thread(target=read, name="codeloom-reader", daemon=True).start()
    try:
        return await protocol.ended
    finally:
        server.shutdown()  # type: ignore[no-untyped-call]
