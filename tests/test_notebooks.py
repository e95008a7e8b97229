"""Notebooks: what their cells come to as one text, and where its rows come from."""

import json

import pytest

import codeloom
from codeloom import Notebook


def Made(*sources, language="python", kind="code"):
    cells = [{"cell_type": kind, "source": source} for source in sources]
    metadata = {"language_info": {"name": language}}
    return json.dumps({"cells": cells, "metadata": metadata, "nbformat": 4}).encode()


@pytest.mark.parametrize(
    ("cell", "text"),
    [
        ("%matplotlib inline\nx\n", "# %matplotlib inline\nx\n"),
        ("x = !ls (\\\n  -l\ny", "x = None  # !ls (\n#   -l\ny\n"),
        (
            "for a in b:\n    !echo don't\n    %time x\n",
            "for a in b:\n    pass  # !echo don't\n    pass  # %time x\n",
        ),
        ("y = (1\n % 2)\nz %= 3\na != b\n", "y = (1\n % 2)\nz %= 3\na != b\n"),
        ("s = '''\n%no ( \\'''\n!no\n'''\n?s", "s = '''\n%no ( \\'''\n!no\n'''\n# ?s\n"),
        ("a.b?\nc??", "# a.b?\n# c??\n"),
        ("a, b = %sql (", "a, b = None  # %sql (\n"),
        ("%%bash\nif [ x ]\n", "# %%bash\n# if [ x ]\n"),
        ("%%time\r\nx = 1\r\n", "# %%time\nx = 1\n"),
        (["x\n", "y"], "x\ny\n"),
        ("", "\n"),
    ],
)
def test_what_is_no_python_is_passed_over(cell, text):
    notebook = Notebook(Made(cell))
    assert notebook.text == text
    assert not codeloom.analyze(notebook.text).problems


def test_places():
    cells = json.loads(Made("a\nb", "c"))
    cells["cells"].insert(1, {"cell_type": "markdown", "source": "# title"})
    notebook = Notebook(json.dumps(cells).encode())
    assert (notebook.text, [notebook.place(row) for row in (1, 2, 3, 4)]) == (
        "a\nb\nc\n",
        [(1, 1), (1, 2), (3, 1), (3, 2)],
    )
    assert Notebook(Made("x", language="R")).text == "" and Notebook(Made()).place(1) == (1, 1)


@pytest.mark.parametrize("data", [b"", b"\xff", b"[]", b"{}", b'{"cells": 1}', b"[" * 100_000])
def test_what_is_no_notebook(data, tmp_path):
    path = tmp_path / "a.ipynb"
    path.write_bytes(data)
    for call in (codeloom.analyze_file, codeloom.read_notebook):
        with pytest.raises(OSError, match="it isn't a notebook") as raised:
            call(path)
        assert raised.value.filename == str(path)


def test_an_indented_cell_is_as_one_that_is_not(run_cli, write_files):
    cells = Made(
        "\n  x = 1\n  if x:\n    y = )\n", "    %time\n    for i in x:\n        pass\n", "if x:\n  y = 1\n"
    )
    write_files({"n.ipynb": cells})
    assert run_cli("check", "n.ipynb").stdout.splitlines() == [
        "n.ipynb:cell 1:4:9: CL203 unmatched ')'",
        "    4 |     y = )",
        "      |         ^",
        "1 problem in 1 of 1 file, 8 logical lines",
    ]


@pytest.mark.parametrize("end", ["f(1", "y = [1,\n  2\n", "def g(a", "z = {'a': (", "if f(:\n    pass"])
def test_what_a_cell_leaves_open_ends_with_it(end):
    notebook = Notebook(Made(f"x = 1\n{end}", "total = 1\nprint(total)\n"))
    analysis = codeloom.analyze(notebook.text)
    assert [notebook.place(problem.range.row)[0] for problem in analysis.problems] == [1]
    assert [problem.code for problem in analysis.problems] in (["CL202"], ["CL203"], ["CL211"], ["CL217"])
    assert [line.text for line in analysis.lines][-2:] == ["total = 1", "print(total)"]


def test_odd_cells():
    cells = [1, {}, {"cell_type": "code"}, {"cell_type": "code", "source": [1, "x"]}, {"cell_type": "raw"}]
    assert Notebook(json.dumps({"cells": cells, "metadata": []}).encode()).text == "\nx\n"
    old = {"worksheets": [{"cells": [{"cell_type": "code", "input": "x = 1"}]}, None]}
    assert Notebook(json.dumps(old).encode()).text == "x = 1\n"


def test_the_command(run_cli, write_files):
    write_files({"a/n.ipynb": Made("await x\nasync with y: z\n", "def f():\n    await x\nreturn")})
    done = run_cli("check", "a", "--format", "concise")
    assert done.stdout.splitlines() == [
        "a/n.ipynb:cell 2:2:5: CL322 'await' outside async function",
        "a/n.ipynb:cell 2:3:1: CL321 'return' outside function",
    ]
    done = run_cli("names", "--stdin-filename", "n.ipynb", "-", stdin=Made("!ls", "x = 1"))
    assert done.stdout == "n.ipynb:cell 2:1:1: x = 1\n    1  x  bind  module\n"
