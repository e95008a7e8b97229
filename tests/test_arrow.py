"""Tables: what other libraries take over as it is, and what is in them."""

import gc
import threading

import duckdb
import pandas
import polars
import pyarrow
import pytest
from tools_of_project import tool_named

from codeloom import Analysis, Range, analyze
from codeloom._analysis import table_kinds

# Faults, non-ASCII columns, two lines on a row, an attribute.
TEXT = """\
import os, é.b as c

class A:
\tdef f(self, é: "int"=1, /, *more, **others) -> None:  # why
\t\treturn é.c.__x; y = )
async def g(a=[1,
    2]): global h
if
"""

SEQUENCES = ("problems", "lines", "records", "limits", "occurrences", "scopes", "signatures", "hints")
TABLES = [name for name, _, _ in table_kinds()]


@pytest.fixture(scope="module")
def analysis() -> Analysis:
    return analyze(TEXT)


def Rows(table):
    """A table as pyarrow has it after it was validated, as dictionaries."""
    taken = pyarrow.table(table)
    taken.validate(full=True)
    return taken.to_pylist()


def RangeOf(row, prefix=""):
    columns = ("row", "column", "end_row", "end_column")
    places = [row[prefix + name] for name in columns]
    return None if None in places else Range(*places)


def KindOf(kind):
    return None if kind is None else kind.value


class TestRows:
    """They say what the items say."""

    def test_problems(self, analysis):
        rows = Rows(analysis.problems)
        assert len(rows) == 2
        for row, problem in zip(rows, analysis.problems, strict=True):
            assert (row["code"], row["severity"]) == (problem.code, problem.severity)
            assert (row["message"], row["hint"]) == (problem.message, problem.hint)
            assert row["text"] == analysis.text.splitlines()[problem.range.row - 1]
            assert RangeOf(row) == problem.range
            assert problem in analysis.lines[row["line"]].problems

    def test_lines(self, analysis):
        for i, (row, line) in enumerate(zip(Rows(analysis.lines), analysis.lines, strict=True)):
            assert (row["line"], row["kind"], row["indent"]) == (i, line.kind.value, line.indent)
            assert (RangeOf(row), row["text"]) == (line.range, line.text)

    def test_records(self, analysis):
        for row, record in zip(Rows(analysis.records), analysis.records, strict=True):
            assert (row["kind"], row["name"]) == (record.kind.value, record.name)
            assert (row["payload"], row["of_argument"]) == (record.payload, record.of_argument)
            assert RangeOf(row) == record.range
            assert analysis.lines[row["line"]] == record.line

    def test_limits(self):
        deep = analyze("x\n" + "a = " + "(" * 60 + "1" + ")" * 60 + "\n")
        assert Rows(deep.limits) == [{"line": 1, "kind": "too deep"}]

    def test_occurrences(self, analysis):
        for row, occurrence in zip(Rows(analysis.occurrences), analysis.occurrences, strict=True):
            assert (row["name"], row["role"]) == (occurrence.name, occurrence.role.value)
            assert (RangeOf(row), RangeOf(row, "object_")) == (occurrence.range, occurrence.object)
            assert analysis.scopes[row["scope"]] == occurrence.scope
            assert row["resolution"] == KindOf(occurrence.resolution)
            home = None if row["home"] is None else analysis.scopes[row["home"]]
            assert home == occurrence.home
            for flag in ("is_definition", "in_f_string", "in_quotes", "in_comment"):
                assert row[flag] == getattr(occurrence, flag)

    def test_scopes_and_symbols(self, analysis):
        symbols = iter(Rows(analysis.table("symbols")))
        for i, (row, scope) in enumerate(zip(Rows(analysis.scopes), analysis.scopes, strict=True)):
            assert (row["scope"], row["kind"], row["name"]) == (i, scope.kind.value, scope.name)
            assert RangeOf(row) == scope.range
            parent = None if row["parent"] is None else analysis.scopes[row["parent"]]
            assert parent == scope.parent
            for symbol in scope.symbols:
                told = next(symbols)
                assert told.pop("scope") == i
                assert told == {name: getattr(symbol, name) for name in told}
        assert next(symbols, None) is None

    def test_signatures_and_parameters(self, analysis):
        parameters = iter(Rows(analysis.table("parameters")))
        for i, (row, signature) in enumerate(
            zip(Rows(analysis.signatures), analysis.signatures, strict=True)
        ):
            assert (row["signature"], row["name"]) == (i, signature.name)
            assert (row["is_async"], row["is_method"]) == (signature.is_async, signature.is_method)
            assert (RangeOf(row), analysis.lines[row["line"]]) == (signature.range, signature.line)
            assert row["parameters"] == len(signature.parameters)
            assert row["return_hint"] == (signature.return_hint and signature.return_hint.text)
            for position, parameter in enumerate(signature.parameters):
                told = next(parameters)
                assert (told["signature"], told["position"]) == (i, position)
                assert (told["name"], told["kind"]) == (parameter.name, parameter.kind.value)
                assert (RangeOf(told), told["hint"]) == (
                    parameter.range,
                    parameter.hint and parameter.hint.text,
                )
                assert (told["default"] is None) == (parameter.default is None)
        assert next(parameters, None) is None
        defaults = [row["default"] for row in Rows(analysis.table("parameters"))]
        assert defaults == [None, "1", None, None, "[1,\n    2]"]

    def test_hints(self, analysis):
        for row, hint in zip(Rows(analysis.hints), analysis.hints, strict=True):
            assert (row["kind"], row["name"], row["text"]) == (hint.kind.value, hint.name, hint.text)
            assert (RangeOf(row), row["in_comment"]) == (hint.range, hint.in_comment)
            assert analysis.lines[row["line"]] == hint.line


