"""`codeloom index`: what is read, what is written, and what another run does about changes and accidents."""

import gzip
import io
import json
import os
import shutil
import subprocess
import sys
import tarfile
import zipfile

import pyarrow
import pyarrow.parquet
import pytest
from index_kills import KillAndCompare, Leftovers, Plain, RowsOf

import codeloom
from codeloom.cli import main
from codeloom.cli.index_progress import progress_row
from codeloom.corpus import TABLES, analyze_batch
from codeloom.corpus.store import MANIFEST, Store

FILES = {
    "a.py": b"import os\n\ndef f(x: int = 1):\n    return os.path\n",
    "b/broken.py": b"x = (1\ny = 2\n",
    "b/empty.py": b"",
    "b/latin.py": b"# coding: latin-1\nx = '\xe9'\n",
    "c.pyi": b"x: int\n",
}


@pytest.fixture
def corpus(tmp_path, monkeypatch):
    """A folder with a few files, where commands run."""
    monkeypatch.chdir(tmp_path)
    Write(FILES)
    return tmp_path


def Write(files, folder="src"):
    for name, content in files.items():
        path = os.path.join(folder, name)
        os.makedirs(os.path.dirname(path), exist_ok=True)
        with open(path, "wb") as file:
            file.write(content)


def Index(*arguments, output="index", status=0):
    assert main(["index", "--jobs", "2", "-o", output, *arguments]) == status


def FilesOf(output="index"):
    return {row["path"]: row for row in RowsOf(output)["files"].to_pylist()}


def StatesOf(output="index"):
    return {path: row["state"] for path, row in FilesOf(output).items()}


class TestRows:
    def test_they_are_those_of_a_batch(self, corpus, capsys):
        Index("src")
        summary = f"5 files, {sum(map(len, FILES.values())) / 1e6:.1f} MB, in index\n"
        assert capsys.readouterr().out == summary
        batch = {"path": [f"src/{name}" for name in FILES], "content": list(FILES.values())}
        tables = analyze_batch(pyarrow.table(batch))
        found = RowsOf("index")
        assert "text" not in found["lines"].column_names
        Index("src", "--text", output="whole")
        found["lines"] = RowsOf("whole")["lines"]
        assert set(found) == {"files", *TABLES}
        for name, table in tables.items():
            expected = Plain(pyarrow.table(table))
            expected = expected.sort_by([(column, "ascending") for column in expected.column_names])
            assert found[name].to_pylist() == expected.to_pylist(), name

    def test_parts_and_their_metadata(self, corpus):
        Write({f"{i:03}.py": b"x = 1\n" * 100 for i in range(50)}, "many")
        Index("many", "--part-size", "0.01")
        store = Store("index")
        assert len(store.parts) > 2 and store.is_finished
        for name in store.tables:
            with pyarrow.parquet.ParquetFile(store.files_of(name)[0]) as file:
                metadata = file.schema_arrow.metadata
                assert metadata[b"codeloom.table"] == name.encode()
                assert metadata[b"codeloom.version"] == codeloom.__version__.encode()
                assert metadata[b"codeloom.schema"] == b"1"
                for group in range(file.num_row_groups):  # none without rows
                    assert file.metadata.row_group(group).column(0).compression == "ZSTD"
        paths = [
            path
            for part in store.files_of("files")
            for path in pyarrow.parquet.read_table(part)["path"].to_pylist()
        ]
        assert paths == sorted(paths) and len(paths) == 50

    def test_some_tables(self, corpus):
        Index("src", "--tables", "problems,limits", "--python", "2.7")
        assert set(RowsOf("index")) == {"problems", "limits", "files"}
        assert {row["python"] for row in FilesOf().values()} == {"2.7"}

    def test_nothing_to_read(self, corpus):
        os.mkdir("void")
        Index("void")
        assert {name: len(table) for name, table in RowsOf("index").items()} == dict.fromkeys(
            ("files", *TABLES), 0
        )


