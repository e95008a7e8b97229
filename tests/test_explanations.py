"""Each code has its explanation, and the examples do what they say."""

import json
import re
from pathlib import Path

import pytest
from tools_of_project import tool_named

from codeloom import analyze
from codeloom.explanations import explanations

ROOT = Path(__file__).parent.parent
EXPLAINED = explanations()


def source_of(example):
    return eval(example.text) if example.is_made else example.text


def test_every_code_is_explained_in_order():
    declared = re.findall(r"^ +k\w+ = (\d+),", (ROOT / "src/rules/codes.h").read_text(), re.MULTILINE)
    assert [f"CL{code}" for code in sorted(declared)] == list(EXPLAINED), "mend codeloom/explanations.txt"


@pytest.mark.parametrize("code", EXPLAINED)
def test_examples(code):
    explanation = EXPLAINED[code]

    def codes(example):
        return [found.code for found in analyze(source_of(example), python=explanation.python).problems]

    assert (codes(explanation.wrong), codes(explanation.right)) == ([code], [])


def test_the_page():
    tool = tool_named("make_codes_page")
    assert tool.PAGE.read_text("utf-8") == tool.page(), "run: python tools/make_codes_page.py"


def test_the_command(run_cli):
    done = run_cli("explain", "cl212")
    assert done.returncode == 0
    assert done.stdout.startswith("CL212 a missing colon\n\nThe header of a statement")
    assert "wrong:\n\n    if a\n        pass\n\nright:\n\n    if a:\n" in done.stdout
    assert len(run_cli("explain").stdout.splitlines()) == len(EXPLAINED)
    assert run_cli("explain", "--format", "concise").stdout.startswith("CL101 a character or an encoding")
    done = run_cli("explain", "CL999")
    assert (done.returncode, done.stdout) == (2, "") and "there is no code 'CL999'" in done.stderr


def test_the_command_for_programs(run_cli):
    items = json.loads(run_cli("explain", "cl101", "CL301", "--format", "json").stdout)["items"]
    assert [(item["code"], item["wrong"]["is_made"]) for item in items] == [("CL101", True), ("CL301", False)]
    assert items[1]["right"]["text"] == EXPLAINED["CL301"].right.text
    assert len(run_cli("explain", "--format", "jsonl").stdout.splitlines()) == len(EXPLAINED) + 2
