"""`codeloom tree`: the syntax tree of a line, as rules get to see it."""

import argparse
import os
import re
from itertools import chain

from codeloom.cli.command import AddLanguageArgument, Command, ExitStatus
from codeloom.cli.console import Console, PrintablePath
from codeloom.cli.files import ReadFiles
from codeloom.cli.tree_formats import FORMATS
from codeloom.line_reader import CountRows
from codeloom.line_trees import LineTrees
from codeloom.source import Source, SourceFromBytes, SourceFromText

_CODE_PATH = "<string>"

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
        self._fConsole = Console()

    @staticmethod
    def AddArguments(parser: argparse.ArgumentParser) -> None:
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
        AddLanguageArgument(parser)

    def Run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Print the trees of the code, of the row or of the file."""
        if arguments.code is not None:
            return self._Print(SourceFromText(arguments.code), arguments, _CODE_PATH, None)
        path, row = _PathAndRow(arguments.place)
        if os.path.isdir(path):
            return self._Fail(f"{PrintablePath(path)} is a folder: name a file in it")
        for name, data in ReadFiles([path], self._fConsole.PrintFailure):
            return self._Print(SourceFromBytes(data), arguments, name, row)
        return ExitStatus.FAILURE

    def _Print(self, source: Source, arguments: argparse.Namespace, path: str, row: int | None) -> ExitStatus:
        lines = LineTrees(source, arguments.language, path, row)
        first = next(lines, None)
        if first is None:
            return self._Fail(_NothingThere(source.text, PrintablePath(path), row))
        second = next(lines, None)
        has_headings = arguments.code is None or second is not None
        tree_format = FORMATS[arguments.format](self._fConsole)
        tree_format.Begin()
        status = ExitStatus.SOUND
        for line in chain([first], [] if second is None else [second], lines):
            tree_format.Add(line, has_headings)
            if line.problem is not None:
                status = ExitStatus.PROBLEMS
        tree_format.End()
        return status

    def _Fail(self, message: str) -> ExitStatus:
        self._fConsole.PrintError(f"codeloom: {message}")
        return ExitStatus.FAILURE


def _PathAndRow(place: str) -> tuple[str, int | None]:
    match = None if os.path.exists(place) else _PLACE.fullmatch(place)
    return (match["path"], int(match["row"])) if match else (place, None)


def _NothingThere(text: str, path: str, row: int | None) -> str:
    if row is None:
        return f"{path} holds no line"
    if row == 0:
        return f"{path} has no row 0: rows count from 1"
    count = CountRows(text)
    if row > count:
        return f"{path} has no row {row}: it ends with row {count}"
    return f"row {row} of {path} is blank"
