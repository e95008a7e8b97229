"""What others run codeloom by: the hook for pre-commit, and the action for GitHub."""

import json
import os
import shutil
import subprocess
import sys
from pathlib import Path

import pytest
import yaml

import codeloom

ROOT = Path(__file__).parent.parent


def run(*command, cwd, **environment):
    done = subprocess.run(
        list(map(str, command)),
        cwd=cwd,
        env={**os.environ, **environment},
        capture_output=True,
        text=True,
        timeout=110,
    )
    return done.returncode, done.stdout + done.stderr


def commit_all(folder):
    for arguments in (
        ["init", "--quiet"],
        ["add", "--all"],
        ["-c", "user.name=a", "-c", "user.email=a@b", "commit", "--quiet", "-m", "x"],
    ):
        assert run("git", *arguments, cwd=folder)[0] == 0
    return run("git", "rev-parse", "HEAD", cwd=folder)[1].strip()


@pytest.fixture
def hook_repository(write_files, tmp_path):
    """A repository with our hook, which pip can install without a compiler and without the network."""
    import pathspec

    packages = [str(Path(module.__file__).parent) for module in (codeloom, pathspec)]
    write_files(
        {
            "hooks/.pre-commit-hooks.yaml": (ROOT / ".pre-commit-hooks.yaml").read_text(),
            "hooks/hook_backend.py": (ROOT / "tests/hook_backend.py").read_text(),
            "hooks/packages.json": json.dumps(packages),
            "hooks/pyproject.toml": (
                '[build-system]\nrequires = []\nbuild-backend = "hook_backend"\nbackend-path = ["."]\n'
                '[project]\nname = "codeloom"\nversion = "0.0.0"\n'
            ),
        }
    )
    return tmp_path / "hooks", commit_all(tmp_path / "hooks")


@pytest.mark.skipif(shutil.which("git") is None, reason="needs git")
def test_the_hook_of_pre_commit(hook_repository, write_files, tmp_path):
    repository, revision = hook_repository
    hooks = [{"repo": str(repository), "rev": revision, "hooks": [{"id": "codeloom"}]}]
    user = write_files(
        {
            "user/.pre-commit-config.yaml": json.dumps({"repos": hooks}),
            "user/pyproject.toml": '[tool.codeloom]\nextend-exclude = ["data/"]\n',
            "user/a.py": "x = )\n",
            "user/b.pyi": "def f(: ...\n",
            "user/c.ipynb": json.dumps({"cells": [{"cell_type": "code", "source": "y = ("}]}),
            "user/data/d.py": "x = )\n",
            "user/e.txt": "x = )\n",
            "user/.gitignore": "*.log\n",
        }
    ).joinpath("user")
    commit_all(user)
    pre_commit = [sys.executable, "-m", "pre_commit"]
    environment = {
        "PRE_COMMIT_HOME": str(tmp_path / "cache"),
        "PIP_NO_INDEX": "1",
        "VIRTUALENV_NO_PERIODIC_UPDATE": "1",
        "PYTHONPATH": "",
    }
    assert run(*pre_commit, "validate-manifest", ROOT / ".pre-commit-hooks.yaml", cwd=user) == (0, "")
    status, said = run(*pre_commit, "run", "--all-files", cwd=user, **environment)
    assert status == 1, said
    for place in (
        "a.py:1:5: CL203",
        "b.pyi:1:6: CL202",
        "c.ipynb:cell 1:1:5: CL202",
        "3 problems in 3 of 3 files",
    ):
        assert place in said
    write_files({"user/a.py": "x = 1\n", "user/b.pyi": "def f(): ...\n"})
    assert run(*pre_commit, "run", "--files", "a.py", "b.pyi", "data/d.py", cwd=user, **environment)[0] == 0


# The action


def steps_of_the_action():
    return yaml.safe_load((ROOT / "action.yml").read_text())["runs"]["steps"]


def test_the_action_is_valid():
    checked = [sys.executable, "-m", "check_jsonschema", "--builtin-schema", "vendor.github-actions"]
    status, said = run(*checked, ROOT / "action.yml", cwd=ROOT)
    assert status == 0, said


@pytest.mark.skipif(shutil.which("bash") is None, reason="needs bash")
@pytest.mark.parametrize(
    ("arguments", "status", "shown"),
    [
        ("check --format github .", 1, "::error file=a.py,title=CL203,line=1,"),
        ("check --format concise 'a b.py'", 0, ""),
        ("check --exit-zero .; touch made $(touch made)", 2, "made"),
    ],
)
def test_the_action_runs_what_it_is_given_and_nothing_else(write_files, tmp_path, arguments, status, shown):
    *_, step = steps_of_the_action()
    folder = write_files({"a.py": "x = )\n", "a b.py": "x = 1\n"})
    command = write_files({"bin/codeloom": f'#!/bin/sh\nexec {sys.executable} -P -m codeloom "$@"\n'})
    (command / "bin/codeloom").chmod(0o755)
    path = f"{tmp_path / 'bin'}{os.pathsep}{os.environ['PATH']}"
    # As GitHub runs a step with `shell: bash`.
    shell = ["bash", "--noprofile", "--norc", "-eo", "pipefail", "-c", step["run"]]
    found, said = run(*shell, cwd=folder, PATH=path, ARGUMENTS=arguments)
    assert found == status and shown in said
    assert not (folder / "made").exists()
