"""One run over files: which are read, which of their problems count, and where it is written."""

from __future__ import annotations

import sys
from collections.abc import Callable, Iterator, Sequence
from contextlib import contextmanager

from codeloom._face import analyze, processor_count
from codeloom.cli.command import ExitStatus
from codeloom.cli.console import Console, say
from codeloom.cli.excerpt import printable
from codeloom.cli.filters import Filter
from codeloom.cli.filters.codes import code_filters
from codeloom.cli.formats import format_named
from codeloom.cli.items import Finding
from codeloom.cli.options import Options
from codeloom.cli.progress import Progress
from codeloom.cli.project import WrongUseError
from codeloom.cli.source import Source, printable_path
from codeloom.cli.tally import Tally
from codeloom.reading.ahead import read_ahead
from codeloom.reading.files import (
    NOTEBOOK_SUFFIX,
    StandardInput,
    find_files,
    left_out_by_force,
    read_file,
)

TYPE_CHECKING = False  # `typing` takes long to import
if TYPE_CHECKING:
    from codeloom._analysis import Analysis
    from codeloom.cli.filters.changes import Changes
    from codeloom.cli.formats.base import Format
    from codeloom.cli.watch import Watch

STDIN_NAME = "<stdin>"


class Run:
    """What the options come to: files, filters, a format, counts.

    `output` is a format that isn't one of those with a name; `watch` knows what earlier runs have read.
    """

    def __init__(
        self,
        options: Options,
        console: Console,
        *,
        records: bool,
        names: bool,
        output: Format | None = None,
        watch: Watch | None = None,
    ) -> None:
        self.options = options
        self.console = console
        self.tally = Tally()
        self.format = output or format_named(options.format)(console, options.command.NAME)
        self._needs_records, self._needs_names = records, names
        self._needs_fingerprints = self.format.NEEDS_FINGERPRINTS or options.baseline is not None
        self._filters, self._changes = _filters_of(options)
        self._version = options.version
        self._watch = watch
        # What is printed on the terminal all the time shows well enough how far a run is.
        is_wanted = self.format.WRITES_AT_END or not ((records or names) and console.is_terminal)
        self._progress = Progress(console, self._count_files, is_wanted=is_wanted)

    def files(self) -> Iterator[str | OSError]:
        """The paths of the files to read, and what keeps a folder from being listed."""
        return self._concerned(files_of(self.options, self._on_nothing))

    def _count_files(self) -> int:
        return sum(1 for _ in self._concerned(files_of(self.options)))

    def _concerned(self, paths: Iterator[str | OSError]) -> Iterator[str | OSError]:
        changes = self._changes
        if changes is None:
            return paths
        named = (OSError, StandardInput)
        return (path for path in paths if isinstance(path, named) or changes.concern(str(path)))

    def sources(self) -> Iterator[tuple[Source, list[Finding]]]:
        """Each file with the problems that count; what can't be read is reported."""
        options = self.options
        found: Iterator[str | OSError | Source] = self.files()
        if self._watch is not None:
            found = self._watch.recall(self.files())
        results = read_ahead(
            found,
            jobs=options.jobs or processor_count(),
            python=self._version,
            false_hints=options.false_hints,
            records=self._needs_records,
            names=self._needs_names,
        )
        with self._progress as progress:
            for one, analysis in results:
                try:
                    source = self._source(one, analysis)
                except OSError as error:
                    self._on_error(error)
                    continue
                findings = self._findings(source)
                if findings and self.console.is_terminal:
                    progress.clear()
                yield source, findings
                progress.show(self.tally)

    def _source(self, found: str | OSError | Source, analysis: Analysis | None) -> Source:
        """What was found, read if it isn't yet; OSError when it can't be."""
        if isinstance(found, Source):
            return found
        if isinstance(found, OSError):
            raise found
        if analysis is None:
            source = read_source(found, self.options, self._version)
        else:
            source = Source(found, analysis)
        if self._watch is not None and not isinstance(found, StandardInput):
            self._watch.keep(source)
        return source

    def end(self) -> ExitStatus:
        """Write what goes after all files, and give the exit status."""
        self.format.end(self.tally)
        if not self.format.IS_FOR_PROGRAMS:
            self._print_counts()
        status = self.tally.status()
        return ExitStatus.SOUND if self.options.exit_zero and status == ExitStatus.PROBLEMS else status

    def _print_counts(self) -> None:
        options = self.options
        if options.statistics:
            self.console.print_table(("Count", "Code", "First message"), self.tally.statistics())
        if options.command.HAS_SUMMARY and options.format == "text" and not options.quiet:
            self.console.print_row(str(self.tally))

    def _findings(self, source: Source) -> list[Finding]:
        findings: Sequence[Finding] = [Finding.of(source, problem) for problem in source.problems]
        if findings and self._needs_fingerprints:
            from codeloom.cli.filters.baseline import add_fingerprints

            add_fingerprints(findings, self.options.project.root)
        for passes in self._filters if findings else ():
            findings = passes(source, findings)
        return list(findings)

    def _on_nothing(self, path: str, reason: str) -> None:
        if self.options.quiet < 2:
            self._progress.clear()
            self.console.say(f"nothing to read in {printable_path(path)}: {printable(reason)}")

    def _on_error(self, error: OSError) -> None:
        self.tally.unread += 1
        self._progress.clear()
        self.console.print_failure(error)
        self.format.add_failure(error)


