"""Real editors with the language server, by the settings that the page about editors gives."""

import json
import os
import re
import shlex
import shutil
import subprocess
from pathlib import Path

import pytest
from language_client import COMMAND

FOLDER = Path(__file__).parent
PAGE = FOLDER.parent / "docs" / "editors.md"
AREAS = "def area(r):\n    # 😀 area\n    return r\nprint('😀', area(1))\n"


def Settings(language, number):
    """A block of the page."""
    return re.findall(rf"```{language}\n(.*?)```", PAGE.read_text("utf-8"), re.DOTALL)[number]


def Session(folder, command, settings):
    """What an editor reports of a session, and the rows of the file after it."""
    (folder / "bin").mkdir()
    server = folder / "bin" / "codeloom"
    server.write_text(f'#!/bin/sh\n[ "$1" = serve ] && exec {shlex.join(COMMAND)}\n')
    server.chmod(0o755)
    (folder / "settings").write_text(settings)
    edited, report = folder / "areas.py", folder / "report.json"
    edited.write_text(AREAS)
    environment = {
        **os.environ,
        "PATH": f"{server.parent}:{os.environ['PATH']}",
        "EDITED_FILE": str(edited),
        "EDITOR_REPORT": str(report),
        "EDITOR_SETTINGS": str(folder / "settings"),
        "HOME": str(folder),
        "XDG_STATE_HOME": str(folder),
    }
    done = subprocess.run(command, env=environment, cwd=folder, capture_output=True, text=True, timeout=90)
    seen = json.loads(report.read_text()) if report.exists() else {"failure": ""}
    assert "failure" not in seen, (seen, done.stderr)
    assert edited.read_text().splitlines() == [
        "def circle(r):",
        "    # 😀 area",
        "    return r",
        "broken = (1)",
        "print('😀', circle(1))",
    ]
    return seen


@pytest.mark.skipif(shutil.which("nvim") is None, reason="there is no nvim")
def test_neovim(tmp_path):
    """It opens a file, breaks it, sees the diagnostics, mends it, and renames a name."""
    shown = subprocess.run(["nvim", "--version"], capture_output=True, text=True).stdout
    version = re.search(r"v(\d+)\.(\d+)", shown)
    is_new = (int(version[1]), int(version[2])) >= (0, 11)
    command = ["nvim", "--headless", "--clean", "-c", f"luafile {FOLDER / 'editor.lua'}"]
    seen = Session(tmp_path, command, Settings("lua", 0 if is_new else 1))
    assert seen["broken"] == [[3, 9, "CL202", "'(' was never closed"]]


def HasEglot():
    """Whether there is an Emacs with the client."""
    if shutil.which("emacs") is None:
        return False
    asked = ["emacs", "--batch", "--eval", "(progn (package-initialize) (require 'eglot))"]
    return subprocess.run(asked, capture_output=True).returncode == 0


@pytest.mark.skipif(not HasEglot(), reason="there is no Emacs with eglot")
def test_emacs(tmp_path):
    """The same."""
    command = ["emacs", "--batch", "--load", str(FOLDER / "editor.el")]
    seen = Session(tmp_path, command, Settings("elisp", 0))
    ((row, text),) = seen["broken"]
    assert row == 4 and "CL202" in text and "'(' was never closed" in text


def test_extension_of_vs_code():
    """The manifest has what an extension needs, and its settings are those that the code reads."""
    folder = FOLDER.parent / "editors" / "vscode"
    manifest = json.loads((folder / "package.json").read_text())
    assert {"name", "version", "publisher", "engines", "main", "activationEvents"} <= manifest.keys()
    assert (folder / manifest["main"]).exists()
    source = (folder / manifest["main"]).read_text()
    read = set(re.findall(r'settings\.get\("(\w+)"\)', source))
    settings = manifest["contributes"]["configuration"]["properties"]
    assert {f"codeloom.{name}" for name in read} == settings.keys()
    for module in set(re.findall(r'require\("([\w-]+)', source)) - {"vscode"}:
        assert module in manifest["dependencies"]
    assert settings["codeloom.command"]["default"] == ["codeloom", "serve"]
