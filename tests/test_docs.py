"""The examples of the pages run, and give what the pages say.

A block of Python runs with those before it on its page, in a folder that holds the examples; the block of
text after it is what it prints. Blocks of a console hold commands after `$` with their output. `pytest
--rewrite` writes what comes out into the pages.
"""

import ast
import enum
import inspect
import os
import re
import shutil
import subprocess
import sys
from pathlib import Path

import pytest
from test_layout import STEPS
from tools_of_project import tool_named

import codeloom

ROOT = Path(__file__).parent.parent
PYTHON = re.compile(
    r"^```python\n(?P<code>.*?)^```\n(?:```text\n(?P<output>.*?)^```\n)?", re.MULTILINE | re.DOTALL
)
CONSOLE = re.compile(r"^```console\n(?P<session>.*?)^```\n", re.MULTILINE | re.DOTALL)
END = "<end of a block>"
PAGES = sorted(
    str(path.relative_to(ROOT))
    for path in [ROOT / "README.md", *ROOT.glob("docs/*.md")]
    if re.search("^```(python|console)$", path.read_text(), re.MULTILINE)
)


@pytest.fixture
def place(tmp_path):
    """A folder with the examples, where `codeloom` is a command."""
    shutil.copytree(ROOT / "examples", tmp_path / "examples")
    commands = tmp_path / ".bin"
    commands.mkdir()
    script = commands / "codeloom"
    script.write_text(f'#!/bin/sh\nexec {sys.executable} -P -m codeloom "$@"\n')
    script.chmod(0o755)
    path = f"{commands}{os.pathsep}{os.environ['PATH']}"
    environment = {**os.environ, "PATH": path, "COLUMNS": "100", "PYTHONIOENCODING": "utf-8"}
    return tmp_path, {name: value for name, value in environment.items() if name != "FORCE_COLOR"}


def OutputsOfPython(blocks, place):
    """What each block prints."""
    folder, environment = place
    program = "".join(f"{code}\nprint({END!r})\n" for code in blocks)
    done = subprocess.run(
        [sys.executable, "-P", "-c", program], cwd=folder, env=environment, capture_output=True, text=True
    )
    assert done.returncode == 0, done.stderr
    return done.stdout.split(f"{END}\n")[:-1]


def SessionWithOutputs(session, place):
    """The commands of a session, each with what it prints now."""
    folder, environment = place
    rows = []
    for command in re.findall(r"^\$ (.*(?:\\\n.*)*)", session, re.MULTILINE):
        done = subprocess.run(
            ["bash", "-c", command], cwd=folder, env=environment, capture_output=True, text=True
        )
        rows.append(f"$ {command}\n{done.stdout}{done.stderr}")
    return "\n".join(rows)


@pytest.mark.parametrize("page", PAGES)
def test_examples(page, place, rewrite):
    path = ROOT / page
    text = path.read_text()
    outputs = iter(OutputsOfPython([match["code"] for match in PYTHON.finditer(text)], place))

    def WithOutput(match):
        output = next(outputs)
        block = f"```python\n{match['code']}```\n"
        return block + (f"```text\n{output}```\n" if output else "")

    found = PYTHON.sub(WithOutput, text)
    found = CONSOLE.sub(
        lambda match: f"```console\n{SessionWithOutputs(match['session'], place)}```\n", found
    )
    if rewrite:
        path.write_text(found)
    assert found.split("\n") == text.split("\n") or rewrite


def test_every_name_attribute_and_argument_has_an_example():
    blocks = "".join(match["code"] for match in PYTHON.finditer((ROOT / "docs/api.md").read_text()))
    nodes = list(ast.walk(ast.parse(blocks)))
    assert set(codeloom.__all__) <= {node.id for node in nodes if isinstance(node, ast.Name)}
    objects = [getattr(codeloom, name) for name in codeloom.__all__]
    classes = [each for each in objects if inspect.isclass(each) and not issubclass(each, enum.Enum)]
    attributes = {name for each in classes for name in {*vars(each), *each.__annotations__} if name[0] != "_"}
    assert attributes <= {node.attr for node in nodes if isinstance(node, ast.Attribute)}
    functions = [each for each in objects if inspect.isfunction(each)] + [codeloom.Document]
    arguments = {name for each in functions for name in inspect.getfullargspec(each).kwonlyargs}
    assert arguments <= {node.arg for node in nodes if isinstance(node, ast.keyword)}


def test_every_attribute_is_explained():
    tool = tool_named("make_api_page")
    page = tool.PAGE.read_text("utf-8")
    assert tool.with_tables(page) == page, "run: python tools/make_api_page.py"
    objects = [getattr(codeloom, name) for name in codeloom.__all__]
    classes = {each for each in objects if inspect.isclass(each) and not issubclass(each, enum.Enum)}
    assert set(re.findall("<!-- table of (.*) -->", page)) == {each.__name__ for each in classes}
    assert not re.findall(r"^\| .*\|  \|$", page, re.MULTILINE), "an attribute without a description"


def test_links_lead_somewhere():
    for path in [ROOT / "README.md", *ROOT.glob("docs/*.md")]:
        text = re.sub(r"^```.*?^```$", "", path.read_text(), flags=re.MULTILINE | re.DOTALL)
        for link in re.findall(r"\]\(([^)#:]+)(?:#[^)]*)?\)", text):
            assert (path.parent / link).exists(), (path.name, link)


def test_the_picture_is_what_the_command_prints():
    tool = tool_named("make_picture")
    assert tool.picture() == tool.PICTURE.read_text("utf-8"), "run: python tools/make_picture.py"


def test_every_page_is_in_the_site_and_names_the_newest_version():
    site = (ROOT / "mkdocs.yml").read_text()
    assert [path.name for path in ROOT.glob("docs/*.md") if f" {path.name}\n" not in site] == []
    for page in ("README.md", "docs/index.md", "docs/versions.md"):
        assert f"from {codeloom.VERSIONS[0]} to {codeloom.NEWEST}" in (ROOT / page).read_text(), page


def test_the_table_of_stages_names_what_is_there():
    page = (ROOT / "docs/architecture.md").read_text()
    for path in re.findall(r"`((?:src|codeloom)/[\w/.]+)`", page):
        assert (ROOT / path).exists(), path
    for name in re.findall(r"`(test_\w+)`", page):
        assert (ROOT / f"tests/{name}.py").exists(), name
    for (folder,) in STEPS[: STEPS.index(["host"])]:
        assert f"`src/{folder}`" in page, folder
