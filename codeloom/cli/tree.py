"""`codeloom tree`: the syntax tree of a line, as rules get to see it."""

import argparse
import os
import re
from collections.abc import Iterator
from itertools import chain

from codeloom._face import analyze
from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.formats import FOR_TREES, format_named
from codeloom.cli.options import Options, add_exit_zero_argument, add_output_arguments, add_reading_arguments
from codeloom.cli.project import WrongUseError
from codeloom.cli.run import as_named, opened_console, print_facts, read_source
from codeloom.cli.source import Source, printable_path
from codeloom.cli.tally import Tally
from codeloom.cli.tree_items import TreeItem

# A place as `codeloom check` prints it; the column doesn't matter here.
_PLACE = re.compile(
    r"(?P<path>.+?):(?:cell (?P<cell>\d{1,9}):)?(?P<row>\d{1,9})(?::\d+)?:?", re.ASCII | re.DOTALL
)


class TreeCommand(Command):
    """Prints the tree of each logical line that is asked for."""

    NAME = "tree"
    DESCRIPTION = (
        "Print the syntax tree of a line: for each node its class, its grammar rule or kind of token, "
        "the text of a leaf, and after @ the index of its first token. Expressions within the line, in "
        "f-strings and quoted hints, follow as lines of their own. The exit status is 0 if there is no "
        "problem, 1 if there are some, 2 for wrong use or a line that can't be read."
    )

    EXAMPLES = (
        "codeloom tree -c 'x = foo(1)'",
        "codeloom tree src/a.py:12",
        "codeloom tree --format dot -c 'a + b * c' | dot -Tsvg > tree.svg",
    )
    FORMATS = FOR_TREES

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""
        what = parser.add_mutually_exclusive_group()
        what.add_argument(
            "place",
            nargs="?",
            metavar="FILE:ROW",
            help="the line on a row of a file, counted from 1, or of a notebook's cell (FILE:cell N:ROW); "
            "all lines of a FILE; or - for the standard input",
        )
        what.add_argument("-c", dest="code", metavar="CODE", help="the line itself, or several")
        add_reading_arguments(parser)
        add_exit_zero_argument(add_output_arguments(parser, cls.FORMATS))

    def run(self, options: Options) -> ExitStatus:
        """Print the trees of the code, of the row or of the file."""
        if options.code is None and options.place is None:
            raise WrongUseError("name a line as FILE:ROW, or give one with -c CODE")
        if options.verbose:
            print_facts(options)
        with opened_console(options) as console:
            if options.code is not None:
                analysis = analyze(options.code, python=options.version, false_hints=options.false_hints)
                return _print(Source(analysis.path, analysis), options, None, console)
            path, cell, row = _parts_of(options.place or "")
            if os.path.isdir(path):
                return _fail(f"{printable_path(path)} is a folder: name a file in it", console)
            try:
                source = read_source(as_named(path), options, options.version)
            except OSError as error:
                console.print_failure(error)
                return ExitStatus.FAILURE
            if row is not None and (source.is_notebook or cell is not None):
                row = source.row_in_text(cell, row)
                if row is None:
                    place = printable_path(options.place or "")
                    return _fail(f"there is no code in {place}: name FILE:cell N:ROW of a notebook", console)
            return _print(source, options, row, console)


def _print(source: Source, options: Options, row: int | None, console: Console) -> ExitStatus:
    from codeloom.line_trees import line_trees  # it loads the engine

    lines = line_trees(source.analysis, row)
    first = next(lines, None)
    if first is None:
        return _fail(_nothing_there(source, row), console)
    second = next(lines, None)
    has_headings = options.code is None or second is not None
    tally = Tally()
    tally.files = 1

    def items() -> Iterator[TreeItem]:
        for i, line in enumerate(chain([first], [] if second is None else [second], lines)):
            item = TreeItem(source, line, has_headings, is_first=i == 0)
            tally.lines += 1
            tally.count(item.findings)
            yield item

    tree_format = format_named(options.format)(console, TreeCommand.NAME)
    tree_format.begin()
    tree_format.add(source, items())
    tally.faulty_files = int(tally.problems > 0)
    tree_format.end(tally)
    return ExitStatus.PROBLEMS if tally.problems and not options.exit_zero else ExitStatus.SOUND


def _fail(message: str, console: Console) -> ExitStatus:
    console.say(message)
    return ExitStatus.FAILURE


def _parts_of(place: str) -> tuple[str, int | None, int | None]:
    """The path, the cell of a notebook and the row."""
    match = None if os.path.exists(place) else _PLACE.fullmatch(place)
    if match is None:
        return place, None, None
    return match["path"], int(match["cell"]) if match["cell"] else None, int(match["row"])


def _nothing_there(source: Source, row: int | None) -> str:
    from codeloom.line_trees import count_rows

    path = printable_path(source.path)
    if row is None:
        return f"{path} holds no line"
    if row == 0:
        return f"{path} has no row 0: rows count from 1"
    count = count_rows(source.analysis.text)
    if row > count:
        return f"{path} has no row {row}: it ends with row {count}"
    return f"row {row} of {path} is blank"
