"""Another interpreter, for what can only be seen while modules load or under other options."""

import subprocess
import sys


def RunPython(code: str, *options: str) -> str:
    """What `code` prints; it must not fail."""
    done = subprocess.run(
        [sys.executable, "-P", *options, "-c", code], capture_output=True, text=True, timeout=60
    )
    assert done.returncode == 0, done.stderr
    return done.stdout
