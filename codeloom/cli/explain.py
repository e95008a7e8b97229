"""`codeloom explain`: what a code means, with a wrong and a right example."""

import argparse

from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.console import Colour, Console
from codeloom.cli.formats import FOR_ALL_ITEMS, format_named
from codeloom.cli.formats.json import ObjectFormat
from codeloom.cli.options import Options, add_output_arguments
from codeloom.cli.project import WrongUseError, nearest
from codeloom.cli.run import opened_console
from codeloom.cli.tally import Tally
from codeloom.explanations import Example, Explanation, explanations
from codeloom.reading.languages import NEWEST

_INDENT = "    "


class ExplainCommand(Command):
    """Prints what is known of some codes, or a list of all codes."""

    NAME = "explain"
    DESCRIPTION = (
        "Explain the code of a problem, with a wrong and a right example. Without a code, list all codes."
    )
    EXAMPLES = (
        "codeloom explain CL301",
        "codeloom explain",
        "codeloom explain --format json | jq '.items[].code'",
    )
    FORMATS = FOR_ALL_ITEMS

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the codes."""
        parser.add_argument("codes", nargs="*", metavar="CODE", help="a code such as CL301, in either case")
        add_output_arguments(parser, cls.FORMATS)

    def run(self, options: Options) -> ExitStatus:
        """Print them; WrongUseError for a code that doesn't exist."""
        known = explanations()
        codes = [code.upper() for code in options.codes]
        for code in codes:
            if code not in known:
                raise WrongUseError(f"there is no code {code!r}{nearest(code, known)}")
        chosen = [known[code] for code in codes or known]
        with opened_console(options) as console:
            if options.format == "text":
                _print_all(console, chosen, is_list=not codes)
            elif options.format == "concise":
                _print_titles(console, chosen)
            else:
                _write_all(console, options.format, chosen)
        return ExitStatus.SOUND


def _print_all(console: Console, chosen: list[Explanation], is_list: bool) -> None:
    if is_list:
        console.print_table(("Code", "Title"), ((each.code, each.title) for each in chosen))
        return
    for explanation in chosen:
        _print(console, explanation)


def _print_titles(console: Console, chosen: list[Explanation]) -> None:
    for explanation in chosen:
        console.print_row(f"{explanation.code} {explanation.title}")


def _write_all(console: Console, name: str, chosen: list[Explanation]) -> None:
    report = format_named(name)(console, ExplainCommand.NAME)
    assert isinstance(report, ObjectFormat)
    report.begin()
    for explanation in chosen:
        examples = {"wrong": explanation.wrong._asdict(), "right": explanation.right._asdict()}
        report.add_fact({"type": "explanation", **explanation._asdict(), **examples})
    report.end(Tally())


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
