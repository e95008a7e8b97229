"""What a keystroke costs in an editor: the same typing, pasting and undoing for several language servers.

    python benchmarks/keystrokes.py                 milliseconds until the diagnostics of a new text are there
    python benchmarks/keystrokes.py --processor     the same in processor time alone
    python benchmarks/keystrokes.py --rows 1000     in files of so many rows alone
    python benchmarks/keystrokes.py --beside        keystrokes while another request is worked on
    python benchmarks/keystrokes.py --flicker 200   problems elsewhere while so many functions are typed

`pip install --group benchmark` installs the peers; one that isn't there is left out. Times of a shared
machine mean little by themselves: what counts is how they compare in one run.
"""

import argparse
import ast
import shutil
import statistics
import sys
import sysconfig
import tempfile
import time
from collections.abc import Callable, Iterator
from pathlib import Path
from typing import NamedTuple

from corpus import text_of
from wire import SilentError, Wire

ROWS = (1_000, 10_000, 100_000)

TYPED = "def added(first, second=(1, 2)):\n    total = [first, *second]\n    return f'{total!r}'\n\n\n"
PASTED = "".join(
    f"def pasted_{i}(a, b):\n    if a:\n        return [b]\n    return a\n\n\n" for i in range(5)
)
PASTES = 10

# A server that takes longer than this for all of a replay is asked for no more.
MOST_SECONDS = 20.0

Place = tuple[int, int]


class Edit(NamedTuple):
    """What is replaced, rows and columns from zero, and by what."""

    start: Place
    end: Place
    text: str


class Peer(NamedTuple):
    """A server, and whether its diagnostics are asked for."""

    name: str
    command: list[str]
    asks: bool


def peers() -> Iterator[Peer]:
    """The servers that are installed."""
    ours = [sys.executable, "-P", "-m", "codeloom", "serve"]
    yield Peer("codeloom", ours, False)
    yield Peer("codeloom, asked", ours, True)  # no problem waits: this client can't be made to ask again
    for name, program, arguments, asks in (
        ("ruff", "ruff", ["server"], True),
        ("basedpyright", "basedpyright-langserver", ["--stdio"], True),
        ("jedi-language-server", "jedi-language-server", [], False),
    ):
        folder = Path(sys.executable).parent
        path = shutil.which(program, path=str(folder)) or shutil.which(program)
        if path is not None:
            yield Peer(name, [path, *arguments], asks)


def replay(text: str) -> Iterator[Edit]:
    """A function typed in the middle of a text, blocks pasted and undone, the function taken back."""
    rows = text.split("\n")
    middle = len(rows) // 2
    row = next(i for i in range(middle, len(rows)) if rows[i].startswith(("def ", "class ")))
    typed = list(_typed(TYPED, (row, 0)))
    yield from typed
    pasted_rows = PASTED.count("\n")
    for _ in range(PASTES):
        yield Edit((row, 0), (row, 0), PASTED)
        yield Edit((row, 0), (row + pasted_rows, 0), "")
    for edit in reversed(typed):
        yield _undone(edit)


def _typed(text: str, place: Place) -> Iterator[Edit]:
    row, column = place
    for character in text:
        yield Edit((row, column), (row, column), character)
        row, column = (row + 1, 0) if character == "\n" else (row, column + 1)


def _undone(edit: Edit) -> Edit:
    row, column = edit.start
    after = (row + 1, 0) if edit.text == "\n" else (row, column + 1)
    return Edit(edit.start, after, "")


# How long it takes


def seconds_on_wire(peer: Peer, text: str, folder: Path, *, of_processor: bool) -> list[float]:
    """Until the diagnostics are there, for each edit."""
    wire = Wire(peer.command, folder, asks=peer.asks, seconds=MOST_SECONDS)
    try:
        wire.open(text)
        clock = wire.processor_seconds if of_processor else time.perf_counter
        return _seconds(text, lambda edit: wire.edit(*edit), clock)
    except (SilentError, EOFError, RuntimeError) as error:
        print(f"{peer.name}: {str(error) or 'no answer in time'}", file=sys.stderr)
        return []
    finally:
        wire.close()


def seconds_of_document(text: str, clock: Callable[[], float]) -> list[float]:
    """The same in one process: an edit of a `Document`, and its problems."""
    from codeloom import Document

    document = Document(text)
    _ = len(document.analysis.problems)

    def edit(one: Edit) -> None:
        start, end = ((place[0] + 1, place[1] + 1) for place in (one.start, one.end))
        document.edit(start, end, one.text)
        _ = len(document.analysis.problems)

    return _seconds(text, edit, clock)


