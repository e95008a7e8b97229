"""The language server: what editors ask of a text while it is typed.

    transport       bytes of the standard streams -> messages, ahead in a thread of their own
    protocol        messages -> calls; what is no message gets an error
    documents       the open texts: rows, edits, positions in the client's units, settings
    diagnostics ... one file a feature: a document and a position -> what the protocol wants

`serve` runs it. It needs the packages of the extra `lsp`.
"""

TYPE_CHECKING = False
if TYPE_CHECKING:
    from codeloom.server.run import serve

__all__ = ["serve"]


def __getattr__(name: str) -> object:
    if name != "serve":
        raise AttributeError(f"module {__name__!r} has no attribute {name!r}")
    from codeloom.server.run import serve

    return serve
