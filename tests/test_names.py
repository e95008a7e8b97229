"""`codeloom names` and the library below it: what is said of each line, and where the names stand."""

import json

import pytest
from test_library import LibraryTexts

from codeloom.line_names import NamesInFile, NamesInText

SOURCE = """\
import os.path as p, sys
from typing import List
class Café(Base):
    size: List[int] = []
    def area(self, w, h=1, *rest) -> "float":
        total, _ = add(w, self.h)
        x = (1))
        for i, é in enumerate(rest): print(f"{i!r}", é.b)
        return total + x
    @p.join
    def g[T: int, *Ts](a):
        # type: (List) -> str
        global n; pass
        y[0] = isinstance(a, Foo) and [k for k in y]
        yield from a.b
"""

IN_WORDS = """\
f.py:1:1: import os.path as p, sys
    binds    p = module os.path
             module sys
f.py:2:1: from typing import List
    binds    List from typing
f.py:3:1: class Café(Base):
    binds    Café
    reads    Base
f.py:4:5: size: List[int] = []
    binds    size: List[int] = []
    reads    List, int
f.py:5:5: def area(self, w, h=1, *rest) -> "float":
    binds    area
    takes    self, w
             h = 1
             rest = a tuple
    reads    float
    returns  float
f.py:6:9: total, _ = add(w, self.h)
    binds    total = add(w, self.h)[0]
             _ = add(w, self.h)[1]
    calls    add(w,self.h)
    reads    add, w, self, self.h
f.py:7:16: invalid syntax
            x = (1))
                   ^
f.py:8:9: for i, é in enumerate(rest): print(f"{i!r}", é.b)
    binds    i = [0] of an item of enumerate(rest)
             é = [1] of an item of enumerate(rest)
    calls    enumerate(rest)
             print('',é.b)
    reads    enumerate, rest, print, é, é.b, i
f.py:9:9: return total + x
    reads    total, x
    returns  total + x
f.py:10:5: @p.join
    calls    p.join()
    reads    p, p.join
f.py:11:5: def g[T: int, *Ts](a):
    binds    g
    types    T: int
             *Ts
    takes    a
    reads    int
f.py:12:9: # type: (List) -> str
    knows    argument 1: List
    reads    List, str
    returns  str
f.py:13:9: global n
    global   n
f.py:14:9: y[0] = isinstance(a, Foo) and [k for k in y]
    inside   k
    knows    y[0] = isinstance(a, Foo) and [k for k in y]
             a = a Foo
    calls    isinstance(a,Foo)
    reads    y, isinstance, a, Foo, k
f.py:15:9: yield from a.b
    reads    a, a.b
    yields   from a.b
"""


def test_in_words(run_cli, write_files):
    write_files({"f.py": SOURCE})
    done = run_cli("names", "--python", "3.12", "f.py")
    assert (done.stdout, done.stderr, done.returncode) == (IN_WORDS, "", 1)


def Places(text, language="3.12"):
    """Kind, name and range of each record; of a range within a row just the columns."""
    told = []
    for line in NamesInText(text, language):
        for placed in line.records:
            place = placed.range
            if place is not None and place.row == place.end_row == line.row:
                place = f"{place.column}-{place.end_column}"
            told.append(f"{placed.record.kind.word} {placed.record.name} {place}")
    return told


@pytest.mark.parametrize(
    ("text", "places"),
    [
        ("x = x + 1", ["set x 1-2", "expression x 1-2", "get x 5-6"]),
        ("é.b[i] = 1", ["literal é.b[i] 1-7", "get é 1-2", "get é.b 1-4", "get i 5-6"]),
        ("a.b(c)(d)", ["called a.b 1-4", "get a 1-2", "get a.b 1-4", "get c 5-6", "get d 8-9"]),
        ("f(f := f)", ["set f 3-4", "is f 3-4", "called f 1-2", "get f 1-2"]),
        ("*(a), b = a", ["set a 3-4", "literal a 3-4", "set b 7-8", "is b 7-8", "get a 11-12"]),
        ("*a[0], b = c", ["set a[0] 2-6", "literal a[0] 2-6", "set b 8-9"]),
        ("[x for x in x]", ["get x 2-3", "within x 8-9"]),
        ("lambda x=x: x", ["get x 10-11", "within x 8-9"]),
        ("import a.a as a", ["set a 15-16", "import a 15-16", "as a 15-16"]),
        ("from a import (a, # a\n  b as a)", ["set a 16-17", "from a 16-17", "set a 16-17", "from a 16-17"]),
        ("def f(f=f): pass", ["set f 5-6", "get f 9-10", "set f 7-8", "is f 7-8"]),
        ("def f(a) -> b: pass", ["set f 5-6", "get b 13-14", "set a 7-8", "hint return 10-12"]),
        ("global a, b", ["global a 8-9", "global b 11-12"]),
        ("except A as A: x", ["set A 13-14", "is A 13-14", "get A 8-9", "get x 16-17"]),
        ("yield (yield x)", ["is yield 8-13", "is yield 1-6", "get x 14-15"]),
        ("isinstance(x, A)", ["is x 12-13", "called isinstance 1-11", "get isinstance 1-11"]),
        ("case A(x=x) if x: x.y", ["set x 10-11", "get A 6-7", "get x 16-17", "get x.y 19-22"]),
        ("x = 1  # type: x.y", ["set x 1-2", "literal x 1-2", "get x 16-17", "get x.y 16-19"]),
        ('f"{x} {x.y}"', ["get x 4-5", "get x 8-9", "get x.y 8-11"]),
        ("(a\n.b)", ["get a 2-3", "get a.b SourceRange(row=1, column=2, end_row=2, end_column=3)"]),
        (
            "def f(a):\n # type: (x) -> y",
            ["set f 5-6", "set a 7-8", "get x 11-12", "hint :a:0 None", "get y 17-18", "hint return None"],
        ),
    ],
)
def test_places(text, places):
    assert Places(text)[: len(places)] == places


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
