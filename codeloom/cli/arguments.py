"""The commands, and what the command line says.

A run loads the command that it runs and no other.
"""

import argparse
import sys
from collections.abc import Sequence
from importlib import import_module
from typing import NoReturn

from codeloom.cli.command import Command
from codeloom.cli.options import Options
from codeloom.cli.project import nearest

# The module and the class of each command, and what it does.
COMMANDS = {
    "check": ("check", "CheckCommand", "show what isn't sound, with the place of each fault"),
    "names": (
        "names",
        "NamesCommand",
        "show what each line reads and binds, and what it says of these names",
    ),
    "hints": (
        "hints",
        "HintsCommand",
        "show each def with the types of its arguments and what it gives back",
    ),
    "tree": ("tree", "TreeCommand", "show the syntax tree of a line"),
    "explain": ("explain", "ExplainCommand", "print what the code of a problem means, with examples"),
    "completion": ("completion", "CompletionCommand", "print what completes commands and options in a shell"),
}

_HELP = """usage: codeloom COMMAND ...

Analyses Python source one logical line at a time.

commands:
{commands}

options:
  --help            show this, or with a command what it takes
  --version         show the version, the grammars and the Python that runs it

examples:
  codeloom check src tests
  codeloom check --format github .
  codeloom names --format jsonl src
  codeloom tree -c 'x = foo(1)'

Exit status: 0 when all is sound, 1 when there are problems, 2 on wrong use or when a file can't be read."""


def options_from(argv: Sequence[str]) -> Options:
    """What a command line asks; `argv` is without the program's name.

    SystemExit after help and wrong use, WrongUseError for wrong settings.
    """
    name = argv[0] if argv else ""
    if name in ("-h", "--help", "help"):
        print(
            _HELP.format(commands="\n".join(f"  {name:<16}  {help}" for name, (*_, help) in COMMANDS.items()))
        )
        sys.exit(0)
    if name not in COMMANDS:
        _fail(
            "codeloom", f"there is no command {name!r}{nearest(name, COMMANDS)}" if name else "name a COMMAND"
        )
    command = command_named(name)
    given = vars(parser_of(command).parse_args(argv[1:]))
    return Options({**given, "command": command})


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

    def error(self, message: str) -> NoReturn:
        """End with the status of wrong use."""
        _fail(self.prog, message)


class _HelpFormatter(argparse.RawDescriptionHelpFormatter):
    """Fills the description as a paragraph and leaves the examples as they are."""

    def _fill_text(self, text: str, width: int, indent: str) -> str:
        if text.startswith("examples:"):
            return super()._fill_text(text, width, indent)
        return argparse.HelpFormatter._fill_text(self, text, width, indent)


def _fail(program: str, message: str) -> NoReturn:
    print(f"{program}: {message}\nTry `{program} --help`.", file=sys.stderr)
    sys.exit(2)
