"""A real editor with the language server."""

import json
import os
import shutil
import subprocess
from pathlib import Path

import pytest
from language_client import COMMAND

SCRIPT = Path(__file__).parent / "editor.lua"


@pytest.mark.skipif(shutil.which("nvim") is None, reason="there is no nvim")
def test_neovim(tmp_path):
    """It opens a file, breaks it, sees the diagnostics, mends it, and renames a name."""
    edited, report = tmp_path / "areas.py", tmp_path / "report.json"
    edited.write_text("def area(r):\n    # 😀 area\n    return r\nprint('😀', area(1))\n")
    environment = {
        **os.environ,
        "EDITED_FILE": str(edited),
        "EDITOR_REPORT": str(report),
        "SERVER_COMMAND": json.dumps(COMMAND),
        "HOME": str(tmp_path),
        "XDG_STATE_HOME": str(tmp_path),
    }
    done = subprocess.run(
        ["nvim", "--headless", "--clean", "-c", f"luafile {SCRIPT}"],
        env=environment,
        capture_output=True,
        text=True,
        timeout=90,
    )
    seen = json.loads(report.read_text()) if report.exists() else done.stderr
    assert "failure" not in seen, (seen, done.stderr)
    assert seen["broken"] == [[3, 9, "CL202", "'(' was never closed"]]
    assert seen["rows"] == [
        "def circle(r):",
        "    # 😀 area",
        "    return r",
        "broken = (1)",
        "print('😀', circle(1))",
    ]
    assert edited.read_text().splitlines() == seen["rows"]
