"""All measurements in one run.

    python benchmarks/bench.py            everything, with the peers that are installed
    python benchmarks/bench.py --short    our own counts over few files; fails where one has grown by 5%
    --write                               keep what comes out in benchmarks/results.json

`make bench` installs the peers first.
"""

import argparse
import importlib.util
import json
import shutil
import sys
from pathlib import Path

import counting
import memory
import timing
from corpus import count_rows, files
from workloads import OURS, PEERS, search_path

KEPT = Path(__file__).with_name("results.json")
ALLOWED_GROWTH = 1.05
COUNTED = [*OURS, "command"]
MODULES = {"ast.parse": "ast", "tree-sitter": "tree_sitter_python"}

Results = dict[str, dict[str, float]]


def main() -> int:
    parser = argparse.ArgumentParser(description=(__doc__ or "").partition("\n")[0])
    parser.add_argument("--short", action="store_true")
    parser.add_argument("--write", action="store_true")
    options = parser.parse_args()
    kept: Results = json.loads(KEPT.read_text()) if KEPT.exists() else {}
    if not counting.can_count():
        print("valgrind isn't installed, so nothing is counted: `apt-get install valgrind`")
        return 0 if options.short else 2
    results = short_results() if options.short else all_results()
    if options.write:
        KEPT.write_text(json.dumps(kept | results, indent=2) + "\n")
    return 0 if options.write or not options.short else compared(results, kept)


def short_results() -> Results:
    """Our own counts over few files."""
    title = "instructions a row, few files"
    return {title: printed(title, {name: counting.instructions_per_row(name, True) for name in COUNTED})}


def all_results() -> Results:
    """Everything that can be measured here."""
    peers = [name for name in PEERS if is_installed(name)]
    has_ruff = shutil.which("ruff", path=search_path()) is not None
    print(f"{len(files())} files, {count_rows(files()):,} rows\n")
    results = short_results()

    def add(title: str, values: dict[str, float]) -> None:
        results[title] = printed(title, values)

    counted = [*COUNTED, *peers, *(["ruff"] if has_ruff else [])]
    add("instructions a row", {name: counting.instructions_per_row(name) for name in counted})
    add("problems: times faster", {name: timing.times_faster("problems", name) for name in peers})
    add("records: times faster", {name: timing.times_faster("records", name) for name in peers})
    if has_ruff:
        add("command: times faster", {"ruff": timing.command_against_ruff()})
    add("cost of a row, by the rows of the text", timing.growth())
    measured = ["problems", "records", *(name for name in peers if name != "parso")]
    add("bytes a row beyond the text", {name: memory.bytes_per_row(name) for name in measured})
    add("one thread", {"times two threads": timing.one_thread_against_two()})
    return results


def is_installed(peer: str) -> bool:
    """True when a peer can be imported."""
    return importlib.util.find_spec(MODULES.get(peer, peer)) is not None


def printed(title: str, values: dict[str, float]) -> dict[str, float]:
    """The values, shown as a table."""
    print(title)
    for name, value in values.items():
        print(f"    {name:<24}{value:>14,.2f}" if value < 100 else f"    {name:<24}{value:>11,.0f}")
    print(flush=True)
    return values


def compared(results: Results, kept: Results) -> int:
    """1 when a count has grown by more than is allowed."""
    grown = [
        f"{name} in {title}: {value:,.0f}, kept {kept[title][name]:,.0f}"
        for title, values in results.items()
        for name, value in values.items()
        if value > kept.get(title, {}).get(name, value) * ALLOWED_GROWTH
    ]
    for row in grown:
        print(f"grown by more than 5%: {row}", file=sys.stderr)
    return 1 if grown else 0


if __name__ == "__main__":
    sys.exit(main())
