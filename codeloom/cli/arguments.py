"""The commands, and what the command line says.

A run loads the command that it runs and no other.
"""

from __future__ import annotations

import argparse
import sys
from collections.abc import Sequence
from importlib import import_module

from codeloom.cli.command import Command
from codeloom.cli.console import print_error
from codeloom.cli.options import Options
from codeloom.cli.project import nearest
from codeloom.cli.terminal import terminal_width
from codeloom.reading.languages import NEWEST, VERSIONS

TYPE_CHECKING = False  # `typing` takes long to import
if TYPE_CHECKING:
    from typing import NoReturn

# The module and the class of each command, and what it does.
COMMANDS = {
    "check": ("check", "CheckCommand", "report what is broken, with the place of each fault"),
    "names": ("names", "NamesCommand", "list every name: what it does there, and its scope"),
    "hints": ("hints", "HintsCommand", "list each def with the types of its arguments and results"),
    "tree": ("tree", "TreeCommand", "print the syntax tree of a line"),
    "report": ("report", "ReportCommand", "write a page for a browser: problems, source, names, charts"),
    "index": ("index", "IndexCommand", "write what many files say into tables, as Parquet files"),
    "query": ("query", "QueryCommand", "ask about an index in SQL"),
    "serve": ("serve", "ServeCommand", "serve an editor by the language server protocol"),
    "explain": ("explain", "ExplainCommand", "explain the code of a problem, with examples"),
    "completion": ("completion", "CompletionCommand", "print a script that completes commands in your shell"),
}

_HELP_WORDS = ("help", "-h", "--help")
_OPTIONS = ("--help", "--version")  # without a command

_HELP = """usage: codeloom COMMAND ...

Analyses Python source, from {oldest} to {newest}, one logical line at a time.

commands:
{commands}

options:
  -h, --help     show this help
  -V, --version  show the version, the grammars and the Python that runs it

examples:
  codeloom check src tests
  codeloom check --format github .
  codeloom names --format jsonl src
  codeloom tree -c 'x = foo(1)'

`codeloom help COMMAND` lists the options of a command.
Exit status: 0 if all is well, 1 if there are problems, 2 for wrong use or
a file that can't be read."""


def options_from(argv: Sequence[str]) -> Options:
    """What a command line asks; `argv` is without the program's name.

    SystemExit after help and wrong use, WrongUseError for wrong settings.
    """
    name, rest = (argv[0], argv[1:]) if argv else ("", ())
    if name in _HELP_WORDS and not rest:
        print(_help(), flush=True)
        sys.exit(0)
    if name in _HELP_WORDS:
        name, rest = rest[0], ("--help",)
    if not name:
        print_error(_help())
        sys.exit(2)
    if name.startswith("-"):
        _fail("codeloom", f"there is no option {name}{nearest(name, _OPTIONS)}")
    if name not in COMMANDS:
        _fail("codeloom", f"there is no command {name!r}{nearest(name, COMMANDS)}")
    command = command_named(name)
    given = vars(parser_of(command).parse_args(rest))
    return Options({**given, "command": command})


def _help() -> str:
    width = max(map(len, COMMANDS))
    commands = "\n".join(f"  {name:<{width}}  {help}" for name, (*_, help) in COMMANDS.items())
    return _HELP.format(commands=commands, oldest=VERSIONS[0], newest=NEWEST)


def command_named(name: str) -> type[Command]:
    """The class of a command."""
    module, class_name, _ = COMMANDS[name]
    command: type[Command] = getattr(import_module(f"codeloom.cli.{module}"), class_name)
    return command


def parser_of(command: type[Command]) -> argparse.ArgumentParser:
    """What reads a command's arguments; those that aren't given stay out of the result."""
    examples = "\n".join(f"  {example}" for example in command.EXAMPLES)
    parser = _Parser(
        prog=f"codeloom {command.NAME}",
        description=command.DESCRIPTION,
        epilog=f"examples:\n{examples}" if examples else None,
        argument_default=argparse.SUPPRESS,
        formatter_class=_HelpFormatter,
        allow_abbrev=False,
    )
    command.add_arguments(parser)
    return parser


class _Parser(argparse.ArgumentParser):
    """Says what is wrong in a row or two, with the option that may have been meant."""

    def parse_args(self, args=None, namespace=None):  # type: ignore[no-untyped-def]
        """As the base class does, with a suggestion for an unknown option."""
        found, unknown = self.parse_known_args(args, namespace)
        if unknown:
            option = unknown[0].partition("=")[0]
            known = [name for action in self._actions for name in action.option_strings]
            self.error(f"there is no option {option}{nearest(option, known)}")
        return found

    def print_help(self, file=None):  # type: ignore[no-untyped-def]
        """As the base class does, which says nothing when it can't write."""
        print(self.format_help(), end="", file=file, flush=True)

    def error(self, message: str) -> NoReturn:
        """End with the status of wrong use."""
        _fail(self.prog, message)


class _HelpFormatter(argparse.RawDescriptionHelpFormatter):
    """Fills the description as a paragraph and leaves the examples as they are."""

    def __init__(self, prog: str) -> None:
        super().__init__(prog, width=terminal_width(80) - 2)

    def _fill_text(self, text: str, width: int, indent: str) -> str:
        if text.startswith("examples:"):
            return super()._fill_text(text, width, indent)
        return argparse.HelpFormatter._fill_text(self, text, width, indent)


def _fail(program: str, message: str) -> NoReturn:
    print_error(f"{program}: {message}\nTry `{program} --help`.")
    sys.exit(2)
