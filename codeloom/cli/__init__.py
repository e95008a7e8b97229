"""The command line: `codeloom COMMAND ...`.

Each command is a class in a file of its own; `COMMANDS` lists them.
"""

import argparse
import os
import sys
from collections.abc import Sequence

from codeloom import __version__
from codeloom.cli.check import CheckCommand
from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.hints import HintsCommand
from codeloom.cli.names import NamesCommand
from codeloom.cli.tree import TreeCommand

COMMANDS: Sequence[type[Command]] = (CheckCommand, NamesCommand, HintsCommand, TreeCommand)

# What a shell reports for a program that SIGINT or SIGPIPE ended.
_INTERRUPTED = 130
_PIPE_CLOSED = 141


def main(argv: Sequence[str] | None = None) -> int:
    """Run one command, and give the exit status; `argv` is without the program's name.

    Wrong use raises SystemExit, as the standard library's parser of arguments does.
    """
    try:
        arguments = _argument_parser().parse_args(argv)
        status: int = arguments.command().run(arguments)
        if sys.stdout is not None:
            sys.stdout.flush()
        return status
    except KeyboardInterrupt:
        return _INTERRUPTED
    except BrokenPipeError:
        _drop_output()
        return _PIPE_CLOSED
    except OSError as error:
        _drop_output()
        print(f"codeloom: {error}", file=sys.stderr)
    except MemoryError:
        print("codeloom: out of memory: name fewer or smaller files", file=sys.stderr)
    return ExitStatus.FAILURE


def _argument_parser() -> argparse.ArgumentParser:
    parser = argparse.ArgumentParser(
        prog="codeloom", description="Analyses Python source one logical line at a time."
    )
    parser.add_argument("--version", action="version", version=f"codeloom {__version__}")
    commands = parser.add_subparsers(metavar="COMMAND", required=True)
    for command in COMMANDS:
        command_parser = commands.add_parser(command.NAME, help=command.HELP, description=command.DESCRIPTION)
        command.add_arguments(command_parser)
        command_parser.set_defaults(command=command)
    return parser


def _drop_output() -> None:
    """Send what is left in the buffers nowhere, so that the interpreter can end quietly."""
    nowhere = os.open(os.devnull, os.O_WRONLY)
    os.dup2(nowhere, sys.stdout.fileno())
    os.close(nowhere)
