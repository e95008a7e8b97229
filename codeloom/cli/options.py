"""What a run is asked to do, and the arguments that several commands share.

The command line goes before the settings of the project, and these before the defaults.
"""

from __future__ import annotations

import argparse
import os
from collections.abc import Callable, Mapping, Sequence

from codeloom.cli.formats import FORMATS
from codeloom.cli.project import Project, WrongUseError, checked_settings, nearest
from codeloom.reading.exclusion import DEFAULT_PATTERNS, Exclusion, is_pattern
from codeloom.reading.files import StandardInput
from codeloom.reading.languages import NEWEST, VERSIONS, oldest_admitted, version_named

TYPE_CHECKING = False  # `typing` takes long to import
if TYPE_CHECKING:
    from typing import Any

    from codeloom.cli.command import Command

COLOURS = ("auto", "always", "never")


class Options:
    """All that a run may be asked, with the defaults."""

    command: type[Command]
    paths: Sequence[str] = ()
    place: str | None = None
    code: str | None = None
    shell: str = ""
    records: bool = False
    unused: bool = False
    undefined: bool = False
    codes: Sequence[str] = ()
    python: str | None = None
    false_hints: bool = False
    stdin_filename: str | None = None
    jobs: int | None = None
    config: str | None = None

    exclude: Sequence[str] = DEFAULT_PATTERNS
    extend_exclude: Sequence[str] = ()
    force_exclude: bool = False
    gitignore: bool = True
    show_files: bool = False

    select: Sequence[str] = ()
    ignore: Sequence[str] = ()
    baseline: str | None = None
    diff: str | None = None

    format: str = "text"
    output: str | None = None
    color: str = "auto"
    statistics: bool = False
    exit_zero: bool = False
    quiet: int = 0
    verbose: bool = False
    watch: bool = False

    tables: Sequence[str] | None = None  # all
    resume: bool = False
    dedup: bool = False
    text: bool = False
    git: bool = False
    path_column: str = "path"
    content_column: str = "content"
    python_column: str = "python"
    max_bytes: int = 10
    max_seconds: float = 10.0
    part_size: float = 16.0
    engine: str = "threads"
    address: str | None = None
    sql: str = ""
    index: str = ""

    title: str | None = None
    source: str = "auto"

    project: Project

    def __init__(self, given: Mapping[str, Any]) -> None:
        """From what the command line gives; WrongUseError where it or a setting is wrong."""
        named = [path for path in given.get("paths", ()) if path != StandardInput.NAME]
        named += [given[name] for name in ("stdin_filename", "place") if name in given]
        self.project = Project(named or ["."], given.get("config"))
        for name, value in checked_settings(self.project, _READERS):
            setattr(self, name.replace("-", "_"), value)
        if self.baseline is not None:
            self.baseline = os.path.join(self.project.root, self.baseline)
        self._keep_format_of(given)
        for name, value in given.items():
            setattr(self, name, value)
        self._check_output()
        if self.stdin_filename is not None and StandardInput.NAME not in (*self.paths, self.place):
            raise WrongUseError("--stdin-filename is for the standard input: name - to read it")

    @property
    def version(self) -> str:
        """The version of Python that sources are written in."""
        if self.python is not None:
            return self.python
        requirement = self.project.requires_python
        return (requirement and oldest_admitted(requirement)) or NEWEST

    @property
    def exclusion(self) -> Exclusion:
        """What a search through folders leaves out."""
        patterns = (*self.exclude, *self.extend_exclude)
        return Exclusion(self.project.root, patterns, gitignore=self.gitignore, force=self.force_exclude)

    def _check_output(self) -> None:
        """WrongUseError for an output that would overwrite what is read; a baseline is written anew."""
        if any(map(self._is_output, (*self.paths, self.place, self.project.settings_file))):
            raise WrongUseError(f"{self.output} is to be read: name another file for the output")
        if self._is_output(self.baseline):
            self.baseline = None

    def _is_output(self, path: str | None) -> bool:
        if path is None or self.output is None or not os.path.isfile(self.output):
            return False
        return os.path.exists(path) and os.path.samefile(path, self.output)

    def _keep_format_of(self, given: Mapping[str, Any]) -> None:
        """A format in the settings is for the commands that have it."""
        command = given.get("command")
        if command is not None and self.format not in command.FORMATS:
            self.format = "text"