class TestFurtherRuns:
    def test_only_changes_are_analysed(self, corpus, capsys):
        Index("src", "--part-size", "0.00004")  # a part for nearly each file
        os.remove("src/b/broken.py")
        Write({"a.py": b"changed = 1\n", "d.py": b"new = 1\n"})
        capsys.readouterr()
        Index("src", "--part-size", "0.00004")
        assert "5 files, 0.0 MB; 3 unchanged; 2 removed or made anew, in index" in capsys.readouterr().out
        Index("src", output="fresh")
        assert RowsOf("index") == RowsOf("fresh")
        assert not Leftovers("index")
        parts = Store("index").parts
        Index("src")
        assert Store("index").parts == parts

    def test_a_part_that_loses_all_its_files(self, corpus):
        Index("src")
        shutil.rmtree("src/b")
        os.remove("src/a.py")
        Write({"c.pyi": b"y: int\n"})
        Index("src")
        assert list(FilesOf()) == ["src/c.pyi"]
        assert len(Store("index").parts) == 1

    def test_duplicates(self, corpus):
        Write({"a_copy.py": FILES["a.py"], "z.py": FILES["a.py"]})
        Index("src", "--dedup")
        states = StatesOf()
        assert (states["src/a.py"], states["src/z.py"]) == ("ok", "duplicate")
        assert FilesOf()["src/z.py"]["reason"] == "its content is that of src/a.py"
        os.remove("src/a.py")
        Index("src", "--dedup")
        Index("src", "--dedup", output="fresh")
        found, fresh = RowsOf("index"), RowsOf("fresh")
        for name in TABLES:
            assert found[name] == fresh[name], name
        assert StatesOf()["src/a_copy.py"] == "ok"
        Write({"0.py": FILES["a.py"]})
        Index("src", "--dedup")
        assert StatesOf()["src/0.py"] == "ok" and StatesOf()["src/a_copy.py"] == "duplicate"

    def test_a_file_named_twice_is_there_once(self, corpus):
        Index("src", "src/a.py", "src")
        assert len(RowsOf("index")["files"]) == len(FILES)


