"""`codeloom tree`: which lines are shown, the three formats, what goes wrong."""

import json

import pytest

TREE = """\
CExprStmt expr_stmt @0
  CNameLiteral NAME 'x' @0
  CNode EQUAL '=' @1
  CAtomExpr atom_expr @2
    CNameLiteral NAME 'foo' @2
    CTrailer trailer @3
      CNode LPAR '(' @3
      CStringLiteral STRING '"é\\\\n"' @4
      CNode RPAR ')' @5
"""
CODE = 'x = foo("é\\n")'
FILE = """\
import a

def f(b,
      c):  # why
    # nothing
    d = 1; return f"{b + c!r}"

x = (1
y = 2
"""


def Headings(output):
    return [row for row in output.splitlines() if row.startswith(("f.py:", "<stdin>:", "<string>:"))]


def test_a_line(run_cli):
    done = run_cli("tree", "-c", CODE)
    assert (done.returncode, done.stdout, done.stderr) == (0, TREE, "")


def test_several_lines(run_cli):
    done = run_cli("tree", "-c", "a = 1; b = 2")
    assert Headings(done.stdout) == ["<string>:1:1: a = 1", "<string>:1:8: b = 2"]
    assert "\n\n<string>:1:8:" in done.stdout


@pytest.mark.parametrize(
    ("place", "headings"),
    [
        ("f.py:1", ["f.py:1:1: import a"]),
        ("f.py:3", ["f.py:3:1: def f(b, ..."]),
        ("f.py:4", ["f.py:3:1: def f(b, ..."]),
        ("f.py:5", ["f.py:5:5: # nothing"]),
        ("f.py:6", ["f.py:6:5: d = 1", 'f.py:6:12: return f"{b + c!r}"', "f.py:6:22: b + c"]),
        ("f.py:9:3:", ["f.py:9:1: y = 2"]),
        ("f.py:8", ["f.py:8:5: CL202 '(' was never closed"]),
    ],
)
def test_the_row_of_a_file(write_files, run_cli, place, headings):
    write_files({"f.py": FILE})
    done = run_cli("tree", place)
    assert (Headings(done.stdout), done.stderr) == (headings, "")
    assert done.returncode == (1 if place == "f.py:8" else 0)


def test_whole_files(write_files, run_cli):
    write_files({"f.py": FILE, "f.py:3": "z"})
    assert len(Headings(run_cli("tree", "f.py").stdout)) == 8
    assert run_cli("tree", "f.py:3").stdout.endswith("\nCNameLiteral NAME 'z' @0\n")
    done = run_cli("tree", "-", stdin=b"\nb\n")
    assert done.stdout == "<stdin>:2:1: b\nCNameLiteral NAME 'b' @0\n"


def test_a_broken_line(run_cli):
    done = run_cli("tree", "-c", "x = [é, 1 2]")
    assert (done.returncode, done.stderr) == (1, "")
    assert done.stdout.splitlines() == [
        "<string>:1:9: CL211 invalid syntax. Perhaps you forgot a comma?",
        "    1 | x = [é, 1 2]",
        "      |         ^^^",
        "    hint: write ',' or an operator before '2'",
    ]
    # The place of a fault in an expression is a place of the file.
    done = run_cli("tree", "-c", "\nx = f'é{a b} {c}'")
    assert Headings(done.stdout) == [
        "<string>:2:1: x = f'é{a b} {c}'",
        "<string>:2:9: CL211 invalid syntax. Perhaps you forgot a comma?",
        "<string>:2:15: c",
    ]
    assert run_cli("tree", "-c", "case [a b]: pass").stdout.startswith("<string>:1:7: CL211 invalid")


def test_a_row_for_each_line(write_files, run_cli):
    write_files({"f.py": "x = 1\ny = )\n"})
    rows = run_cli("tree", "f.py", "--format", "concise").stdout.splitlines()
    assert rows == ["f.py:1:1: x = 1", "f.py:2:5: CL203 unmatched ')'"]


def test_a_line_that_parses_and_is_refused(run_cli):
    """It has its problems above its tree; what only looks like a hint isn't a line."""
    done = run_cli("tree", "-c", "f() = 1")
    assert done.returncode == 1
    assert Headings(done.stdout)[0].startswith("<string>:1:1: CL401 cannot assign to function call")
    assert "\nCExprStmt expr_stmt @0\n" in done.stdout
    done = run_cli("tree", "-c", 'def f(a: "the first of them"): pass')
    assert (done.returncode, Headings(done.stdout)) == (0, [])


def test_what_cannot_be_read(write_files, run_cli):
    write_files({"f.py": b"x = 1\ny = '\xe9'\n\n", "folder/a.py": ""})
    for place, message in [
        ("absent.py:1", "can't read absent.py: No such file or directory"),
        ("folder", "folder is a folder: name a file in it"),
        ("folder/a.py", "folder/a.py holds no line"),
        ("f.py:0", "f.py has no row 0: rows count from 1"),
        ("f.py:3", "row 3 of f.py is blank"),
        ("f.py:4", "f.py has no row 4: it ends with row 3"),
        ("f.py:9999999999", "can't read f.py:9999999999: No such file or directory"),
    ]:
        done = run_cli("tree", place)
        assert (done.returncode, done.stdout) == (2, "")
        assert done.stderr == f"codeloom: {message}\n"
    done = run_cli("tree", "f.py")
    assert done.returncode == 1 and "CExprStmt" in done.stdout
    assert Headings(done.stdout)[1].startswith("f.py:2:6: CL101 byte 0xE9 can't be read as utf-8")