def files_of(
    options: Options, on_nothing: Callable[[str, str], None] | None = None
) -> Iterator[str | OSError]:
    """The paths of the files that the options name, and what keeps a folder from being listed.

    `on_nothing` gets each path that gives no file, and the reason.
    """
    exclusion = options.exclusion
    for path in find_files([as_named(path) for path in options.paths], exclusion, on_nothing):
        name = options.stdin_filename
        cause = exclusion.cause_for_named(name) if isinstance(path, StandardInput) and name else None
        if cause is None:
            yield path
        elif on_nothing is not None:
            on_nothing(StandardInput.NAME, left_out_by_force(cause))


def read_source(path: str, options: Options, version: str) -> Source:
    """One file, or the standard input, analysed; OSError when it can't be read."""
    name = path
    if not isinstance(path, StandardInput):
        data = read_file(path)
    elif sys.stdin is None:
        raise OSError(0, "there is no standard input", path)
    else:
        data = sys.stdin.buffer.read()
        name = options.stdin_filename or STDIN_NAME
    notebook = None
    if name.lower().endswith(NOTEBOOK_SUFFIX):
        from codeloom.reading.notebooks import read_notebook  # it loads a parser of JSON

        notebook = read_notebook(data, name)
    text = data if notebook is None else notebook.text
    analysis = analyze(text, path=name, python=version, false_hints=options.false_hints)
    return Source(name, analysis, notebook, None if notebook is None else notebook.written_rows)


def as_named(path: str) -> str:
    """A path as it is meant on the command line, where - is the standard input."""
    return StandardInput() if path == StandardInput.NAME else path


@contextmanager
def opened_console(options: Options) -> Iterator[Console]:
    """The output that the options name."""
    if options.output is None:
        yield Console(None, options.color)
        return
    with open(options.output, "w", encoding="utf-8", newline="\n") as stream:
        yield Console(stream, options.color)


def print_facts(options: Options) -> None:
    """Say what a run goes by."""
    settings = options.project.settings_file or "none"
    say(f"settings: {settings}")
    say(f"source is read as Python {options.version}")
    say(f"threads: {options.jobs or processor_count()}")


def _filters_of(options: Options) -> tuple[list[Filter], Changes | None]:
    filters = code_filters(options.select, options.ignore)
    changes = None
    try:
        if options.diff is not None:
            from codeloom.cli.filters.changes import Changes

            changes = Changes(options.diff)
            filters.append(changes)
        if options.baseline is not None:
            from codeloom.cli.filters.baseline import Baseline

            filters.append(Baseline(options.baseline))
    except OSError as error:
        raise WrongUseError(f"can't read {error.filename}: {error.strerror}") from None
    except ValueError as error:
        raise WrongUseError(str(error)) from None
    return filters, changes
