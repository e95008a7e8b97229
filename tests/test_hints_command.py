"""`codeloom hints` and what it tells of each def.

Golden files in signatures/ hold sources with what the command prints of them.
"""

import ast
import json
import re
from contextlib import redirect_stdout
from io import StringIO
from pathlib import Path

import pytest
from golden import Cases, Check
from test_library import LibraryTexts

from codeloom import analyze, analyze_file
from codeloom.cli.console import Console
from codeloom.cli.defs import Argument, Value, defs_of
from codeloom.cli.hints import HintsCommand
from codeloom.cli.items import Finding, show_items
from codeloom.cli.source import Source


def Defs(text, python="3.12"):
    return [found for _, found in defs_of(analyze(text, python=python))]


def Printed(source):
    stream = StringIO()
    analysis = Source("<string>", analyze(source, python="3.12"))
    findings = [Finding.of(analysis, problem) for problem in analysis.problems]
    with redirect_stdout(stream):
        show_items(HintsCommand().items(analysis, findings), Console())
    return f"---\n{stream.getvalue()}".replace("<string>:", "").rstrip("\n")


@pytest.mark.parametrize("case", Cases(Path(__file__).parent / "signatures", ".signatures"))
def test_signatures(case, rewrite):
    Check(case, Printed(case.source), rewrite)


def Plain(hint):
    """A hint without what may be written in more than one way."""
    return hint and re.sub(r"[\s()'\",]", "", hint)


def DefsByTree(tree):
    """Row, name and hints of each def, by the interpreter's own parser."""
    for node in ast.walk(tree):
        if isinstance(node, ast.FunctionDef | ast.AsyncFunctionDef):
            args = node.args
            arguments = [*args.posonlyargs, *args.args, args.vararg, *args.kwonlyargs, args.kwarg]
            hints = [(arg.arg, arg.annotation) for arg in arguments if arg] + [("return", node.returns)]
            yield node.lineno, node.name, *((name, Plain(hint and ast.unparse(hint))) for name, hint in hints)


def Def(found):
    arguments = ((argument.name, Plain(argument.hint)) for argument in found.arguments if argument.name)
    name = found.name.rpartition(".")[2]
    return found.range.row, name, *arguments, ("return", Plain(found.return_hint))


def test_signatures_are_those_of_the_interpreter(seed):
    for path, text, tree in LibraryTexts(80, seed):
        if "# type:" not in text:
            defs = Defs(text)
            ours = {Def(found) for found in defs if found is not None}
            theirs = {*DefsByTree(tree)}
            assert ours <= theirs and len(theirs) <= len(defs), (seed, path)


def test_an_api_of_values(tmp_path):
    path = tmp_path / "a.py"
    path.write_text("class A:\n  def f(self, a: int = 1): return 2\n  def g(self):\n    return b\n")
    (_, f), (_, g) = defs_of(analyze_file(path))
    assert (f.range.row, f.range.column, f.name) == (2, 3, "A.f")
    assert f.arguments == (Argument("self"), Argument("a", "", "int", Value(2, "int", "1")))
    assert (f.returns, g.returns) == ([], [Value(4, None, "b")])
    with pytest.raises(FileNotFoundError):
        analyze_file(tmp_path / "absent.py")


def test_depth():
    text = "[" * 199 + "]" * 199
    (found,) = Defs(f"def f(a={text}): pass")
    assert found.arguments[0].default.text == text
    assert Defs(f"def f(a={'[' * 20_000}{']' * 20_000}): pass") == [None]
    (found,) = Defs(f"def f({'(' * 20_000}a,{')' * 20_000}): pass", "2.7")
    assert found.arguments is None


def test_what_a_signature_is_written_as():
    """Defaults as written, hints in quotes by their value; a comment must fit the arguments."""
    (f,) = Defs("def f(a=('==', '<'), b: \"Literal['\\\\n']\" = 'x'): pass")
    assert [argument.default.text for argument in f.arguments] == ["('==', '<')", "'x'"]
    assert f.arguments[1].hint == "Literal['\\n']"
    text = "class A:\n  def f(self, a, b):\n    # type: ({}) -> c\n    pass\n"
    for hints, found in [
        ("x, y", [None, "x", "y"]),
        ("s, x, y", ["s", "x", "y"]),
        ("x", [None, None, None]),
        ("s, x, y, z", [None, None, None]),
    ]:
        (known,) = Defs(text.format(hints))
        assert [argument.hint for argument in known.arguments] == found


@pytest.mark.parametrize(
    ("arguments", "status", "rows"),
    [
        (["a.py"], 0, ["a.py:1:1: def f(a)", "    a      int", "    gives  int 1"]),
        (
            ["b.py", "a.py"],
            1,
            ["b.py:1:7: CL211 invalid syntax. Perhaps you forgot a comma?", "    1 | def f(a b): pass"],
        ),
        (["absent.py", "b.py"], 2, ["b.py:1:7: CL211 invalid syntax. Perhaps you forgot a comma?"]),
        (["--python", "2.7", "old.py"], 0, ["old.py:1:1: def f(a, b, c)", "    a  = 1, int"]),
        (["c.py"], 0, ["c.py:1:1: def f(a)"]),
        (["--false-hints", "c.py"], 1, ["c.py:1:20: CL601 warning: type hint: invalid syntax"]),
    ],
)
def test_the_command(run_cli, write_files, arguments, status, rows):
    write_files(
        {
            "a.py": "def f(a):\n  # type: (int) -> None\n  return 1\n".replace(" -> None", ""),
            "b.py": "def f(a b): pass\n",
            "c.py": "def f(a):  # type: ignore[x]\n  pass",
            "old.py": "def f(a=1, (b, c)=d): print a\n",
        }
    )
    done = run_cli("hints", *arguments)
    assert done.returncode == status
    assert done.stdout.splitlines()[: len(rows)] == rows
    assert ("absent.py" in done.stderr) == (status == 2)


def test_rows_of_json(run_cli, write_files):
    write_files({"a.py": "async def f(a: int = 1, *b):\n  yield\n  yield c\ndef g(h i): pass\n"})
    done = run_cli("hints", "--format", "jsonl", "a.py")
    _, f, g, _ = map(json.loads, done.stdout.splitlines())
    assert f["is_async"] and f["yields"] == [{"row": 3, "type": None, "text": "c"}]
    assert f["arguments"] == [
        {"name": "a", "prefix": "", "hint": "int", "default": {"row": 1, "type": "int", "text": "1"}},
        {"name": "b", "prefix": "*", "hint": None, "default": None},
    ]
    assert (g["type"], g["row"], g["column"], g["code"]) == ("problem", 4, 7, "CL211")