def seconds_of_tree_sitter(text: str, clock: Callable[[], float]) -> list[float]:
    """An incremental parse, and whether there is an error."""
    try:
        import tree_sitter
        import tree_sitter_python
    except ModuleNotFoundError:
        return []
    parser = tree_sitter.Parser(tree_sitter.Language(tree_sitter_python.language()))
    source = text.encode()
    starts = [0]
    for row in source.split(b"\n"):
        starts.append(starts[-1] + len(row) + 1)
    tree = parser.parse(source)

    def edit(one: Edit) -> None:
        nonlocal source, tree, starts
        start, end = (starts[place[0]] + place[1] for place in (one.start, one.end))
        new = one.text.encode()
        source = source[:start] + new + source[end:]
        new_rows = new.count(b"\n")
        last = new.rpartition(b"\n")[2]
        end_point = one.start[0] + new_rows, len(last) + (0 if new_rows else one.start[1])
        tree.edit(start, end, start + len(new), one.start, one.end, end_point)
        tree = parser.parse(source, tree)
        _ = tree.root_node.has_error
        if new_rows or one.start[0] != one.end[0]:
            starts = [0]
            for row in source.split(b"\n"):
                starts.append(starts[-1] + len(row) + 1)

    return _seconds(text, edit, clock)


def _seconds(text: str, apply: Callable[[Edit], object], clock: Callable[[], float]) -> list[float]:
    found = []
    end = time.monotonic() + MOST_SECONDS
    for edit in replay(text):
        start = clock()
        apply(edit)
        found.append(clock() - start)
        if time.monotonic() > end:
            break
    return found


def show_times(servers: list[Peer], sizes: list[int], *, of_processor: bool) -> None:
    """A table: for each size the median and the 99th hundredth, in milliseconds."""
    heads = " | ".join(f"{size:,} rows" for size in sizes)
    print(f"| milliseconds a keystroke, median / 99th hundredth | {heads} |")
    print(f"| --- |{' --- |' * len(sizes)}")
    columns: dict[str, list[str]] = {}
    clock = time.process_time if of_processor else time.perf_counter
    for size in sizes:
        text = text_of(size).decode()
        with tempfile.TemporaryDirectory() as folder:
            for peer in servers:
                times = seconds_on_wire(peer, text, Path(folder), of_processor=of_processor)
                columns.setdefault(f"{peer.name}, over the wire", []).append(_cell(times))
        for name, measure in (("codeloom", seconds_of_document), ("tree-sitter", seconds_of_tree_sitter)):
            columns.setdefault(f"{name}, in the process", []).append(_cell(measure(text, clock)))
    for name, cells in columns.items():
        print(f"| {name} | {' | '.join(cells)} |")


