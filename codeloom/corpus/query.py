"""Questions in SQL about an index, answered by DuckDB."""

from collections.abc import Iterator, Sequence
from typing import Any

import duckdb

from codeloom.corpus.store import Store, StoreError

# Rows that are fetched at once.
_ROWS = 1000


class QueryError(Exception):
    """What the database says of a question that it can't answer."""


class Answer:
    """The columns of an answer, and its rows one after the other."""

    def __init__(self, columns: Sequence[str], rows: Iterator[tuple[Any, ...]]) -> None:
        self.columns = columns
        self.rows = rows


def query(sql: str, folder: str) -> Answer:
    """Ask about the index in a folder, whose tables are views by their names.

    StoreError for what is no index, QueryError for SQL that can't be run, also while rows are fetched.
    """
    database = connect(folder)
    try:
        cursor = database.execute(sql)
        columns = [column[0] for column in cursor.description or ()]
    except duckdb.Error as error:
        raise QueryError(str(error)) from None
    return Answer(columns, _rows(cursor) if columns else iter(()))


def connect(folder: str) -> Any:
    """A database in memory with a view for each table of the index in a folder."""
    store = Store(folder)
    if not store.parts:
        raise StoreError(f"there is no index in {folder}: make one with codeloom index PATH -o {folder}")
    database = duckdb.connect()
    for table in store.tables:
        files = ", ".join(_quoted(path) for path in store.files_of(table))
        database.execute(f'CREATE VIEW "{table}" AS SELECT * FROM read_parquet([{files}])')
    return database


def _rows(cursor: Any) -> Iterator[tuple[Any, ...]]:
    while True:
        try:
            rows = cursor.fetchmany(_ROWS)
        except duckdb.Error as error:
            raise QueryError(str(error)) from None
        if not rows:
            return
        yield from rows


def _quoted(text: str) -> str:
    return "'" + text.replace("'", "''") + "'"
