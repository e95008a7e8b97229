"""Instructions, counted by valgrind. A count doesn't suffer from what else the machine does."""

import os
import re
import shutil
import subprocess
import sys
from pathlib import Path

from corpus import SHORT, SHORT_WARM_UP, WARM_UP, count_rows, files
from workloads import COMMAND, RUFF, search_path

_COLLECTED = re.compile(r"Collected : (\d+)")
_VALGRIND = ["valgrind", "--tool=callgrind", "--callgrind-out-file=/dev/null"]


def can_count() -> bool:
    """True where valgrind is installed."""
    return shutil.which("valgrind") is not None


def instructions_per_row(name: str, short: bool = False) -> int:
    """What a row costs a workload, start-up left out: many files less a few."""
    paths, warm_up = (files()[:SHORT], SHORT_WARM_UP) if short else (files(), WARM_UP)
    many, few = instructions(_command(name, paths)), instructions(_command(name, paths[:warm_up]))
    return round((many - few) / count_rows(paths[warm_up:]))


def _command(name: str, paths: list[str]) -> list[str]:
    if name == "command":
        return [*COMMAND, *paths]
    if name == "ruff":
        return [shutil.which("ruff", path=search_path()) or "ruff", *RUFF[1:], *paths]
    return [sys.executable, str(Path(__file__).with_name("workloads.py")), name, *paths]


def instructions(command: list[str]) -> int:
    """What a command executes, counted."""
    environment = os.environ | {"PYTHONHASHSEED": "0", "RAYON_NUM_THREADS": "1"}
    done = subprocess.run([*_VALGRIND, *command], capture_output=True, text=True, env=environment)
    found = _COLLECTED.search(done.stderr)
    if found is None:
        raise RuntimeError(f"valgrind counted nothing for {command[:4]}: {done.stderr[-1000:]}")
    return int(found[1])
