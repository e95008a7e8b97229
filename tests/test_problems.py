"""Whole texts and files: which problems are found, and where in the file."""

import threading

import pytest

from codeloom import Range, analyze, analyze_file


def Found(text, python="3.12"):
    """Each problem as "row:column", with its message where that is about a hint or what isn't text."""
    return [
        f"{problem.range.row}:{problem.range.column}"
        + (f" {problem.message}" if problem.code in ("CL101", "CL601") else "")
        for problem in analyze(text, python=python).problems
    ]


@pytest.mark.parametrize(
    "text",
    [
        "",
        "\n\n",
        "# only a comment",
        "\\\n\n",
        "x = 1",
        "x = [\n\n1,  # one\n\n]\r\ny = '''\r\n'''\rz = 3\n",
        "if x: pass\nelif y: pass\nelse: pass\n",
        "async def f():\n    await g(); return [x async for x in y]\n",
        'print(f"{a!r:>{width}} {b=} {{}}")\n',
        "def f(x: 'List[int]') -> 'Dict[str, int]': ...  # type: ignore\n",
        "x = '\ufffd'\x0c\n\x0cy = '\u2028'\n",
    ],
)
def test_sound_texts(text):
    assert Found(text) == []


@pytest.mark.parametrize(
    ("text", "found"),
    [
        # In the first row and below it, counted in characters.
        ("x = (1))", ["1:8"]),
        ("if a:\n\n  é = '日本' '\U0001d4b3' )\n", ["3:16"]),
        ("if a:\n\tx = 1 1\n", ["2:8"]),
        ("f(a,\n  b,\n\tc d,\n)\n", ["3:2"]),
        ("x = '''\né''' 1\n", ["2:6"]),
        # Where something is missing at the end: the last token, or the parenthesis that is open.
        ("x =", ["1:3"]),
        ("x = a +  # why\n", ["1:7"]),
        ("x = (\n", ["1:5"]),
        ("x = ('''a\r\nbé'''\r\n", ["1:5"]),
        # One problem for each line, and several lines in one row.
        ("x = )\ny = 1\nz = ]\n", ["1:5", "3:5"]),
        ("x = ); y = 1; é = ]", ["1:5", "1:19"]),
        # Every kind of row end, and what is none.
        ("x = 1\ry = )\r\n\rz = )\n", ["2:5", "4:5"]),
        ("x = '\u2028\x0b\x85'; y = )", ["1:16"]),
        # Incomplete text is the fault of its own line only.
        ("x = f(1,\ndef g():\n    return 2\n", ["1:6"]),
        ("x = 'a\ny = 1\n", ["1:5"]),
    ],
)
def test_places(text, found):
    assert Found(text) == found


SIDE_BY_SIDE = "type hint: expected an operator or the end of the hint before"


@pytest.mark.parametrize(
    ("text", "found"),
    [
        ("x = f'{a b}'", ["1:8"]),
        ("é = '日本', f'é{a} {{}} {b c}'", ["1:24"]),
        ("if a:\n\tf(f'''\n{a}\n\té {b c}\n''')", ["4:5"]),
        ("f(\n  a, f'''{\n\né b}''')", ["4:1"]),
        # Of equal expressions the first is at fault.
        ("x = f'{a b} {a b}'", ["1:8"]),
        ("x = f'{a b}', '{a b}', f'{a b}'", ["1:8"]),
        # The field of a format, and a field after a sound one of the same text.
        ("x = f'{a:{b c}}'", ["1:11"]),
        ("x = f'{é}' f'{é}' f'{é(}'", ["1:24"]),
        ("x: 'List[int' = 1", ["1:9 type hint: '[' was never closed"]),
        ("def f(é: 'é é', b: 'c d'): pass", ["1:13 type hint: 'é' is written twice"]),
        ("def f(\n    a: '日 b',\n): pass", [f"2:11 {SIDE_BY_SIDE} 'b'"]),
        ("x: '''A[\n  é b]''' = 1", ["2:3 type hint: invalid syntax. Perhaps you forgot a comma?"]),
    ],
)
def test_places_within_strings(text, found):
    assert Found(text) == found


def test_place_of_a_walkers_complaint():
    (problem,) = analyze("x = (1,\n f'{f(a for a in b, 1)}')").problems
    assert problem.message == "Generator expression must be parenthesized"
    assert problem.range.row == 2 and problem.range.column in (6, 7)


def test_places_of_commented_hints():
    assert Found("def f(a):\n    é = 1  # type: List[\n") == ["2:24 type hint: '[' was never closed"]


@pytest.mark.parametrize(
    ("text", "found"),
    [
        ("x = 1; é = '\udcff')\ny = )\n", ["1:13 the lone", "2:5"]),
        ("'''\n\0\n''' )\ny = )", ["2:1 a NUL", "4:5"]),
        ("é = \0\n", ["1:5 a NUL"]),
        # A replacement character that the file itself holds spoils nothing.
        ("x = '\ufffd')\n'\0'", ["1:8", "2:2 a NUL"]),
        ("x = '\ufffd\u2028')\n'\0'", ["1:9", "2:2 a NUL"]),
    ],
)
def test_a_line_with_unreadable_characters_has_that_problem_alone(text, found):
    assert [words[: len(want)] for words, want in zip(Found(text), found, strict=True)] == found


def test_a_problem_tells_all_of_its_place(write_files):
    folder = write_files({"a.py": "# coding: latin-1\r\nif a:\r\n\té = )\r\n".encode("latin-1")})
    path = folder / "a.py"
    (problem,) = analyze_file(path).problems
    assert (problem.path, problem.range) == (str(path), Range(3, 6, 3, 7))
    assert (problem.code, problem.message, problem.source_row) == ("CL203", "unmatched ')'", "\té = )")
    assert str(problem) == f"{path}:3:6: CL203 unmatched ')'"
    with pytest.raises(FileNotFoundError):
        analyze_file(folder / "absent.py")


def test_a_walk_that_hits_a_limit_prints_nothing(capfd):
    analysis = analyze("a" + ".a" * 2_000 + "\nx = " + "-" * 2_000 + "1")
    assert not analysis.problems and analysis.records
    assert capfd.readouterr() == ("", "")


def test_threads():
    text = "x = f'{a b}'\ny = [i for i in range(9)]\nz = )\n" * 200
    results = []
    threads = [
        threading.Thread(target=lambda name=name: results.append(Found(text, name)))
        for name in ("3.11", "3.11", "3.12", "3.12")
    ]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert results == [Found(text)] * 4


@pytest.mark.parametrize("seed", range(3))
def test_a_broken_line_spoils_no_other(seed):
    sound = ["def f(a): return {'x': a}", "x: int = 1", "class C: x = 1", "if a: pass", "with a: pass"]
    broken = ["x = 1 1", "y = 'a", "import", "f(a b)", "z = ]", "x = f'{a b}'"]
    rows = [sound[(i * 7 + seed) % 5] if i % 3 else broken[(i + seed) % 6] for i in range(60)]
    faulty_rows = {problem.range.row for problem in analyze("\n".join(rows)).problems}
    assert faulty_rows == {i + 1 for i, row in enumerate(rows) if row in broken}
