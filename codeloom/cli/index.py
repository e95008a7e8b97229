"""`codeloom index`: a corpus as tables in Parquet files."""

import argparse
import os
from collections.abc import Iterator
from math import inf, nan
from typing import TYPE_CHECKING

from codeloom._face import processor_count
from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.extras import needing_extra
from codeloom.cli.index_progress import IndexProgress
from codeloom.cli.options import (
    Options,
    WrongUseError,
    add_finding_arguments,
    add_jobs_argument,
    add_python_argument,
    as_argument,
    count,
)
from codeloom.corpus.batch import MOST_BYTES, MOST_SECONDS, TABLES, checked_tables
from codeloom.reading.files import find_files

if TYPE_CHECKING:
    from codeloom.corpus.index import Counts, Indexer, Pool
    from codeloom.corpus.sources import Entry, Finder
    from codeloom.corpus.store import WritableStore

_MEGABYTE = 1_000_000
_ENGINES = ("threads", "ray")


class IndexCommand(Command):
    """Writes what all files say into a folder."""

    NAME = "index"
    DESCRIPTION = (
        "Write what many files say as tables into Parquet files, for databases and data frames. Run it again "
        "to bring the index to what the files are now: only what has changed is analysed. It needs the "
        "extra arrow: pip install 'codeloom[arrow]'."
    )
    EXAMPLES = (
        "codeloom index src -o index",
        "codeloom index --git . -o index               # what git tracks",
        "codeloom index *.tar.gz wheels/*.whl -o index # archives are read in place",
        "codeloom index sources.parquet --content-column text -o index",
        "codeloom index --resume src -o index          # go on after an interruption",
    )

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add what is read, how, and where to."""
        parser.add_argument(
            "paths",
            nargs="*",
            default=["."],
            metavar="PATH",
            help="a folder, a file, a tar or zip archive, or a Parquet or JSONL file with sources "
            "(default: the current folder)",
        )
        parser.add_argument("-o", "--output", metavar="DIR", required=True, help="the folder of the index")
        parser.add_argument(
            "--tables",
            type=as_argument(_table_names),
            metavar="NAMES",
            help=f"only these tables, separated by commas (default: {', '.join(TABLES)})",
        )
        parser.add_argument(
            "--resume", action="store_true", help="go on with a run that didn't come to its end"
        )
        parser.add_argument(
            "--dedup", action="store_true", help="analyse only the first of files with the same content"
        )
        parser.add_argument("--false-hints", action="store_true", help="as in check")
        parser.add_argument(
            "--text", action="store_true", help="with the text of each line, which nearly doubles the index"
        )
        add_jobs_argument(parser)
        parser.add_argument(
            "--engine",
            choices=_ENGINES,
            metavar="NAME",
            help="threads of this machine, or ray for workers of a cluster (default: threads)",
        )
        parser.add_argument(
            "--address",
            metavar="ADDRESS",
            help="of a running cluster of Ray, or auto (default: one that is started for this run)",
        )
        parser.add_argument("--config", metavar="FILE", help="read the settings from this file")
        add_python_argument(parser)
        _add_limits(parser)
        group = add_finding_arguments(parser)
        group.add_argument("--git", action="store_true", help="of folders, the files that git tracks")
        for name in ("path", "content", "python"):
            group.add_argument(
                f"--{name}-column", metavar="NAME", help=f"of tables, the column of this (default: {name})"
            )
        parser.add_argument("-q", "--quiet", action="count", help="no summary")

    def run(self, options: Options) -> ExitStatus:
        """Bring the index up to date; WrongUseError where it can't be one."""
        # pyarrow's own pool keeps for each thread what that once needed.
        os.environ.setdefault("ARROW_DEFAULT_MEMORY_POOL", "system")
        with needing_extra("index", "arrow", "pyarrow"):
            from codeloom.corpus.index import Indexer, PoolError
            from codeloom.corpus.part import settings_of
            from codeloom.corpus.store import StoreError, WritableStore
        settings = settings_of(
            options.version,
            options.tables or TABLES,
            false_hints=options.false_hints,
            text=options.text,
            dedup=options.dedup,
            max_bytes=options.max_bytes * _MEGABYTE,
            max_seconds=options.max_seconds,
        )
        try:
            store = WritableStore(str(options.output), settings, resume=options.resume)
        except StoreError as error:
            raise WrongUseError(str(error)) from None
        with store:
            pool = _pool(options, store)
            try:
                indexer = Indexer(store, pool, part_bytes=int(options.part_size * _MEGABYTE))
                return _Run(options, indexer).run()
            except PoolError as error:
                raise WrongUseError(
                    f"{error}; go on with --resume when they are mended or excluded"
                ) from None
            finally:
                pool.close()


