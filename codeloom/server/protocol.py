"""Messages into calls. Whatever comes in, the client gets an error, and the server goes on."""

import asyncio
import json
import logging
import operator
import time
from collections.abc import Generator
from concurrent.futures import Future
from functools import partial
from typing import TYPE_CHECKING, Any

from lsprotocol import types
from pygls.exceptions import (
    FeatureNotificationError,
    JsonRpcException,
    JsonRpcInvalidRequest,
    JsonRpcParseError,
    JsonRpcRequestCancelled,
    JsonRpcServerNotInitialized,
)
from pygls.protocol import LanguageServerProtocol, default_converter, lsp_method

from codeloom.server.json_text import Fields, JsonText
from codeloom.server.transport import Inbox, is_identity

if TYPE_CHECKING:
    from codeloom.server.server import Server

_JSON_RPC = "jsonrpc"
# What a message has at least one of.
_MARKS = ("method", "result", "error")


def strict_converter() -> Any:
    """What makes objects of JSON: a null where the protocol has a text is refused, and not spelled out."""
    converter: Any = default_converter()  # type: ignore[no-untyped-call]
    for kind, hook in ((str, _text), (int, _whole_number)):  # and for none that derives from them
        converter.register_structure_hook_func(partial(operator.is_, kind), hook)
    return converter


def _text(value: object, _: type) -> str:
    if not isinstance(value, str):
        raise TypeError(f"{value!r} isn't a text")
    return value


def _whole_number(value: object, _: type) -> int:
    if isinstance(value, bool) or not isinstance(value, int | float) or value != int(value):
        raise TypeError(f"{value!r} isn't a whole number")
    return int(value)


class Protocol(LanguageServerProtocol):
    """The protocol with documents of our own."""

    _server: "Server"
    inbox: Inbox

    def __init__(self, server: "Server", converter: Any) -> None:
        super().__init__(server, converter)
        self.ended: asyncio.Future[int] | None = None
        # When it came, by the monotonic clock.
        self.last_message = 0.0
        self._is_initialized = False

    def take(self, message: Any, is_cancelled: bool = False) -> None:
        """Handle what was read: a message, something else that is JSON, or an error of reading."""
        self.last_message = time.monotonic()
        try:
            if isinstance(message, Exception):
                raise JsonRpcParseError(f"the message can't be read: {message}")
            if not isinstance(message, dict) or message.get(_JSON_RPC) != self.VERSION:
                raise JsonRpcInvalidRequest("this is no message of JSON-RPC 2.0")
            if not is_identity(message.get("id", 0)):
                raise JsonRpcInvalidRequest("the id of a message is a whole number or a text")
            if is_cancelled:
                raise JsonRpcRequestCancelled("the request was cancelled")
            self._check_order(message)
            self.handle_message(self._structured(message))
        except JsonRpcException as error:
            self._refuse(message, error)

    def _check_order(self, message: dict[str, Any]) -> None:
        method = message.get("method")
        if not self._is_initialized and method not in (types.INITIALIZE, types.EXIT, None):
            raise JsonRpcServerNotInitialized(f"{method} is sent before {types.INITIALIZE}")
        if self._is_initialized and method == types.INITIALIZE:
            raise JsonRpcInvalidRequest("the server is initialized already")
        if self._shutdown and method not in (types.EXIT, None):
            raise JsonRpcInvalidRequest(f"{method} is sent after {types.SHUTDOWN}")

    def _structured(self, message: dict[str, Any]) -> Any:
        try:
            return self.structure_message(message)
        except JsonRpcException as error:
            method = message.get("method", "an answer")
            raise type(error)(f"the parameters of {method} aren't as the protocol says") from None

    def _refuse(self, message: Any, error: JsonRpcException) -> None:
        """Report to the client: by an answer to what asks for one, else by a row in its log."""
        is_message = isinstance(message, dict) and not message.keys().isdisjoint(_MARKS)
        if not is_message or ("id" in message and "method" in message):
            answer = {"code": error.code, "message": error.message}
            identity = message.get("id") if is_message else None
            known = identity if is_identity(identity) else None
            self._send_data({_JSON_RPC: self.VERSION, "id": known, "error": answer})
        else:
            self._server.report_server_error(error, FeatureNotificationError)

    def _send_response(self, msg_id: int | str, result: Any = None, error: Any = None) -> None:
        """Send an answer; one that is JSON already as it is."""
        if error is not None or not isinstance(result, JsonText):
            super()._send_response(msg_id, result, error)
            return
        self._result_types.pop(msg_id, None)
        head = f'{{"jsonrpc":"{self.VERSION}","id":{json.dumps(msg_id)},"result":'
        body = b"%s%s}" % (head.encode(), result.encoded())
        assert self.writer is not None
        self.writer.write(b"Content-Length: %d\r\n\r\n%s" % (len(body), body))

    def notify_by_fields(self, method: str, params: Fields) -> None:
        """Tell the client something, in the fields that the protocol names."""
        self._send_data({_JSON_RPC: self.VERSION, "method": method, "params": params})

    def _check_handler_result(self, future: "Future[Any]") -> None:
        """Report what went wrong with a notification in its own words."""
        if not future.cancelled() and (error := future.exception()) is not None:
            if not isinstance(error, JsonRpcException):
                logging.getLogger(__name__).error("a notification failed", exc_info=error)
            self._server.report_server_error(error, FeatureNotificationError)  # type: ignore[arg-type]

    @lsp_method(types.INITIALIZE)
    def lsp_initialize(self, params: types.InitializeParams) -> Generator[Any, Any, types.InitializeResult]:
        """Agree on what both sides can do."""
        self._is_initialized = True
        return (yield from super().lsp_initialize(params))

    @lsp_method(types.EXIT)
    def lsp_exit(self, *args: Any) -> None:  # type: ignore[override]
        """End the process: with 0 when the client has shut the server down before."""
        if self.ended is not None and not self.ended.done():
            self.ended.set_result(0 if self._shutdown else 1)

    @lsp_method(types.TEXT_DOCUMENT_DID_OPEN)
    def lsp_text_document__did_open(self, params: types.DidOpenTextDocumentParams) -> None:
        """Take a text."""
        self._server.opened(params.text_document)

    @lsp_method(types.TEXT_DOCUMENT_DID_CHANGE)
    def lsp_text_document__did_change(self, params: types.DidChangeTextDocumentParams) -> None:
        """Change a text."""
        self._server.changed(params)

    @lsp_method(types.TEXT_DOCUMENT_DID_CLOSE)
    def lsp_text_document__did_close(self, params: types.DidCloseTextDocumentParams) -> None:
        """Forget a text."""
        self._server.closed(params.text_document.uri)

    @lsp_method(types.NOTEBOOK_DOCUMENT_DID_OPEN)
    def lsp_notebook_document__did_open(self, params: types.DidOpenNotebookDocumentParams) -> None:
        """Take a notebook."""
        self._server.notebook_opened(params)

    @lsp_method(types.NOTEBOOK_DOCUMENT_DID_CHANGE)
    def lsp_notebook_document__did_change(self, params: types.DidChangeNotebookDocumentParams) -> None:
        """Change the cells of a notebook."""
        self._server.notebook_changed(params)

    @lsp_method(types.NOTEBOOK_DOCUMENT_DID_CLOSE)
    def lsp_notebook_document__did_close(self, params: types.DidCloseNotebookDocumentParams) -> None:
        """Forget a notebook."""
        self._server.notebook_closed(params.notebook_document.uri)
