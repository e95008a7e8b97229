"""`codeloom explain`: what a code means, with a wrong and a right example."""

import argparse

from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.console import Colour, Console
from codeloom.cli.options import Options
from codeloom.cli.project import WrongUseError, nearest
from codeloom.explanations import Example, Explanation, explanations
from codeloom.reading.languages import NEWEST

_INDENT = "    "


class ExplainCommand(Command):
    """Prints what is known of some codes, or a list of all codes."""

    NAME = "explain"
    DESCRIPTION = (
        "Explain the code of a problem, with a wrong and a right example. Without a code, list all codes."
    )
    EXAMPLES = ("codeloom explain CL301", "codeloom explain")

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the codes."""
        parser.add_argument("codes", nargs="*", metavar="CODE", help="a code such as CL301, in either case")

    def run(self, options: Options) -> ExitStatus:
        """Print them; WrongUseError for a code that doesn't exist."""
        console = Console()
        known = explanations()
        codes = [code.upper() for code in options.codes]
        for code in codes:
            if code not in known:
                raise WrongUseError(f"there is no code {code!r}{nearest(code, known)}")
        for code in codes:
            _print(console, known[code])
        if not codes:
            console.print_table(("Code", "Title"), ((each.code, each.title) for each in known.values()))
        return ExitStatus.SOUND


def _print(console: Console, explanation: Explanation) -> None:
    console.print_row(f"{console.coloured(Colour.BOLD, explanation.code)} {explanation.title}")
    console.print_row("")
    console.print_paragraph(explanation.meaning)
    version = "" if explanation.python == NEWEST else f", in Python {explanation.python}"
    for label, example in ((f"wrong{version}", explanation.wrong), ("right", explanation.right)):
        _print_example(console, label, example)
    console.print_row("")


def _print_example(console: Console, label: str, example: Example) -> None:
    console.print_row("")
    console.print_row(f"{label}, made by:" if example.is_made else f"{label}:")
    console.print_row("")
    for row in example.text.splitlines():
        console.print_row(f"{_INDENT}{row}")
