"""The server's process: a loop that reads, handles and answers; files in the background have a thread."""

import asyncio
import logging
import selectors
import sys

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
from codeloom.server.transport import Inbox, Writer, standard_streams

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
    # What matters goes to the client's log.
    logging.getLogger("pygls").setLevel(logging.CRITICAL)
    sys.setswitchinterval(_SWITCH_SECONDS)
    with standard_streams() as (source, sink), asyncio.Runner(loop_factory=_new_loop) as runner:
        return runner.run(_serve(make_server(), source, sink))


def _new_loop() -> asyncio.AbstractEventLoop:
    """A loop that can wait for a file too, which a shell may have put in the place of the input."""
    return asyncio.SelectorEventLoop(selectors.PollSelector())


def make_server() -> Server:
    """A server with all its features."""
    server = Server()
    for feature in _FEATURES:
        feature.register(server)
    return server


async def _serve(server: Server, source: int, sink: int) -> int:
    loop = asyncio.get_running_loop()
    protocol, inbox = server.protocol, Inbox(source)
    protocol.inbox, protocol.ended = inbox, loop.create_future()
    writer = Writer(sink, loop)
    protocol.set_writer(writer)

    def handle_one() -> None:
        """Handle the next message; others have their turn before the one after it."""
        inbox.read()
        if inbox:
            protocol.take(*inbox.next())
        if inbox:
            loop.call_soon(handle_one)
        elif inbox.has_ended:
            loop.remove_reader(source)
            protocol.lsp_exit()
        else:
            loop.add_reader(source, begin)

    def begin() -> None:
        loop.remove_reader(source)
        handle_one()

    loop.add_reader(source, begin)
    try:
        return await protocol.ended
    finally:
        server.shutdown()  # type: ignore[no-untyped-call]
        writer.close()
