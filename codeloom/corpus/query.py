"""Questions in SQL about an index, answered by DuckDB."""

import glob
from collections.abc import Callable, Iterator, Sequence
from concurrent.futures import ThreadPoolExecutor, wait
from functools import partial
from itertools import chain, count
from typing import Any

import duckdb

from codeloom.corpus.store import Store, StoreError

# Rows that are fetched at once.
_ROWS = 10_000
# Seconds between two looks at a question that is being answered.
_INTERVAL = 0.1


class QueryError(Exception):
    """What the database says of a question that it can't answer."""


class Answer:
    """The columns of an answer, each with a name of its own, and its rows one after the other."""

    def __init__(self, columns: Sequence[str], rows: Iterator[tuple[Any, ...]]) -> None:
        self.columns = columns
        self.rows = rows


def query(sql: str, folder: str) -> Answer:
    """Ask about the index in a folder, whose tables are views by their names.

    StoreError for what is no index, QueryError for SQL that can't be run, also while rows are fetched.
    """
    database = connect(folder)
    if not _is_utf8(sql):
        raise QueryError("the question isn't UTF-8")
    cursor = _awaited(database, partial(database.execute, sql))
    if cursor is None:
        raise QueryError("there is no statement in the question")
    columns = [column[0] for column in cursor.description or ()]
    return Answer(_distinct(columns), _rows(database, cursor) if columns else iter(()))


def connect(folder: str) -> Any:
    """A database in memory with a view for each table of the index in a folder; StoreError for what is none,
    and for one that can't be read."""
    store = Store(folder)
    if not store.parts:
        raise StoreError(f"there is no index in {folder}: make one with codeloom index PATH -o {folder}")
    if not _is_utf8(folder):
        raise StoreError("the database reads nothing below a folder whose name isn't UTF-8")
    database = duckdb.connect()
    for table in store.tables:
        files = ", ".join(_quoted(glob.escape(path)) for path in store.files_of(table))
        try:
            database.execute(
                f'CREATE VIEW "{table}" AS SELECT * FROM read_parquet([{files}], hive_partitioning = false)'
            )
        except duckdb.Error as error:
            raise StoreError(f"the index in {folder} is damaged: {error}") from None
    return database


def _rows(database: Any, cursor: Any) -> Iterator[tuple[Any, ...]]:
    while rows := _awaited(database, partial(cursor.fetchmany, _ROWS)):
        yield from rows


def _awaited(database: Any, ask: Callable[[], Any]) -> Any:
    """What the database gives; QueryError for what it says instead. It ends when the process is interrupted,
    which the database doesn't notice by itself."""
    with ThreadPoolExecutor(1) as thread:
        answer = thread.submit(ask)
        try:
            # Piece by piece, since with some libraries in the process a signal doesn't end a wait.
            while not wait([answer], _INTERVAL).done:
                pass
            return answer.result()
        except duckdb.Error as error:
            raise QueryError(str(error)) from None
        except KeyboardInterrupt:
            # A question that hasn't quite begun can't be interrupted yet.
            while not wait([answer], _INTERVAL).done:
                database.interrupt()
            raise


def _distinct(names: Sequence[str]) -> list[str]:
    """The names of columns, numbered where there are several of one, as in a data frame: name, name_1."""
    distinct: dict[str, None] = {}
    for name in names:
        choices = chain([name], (f"{name}_{i}" for i in count(1)))
        distinct[next(choice for choice in choices if choice not in distinct)] = None
    return list(distinct)


def _is_utf8(text: str) -> bool:
    """False for what comes from the command line in other bytes."""
    return text == text.encode(errors="replace").decode()


def _quoted(text: str) -> str:
    return "'" + text.replace("'", "''") + "'"