class TestSources:
    def test_archives(self, corpus):
        shutil.make_archive("one", "gztar", "src")
        shutil.make_archive("two", "zip", "src")
        Index("one.tar.gz", "two.zip")
        files = FilesOf()
        for archive in ("one.tar.gz", "two.zip"):
            found = {path: row["bytes"] for path, row in files.items() if path.startswith(archive)}
            expected = {name: len(content) for name, content in FILES.items()}
            assert {
                os.path.normpath(os.path.relpath(path, archive)): size for path, size in found.items()
            } == (expected)

    def test_tables(self, corpus):
        table = pyarrow.table(
            {"name": ["a", None, "c"], "text": ["x = 1\n", "y = 2\n", None], "v": ["2.7", None, None]}
        )
        pyarrow.parquet.write_table(table, "sources.parquet")
        rows = [
            {"name": "a", "text": "x = 1\n", "v": "2.7"},
            {"text": "y = '\ud800'\n"},
            {"name": "c", "text": 3},
        ]
        with gzip.open("sources.jsonl.gz", "wt") as file:
            file.write("".join(json.dumps(row) + "\n" for row in rows) + "\n{\n")
        columns = ("--path-column", "name", "--content-column", "text", "--python-column", "v")
        Index("sources.parquet", "sources.jsonl.gz", *columns)
        files = FilesOf()
        assert {path: (row["state"], row["python"]) for path, row in files.items()} == {
            "sources.parquet/a": ("ok", "2.7"),
            "sources.parquet/2": ("ok", codeloom.NEWEST),
            "sources.parquet/c": ("missing", codeloom.NEWEST),
            "sources.jsonl.gz/a": ("ok", "2.7"),
            "sources.jsonl.gz/2": ("unreadable", codeloom.NEWEST),
            "sources.jsonl.gz/c": ("missing", codeloom.NEWEST),
            "sources.jsonl.gz/5": ("missing", codeloom.NEWEST),
        }

    def test_what_git_tracks(self, corpus):
        git = ("git", "-C", "src", "-c", "user.name=a", "-c", "user.email=a@b")
        subprocess.run([*git, "init", "--quiet"], check=True)
        subprocess.run([*git, "add", "a.py", "c.pyi"], check=True)
        Index("--git", "src")
        assert list(FilesOf()) == ["src/a.py", "src/c.pyi"]
        os.mkdir("plain")
        Index("--git", "plain", output="other", status=2)

    def test_notebooks(self, corpus):
        cells = [
            {"cell_type": "code", "source": "%time x = 1\ny = 2"},
            {"cell_type": "markdown", "source": "#"},
        ]
        Write({"n.ipynb": json.dumps({"cells": cells}).encode(), "bad.ipynb": b"{"}, "notebooks")
        Index("notebooks", "--text")
        states = StatesOf()
        assert states == {"notebooks/n.ipynb": "ok", "notebooks/bad.ipynb": "missing"}
        assert "y = 2" in RowsOf("index")["lines"]["text"].to_pylist()

    def test_what_cannot_be_read(self, corpus, capsys):
        Write({"long.py": b"x = 1\n" * 200_000})
        os.symlink("nowhere", "src/link.py")
        Index("src", "--max-bytes", "1")
        files = FilesOf()
        assert files["src/long.py"]["state"] == "too big"
        assert files["src/link.py"]["state"] == "missing"
        assert files["src/link.py"]["reason"] == os.strerror(2)
        Index("src", "nowhere.tar", output="other", status=2)
        assert "nowhere.tar" in capsys.readouterr().err
        assert len(FilesOf("other")) == len(files)

    def test_names_that_are_no_text(self, corpus):
        os.mkdir("odd")
        with open(b"odd/caf\xe9.py", "wb") as file:
            file.write(b"x = 1\n")
        Index("odd")
        assert list(FilesOf()) == ["odd/caf\\xe9.py"]

    def test_damaged_archives(self, corpus, capsys):
        shutil.make_archive("whole", "gztar", "src")
        with open("whole.tar.gz", "rb") as file:
            data = file.read()
        Write({"cut.tar.gz": data[: len(data) // 2], "no.zip": b"x", "no.parquet": b"x"}, ".")
        Index("cut.tar.gz", "no.zip", "no.parquet", "src", status=2)
        errors = capsys.readouterr().err
        assert all(name in errors for name in ("cut.tar.gz", "no.zip", "no.parquet"))
        assert set(FilesOf()) >= {f"src/{name}" for name in FILES}

    def test_a_member_that_is_longer_than_it_says(self, corpus):
        with tarfile.open("long.tar", "w") as archive:
            member = tarfile.TarInfo("long.py")
            member.size = 1_200_000
            archive.addfile(member, io.BytesIO(b"x = 1\n" * 200_000))
        with zipfile.ZipFile("long.zip", "w", zipfile.ZIP_DEFLATED) as archive:
            archive.writestr("long.py", b"x = 1\n" * 200_000)
        with open("long.zip", "rb") as file:
            data = file.read()
        size = (1_200_000).to_bytes(4, "little")
        with open("lying.zip", "wb") as file:
            file.write(data.replace(size, (10).to_bytes(4, "little")))
        Index("long.tar", "long.zip", "lying.zip", "--max-bytes", "1")
        states = StatesOf()
        assert (states["long.tar/long.py"], states["long.zip/long.py"]) == ("too big", "too big")
        assert states["lying.zip/long.py"] in ("missing", "too big", "ok")


def test_progress():
    assert progress_row(1_000, 4_000, 2.0) == "1,000 of 4,000 files, 500 a second, 6 s left ..."
    assert progress_row(1_000, None, 2.0) == "1,000 files, 500 a second ..."
    assert progress_row(0, 10, 0.0) == "0 of 10 files, 0 a second ..."


class TestAccidents:
    def test_wrong_folders(self, corpus, capsys):
        Index("src", output="src", status=2)
        assert "holds something else than an index" in capsys.readouterr().err
        Index("src")
        Index("src", "--python", "3.8", status=2)
        assert "made with other settings: python '3.15', now '3.8'" in capsys.readouterr().err

    def test_an_unknown_table_is_wrong_use(self, corpus, capsys):
        with pytest.raises(SystemExit, match="2"):
            Index("src", "--tables", "rows")
        assert "no table is called 'rows'" in capsys.readouterr().err

    def test_an_unfinished_run_is_gone_on_with_on_request(self, corpus, capsys):
        Index("src", "--part-size", "0.00004")
        rows = RowsOf("index")
        with open(f"index/{MANIFEST}", "rb") as file:
            manifest = file.read().splitlines(keepends=True)
        # Killed while it wrote the third row, with a part that no row names.
        with open(f"index/{MANIFEST}", "wb") as file:
            file.write(b"".join(manifest[:2]) + manifest[2][:5])
        Index("src", status=2)
        assert "didn't come to its end: go on with --resume" in capsys.readouterr().err
        Index("src", "--resume")
        assert RowsOf("index") == rows
        assert not Leftovers("index")

    def test_killed_between_a_new_part_and_the_end_of_an_old_one(self, corpus):
        Index("src")
        shutil.copytree("index", "before")
        Write({"a.py": b"changed = 1\n"})
        Index("src")
        rows = RowsOf("index")
        # The new part counts already, and so does the old one.
        with open(f"before/{MANIFEST}", "ab") as file:
            file.write(b'{"begun": true}\n{"part": 1}\n')
        for name in rows:
            shutil.copy(f"index/{name}/00000001.parquet", f"before/{name}")
        Index("src", "--resume", output="before")
        assert RowsOf("before") == rows

    def test_a_damaged_manifest(self, corpus, capsys):
        Index("src")
        with open(f"index/{MANIFEST}", "ab") as file:
            file.write(b"[\n")
        Index("src", status=2)
        assert "is damaged" in capsys.readouterr().err

    def test_one_process_writes(self, corpus, capsys):
        Index("src")
        code = (
            "from codeloom.corpus.store import *; print(WritableStore('index', Store('index').settings), "
            "flush=True); input()"
        )
        with subprocess.Popen(
            [sys.executable, "-P", "-c", code], stdin=subprocess.PIPE, stdout=subprocess.PIPE
        ) as other:
            other.stdout.readline()
            Index("src", status=2)
            assert "another process writes into index" in capsys.readouterr().err
            other.communicate(b"\n")
        Index("src")

    @pytest.mark.slow
    def test_kills_leave_no_trace(self, tmp_path, seed):
        KillAndCompare(tmp_path, files=120, kills=4, part_size=0.2, seed=seed)
