"""Another interpreter, for what can only be seen while modules load or under other options."""

import subprocess
import sys

# Where the interpreter keeps its subinterpreters.
_SUBINTERPRETERS = "_interpreters" if sys.version_info >= (3, 13) else "_xxsubinterpreters"


def RunPython(code: str, *options: str) -> str:
    """What `code` prints; it must not fail."""
    done = subprocess.run(
        [sys.executable, "-P", *options, "-c", code], capture_output=True, text=True, timeout=60
    )
    assert done.returncode == 0, done.stderr
    return done.stdout


def RunInSubinterpreter(code: str, before: str = "", configuration: str = "isolated") -> str:
    """What `code` prints in a subinterpreter, after `before` in the main one.

    `configuration` is "isolated", with a lock of its own from 3.12 on, or "legacy".
    """
    made = f"{_SUBINTERPRETERS}.create({configuration!r})"
    if sys.version_info < (3, 13):
        made = f"{_SUBINTERPRETERS}.create(isolated={configuration == 'isolated'})"
    return RunPython(f"{before}\nimport {_SUBINTERPRETERS}\n{_SUBINTERPRETERS}.run_string({made}, {code!r})")
