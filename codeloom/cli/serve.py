"""`codeloom serve`: a language server for editors."""

import argparse

from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.extras import needing_extra
from codeloom.cli.options import Options


class ServeCommand(Command):
    """Serves an editor."""

    NAME = "serve"
    DESCRIPTION = (
        "Serve an editor by the language server protocol, over the standard input and output. It needs "
        "the extra lsp: pip install 'codeloom[lsp]'. Settings are those of the project that a file is in."
    )
    EXAMPLES = ("codeloom serve  # as an editor starts it",)

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """There are none, but for what clients add by habit."""
        parser.add_argument(
            "--stdio", action="store_true", help="accepted because some editors pass it; it is always so"
        )

    def run(self, options: Options) -> ExitStatus:
        """Serve until the client ends it."""
        with needing_extra("serve", "lsp", "pygls", "lsprotocol"):
            from codeloom.server.run import serve
        return ExitStatus(serve())
