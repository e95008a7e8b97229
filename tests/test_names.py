"""`codeloom names` and the library below it: what is said of each line, and where the names stand."""

import json
from pathlib import Path

import pytest
from golden import Cases, Check
from test_library import LibraryTexts

from codeloom.line_names import NamesInFile, NamesInText
from codeloom.records import FormatRecord

FOLDER = Path(__file__).parent / "names"


@pytest.mark.parametrize("case", Cases(FOLDER, ".words"))
def test_in_words(case, rewrite, run_cli, write_files):
    write_files({"f.py": case.source})
    done = run_cli("names", "--python", "3.12", "f.py")
    Check(case, f"---\n{done.stdout.rstrip()}", rewrite)
    assert (done.stderr, done.returncode) == ("", 1)


def Place(placed, row):
    """From column to column, within the line's first row."""
    place = placed.range
    if place is None:
        return "nowhere"
    if place.row == place.end_row == row:
        return f"{place.column}-{place.end_column}"
    return f"{place.row}:{place.column}-{place.end_row}:{place.end_column}"


@pytest.mark.parametrize("case", Cases(FOLDER, ".places"))
def test_places(case, rewrite):
    rows = ["---"]
    for line in NamesInText(case.source, "3.12"):
        rows += line.text.strip().splitlines()
        rows += [f"    {Place(placed, line.row):<8} {FormatRecord(placed.record)}" for placed in line.records]
    Check(case, "\n".join(rows), rewrite)


def WithoutBlanks(rows, place):
    """What stands in a range of the file."""
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
        for line in NamesInText(text, "3.11"):
            for placed in line.records:
                name = placed.record.name
                if not name.replace(".", "").isidentifier() or name == "return":
                    continue
                assert placed.range is not None, (path, line.row, name)
                assert WithoutBlanks(rows, placed.range) == name, (path, line.row)
                count += 1
    assert count > 10_000


def Rows(done):
    return [json.loads(row) for row in done.stdout.splitlines()]


def test_rows_of_json(run_cli, write_files):
    write_files({"f.py": "def é(a=1): pass\nx = )\n"})
    done = run_cli("names", "--format", "jsonl", "f.py")
    keys = ["path", "row", "column", "end_row", "end_column", "name", "kind", "payload", "scope"]
    rows = Rows(done)
    assert all(list(row) == keys for row in rows) and done.returncode == 1
    assert [list(row.values()) for row in rows] == [
        ["f.py", 1, 5, 1, 6, "é", "set", None, None],
        ["f.py", 1, 7, 1, 8, "a", "set", None, "é"],
        ["f.py", 1, 7, 1, 8, "a", "literal", "int: 1", "é"],
        ["f.py", 2, 5, None, None, None, "error", "invalid syntax", None],
    ]


def test_limits_leave_the_rows_alone(run_cli):
    text = f"x = f(y, {'[' * 50}{']' * 50})\nz = 1".encode()
    done = run_cli("names", "--format", "jsonl", "-", stdin=text)
    assert [row["name"] for row in Rows(done)] == ["x", "x", "z", "z"]
    assert done.stderr.startswith("<stdin>:1: RuntimeError raised in CNodeWalker.Walk: ")
    in_words = run_cli("names", "-", stdin=text)
    assert "    partly   the line is too much for a full walk: Runtime" in in_words.stdout
    assert (in_words.stderr, done.returncode, in_words.returncode) == ("", 0, 0)


def test_what_looks_like_a_hint(run_cli, write_files):
    write_files({"f.py": "x = 1  # type: ignore[code]\n"})
    assert "code" not in str(Rows(run_cli("names", "--format", "jsonl", "f.py")))
    assert "get" in str(Rows(run_cli("names", "--format", "jsonl", "--false-hints", "f.py")))


def test_other_encodings_versions_and_what_cannot_be_read(run_cli, write_files):
    folder = write_files(
        {
            "latin.py": "# coding: latin-1\né = 1\n".encode("latin-1"),
            "two.py": "print x\n",
            "bad.py": b"x = '\xff'\ny\n",
        }
    )
    (line,) = [line for line in NamesInFile(folder / "latin.py") if line.records]
    assert line.records[0].record.name == "é"
    assert "reads    x" in run_cli("names", "--python", "2.7", "two.py").stdout
    done = run_cli("names", "bad.py", "missing.py")
    assert "byte 0xFF can't be read" in done.stdout and "bad.py:2:1: y" in done.stdout
    assert "can't read missing.py" in done.stderr and done.returncode == 2