def add_source_arguments(parser: argparse.ArgumentParser, formats: Sequence[str]) -> None:
    """Add what every command has that goes through files and prints what it finds."""
    add_run_arguments(parser)
    group = add_output_arguments(parser, formats)
    add_jobs_argument(group)
    group.add_argument("--statistics", action="store_true", help="count the problems by code at the end")
    add_watch_argument(group)


def add_run_arguments(parser: argparse.ArgumentParser) -> None:
    """Add what says which files are read, how, and which of their problems count."""
    parser.add_argument(
        "paths",
        nargs="*",
        default=["."],
        metavar="FILE-OR-FOLDER",
        help="a file; a folder, for all Python files and notebooks in it; or - for the standard input "
        "(default: the current folder)",
    )
    add_reading_arguments(parser)
    add_finding_arguments(parser).add_argument(
        "--show-files", action="store_true", help="list the files that would be read, and exit"
    )
    _add_selecting(parser)


def add_finding_arguments(parser: argparse.ArgumentParser) -> argparse._ArgumentGroup:
    """Add what says which files are read."""
    group = parser.add_argument_group("which files")
    patterns: dict[str, Any] = {"type": as_argument(_patterns), "action": "extend", "metavar": "PATTERN"}
    group.add_argument(
        "--exclude",
        **patterns,
        help="skip paths that match, written as in a .gitignore file; replaces the defaults "
        f"{' '.join(DEFAULT_PATTERNS)}",
    )
    group.add_argument("--extend-exclude", **patterns, help="skip these too")
    group.add_argument(
        "--force-exclude", action="store_true", help="skip paths that match even if you name them"
    )
    group.add_argument(
        "--no-gitignore", dest="gitignore", action="store_false", help="read what .gitignore files list"
    )
    return group


def _add_selecting(parser: argparse.ArgumentParser) -> None:
    group = parser.add_argument_group("which problems")
    codes: dict[str, Any] = {"type": as_argument(_selectors), "action": "extend", "metavar": "CODES"}
    group.add_argument(
        "--select", **codes, help="report only these codes, such as CL301, or CL3 for all that begin with it"
    )
    group.add_argument(
        "--ignore",
        **codes,
        help="don't report these codes; where a code matches both options, the longer match counts",
    )
    group.add_argument(
        "--baseline",
        metavar="FILE",
        help="report only what isn't in this earlier report, written with --format json",
    )
    group.add_argument(
        "--diff",
        metavar="REVISION",
        help="report only problems on lines changed since this git revision, such as HEAD or main",
    )
    add_exit_zero_argument(group)


def add_watch_argument(group: argparse._ArgumentGroup) -> None:
    """Add `watch`."""
    group.add_argument("--watch", action="store_true", help="run again whenever a file changes")


def add_jobs_argument(group: argparse._ActionsContainer) -> None:
    """Add how many threads there are."""
    group.add_argument(
        "--jobs",
        type=as_argument(count),
        metavar="N",
        help="number of threads (default: one per processor)",
    )


def add_output_arguments(parser: argparse.ArgumentParser, formats: Sequence[str]) -> argparse._ArgumentGroup:
    """Add what every command has that writes results."""
    group = parser.add_argument_group("output")
    group.add_argument(
        "--format",
        **choice_of(formats),
        metavar="FORMAT",
        help=f"{', '.join(formats[:-1])} or {formats[-1]} (default: text)",
    )
    group.add_argument("-o", "--output", metavar="FILE", help="write to this file, not the standard output")
    group.add_argument(
        "--color",
        **choice_of(COLOURS),
        metavar="WHEN",
        help="auto, always or never (default: auto, which heeds NO_COLOR and FORCE_COLOR)",
    )
    group.add_argument("-q", "--quiet", action="count", help="no summary; -qq: no problems either")
    add_verbose_argument(group)
    return group


def add_verbose_argument(group: argparse._ArgumentGroup) -> None:
    """Add `verbose`."""
    group.add_argument(
        "-v", "--verbose", action="store_true", help="say which settings and versions are used"
    )


