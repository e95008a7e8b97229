"""The command line: `codeloom COMMAND ...`.

Each command is a class in a file of its own, which is loaded when it runs.
"""

import sys

TYPE_CHECKING = False  # `typing` takes longer to import than `--version` takes
if TYPE_CHECKING:
    from collections.abc import Sequence

# What a shell reports for a program that SIGINT or SIGPIPE ended.
_INTERRUPTED = 130
_PIPE_CLOSED = 141
_FAILURE = 2


def main(argv: "Sequence[str] | None" = None) -> int:
    """Run one command, and give the exit status; `argv` is without the program's name.

    Help and wrong use raise SystemExit, as the standard library's parser of arguments does.
    """
    arguments = sys.argv[1:] if argv is None else list(argv)
    try:
        status = _run(arguments)
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
        where = f" {error.filename}" if error.filename else ""
        _say(f"can't write{where}: {error.strerror or error}")
    except MemoryError:
        _say("out of memory: name fewer or smaller files")
    return _FAILURE


def _run(arguments: list[str]) -> int:
    if arguments in (["--version"], ["-V"]):
        from codeloom.cli.version import version_text

        print(version_text())
        return 0
    from codeloom.cli.arguments import options_from
    from codeloom.cli.project import WrongUseError

    try:
        options = options_from(arguments)
        return options.command().run(options)
    except WrongUseError as error:
        _say(str(error))
        return _FAILURE


def _say(text: str) -> None:
    from codeloom.cli.console import say

    say(text)


def _drop_output() -> None:
    from codeloom.cli.console import discard

    discard(sys.stdout)
