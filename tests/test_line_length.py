"""Lines that are too long to be analysed: which they are, and that every command says so."""

import pytest

from codeloom import analyze
from codeloom.line_trees import line_trees


@pytest.mark.parametrize(
    ("text", "reason"),
    [
        ("x = [" + "1, " * 400_000 + "]", None),
        ("x = [" + "1, " * 500_000 + "]", "1,000,004 tokens"),
        ("x = '" + "x" * 3_000_000 + "'", None),
        ("a" + ".b" * 3_000, None),
        ("a" + ".b" * 5_000, "chain"),
        ("f(g(a" + ".b" * 5_000 + "))", "chain"),
        ("[" + ", ".join("a" + ".b" * 1_000 for _ in range(21)) + "]", "chain"),
        ("f'{a" + ".b" * 5_000 + "}'", "chain"),
        ("x = " + " or ".join(["a.b.c"] * 5_000), None),
        ("a = " * 10_000 + "[" + "1," * 10_000 + "]", "targets"),
        ("(" * 10_000 + ")" * 10_000, None),
    ],
    ids=range(11),
)
def test_which_lines_are_too_long(text, reason):
    problems = [problem for problem in analyze(text).problems if problem.code == "CL902"]
    assert len(problems) == (reason is not None)
    if problems:
        assert reason in problems[0].message and "split it" in problems[0].message
        assert next(bool(line.problems) for line in line_trees(analyze(text)))


def test_records_of_a_file_stay_in_proportion_to_it():
    row = "x=f'{a" + ".a" * 4_400 + "}'\n"
    analysis = analyze(row * 20)
    assert {problem.code for problem in analysis.problems} == {"CL902"}
    assert 0 < len(analysis.problems) < 20
    assert "file" in analysis.problems[0].message