def _pool(options: Options, store: "WritableStore") -> "Pool":
    if options.engine == "threads":
        from codeloom.corpus.index import Threads

        return Threads(store, options.jobs or processor_count())
    with needing_extra("the engine ray", "ray", "ray"):
        from codeloom.corpus.ray_pool import RayPool
    try:
        return RayPool(store, options.address, options.jobs)
    except ConnectionError as error:
        raise WrongUseError(f"there is no cluster of Ray at {options.address}: {error}") from None


class _Run:
    """One run, with what people see of it."""

    def __init__(self, options: Options, indexer: "Indexer") -> None:
        self._options = options
        self._indexer = indexer
        self._console = Console()
        self._progress = IndexProgress(self._count_files, is_wanted=not options.quiet)
        self._failures = 0

    def run(self) -> ExitStatus:
        """Index everything, and say what was done."""
        finder = self._finder()
        try:
            for _ in self._indexer.run(self._shown(finder)):
                pass
        finally:
            self._progress.clear()
        if not self._options.quiet:
            self._console.print_row(self._summary(self._indexer.counts))
        return ExitStatus.FAILURE if self._failures else ExitStatus.SOUND

    def _finder(self) -> "Finder":
        from codeloom.corpus.sources import Columns, Finder

        options = self._options
        columns = Columns(options.path_column, options.content_column, options.python_column)
        return Finder(
            self._on_error,
            exclusion=options.exclusion,
            columns=columns,
            max_bytes=options.max_bytes * _MEGABYTE,
            use_git=options.git,
        )

    def _shown(self, finder: "Finder") -> "Iterator[Entry]":
        for entry in finder.entries(self._options.paths):
            self._progress.show(self._indexer.counts.files)
            yield entry

    def _on_error(self, error: OSError) -> None:
        self._failures += 1
        self._progress.clear()
        self._console.print_failure(error)

    def _count_files(self) -> int | None:
        options = self._options
        if options.git or not all(os.path.isdir(path) for path in options.paths):
            return None
        return sum(1 for _ in find_files(list(options.paths), options.exclusion))

    def _summary(self, counts: "Counts") -> str:
        parts = [
            f"{counts.files:,} file{'' if counts.files == 1 else 's'}, {counts.bytes / _MEGABYTE:,.1f} MB"
        ]
        for number, word in (
            (counts.unchanged, "unchanged"),
            (counts.duplicates, "duplicates"),
            (counts.removed, "removed or made anew"),
        ):
            if number:
                parts.append(f"{number:,} {word}")
        return f"{'; '.join(parts)}, in {self._options.output}"


def _add_limits(parser: argparse.ArgumentParser) -> None:
    group = parser.add_argument_group("limits")
    group.add_argument(
        "--max-bytes",
        type=as_argument(count),
        metavar="MB",
        help=f"don't analyse longer files, in megabytes (default: {MOST_BYTES // _MEGABYTE})",
    )
    group.add_argument(
        "--max-seconds",
        type=as_argument(_positive),
        metavar="S",
        help=f"don't spend more on a file, in seconds of a processor (default: {MOST_SECONDS:g})",
    )
    group.add_argument(
        "--part-size",
        type=as_argument(_positive),
        metavar="MB",
        help="megabytes of source in a part, which is what a run loses at most when it is killed, for each "
        "thread (default: 16)",
    )


def _table_names(text: str) -> list[str]:
    return checked_tables(name for name in text.split(",") if name)


def _positive(text: str) -> float:
    try:
        value = float(text)
    except ValueError:
        value = nan
    if not 0 < value < inf:
        raise ValueError(f"it must be a number of more than 0, not {text}")
    return value
