"""What a terminal shows with the library rich and without it."""

import os
import re
import subprocess
import sys
import threading
from typing import NamedTuple

import pytest
from run_python import RunPython

pty = pytest.importorskip("pty")
pytest.importorskip("rich")

BOTH = pytest.mark.parametrize("has_rich", [True, False], ids=["with rich", "without rich"])


class Shown(NamedTuple):
    terminal: str
    other: str  # what the other of the two streams got


@pytest.fixture
def on_terminal(tmp_path, cli_environment):
    """Runs the command line with one of its streams on a terminal of 80 columns."""

    def run(stream, has_rich, *arguments):
        code = "import sys, codeloom.cli, codeloom.cli.progress as p; p._PATIENCE = p._INTERVAL = 0\n"
        code += "" if has_rich else "sys.modules['rich'] = None\n"
        code += f"sys.exit(codeloom.cli.main({list(arguments)!r}))"
        ours, theirs = pty.openpty()
        other = "stderr" if stream == "stdout" else "stdout"
        process = subprocess.Popen(
            [sys.executable, "-P", "-c", code],
            cwd=tmp_path,
            env={**cli_environment, "COLUMNS": "80"},
            **{stream: theirs, other: subprocess.PIPE},
        )
        os.close(theirs)
        shown = bytearray()
        reader = threading.Thread(target=read_all, args=(ours, shown))
        reader.start()
        written = getattr(process, other).read().decode()
        process.wait(60)
        reader.join(60)
        os.close(ours)
        getattr(process, other).close()
        return Shown(shown.decode(), written)

    return run


def read_all(terminal, into):
    try:
        while data := os.read(terminal, 1 << 16):
            into += data
    except OSError:  # its other end is closed
        pass


@BOTH
def test_progress(write_files, on_terminal, has_rich):
    """It is taken away when something else is shown, and the results aren't touched by it."""
    write_files({f"{i}.py": "x = )\n" if i == 50 else "x = 1\n" for i in range(100)})
    shown, output = on_terminal("stderr", has_rich, "check", "--statistics", ".")
    assert output.splitlines()[-2:] == [
        "      1  CL203  unmatched ')'",
        "1 problem in 1 of 100 files, 100 logical lines",
    ]
    assert "\033" not in output
    if has_rich:
        assert "━" in shown and re.search(r"99/100\S* files, 1 problems", shown)
        assert 1 <= shown.count("\033[?25l") == shown.count("\033[?25h")  # the cursor is back
    else:
        assert "99 of 100 files, 1 problems ..." in shown and shown.endswith("\r\033[K")


@BOTH
def test_tables(write_files, on_terminal, has_rich):
    write_files({"a.py": "x = )\nprint 1\nprint 2\nx = [b]]\n"})
    shown, _ = on_terminal("stdout", has_rich, "check", "--statistics", "--color", "never", "a.py")
    assert "\033" not in shown
    rows = [row for row in shown.splitlines() if row.strip()]
    if has_rich:
        titles = next(i for i, row in enumerate(rows) if row.split()[0] == "Count")
        assert rows[titles].split() == ["Count", "Code", "First", "message"] and "───" in rows[titles + 1]
        assert [row.split()[:2] for row in rows[titles + 2 : titles + 4]] == [["2", "CL203"], ["2", "CL241"]]
        assert rows[-2].strip() == "print(...)?"  # the rest of a message too long for its row
    else:
        assert rows[-3] == "      2  CL203  unmatched ')'"
    listed, _ = on_terminal("stdout", has_rich, "explain")
    assert re.search(r"CL203\W.*closing", listed) and ("Title" in listed) == has_rich


def test_rich_is_loaded_for_terminals_alone(write_files):
    folder = write_files({"a.py": "x = )\n"})
    run = f"import sys, codeloom.cli; codeloom.cli.main(['check', '--statistics', {str(folder)!r}])"
    assert RunPython(f"{run}; print('rich' in sys.modules)").endswith("False\n")
