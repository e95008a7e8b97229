"""The folders are the phases: includes go only down the road of a source file."""

import re
from pathlib import Path

SOURCES = Path(__file__).parent.parent / "src"

# Each folder may include those of its own step and of the steps before it.
STEPS = [
    ["text"],
    ["tokenizer"],
    ["grammar"],
    ["syntax"],
    ["names"],
    ["typing"],
    ["line"],
    ["rules"],
    ["occurrences"],
    ["scopes"],
    ["signatures"],
    ["causes"],
    ["file"],
    ["document"],
    ["arrow"],
    ["host"],
    ["neighbours", "strutils", "_fastaccess", "symbolinfo"],
    ["tree"],
    ["parse"],
    ["walker"],
    ["hints"],
    ["analysis"],
    ["extended"],
    ["face"],
]
STEP_OF = {folder: step for step, folders in enumerate(STEPS) for folder in folders}

# The module's entry is above all of them.
ENTRY = "analysis/treesift.cpp"


def Includes(path):
    return re.findall(r'^#include "([^"]+)"', path.read_text(), re.MULTILINE)


def test_includes_go_down_the_road():
    wrong = []
    for path in sorted(SOURCES.rglob("*.[hc]*")):
        if str(path.relative_to(SOURCES)) == ENTRY:
            continue
        folder = path.relative_to(SOURCES).parts[0]
        for included in Includes(path):
            other = included.split("/")[0]
            if STEP_OF[other] > STEP_OF[folder]:
                wrong.append(f"{path.relative_to(SOURCES)} includes {included}")
    assert not wrong


def test_references_are_counted_in_the_host_layer_only():
    for path in SOURCES.rglob("*.[hc]*"):
        if path.relative_to(SOURCES).parts[0] != "host":
            assert not re.search(r"\bPy_(X?INCREF|X?DECREF|CLEAR)\b|\.(inc|dec)_ref\(", path.read_text()), (
                path
            )
