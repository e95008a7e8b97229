"""`codeloom query`: what it prints, and what it says of a question that can't be answered."""

import csv
import io
import json
import os
import shutil
import signal
import threading
from pathlib import Path
from xml.etree import ElementTree

import pytest
from tools_of_project import tool_named

from codeloom.cli import main

ROOT = Path(__file__).parent.parent


@pytest.fixture(scope="module")
def index(tmp_path_factory):
    """The index of the examples, in a folder whose name has a quote."""
    folder = tmp_path_factory.mktemp("corpus") / "the 'index'"
    assert main(["index", "--quiet", "--text", str(ROOT / "examples"), "-o", str(folder)]) == 0
    return str(folder)


def Answer(capsys, sql, index, *options, status=0):
    assert main(["query", sql, index, *options]) == status
    return capsys.readouterr()


def test_a_table_for_people(capsys, index):
    sql = (
        "SELECT 'a\nb' AS text, 12 AS number, NULL AS nothing, 0.25 AS share UNION ALL SELECT 'c', 3, NULL, 1"
    )
    assert Answer(capsys, f"{sql} ORDER BY number DESC", index).out.splitlines() == [
        "text  number  nothing  share",
        "----  ------  -------  -----",
        "a\N{REPLACEMENT CHARACTER}b       12            0.25",
        "c          3            1.00",
    ]
    wide = Answer(capsys, "SELECT repeat('x', 200) AS wide, true AS yes", index).out.splitlines()
    assert wide[-1] == "x" * 77 + "...  true"
    assert Answer(capsys, "SELECT '\u4e00' AS a, 1234567.5::DOUBLE AS b", index).out.splitlines() == [
        "a           b",
        "--  ---------",
        "\u4e00  1234567.5",
    ]
    numbers = Answer(capsys, "SELECT 10 ** (range // 1000) AS n FROM range(2000)", index).out.splitlines()
    assert numbers[-1] == "10"


def test_formats_for_programs(capsys, index):
    sql = "SELECT path, state, lines FROM files WHERE problems > 1 ORDER BY path"
    rows = [json.loads(row) for row in Answer(capsys, sql, index, "--format", "jsonl").out.splitlines()]
    assert rows and all(set(row) == {"path", "state", "lines"} for row in rows)
    table = csv.DictReader(io.StringIO(Answer(capsys, sql, index, "--format", "csv").out))
    assert [row["path"] for row in table] == [row["path"] for row in rows]


def test_values_that_a_format_does_not_have(capsys, index):
    sql = (
        "SELECT 1 AS a, 2 AS a, 'nan'::DOUBLE AS b, [1e999] AS c, 0.5::DECIMAL(3, 1) AS d, "
        "DATE '2020-01-31' AS e, 'a\nb' || chr(0) AS f, MAP {1: true} AS g"
    )
    (row,) = Answer(capsys, sql, index, "--format", "jsonl").out.splitlines()
    expected = {
        "a": 1,
        "a_1": 2,
        "b": None,
        "c": [None],
        "d": 0.5,
        "e": "2020-01-31",
        "f": "a\nb\0",
        "g": {"1": True},
    }
    assert json.loads(row, parse_constant=pytest.fail) == expected
    out = Answer(capsys, "SELECT true AS a, NULL AS b, 'x,\ny' AS c", index, "--format", "csv").out
    assert out == 'a,b,c\ntrue,,"x,\ny"\n'


def test_more_rows_than_are_fetched_at_once(capsys, index):
    out = Answer(capsys, "SELECT * FROM range(2500)", index, "--format", "csv").out
    assert out.splitlines() == ["range", *map(str, range(2500))]


def test_what_cannot_be_answered(capsys, index, tmp_path):
    for sql, words in (
        ("SELECT nothing FROM files", "nothing"),
        ("SELEC", "syntax error"),
        ("SELECT CAST(path AS INTEGER) FROM files", "INT32"),
        ("-- nothing", "there is no statement"),
        ("SELECT '\udcff'", "isn't UTF-8"),
    ):
        told = Answer(capsys, sql, index, status=2)
        assert words in told.err and "Traceback" not in told.err
    told = Answer(capsys, "SELECT 1", str(tmp_path), status=2)
    assert f"there is no index in {tmp_path}: make one with codeloom index" in told.err
    assert Answer(capsys, "SELECT 1", os.path.join(tmp_path, "void"), status=2).out == ""
    assert Answer(capsys, "CREATE TABLE mine (x INTEGER)", index).err == ""


def test_an_interruption_ends_a_question(capsys, index):
    interrupt = threading.Timer(1, os.kill, (os.getpid(), signal.SIGINT))
    interrupt.start()
    endless = (
        "SELECT count(*) FROM range(100000000000) AS a, range(100000) AS b WHERE a.range * b.range % 7 = 3"
    )
    Answer(capsys, endless, index, status=130)


def test_folders_of_indexes(capsys, index, tmp_path):
    """A name is no pattern and no column; what is damaged is named."""
    for name in ("version=3[1]*", "version=311"):
        shutil.copytree(index, tmp_path / name)
    columns = Answer(capsys, "DESCRIBE files", str(tmp_path / "version=311"), "--format", "csv").out
    assert "version" not in columns
    counts = {
        Answer(capsys, "SELECT count(*) FROM files", folder, "--format", "csv").out
        for folder in (index, str(tmp_path / "version=3[1]*"))
    }
    assert len(counts) == 1
    (tmp_path / "version=311/records/00000000.parquet").write_bytes(b"")
    told = Answer(capsys, "SELECT 1", str(tmp_path / "version=311"), status=2).err
    assert "is damaged" in told and "records" in told
    os.rename(tmp_path / "version=311", os.fsencode(tmp_path) + b"/\xff")
    assert "isn't UTF-8" in Answer(capsys, "SELECT 1", f"{tmp_path}/\udcff", status=2).err


@pytest.fixture
def folder_of_questions(tmp_path, monkeypatch):
    """What the page's commands make, of the examples and as some versions only."""
    monkeypatch.chdir(tmp_path)
    (tmp_path / "python3.11").symlink_to(ROOT / "examples")
    assert main(["index", "-q", "--text", "python3.11", "-o", "index"]) == 0
    for version in ("2.7", "3.0", "3.14"):
        arguments = ["index", "-q", "--python", version, "--tables", "problems", "python3.11"]
        assert main([*arguments, "-o", f"versions/version={version}"]) == 0
    return tmp_path


def test_the_questions_of_the_page_can_be_asked(capsys, folder_of_questions):
    tool = tool_named("answer_questions")
    questions = tool.questions()
    assert len(questions) == 10
    for sql, columns in questions:
        out = Answer(capsys, sql, "index", "--format", "csv").out
        assert out.splitlines()[0].split(",") == columns
    years = {element.text for element in ElementTree.fromstring(tool.picture(folder_of_questions)).iter()}
    assert years >= {"2025", "the library", "100%"}
