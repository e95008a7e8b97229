"""`codeloom names` and the library below it: what is said of each line, and where the names are."""

import json
from pathlib import Path

import pytest
from golden import Cases, Check
from test_library import LibraryTexts

from codeloom import analyze, analyze_file

FOLDER = Path(__file__).parent / "names"


@pytest.mark.parametrize("case", Cases(FOLDER, ".words"))
def test_in_words(case, rewrite, run_cli, write_files):
    write_files({"f.py": case.source})
    done = run_cli("names", "--records", "--python", "3.12", "f.py")
    Check(case, f"---\n{done.stdout.rstrip()}", rewrite)
    assert (done.stderr, done.returncode) == ("", 1)


def Place(record, row):
    """From column to column, within the line's first row."""
    place = record.range
    if place is None:
        return "nowhere"
    if place.row == place.end_row == row:
        return f"{place.column}-{place.end_column}"
    return f"{place.row}:{place.column}-{place.end_row}:{place.end_column}"


def Formatted(record):
    """The record as docs/records.md shows records."""
    owner = "arg " if record.of_argument else ""
    payload = f"  {record.payload}" if record.payload else ""
    return f"{owner}{record.kind.value:<4} {record.name}{payload}"


@pytest.mark.parametrize("case", Cases(FOLDER, ".places"))
def test_places(case, rewrite):
    rows = ["---"]
    for line in analyze(case.source, python="3.12").lines:
        rows += line.text.splitlines()
        rows += [f"    {Place(record, line.range.row):<8} {Formatted(record)}" for record in line.records]
    Check(case, "\n".join(rows), rewrite)


def WithoutBlanks(rows, place):
    """What is in a range of the file."""
    if place.row == place.end_row:
        text = rows[place.row - 1][place.column - 1 : place.end_column - 1]
    else:
        first, *between, last = rows[place.row - 1 : place.end_row]
        text = "".join([first[place.column - 1 :], *between, last[: place.end_column - 1]])
    return "".join(text.split())


def test_a_range_holds_the_name():
    """Of names that hold no brackets, in which texts are shortened, and no comments."""
    count = 0
    for path, text, _ in LibraryTexts(40, 3):
        rows = text.split("\n")
        for record in analyze(text).records:
            name = record.name
            if not name.replace(".", "").isidentifier() or name == "return":
                continue
            assert record.range is not None, (path, record)
            assert WithoutBlanks(rows, record.range) == name, (path, record, record.range)
            count += 1
    assert count > 10_000


def Items(done):
    """The objects between those of the run and of the summary."""
    return [json.loads(row) for row in done.stdout.splitlines()][1:-1]


def test_rows_of_json(run_cli, write_files):
    write_files({"f.py": "def é(a=1): pass\nx = )\n"})
    done = run_cli("names", "--records", "--format", "jsonl", "f.py")
    *records, problem = Items(done)
    keys = ["path", "row", "column", "end_row", "end_column", "name", "kind", "payload", "scope"]
    assert [[record[key] for key in keys] for record in records] == [
        ["f.py", 1, 5, 1, 6, "é", "set", None, None],
        ["f.py", 1, 7, 1, 8, "a", "set", None, "é"],
        ["f.py", 1, 7, 1, 8, "a", "literal", "int: 1", "é"],
    ]
    assert (problem["type"], problem["row"], problem["code"], done.returncode) == ("problem", 2, "CL203", 1)


LIMIT = "the line is nested too deep for a full walk: names further in have no records"


def test_limits_leave_the_rows_alone(run_cli):
    text = f"x = f(y, {'[' * 50}{']' * 50})\nz = 1".encode()
    done = run_cli("names", "--records", "--format", "jsonl", "-", stdin=text)
    items = Items(done)
    assert [item["name"] for item in items if item["type"] == "record"] == ["x", "x", "z", "z"]
    assert [(item["row"], item["message"]) for item in items if item["type"] == "limit"] == [(1, LIMIT)]
    in_words = run_cli("names", "--records", "-", stdin=text)
    assert in_words.stdout.count(f"    partly   {LIMIT[:60]}") == 1
    assert (in_words.stderr + done.stderr, done.returncode, in_words.returncode) == ("", 0, 0)


def test_what_looks_like_a_hint(run_cli, write_files):
    write_files({"f.py": "x = 1  # type: ignore[code]\n"})
    command = ["names", "--records", "--format", "jsonl", "f.py"]
    assert "'code'" not in str(Items(run_cli(*command)))
    assert "get" in str(Items(run_cli(*command, "--false-hints")))


def test_other_encodings_versions_and_what_cannot_be_read(run_cli, write_files):
    folder = write_files(
        {
            "latin.py": "# coding: latin-1\né = 1\n".encode("latin-1"),
            "two.py": "print x\n",
            "bad.py": b"x = '\xff'\ny\n",
        }
    )
    assert analyze_file(folder / "latin.py").records[0].name == "é"
    assert "7  x  read  module, undefined" in run_cli("names", "--python", "2.7", "two.py").stdout
    done = run_cli("names", "bad.py", "missing.py")
    assert "byte 0xFF can't be read" in done.stdout and "bad.py:2:1: y" in done.stdout
    assert "can't read missing.py" in done.stderr and done.returncode == 2


# Appearances of names: roles, unused and undefined ones


TEXT = "import os, re\n\n\ndef f(a):\n    b = re.x\n    return a + c\n\n\nx = (1,]\n"


def test_unused_and_undefined(run_cli, write_files):
    write_files({"f.py": TEXT})
    done = run_cli("names", "--unused", "--undefined", "--format", "concise", "f.py")
    assert done.stdout.splitlines() == [
        "f.py:1:8: unused import os in module",
        "f.py:5:5: unused bind b in function f",
        "f.py:6:16: undefined read c in function f",
        "f.py:9:8: CL204 closing parenthesis ']' does not match opening parenthesis '('",
    ]
    assert done.returncode == 1


@pytest.mark.parametrize("case", Cases(FOLDER, ".occurrences"))
def test_occurrences_line_by_line(case, rewrite, run_cli, write_files):
    write_files({"f.py": case.source})
    done = run_cli("names", "--python", "3.12", "f.py")
    Check(case, f"---\n{done.stdout.rstrip()}", rewrite)
    assert done.stderr == ""


def test_records_are_a_choice_of_their_own(run_cli, write_files):
    write_files({"f.py": "x"})
    done = run_cli("names", "--records", "--unused", "f.py")
    assert (done.returncode, done.stdout) == (2, "")
    assert done.stderr == "codeloom: --records doesn't go with --unused and --undefined\n"


def test_occurrences_in_other_formats(run_cli, write_files):
    write_files({"f.py": "import os\ndef f(a):\n    a.b(len(os), c=d)\n"})
    done = run_cli("names", "--format", "concise", "f.py")
    assert [row.partition(": ")[2] for row in done.stdout.splitlines()] == [
        "import os in module",
        "bind f in module",
        "parameter a in function f",
        "read a in function f",
        "attribute b in function f",
        "read len (builtin) in function f",
        "read os of module in function f",
        "keyword c in function f",
        "read d (unknown) in function f",
    ]
    items = json.loads(run_cli("names", "--format", "json", "f.py").stdout)["items"]
    assert items[6] == {
        "type": "occurrence",
        "path": "f.py",
        "row": 3,
        "column": 13,
        "end_row": 3,
        "end_column": 15,
        "name": "os",
        "role": "read",
        "finding": None,
        "scope": "function f",
        "resolution": "scope",
        "home": "module",
    }