def test_a_row_of_a_cell(write_files, run_cli):
    cells = [
        {"cell_type": kind, "source": text} for kind, text in (("markdown", "# A"), ("code", "a\nb = 1"))
    ]
    write_files({"n.ipynb": json.dumps({"cells": cells})})
    assert run_cli("tree", "n.ipynb:cell 2:2:1:").stdout.startswith("n.ipynb:cell 2:2:1: b = 1\nCExprStmt")
    write_files({"a.py": "x\n"})
    for place in ("n.ipynb:2", "n.ipynb:cell 1:1", "a.py:cell 1:1"):
        done = run_cli("tree", place)
        assert done.returncode == 2 and "name FILE:cell N:ROW" in done.stderr


def test_other_grammars(run_cli):
    assert run_cli("tree", "-c", "print x", "--python", "2.7").stdout.startswith("CNode print_stmt")
    assert run_cli("tree", "-c", "print x").returncode == 1
    # `await` isn't a keyword everywhere, but is one in an `async def`.
    code = "async def f():\n    await x\nawait = x"
    done = run_cli("tree", "-c", code, "--python", "3.5")
    assert "CKeywordLiteral KEYWORD 'await'" in done.stdout
    assert "CNameLiteral NAME 'await'" in done.stdout


def test_json(write_files, run_cli):
    def Texts(node):
        return [node["text"]] if "text" in node else [t for c in node["children"] for t in Texts(c)]

    def Items(*arguments):
        return json.loads(run_cli("tree", *arguments, "--format=json").stdout)["items"]

    (line,) = Items("-c", CODE)
    tree = line.pop("tree")
    place = {"row": 1, "column": 1, "end_row": 1, "end_column": len(CODE) + 1}
    assert line == {"type": "tree", "path": "<string>", **place, "text": CODE, "problems": []}
    assert Texts(tree) == ["x", "=", "foo", "(", '"é\\n"', ")"]
    assert tree["children"][2]["children"][1] == {
        "class": "CTrailer",
        "rule": "trailer",
        "token": 3,
        "children": [
            {"class": "CNode", "rule": "LPAR", "text": "(", "token": 3},
            {"class": "CStringLiteral", "rule": "STRING", "text": '"é\\n"', "token": 4},
            {"class": "CNode", "rule": "RPAR", "text": ")", "token": 5},
        ],
    }
    write_files({"f.py": FILE})
    lines = Items("f.py")
    assert len(lines) == 8
    (line,) = (line for line in lines if line["tree"] is None)
    (problem,) = line["problems"]
    assert (problem["row"], problem["column"], problem["code"]) == (8, 5, "CL202")
    (line, field) = Items("-c", 'x = """\n""" + f"{é}"')
    assert (line["end_row"], line["end_column"]) == (2, 13)
    assert (field["row"], field["column"], field["end_column"]) == (2, 10, 11)
    (line,) = Items("-c", "case a: b")
    assert line["tree"]["children"][1]["position"] == [0, 5]


def test_dot(run_cli):
    done = run_cli("tree", "-c", 'x = "\\\\\\""; y = (', "--format=dot")
    assert done.returncode == 1
    assert done.stderr.startswith("<string>:1:17: CL202 '(' was never closed\n")
    assert done.stdout.splitlines() == [
        "digraph tree {",
        '  node [fontname="monospace"]; edge [arrowhead=none];',
        '  n1 [shape=plaintext label="1: x = \\"\\\\\\\\\\\\\\"\\""];',
        '  n2 [shape=ellipse label="CExprStmt\\nexpr_stmt"];',
        "  n1 -> n2;",
        "  n3 [shape=box label=\"CNameLiteral\\n'x'\"];",
        "  n2 -> n3;",
        "  n4 [shape=box label=\"CNode\\n'='\"];",
        "  n2 -> n4;",
        '  n5 [shape=box label="CStringLiteral\\n\'\\"\\\\\\\\\\\\\\\\\\\\\\\\\\"\\"\'"];',
        "  n2 -> n5;",
        "}",
    ]


@pytest.mark.parametrize("tree_format", ["text", "json", "dot"])
def test_deep_trees(run_cli, tree_format):
    depth = 3_000
    source = b"(" * depth + b"a" + b")" * depth
    done = run_cli("tree", "-", "--format", tree_format, stdin=source)
    assert done.returncode == 1  # the interpreter takes fewer parentheses; the tree is there nevertheless
    assert "Traceback" not in done.stderr
    assert done.stdout.count("CAtom") == depth


def test_options_that_it_shares(write_files, run_cli):
    """The version is that of the project that the file is in."""
    write_files({"old/pyproject.toml": "[project]\nrequires-python = '>=3.8'\n", "old/a.py": "\nmatch x:\n"})
    done = run_cli("tree", "old/a.py:2", "--exit-zero")
    assert done.returncode == 0 and "CL701 `match` needs Python 3.10" in done.stdout
    prose = ("-c", "def f(a: 'the first of them'): pass")
    assert run_cli("tree", *prose).returncode == 0
    assert "CL601" in run_cli("tree", "--false-hints", *prose).stdout
    assert run_cli("tree", "-v", "-c", "x").stderr.startswith("codeloom: settings: none\n")
