"""The language server: what editors ask of a text while it is typed.

    transport       bytes of the standard streams -> messages, ahead in a thread of their own
    protocol        messages -> calls; what is no message gets an error
    documents       what is open by its name; document and notebook: positions in the client's units
    live_text       a text that is edited: its analysis, its settings, the problems that wait
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