def add_reading_arguments(parser: argparse.ArgumentParser) -> None:
    """Add what every command has that shows something of source."""
    add_python_argument(parser)
    parser.add_argument(
        "--false-hints",
        action="store_true",
        help="treat everything that looks like a type hint as one: also prose after `# type:`, "
        "codes after `# type: ignore` and sentences in quoted annotations",
    )
    parser.add_argument("--config", metavar="FILE", help="read the settings from this file")


def add_python_argument(parser: argparse.ArgumentParser) -> None:
    """Add `python` and `stdin_filename`."""
    parser.add_argument(
        "--python",
        type=as_argument(version_named),
        metavar="VERSION",
        help=f"the version of Python that the source is for: {VERSIONS[0]}, or {VERSIONS[1]} to {NEWEST}, "
        f"written 3.12, py312 or 3 (default: the oldest that the project's requires-python allows, "
        f"or {NEWEST})",
    )
    parser.add_argument("--stdin-filename", metavar="FILE", help="report the standard input under this name")


def add_exit_zero_argument(parser: argparse._ActionsContainer) -> None:
    """Add `exit_zero`."""
    parser.add_argument("--exit-zero", action="store_true", help="exit with 0 even if there are problems")


def choice_of(names: Sequence[str]) -> dict[str, Any]:
    """For an argument that takes one of some words: what names the nearest when it is another."""
    return {"choices": names, "type": as_argument(lambda name: _one_of(name, names))}


def as_argument(read: Callable[[str], Any]) -> Callable[[str], Any]:
    """A reader of settings as the standard library's parser of arguments wants it."""

    def read_argument(text: str) -> Any:
        try:
            return read(text)
        except ValueError as error:
            raise argparse.ArgumentTypeError(str(error).removeprefix("python: ")) from None

    return read_argument


def _selectors(value: str | list[str]) -> list[str]:
    from codeloom.cli.filters.codes import selectors_of

    return [selector for text in _texts(value) for selector in selectors_of(text)]


def _patterns(value: str | list[str]) -> list[str]:
    patterns = _texts(value)
    for pattern in patterns:
        if not is_pattern(pattern):
            raise ValueError(f"{pattern!r} isn't a pattern")
    return patterns


def _texts(value: object) -> list[str]:
    texts = [value] if isinstance(value, str) else value
    if not isinstance(texts, list) or not all(isinstance(text, str) for text in texts):
        raise TypeError("it must be a list of strings")
    return texts


def _text(value: object) -> str:
    if not isinstance(value, str):
        raise TypeError("it must be a string")
    return value


def _flag(value: object) -> bool:
    if not isinstance(value, bool):
        raise TypeError("it must be true or false")
    return value


def count(value: object) -> int:
    """A number from 1."""
    if isinstance(value, bool) or not isinstance(value, int | str):
        raise TypeError("it must be a number")
    try:
        count = int(value)
    except ValueError:
        count = 0
    if count < 1:
        raise ValueError(f"it must be a number from 1, not {value}")
    return count


def _one_of(value: object, names: Sequence[str]) -> str:
    if value not in names:
        suggestion = nearest(str(value), names) or f": choose {', '.join(names[:-1])} or {names[-1]}"
        raise ValueError(f"unknown value {value!r}{suggestion}")
    return str(value)


# The settings, each with what makes its value of what the file holds.
_READERS: Mapping[str, Callable[[Any], Any]] = {
    "python": lambda value: version_named(_text(value)),
    "false-hints": _flag,
    "jobs": count,
    "exclude": _patterns,
    "extend-exclude": _patterns,
    "force-exclude": _flag,
    "gitignore": _flag,
    "select": _selectors,
    "ignore": _selectors,
    "baseline": _text,
    "exit-zero": _flag,
    "format": lambda value: _one_of(value, tuple(FORMATS)),
    "color": lambda value: _one_of(value, COLOURS),
    "statistics": _flag,
}

__all__ = [
    "Options",
    "WrongUseError",
    "add_exit_zero_argument",
    "add_finding_arguments",
    "add_output_arguments",
    "add_python_argument",
    "add_reading_arguments",
    "add_run_arguments",
    "add_source_arguments",
    "add_verbose_argument",
    "add_watch_argument",
    "as_argument",
    "choice_of",
    "count",
]
