"""Which problems are found, where, and in which words: golden files by topic in problems/."""

import difflib
from pathlib import Path

import pytest
from problem_rows import cases_of, write_cases

FILES = sorted((Path(__file__).parent / "problems").glob("*.problems"))


@pytest.mark.parametrize("path", FILES, ids=lambda path: path.stem)
def test_problems(path, rewrite):
    cases = cases_of(path)
    if rewrite:
        return write_cases(path, cases)
    differences = []
    for case in cases:
        rows = difflib.unified_diff(case.rows, case.found(), case.title, "what is found", lineterm="", n=2)
        differences += rows
    if differences:
        pytest.fail("\n".join([*differences, "To accept all of it: pytest --rewrite"]), pytrace=False)
