"""`codeloom query`: what it prints, and what it says of a question that can't be answered."""

import csv
import io
import json
import os
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
    assert main(["index", "--quiet", str(ROOT / "examples"), "-o", str(folder)]) == 0
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
    wide = Answer(capsys, "SELECT repeat('x', 200) AS wide", index).out.splitlines()
    assert wide[-1] == "x" * 77 + "..."


def test_formats_for_programs(capsys, index):
    sql = "SELECT path, state, lines FROM files WHERE problems > 1 ORDER BY path"
    rows = [json.loads(row) for row in Answer(capsys, sql, index, "--format", "jsonl").out.splitlines()]
    assert rows and all(set(row) == {"path", "state", "lines"} for row in rows)
    table = csv.DictReader(io.StringIO(Answer(capsys, sql, index, "--format", "csv").out))
    assert [row["path"] for row in table] == [row["path"] for row in rows]


def test_more_rows_than_are_fetched_at_once(capsys, index):
    out = Answer(capsys, "SELECT * FROM range(2500)", index, "--format", "csv").out
    assert out.splitlines() == ["range", *map(str, range(2500))]


def test_what_cannot_be_answered(capsys, index, tmp_path):
    for sql, words in (
        ("SELECT nothing FROM files", "nothing"),
        ("SELEC", "syntax error"),
        ("SELECT CAST(path AS INTEGER) FROM files", "INT32"),
    ):
        told = Answer(capsys, sql, index, status=2)
        assert words in told.err and "Traceback" not in told.err
    told = Answer(capsys, "SELECT 1", str(tmp_path), status=2)
    assert f"there is no index in {tmp_path}: make one with codeloom index" in told.err
    assert Answer(capsys, "SELECT 1", os.path.join(tmp_path, "void"), status=2).out == ""
    assert Answer(capsys, "CREATE TABLE mine (x INTEGER)", index).err == ""


@pytest.fixture
def folder_of_questions(tmp_path, monkeypatch):
    """What the page's commands make, of the examples and as some versions only."""
    monkeypatch.chdir(tmp_path)
    (tmp_path / "python3.11").symlink_to(ROOT / "examples")
    assert main(["index", "-q", "python3.11", "-o", "index"]) == 0
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
