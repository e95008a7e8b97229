"""`codeloom report`: a run as one page for a browser."""

from __future__ import annotations

import argparse
import os
import stat
from collections.abc import Iterable
from datetime import UTC, datetime

from codeloom.cli.command import ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.extras import needing_extra
from codeloom.cli.formats.base import Format, failed_path
from codeloom.cli.items import Finding, Item
from codeloom.cli.options import (
    Options,
    WrongUseError,
    add_jobs_argument,
    add_run_arguments,
    add_verbose_argument,
    add_watch_argument,
)
from codeloom.cli.run import STDIN_NAME, Run, files_of
from codeloom.cli.source import Source, printable_path
from codeloom.cli.source_command import SourceCommand
from codeloom.cli.tally import Tally
from codeloom.reading.files import StandardInput

TYPE_CHECKING = False  # it is loaded by those who watch
if TYPE_CHECKING:
    from codeloom.cli.watch import Watch

_STDOUT = "-"
_SOURCES = ("auto", "whole", "around")
_MEGABYTE = 1_000_000
# Bytes of source up to which a page holds all rows unless told otherwise.
_MOST_WHOLE = 2 * _MEGABYTE
# The time that a page bears, in seconds since 1970, so that the same input gives the same page:
# https://reproducible-builds.org/specs/source-date-epoch/
_DATE_VARIABLE = "SOURCE_DATE_EPOCH"


class ReportCommand(SourceCommand):
    """Writes the page."""

    NAME = "report"
    DESCRIPTION = (
        "Write one page for a browser that needs nothing else: each problem in its source, every name with "
        "what it does there, a search, tables and charts. The exit status is 0 if there is no problem, 1 if "
        "there are some, 2 for wrong use or a file that can't be read, which the page lists too. It needs "
        "the extra report: pip install 'codeloom[report]'."
    )
    EXAMPLES = (
        "codeloom report src -o report.html",
        "codeloom report --diff main . -o changes.html",
        'codeloom report --title "Nightly run" --exit-zero . -o nightly.html',
        "SOURCE_DATE_EPOCH=$(date +%s) codeloom report . -o dated.html",
    )
    FORMATS = ()
    HAS_SUMMARY = True

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add what is read, and what the page is like."""
        add_run_arguments(parser)
        group = parser.add_argument_group("output")
        group.add_argument(
            "-o", "--output", metavar="FILE", required=True, help="the page; - for the standard output"
        )
        group.add_argument("--title", metavar="TEXT", help="the page's title (default: what is read)")
        group.add_argument(
            "--source",
            choices=_SOURCES,
            metavar="WHICH",
            help="whole for all rows of every file, around for those around problems, or auto: whole up to "
            f"{_MOST_WHOLE // _MEGABYTE} MB of source (default: auto)",
        )
        add_jobs_argument(group)
        add_watch_argument(group)
        group.add_argument("-q", "--quiet", action="store_const", const=1, help="no summary")
        add_verbose_argument(group)

    def run_once(self, options: Options, watch: Watch | None = None) -> ExitStatus:
        """Write the page; WrongUseError where it can't be written."""
        console = Console()
        page = PageFormat(console, options)
        return self.show(Run(options, console, records=True, names=True, output=page, watch=watch))

    def items(self, source: Source, findings: list[Finding]) -> Iterable[Item]:
        """The problems."""
        return findings


class PageFormat(Format):
    """Collects what a run reads, and writes the page at its end."""

    WRITES_AT_END = True

    def __init__(self, console: Console, options: Options) -> None:
        """WrongUseError when the page can't be written there, or its date is wrong."""
        self._output = str(options.output)
        # Then the summary isn't on the standard output.
        self.IS_FOR_PROGRAMS = self._output == _STDOUT
        super().__init__(console, options.command.NAME)
        with needing_extra("report", "report", "jinja2", "markupsafe"):
            from codeloom.report.page import Page
        if not self.IS_FOR_PROGRAMS:
            _check_folder(self._output)
        self._page = Page(_title(options), options.version, is_whole=_is_whole(options), date=_date())

    def add(self, source: Source, items: Iterable[Item]) -> None:
        """Take in a file."""
        self._page.add(source, [item for item in items if isinstance(item, Finding)])

    def add_failure(self, error: OSError) -> None:
        """Take in a file that can't be read."""
        self._page.add_failure(failed_path(error), error.strerror or str(error))

    def end(self, tally: Tally) -> None:
        """Write the page."""
        pieces = self._page.html(tally)
        if self.IS_FOR_PROGRAMS:
            for piece in pieces:
                self._console.write(piece)
        else:
            _write_whole(self._output, pieces)


def _write_whole(path: str, pieces: Iterable[str]) -> None:
    """Write a file so that nobody ever finds a part of it; OSError when that fails."""
    path = os.path.realpath(path)  # a link stays one
    if os.path.exists(path) and not stat.S_ISREG(os.stat(path).st_mode):  # such as a pipe
        _write(path, pieces)
        return
    new = f"{path}.{os.getpid()}.new"
    try:
        _write(new, pieces)
        os.replace(new, path)
    except OSError as error:
        error.filename, error.filename2 = path, None  # which the user knows
        raise
    finally:
        if os.path.exists(new):
            os.unlink(new)


def _write(path: str, pieces: Iterable[str]) -> None:
    with open(path, "w", encoding="utf-8", newline="\n") as file:
        file.writelines(pieces)


def _check_folder(path: str) -> None:
    folder = os.path.dirname(os.path.realpath(path))
    if os.path.isdir(path):
        reason = "it is a folder"
    elif not os.path.isdir(folder):
        reason = f"there is no folder {printable_path(folder)}"
    else:
        return
    raise WrongUseError(f"can't write {printable_path(path)}: {reason}")


def _title(options: Options) -> str:
    if options.title is not None:
        return options.title
    here = os.path.basename(os.getcwd()) or os.getcwd()
    names = {".": here, StandardInput.NAME: options.stdin_filename or STDIN_NAME}
    return ", ".join(names.get(path) or printable_path(path) for path in options.paths)


def _is_whole(options: Options) -> bool:
    if options.source != "auto":
        return options.source == "whole"
    left = _MOST_WHOLE
    for path in files_of(options):
        if isinstance(path, str) and not isinstance(path, StandardInput):
            left -= os.path.getsize(path) if os.path.exists(path) else 0
        if left < 0:
            return False
    return True


def _date() -> datetime | None:
    text = os.environ.get(_DATE_VARIABLE)
    if not text:
        return None
    try:
        return datetime.fromtimestamp(int(text), UTC)
    except (ValueError, OverflowError, OSError):
        raise WrongUseError(
            f"{_DATE_VARIABLE} must be a number of seconds since 1970, not {text!r}"
        ) from None
