"""Batches of sources: what goes in from which library, and what comes out."""

import hashlib
import threading

import duckdb
import pandas
import polars
import pyarrow
import pytest

from codeloom import NEWEST, analyze
from codeloom.corpus import TABLES, analyze_batch

SOURCES = {
    "a.py": b"import os\n\nclass A:\n    def f(self, x: int = 1) -> None:\n        return os.path\n",
    "empty.py": b"",
    "b/broken.py": b"x = (1\ny = 2\nprint y\n",
    "latin.py": "# coding: latin-1\nna\N{LATIN SMALL LETTER I WITH DIAERESIS}ve = 1\n".encode("latin-1"),
    "marked.py": b"\xef\xbb\xbfz = 1\n",
    "wide.py": "\N{GREEK SMALL LETTER LAMDA} = '\N{SNOWMAN}'\n".encode(),
}


def Batch(sources=SOURCES, **columns):
    return pyarrow.table({"path": list(sources), "content": list(sources.values()), **columns})


def Rows(table):
    taken = pyarrow.table(table)
    taken.validate(full=True)
    return taken.to_pylist()


def Files(batch, **options):
    return {row["path"]: row for row in Rows(analyze_batch(batch, (), **options)["files"])}


def test_the_rows_are_those_of_each_source():
    tables = analyze_batch(Batch())
    assert list(tables) == ["files", *TABLES]
    files = Rows(tables["files"])
    assert [row["path"] for row in files] == list(SOURCES)
    for name in TABLES:
        rows = Rows(tables[name])
        for file in files:
            own = [
                {column: value for column, value in row.items() if column != "file_id"}
                for row in rows
                if row["file_id"] == file["file_id"]
            ]
            assert own == Rows(analyze(SOURCES[file["path"]]).table(name)), (name, file["path"])
    assert len({row["file_id"] for row in files}) == len(files)


def test_files():
    files = Files(Batch())
    for path, content in SOURCES.items():
        row = files[path]
        assert (row["sha256"], row["bytes"]) == (hashlib.sha256(content).hexdigest(), len(content))
        assert (row["python"], row["state"], row["reason"]) == (NEWEST, "ok", None)
        analysis = analyze(content)
        assert (row["lines"], row["problems"]) == (len(analysis.lines), len(analysis.problems))
        assert row["rows"] == len(analysis.text.splitlines())
    ids = {path: row["file_id"] for path, row in files.items()}
    assert {path: row["file_id"] for path, row in Files(Batch()).items()} == ids
    changed = Files(Batch({"a.py": b"x", "empty.py": b""}))
    assert changed["a.py"]["file_id"] != ids["a.py"]
    assert changed["empty.py"]["file_id"] == ids["empty.py"]


class TestStates:
    def test_what_has_no_rows(self):
        sources = {"none.py": None, "big.py": b"x = 1\n" * 20, "old.py": b"x\n", "fine.py": b"x\n"}
        batch = Batch(sources, python=[None, None, "1.5", None])
        tables = analyze_batch(batch, ("lines",), max_bytes=100)
        files = {row["path"]: row for row in Rows(tables["files"])}
        assert {path: (row["state"], row["reason"]) for path, row in files.items()} == {
            "none.py": ("missing", "there is no content"),
            "big.py": ("too big", "120 bytes are more than the limit of 100"),
            "old.py": ("unknown version", "the version '1.5' of Python isn't known"),
            "fine.py": ("ok", None),
        }
        assert {row["file_id"] for row in Rows(tables["lines"])} == {files["fine.py"]["file_id"]}
        assert files["none.py"]["sha256"] is files["none.py"]["bytes"] is files["big.py"]["lines"] is None

    def test_what_takes_too_long(self):
        tables = analyze_batch(
            Batch({"long.py": b"x = 1\n" * 1000, "short.py": b"x\n"}), ("lines", "occurrences"), max_seconds=0
        )
        long, short = Rows(tables["files"])
        assert (long["state"], long["lines"], short["state"]) == ("too slow", None, "ok")
        assert {row["file_id"] for row in Rows(tables["lines"])} == {short["file_id"]}

    def test_what_cannot_be_decoded(self):
        content = b"x = 'caf\xe9'\ny = \0\n"
        tables = analyze_batch(Batch({"a.py": content}), ("problems", "lines"))
        (file,) = Rows(tables["files"])
        assert file["state"] == "unreadable"
        assert file["reason"].startswith("byte 0xE9 can't be read as utf-8")
        problems = [(row["row"], row["code"]) for row in Rows(tables["problems"])]
        assert problems == [(one.range.row, one.code) for one in analyze(content).problems]
        assert len(tables["lines"]) == 2

    def test_bytes_of_noise(self):
        noise = bytes(range(256)) * 20
        files = Files(Batch({"noise.py": noise, "utf16.py": "x = 1\n".encode("utf-16")}))
        assert {row["state"] for row in files.values()} == {"unreadable"}


def test_versions():
    batch = Batch(
        {"a.py": b"print 1\n", "b.py": b"print 1\n", "c.py": b"print 1\n"}, python=["2.7", None, "py312"]
    )
    tables = analyze_batch(batch, ("problems",), python="3.8")
    assert [(row["python"], row["problems"]) for row in Rows(tables["files"])] == [
        ("2.7", 0),
        ("3.8", 1),
        ("3.12", 1),
    ]


