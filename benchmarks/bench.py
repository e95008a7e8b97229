"""All measurements in one run.

    python benchmarks/bench.py            everything, with the peers that are installed
    python benchmarks/bench.py --short    our own counts over few files; fails where one has grown by 5%
    --write                               keep what comes out in benchmarks/results.json

`make bench` installs the peers first.
"""

import argparse
import importlib.util
import json
import platform
import re
import shutil
import sys
from collections.abc import Callable, Iterable
from functools import partial
from pathlib import Path
from typing import Any

import counting
import memory
import timing
from corpus import count_rows, files
from workloads import OURS, PEERS, search_path

KEPT = Path(__file__).with_name("results.json")
ALLOWED_GROWTH = 1.05
ALLOWED_DIFFERENCE = 0.02  # of the yardstick
COUNTED = [*OURS, "command"]
MODULES = {"ast.parse": "ast", "tree-sitter": "tree_sitter_python"}
SHORT = "instructions a row, few files"
MADE_WITH = "made with"
SLOW = ("parso", "libcst")  # so that they are counted over few files only
# What the interpreter alone is at work in: where its count differs, so do its libraries, and so do all.
YARDSTICK = "ast.parse"

Results = dict[str, dict[str, float]]


def main() -> int:
    parser = argparse.ArgumentParser(description=(__doc__ or "").partition("\n")[0])
    parser.add_argument("--short", action="store_true")
    parser.add_argument("--write", action="store_true")
    options = parser.parse_args()
    if not counting.can_count():
        print("valgrind isn't installed, so nothing is counted: `apt-get install valgrind`")
        return 0 if options.short else 2
    results = short_results() if options.short else all_results()
    kept: dict[str, Any] = json.loads(KEPT.read_text()) if KEPT.exists() else {}
    if options.write:
        KEPT.write_text(json.dumps(kept | results | {MADE_WITH: makers()}, indent=2) + "\n")
        return 0
    return compared(results[SHORT], kept) if options.short else 0


def short_results(slow_peers: Iterable[str] = ()) -> Results:
    """Our own counts over few files, and the yardstick's."""
    names = [*COUNTED, YARDSTICK, *slow_peers]
    return {SHORT: measured(SHORT, names, partial(counting.instructions_per_row, short=True))}


def all_results() -> Results:
    """Everything that can be measured here."""
    peers = [name for name in PEERS if is_installed(name)]
    has_ruff = shutil.which("ruff", path=search_path()) is not None
    print(f"{len(files())} files, {count_rows(files()):,} rows\n")
    results = short_results(name for name in peers if name in SLOW)

    def add(title: str, names: Iterable[str], measure: Callable[[str], float]) -> None:
        results[title] = measured(title, names, measure)

    counted = [*COUNTED, *(name for name in peers if name not in SLOW), *(["ruff"] if has_ruff else [])]
    add("instructions a row", counted, counting.instructions_per_row)
    add("problems: times faster", peers, partial(timing.times_faster, "problems"))
    add("records: times faster", peers, partial(timing.times_faster, "records"))
    if has_ruff:
        add("command: times faster than ruff, by the files", ["74", "1000"], timing.command_against_ruff)
    add("cost of a row, by the rows of the text", map(str, timing.GROWTH), timing.Growth().of)
    kept_in_memory = ["problems", "records", *(name for name in peers if name != "parso")]
    add("bytes a row beyond the text", kept_in_memory, memory.bytes_per_row)
    add("two jobs: times faster than one", timing.FOR_JOBS, timing.one_job_against_two)
    add("milliseconds of an import", timing.IMPORTED, timing.import_time)
    return results


def is_installed(peer: str) -> bool:
    """True when a peer can be imported."""
    return importlib.util.find_spec(MODULES.get(peer, peer)) is not None


def measured(title: str, names: Iterable[str], measure: Callable[[str], float]) -> dict[str, float]:
    """What is measured for each name, shown as a table while it grows."""
    print(title)
    values = {}
    for name in names:
        value = values[name] = round(measure(name), 2)
        shown = f"{value:>14,.2f}" if value < 100 else f"{value:>11,.0f}"
        print(f"    {name:<24}{shown}", flush=True)
    print(flush=True)
    return values


def makers() -> dict[str, str]:
    """What counts depend on: machine, interpreter, and the compiler that the engine bears the mark of."""
    from codeloom import _analysis

    marks = re.findall(
        rb"(?:GCC: \([^)]*\) [\d.]+|clang version [\d.]+)", Path(_analysis.__file__).read_bytes()
    )
    compilers = {mark.decode() for mark in marks}
    return {
        "machine": platform.machine(),
        "interpreter": platform.python_version(),
        "compiler": ", ".join(sorted(compilers)) or "unknown",
    }


def compared(counts: dict[str, float], kept: dict[str, Any]) -> int:
    """1 when a count has grown by more than is allowed. Counts of other makers tell nothing."""
    if kept.get(MADE_WITH) != makers():
        print(f"not compared: the kept counts were made with {kept.get(MADE_WITH)}, these with {makers()}")
        return 0
    yardstick = kept[SHORT][YARDSTICK]
    if abs(counts[YARDSTICK] - yardstick) > yardstick * ALLOWED_DIFFERENCE:
        print(
            f"not compared: this interpreter was built in another way, see {YARDSTICK}: {yardstick:,.0f} kept"
        )
        return 0
    grown = {name for name, count in counts.items() if count > kept[SHORT].get(name, count) * ALLOWED_GROWTH}
    for name in sorted(grown):
        print(f"grown by more than 5%: {name}, {kept[SHORT][name]:,.0f} kept", file=sys.stderr)
    return 1 if grown else 0


if __name__ == "__main__":
    sys.exit(main())
