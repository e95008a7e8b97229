"""`codeloom tree`: the syntax tree of a line, as rules get to see it."""

import argparse
import os
import re
from itertools import chain

from codeloom._analysis import Analysis
from codeloom._face import analyze
from codeloom.cli.command import Command, ExitStatus, add_python_argument, as_named, read_path
from codeloom.cli.console import Console, printable_path
from codeloom.cli.tree_formats import FORMATS

# A place as `codeloom check` prints it; the column doesn't matter here.
_PLACE = re.compile(r"(?P<path>.+?):(?P<row>\d{1,9})(?::\d+)?:?", re.ASCII | re.DOTALL)


class TreeCommand(Command):
    """Prints the tree of each logical line that is asked for."""

    NAME = "tree"
    HELP = "show the syntax tree of a line"
    DESCRIPTION = (
        "Show the syntax tree of a line: of each node its class, the grammar rule or kind of token, "
        "the text of a leaf, and behind @ the index of its first token. Expressions within the "
        "line, in f-strings and quoted hints, follow as lines of their own. The exit status is 0 "
        "when all lines are sound, 1 when some aren't, 2 on wrong use or when the line can't be read."
    )

    def __init__(self) -> None:
        self._console = Console()

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""
        what = parser.add_mutually_exclusive_group(required=True)
        what.add_argument(
            "place",
            nargs="?",
            metavar="FILE:ROW",
            help="the line on a row of a file, counted from 1, or all lines of a FILE; "
            "- is the standard input",
        )
        what.add_argument("-c", dest="code", metavar="CODE", help="the line itself, or several")
        parser.add_argument(
            "--format",
            choices=FORMATS,
            default="text",
            help="text, with a row for each node; json; or dot, for Graphviz (default: %(default)s)",
        )
        add_python_argument(parser)

    def run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Print the trees of the code, of the row or of the file."""
        if arguments.code is not None:
            return self._print(analyze(arguments.code, python=arguments.python), arguments, None)
        path, row = _path_and_row(arguments.place)
        if os.path.isdir(path):
            return self._fail(f"{printable_path(path)} is a folder: name a file in it")
        try:
            analysis = read_path(as_named(path), arguments)
        except OSError as error:
            self._console.print_failure(error)
            return ExitStatus.FAILURE
        return self._print(analysis, arguments, row)

    def _print(self, analysis: Analysis, arguments: argparse.Namespace, row: int | None) -> ExitStatus:
        from codeloom.line_trees import line_trees  # it loads the engine

        lines = line_trees(analysis, row)
        first = next(lines, None)
        if first is None:
            return self._fail(_nothing_there(analysis, row))
        second = next(lines, None)
        has_headings = arguments.code is None or second is not None
        tree_format = FORMATS[arguments.format](self._console)
        tree_format.begin()
        status = ExitStatus.SOUND
        for line in chain([first], [] if second is None else [second], lines):
            tree_format.add(line, has_headings)
            if line.fault is not None:
                status = ExitStatus.PROBLEMS
        tree_format.end()
        return status

    def _fail(self, message: str) -> ExitStatus:
        self._console.print_error(f"codeloom: {message}")
        return ExitStatus.FAILURE


def _path_and_row(place: str) -> tuple[str, int | None]:
    match = None if os.path.exists(place) else _PLACE.fullmatch(place)
    return (match["path"], int(match["row"])) if match else (place, None)


def _nothing_there(analysis: Analysis, row: int | None) -> str:
    from codeloom.line_trees import count_rows

    path = printable_path(analysis.path)
    if row is None:
        return f"{path} holds no line"
    if row == 0:
        return f"{path} has no row 0: rows count from 1"
    count = count_rows(analysis.text)
    if row > count:
        return f"{path} has no row {row}: it ends with row {count}"
    return f"row {row} of {path} is blank"
