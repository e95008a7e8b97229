"""`codeloom query`: a question in SQL about an index."""

from __future__ import annotations

import argparse
import csv
import io
import json
from decimal import Decimal
from itertools import chain, islice
from math import isfinite
from numbers import Number
from typing import TYPE_CHECKING, Any

from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.excerpt import printable, width_of
from codeloom.cli.extras import needing_extra
from codeloom.cli.options import Options, WrongUseError

if TYPE_CHECKING:
    from collections.abc import Iterable, Sequence

    from codeloom.corpus.query import Answer

_FORMATS = ("text", "csv", "jsonl")
# A column of a table for people is as wide as the widest of so many rows, and no cell is wider than this.
_ROWS_MEASURED = 1000
_MOST_WIDTH = 80
_CUT = "..."


class QueryCommand(Command):
    """Prints the answer."""

    NAME = "query"
    DESCRIPTION = (
        "Ask about an index in SQL, with a view for each of its tables, and print the answer. It needs the "
        "extra query: pip install 'codeloom[query]'."
    )
    EXAMPLES = (
        'codeloom query "SELECT code, count(*) FROM problems GROUP BY code" index',
        'codeloom query --format csv "SELECT path, state FROM files" index',
    )
    FORMATS = _FORMATS

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the question, the index and the format."""
        parser.add_argument("sql", metavar="SQL", help="one or more statements; the answer is the last one's")
        parser.add_argument("index", metavar="DIR", help="what codeloom index has written")
        parser.add_argument(
            "--format", choices=_FORMATS, metavar="FORMAT", help="text, csv or jsonl (default: text)"
        )

    def run(self, options: Options) -> ExitStatus:
        """Ask, and print; WrongUseError for what is no index and for SQL that can't be run."""
        with needing_extra("query", "query", "duckdb"):
            from codeloom.corpus.query import QueryError, query
            from codeloom.corpus.store import StoreError
        try:
            _print(query(options.sql, options.index), options.format, Console())
        except (StoreError, QueryError) as error:
            raise WrongUseError(str(error)) from None
        return ExitStatus.SOUND


def _print(answer: Answer, style: str, console: Console) -> None:
    if style == "jsonl":
        for row in answer.rows:
            console.print_row(_json_row(dict(zip(answer.columns, row, strict=True))))
    elif style == "csv":
        for cells in chain([answer.columns] if answer.columns else [], answer.rows):
            console.write(_csv_row(cells))
    else:
        _print_table(answer, console)


def _json_row(fields: dict[str, Any]) -> str:
    try:
        return json.dumps(fields, ensure_ascii=False, allow_nan=False)
    except (TypeError, ValueError):
        return json.dumps(_json_value(fields), ensure_ascii=False)


def _json_value(value: Any) -> Any:
    """Null for numbers that aren't finite, and text for what else JSON doesn't have."""
    if isinstance(value, dict):
        return {str(key): _json_value(item) for key, item in value.items()}
    if isinstance(value, list | tuple):
        return [_json_value(item) for item in value]
    if isinstance(value, Decimal):
        value = float(value)
    if isinstance(value, float):
        return value if isfinite(value) else None
    return value if value is None or isinstance(value, str | int) else str(value)


def _csv_row(cells: Iterable[Any]) -> str:
    stream = io.StringIO()
    csv.writer(stream, lineterminator="\n").writerow(
        str(cell).lower() if isinstance(cell, bool) else cell for cell in cells
    )
    return stream.getvalue()


def _print_table(answer: Answer, console: Console) -> None:
    """In columns; numbers go to the right."""
    measured = list(islice(answer.rows, _ROWS_MEASURED))
    widths = [
        min(max(width_of(_shown(row[i])) for row in [answer.columns, *measured]), _MOST_WIDTH)
        for i in range(len(answer.columns))
    ]
    are_numbers = [
        all(row[i] is None or isinstance(row[i], Number) for row in measured)
        for i in range(len(answer.columns))
    ]
    if answer.columns:
        console.print_row(_table_row(answer.columns, widths, are_numbers))
        console.print_row("  ".join("-" * width for width in widths))
    for row in chain(measured, answer.rows):
        console.print_row(_table_row(row, widths, are_numbers))


def _table_row(cells: Sequence[Any], widths: Sequence[int], are_numbers: Sequence[bool]) -> str:
    shown = []
    for cell, width, is_number in zip(cells, widths, are_numbers, strict=True):
        text = _fitted(_shown(cell))
        room = " " * (width - width_of(text))
        shown.append(room + text if is_number else text + room)
    return "  ".join(shown).rstrip()


def _fitted(text: str) -> str:
    """Cut where it is too wide for any column."""
    if width_of(text) <= _MOST_WIDTH:
        return text
    while width_of(text) > _MOST_WIDTH - len(_CUT):
        text = text[: min(_MOST_WIDTH, len(text) - 1)]
    return text + _CUT


def _shown(cell: Any) -> str:
    if cell is None:
        return ""
    if isinstance(cell, bool):
        return str(cell).lower()
    if isinstance(cell, float):
        return f"{cell:.6g}" if abs(cell) < 1e6 else f"{cell:.15g}"
    return printable(str(cell))