def test_slices_have_their_rows(analysis):
    for name in SEQUENCES:
        items = getattr(analysis, name)
        rows = Rows(items)
        for part in (slice(0, 0), slice(1, 3), slice(None, None, -1), slice(-2, None), slice(None, None, 3)):
            assert Rows(items[part]) == rows[part]


def test_more_rows_than_are_put_into_columns_at_once():
    text = "".join(f"x{i} = {i}\n" for i in range(1000))
    rows = Rows(analyze(text).lines)
    assert [row["text"] for row in rows] == text.splitlines()
    assert [row["row"] for row in rows] == list(range(1, 1001))


def test_empty_and_missing(analysis):
    for name in TABLES:
        table = pyarrow.table(analyze("").table(name))
        table.validate(full=True)
        assert table.num_rows == (name == "scopes")  # the module
        assert table.schema == pyarrow.table(analysis.table(name)).schema
    with pytest.raises(ValueError, match="no table is called 'rows'; there are problems, lines, records"):
        analysis.table("rows")


@pytest.mark.parametrize("name", TABLES)
@pytest.mark.parametrize("text", [TEXT, ""], ids=["text", "empty"])
def test_libraries_take_tables(name, text):
    analysis = analyze(text)
    table = analysis.table(name)
    rows = Rows(table)
    assert (table.name, len(table)) == (name, len(rows))
    assert polars.DataFrame(table).to_dicts() == rows
    assert pandas.DataFrame.from_arrow(table).shape == (len(rows), len(table.column_names))
    with duckdb.connect() as database:
        relation = database.register("taken", table).sql("FROM taken")
        columns, found = relation.columns, relation.fetchall()
    assert [dict(zip(columns, row, strict=True)) for row in found] == rows
    if name in SEQUENCES:
        items = getattr(analysis, name)
        assert len(pandas.DataFrame.from_arrow(items)) == len(rows)


def test_types():
    schema = pyarrow.table(analyze(TEXT).table("records")).schema
    words = pyarrow.dictionary(pyarrow.int32(), pyarrow.large_string())
    assert schema.field("kind") == pyarrow.field("kind", words, nullable=False)
    assert schema.field("payload") == pyarrow.field("payload", pyarrow.large_string(), nullable=False)
    assert schema.field("row") == pyarrow.field("row", pyarrow.int32())
    assert schema.field("of_argument") == pyarrow.field("of_argument", pyarrow.bool_(), nullable=False)


class TestLifetime:
    def test_a_stream_that_nobody_takes_is_freed(self, analysis):
        for _ in range(100):
            analysis.lines.__arrow_c_stream__()
        analysis.table("lines").__arrow_c_stream__(requested_schema=None)

    def test_columns_outlive_the_rest(self):
        table = analyze(TEXT).table("lines")
        reader = pyarrow.RecordBatchReader.from_stream(table)
        batch = reader.read_next_batch()
        text = batch.column("text")
        kinds = batch.column("kind")
        del table, reader, batch
        gc.collect()
        assert text[0].as_py() == "import os, é.b as c"
        assert kinds[0].as_py() == "import"

    def test_a_stream_ends_after_its_batch(self, analysis):
        reader = pyarrow.RecordBatchReader.from_stream(analysis.table("lines"))
        assert [len(batch) for batch in reader] == [len(analysis.lines)]
        with pytest.raises(StopIteration):
            reader.read_next_batch()

    def test_threads_take_one_table(self, analysis):
        table = analysis.table("occurrences")
        expected = Rows(table)
        found = []
        threads = [threading.Thread(target=lambda: found.append(Rows(table))) for _ in range(4)]
        for thread in threads:
            thread.start()
        for thread in threads:
            thread.join()
        assert found == [expected] * 4


def test_the_page_lists_all_columns():
    tool = tool_named("make_tables_page")
    assert tool.with_tables(tool.PAGE.read_text()) == tool.PAGE.read_text(), (
        "run: python tools/make_tables_page.py"
    )
