"""The Parquet files of an index, as several libraries read them, hold the rows of a batch."""

import duckdb
import polars
import pyarrow
import pyarrow.parquet
import pytest
from index_kills import Plain

from codeloom.corpus import TABLES, analyze_batch
from codeloom.corpus.part import Hashed, parquet_files, settings_of
from codeloom.corpus.sources import Entry

NAMES = [f"name_{i}" for i in range(70_000)]
FUNCTIONS = [
    f"def {a}_({a}, {b}=1) -> {b}: return {a}.{b}"
    for a, b in zip(NAMES[::2], reversed(NAMES[1::2]), strict=True)
]
# More names than two bytes can number, far columns, rows far apart, gaps of all kinds, and more than is
# analysed at once.
SOURCES = {
    "empty.py": "",
    "many.py": "\n".join(FUNCTIONS),
    "far.py": f"x = {'1 + ' * 30_000}y; z = '\xe9\U0001f600' + x.y\n" * 3,
    "tall.py": "\n" * 100_000 + "class A:\n  def f(self): return self.g\n",
    "long.py": f"'''{'text ' * 300_000}'''\n" * 3,
    "broken.py": "def f(:\n" * 9,
    **{f"{i:03}.py": "\n" * (i * 7 % 400) + FUNCTIONS[i * 97] for i in range(300)},
}


@pytest.fixture(scope="module")
def tables():
    batch = {"path": list(SOURCES), "content": list(SOURCES.values())}
    return {name: pyarrow.table(table) for name, table in analyze_batch(pyarrow.table(batch)).items()}


@pytest.fixture(scope="module")
def files():
    settings = settings_of(
        "3.15", TABLES, false_hints=False, dedup=False, max_bytes=10_000_000, max_seconds=60.0
    )
    return parquet_files(settings, [Hashed(Entry(path, text.encode())) for path, text in SOURCES.items()])


def IsDictionary(field):
    return pyarrow.types.is_dictionary(field.type)


@pytest.mark.parametrize("name", [*TABLES, "files"])
def test_rows(tables, files, name, tmp_path):
    expected = Plain(tables[name])
    path = str(tmp_path / "rows.parquet")
    with open(path, "wb") as file:
        file.write(files[name])
    found = pyarrow.parquet.read_table(path)
    assert [IsDictionary(field) for field in found.schema] == [
        IsDictionary(field) for field in tables[name].schema
    ]
    assert Plain(found).cast(expected.schema).equals(expected)
    assert polars.read_parquet(path).equals(polars.DataFrame(expected))
    by_sql = duckdb.sql(f"FROM read_parquet('{path}')").to_arrow_table()
    assert by_sql.cast(expected.schema).equals(expected)