def _cell(times: list[float]) -> str:
    if not times:
        return "-"
    ordered = sorted(times)
    last = ordered[min(len(ordered) * 99 // 100, len(ordered) - 1)]
    return f"{statistics.median(times) * 1000:,.2f} / {last * 1000:,.2f}"


# What else is asked for

# What editors ask for after each change.
BESIDE: dict[str, dict[str, object]] = {
    "documentSymbol": {},
    "foldingRange": {},
    "semanticTokens/full": {},
    "semanticTokens/full/delta": {},
    "semanticTokens/range": {},
    "documentHighlight": {},
    "completion": {},
}
# When the key is hit, as parts of the time that the request takes.
MOMENTS = [i / 20 for i in range(21)]


def show_beside(servers: list[Peer], sizes: list[int]) -> None:
    """For each request what it takes alone, and the slowest keystroke while it is worked on."""
    heads = " | ".join(f"{size:,} rows" for size in sizes)
    print(f"| milliseconds alone, and the slowest keystroke meanwhile | {heads} |")
    print(f"| --- |{' --- |' * len(sizes)}")
    for peer in servers:
        cells: dict[str, list[str]] = {}
        for size in sizes:
            with tempfile.TemporaryDirectory() as folder:
                wire = Wire(peer.command, Path(folder), asks=peer.asks, seconds=3 * MOST_SECONDS)
                wire.open(text_of(size).decode())
                for method in BESIDE:
                    cells.setdefault(method, []).append(_beside(wire, method, size // 2))
                wire.close()
        for method, found in cells.items():
            print(f"| {peer.name}, {method} | {' | '.join(found)} |", flush=True)


def _beside(wire: Wire, method: str, row: int) -> str:
    place = {"line": row, "character": 0}
    more = {"position": place, "range": {"start": place, "end": {"line": row + 60, "character": 0}}}
    params = {**wire.document, **more}
    alone = slowest = 0.0
    try:
        if method.endswith("delta"):
            params["previousResultId"] = wire.request("textDocument/semanticTokens/full", params)["resultId"]
        for moment in (None, *MOMENTS):
            wire.edit((row, 0), (row, 0), "x")
            start = time.perf_counter()
            number = wire.begin(f"textDocument/{method}", params)
            if moment is not None:
                time.sleep(alone * moment)
                start = time.perf_counter()
                wire.edit((row, 0), (row, 1), "")
                slowest = max(slowest, time.perf_counter() - start)
            if "error" in wire.answer(number) and moment is None:
                return "-"
            if moment is None:
                alone = time.perf_counter() - start
                wire.edit((row, 0), (row, 1), "")
    except (SilentError, EOFError, RuntimeError):
        return "-"
    return f"{alone * 1000:,.1f}, {slowest * 1000:,.1f}"


# What flickers

BEFORE = 'import os\n\nclass A:\n    """Doc."""\n\n    def f(self, x):\n        return [x, "y"]\n\n\n'
AFTER = (
    '\n\ndef last(a, b=(1, 2)):\n    """Doc "quoted"."""\n    if a:\n        return {\n'
    '            "a": a,\n        }\n    return b\n\n\nprint(last(1))\n'
)


def functions(count: int) -> list[str]:
    """Functions of three to ten rows from the interpreter's own library."""
    found: list[str] = []
    for path in sorted(Path(sysconfig.get_path("stdlib")).glob("*.py")):
        text = path.read_text("utf-8", "replace")
        rows = text.splitlines()
        defs = [node for node in ast.parse(text).body if isinstance(node, ast.FunctionDef)]
        short = [node for node in defs if 3 <= (node.end_lineno or 0) - node.lineno + 1 <= 10]
        for node in [node for node in short if not node.decorator_list][:2]:
            found.append("\n".join(rows[node.lineno - 1 : node.end_lineno]) + "\n")
    return found[:count]


def show_flicker(servers: list[Peer], count: int) -> None:
    """For each server: keystrokes, those with an error on another row than the one typed, and such errors."""
    print("| while functions are typed | keystrokes | with errors elsewhere | errors elsewhere |")
    print("| --- | --- | --- | --- |")
    for peer in servers:
        keystrokes = flickering = problems = 0
        with tempfile.TemporaryDirectory() as folder:
            wire = Wire(peer.command, Path(folder), asks=peer.asks, seconds=MOST_SECONDS)
            wire.open(BEFORE + AFTER)
            end = time.monotonic() + 10 * MOST_SECONDS
            for function in functions(count):
                place = BEFORE.count("\n"), 0
                for edit in _typed(function, place):
                    typed_row = edit.start[0] + edit.text.count("\n")
                    told = wire.edit(*edit)
                    elsewhere = [
                        one for one in told if _is_error(one) and not _is_on(one["range"], typed_row)
                    ]
                    keystrokes += 1
                    flickering += bool(elsewhere)
                    problems += len(elsewhere)
                wire.edit(place, (place[0] + function.count("\n"), 0), "")
                if time.monotonic() > end:
                    break
            wire.close()
        print(f"| {peer.name} | {keystrokes:,} | {flickering:,} | {problems:,} |", flush=True)


def _is_on(place: dict[str, dict[str, int]], row: int) -> bool:
    return place["start"]["line"] <= row <= place["end"]["line"]


def _is_error(diagnostic: dict[str, object]) -> bool:
    return diagnostic.get("severity", 1) == 1


def main() -> None:
    """Measure what is asked for."""
    parser = argparse.ArgumentParser(description=(__doc__ or "").partition("\n")[0])
    parser.add_argument("--rows", type=int, action="append", help="the size of a file; may be given again")
    parser.add_argument("--processor", action="store_true", help="measure the processor's time alone")
    parser.add_argument("--flicker", type=int, metavar="COUNT", help="type so many functions")
    parser.add_argument("--beside", action="store_true", help="ask for more while a key is hit")
    parser.add_argument("--server", action="append", help="this server alone; may be given again")
    options = parser.parse_args()
    servers = [peer for peer in peers() if not options.server or peer.name in options.server]
    if options.flicker:
        show_flicker(servers, options.flicker)
    elif options.beside:
        show_beside(servers, options.rows or list(ROWS))
    else:
        show_times(servers, options.rows or list(ROWS), of_processor=options.processor)


if __name__ == "__main__":
    main()