def test_text_is_no_file():
    """A coding comment says nothing about what has been decoded already."""
    text = "# coding: latin-1\nx = 'é'\0\n"
    tables = analyze_batch(Batch({"a.py": text}), ("problems", "lines"))
    (file,) = Rows(tables["files"])
    assert (file["state"], file["bytes"]) == ("unreadable", len(text.encode()))
    assert Rows(tables["lines"])[1]["text"] == "x = 'é'\N{REPLACEMENT CHARACTER}"


class TestInputs:
    """All libraries, and all layouts that they have for text."""

    TEXTS = (
        "x = 1\n",
        None,
        "a much longer text, so that it isn't kept within the view = 2\n",
        "",
        "é = 3\n",
    )

    def Found(self, batch):
        return [(row["path"], row["bytes"]) for row in Rows(analyze_batch(batch, ())["files"])]

    @pytest.mark.parametrize(
        "kind",
        [
            pyarrow.string(),
            pyarrow.large_string(),
            pyarrow.string_view(),
            pyarrow.binary(),
            pyarrow.large_binary(),
            pyarrow.binary_view(),
            *(
                pyarrow.dictionary(index, pyarrow.string())
                for index in (pyarrow.int8(), pyarrow.uint16(), pyarrow.int64())
            ),
        ],
        ids=str,
    )
    def test_layouts(self, kind):
        paths = [f"{i}.py" for i in range(len(self.TEXTS))]
        contents = [
            None if text is None else text.encode() if "binary" in str(kind) else text for text in self.TEXTS
        ]
        table = pyarrow.table(
            {"path": paths, "other": [1] * len(paths), "content": pyarrow.array(contents, kind)}
        )
        expected = [
            (path, None if text is None else len(text.encode()))
            for path, text in zip(paths, self.TEXTS, strict=True)
        ]
        assert self.Found(table) == expected
        assert self.Found(table.slice(1, 3)) == expected[1:4]
        assert (
            self.Found(pyarrow.concat_tables([table.slice(3), table.slice(0, 2)]))
            == expected[3:] + expected[:2]
        )
        assert self.Found(table.to_batches()[0]) == expected
        assert self.Found(table.to_batches()[0].slice(2)) == expected[2:]
        assert self.Found(table.slice(0, 0)) == []

    def test_libraries(self):
        table = pyarrow.table({"path": ["a.py", "b.py"], "content": ["x = 1\n", "a longer text = 2\n"]})
        expected = [("a.py", 6), ("b.py", 18)]
        assert self.Found(polars.DataFrame(table)) == expected
        assert self.Found(pandas.DataFrame(table.to_pydict())) == expected
        with duckdb.connect() as database:
            assert (
                self.Found(database.register("sources", table).sql("FROM sources ORDER BY path")) == expected
            )

    def test_an_array_of_structures(self):
        class Holder:
            def __init__(self, batch):
                self.__arrow_c_array__ = batch.__arrow_c_array__

        batch = pyarrow.record_batch({"path": ["a.py"], "content": ["x"]})
        assert self.Found(Holder(batch)) == [("a.py", 1)]

    def test_wrong_arguments(self):
        with pytest.raises(TypeError, match=r"batch must give __arrow_c_stream__ .* not be a list"):
            analyze_batch([])
        with pytest.raises(ValueError, match="no column 'content'; it has path, text"):
            analyze_batch(pyarrow.table({"path": ["a"], "text": ["x"]}))
        with pytest.raises(ValueError, match="the column 'content' holds neither text nor bytes"):
            analyze_batch(pyarrow.table({"path": ["a"], "content": [1]}))
        with pytest.raises(ValueError, match="no table is called 'row'"):
            analyze_batch(Batch(), ("row",))
        with pytest.raises(TypeError, match="tables must be an iterable"):
            analyze_batch(Batch(), "lines")
        with pytest.raises(ValueError, match="unknown version '4'"):
            analyze_batch(Batch(), python="4")

    def test_other_names_of_columns(self):
        table = pyarrow.table({"file": ["a.py"], "text": ["print 1\n"], "v": ["2"]})
        tables = analyze_batch(
            table, ("problems",), path_column="file", content_column="text", python_column="v"
        )
        assert [(row["path"], row["python"]) for row in Rows(tables["files"])] == [("a.py", "2.7")]


def test_threads_take_batches():
    batch = Batch({f"{i}.py": content for i, content in enumerate([*SOURCES.values()] * 20)})
    expected = Rows(analyze_batch(batch)["occurrences"])
    found = []

    def Run():
        found.append(Rows(analyze_batch(batch)["occurrences"]))

    threads = [threading.Thread(target=Run) for _ in range(4)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert found == [expected] * 4


def test_the_row_of_a_problem_is_there_unless_it_is_long():
    rows = ["x = (", f"y = {'1 + ' * 240}(", f"z = {'1 + ' * 250}("]
    tables = analyze_batch(Batch({f"{i}.py": row for i, row in enumerate(rows)}), ("problems",))
    assert [row["text"] for row in Rows(tables["problems"])] == [*rows[:2], None]
