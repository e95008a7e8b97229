"""Instructions that a keystroke costs a document, in files of different lengths.

    python benchmarks/keystroke_counts.py                 a table, counted by valgrind
    python benchmarks/keystroke_counts.py --rows 1000     for files of so many rows alone

A function is typed in the middle of a file, character by character, and a method's body in the middle of a
class that is all of its file. After each one the problems are asked for, and what has changed. What a few
keystrokes cost is taken from what many cost, so that start-up and the first analysis are left out. The text
is copied once a keystroke, which is counted too.
"""

import argparse
import os
import sys
from collections.abc import Callable

from corpus import text_of
from counting import can_count, instructions
from keystrokes import ROWS, Edit, replay

from codeloom import Document
from codeloom._document import Change

FEW, MANY = 10, 60

# Valgrind counts an instruction that copies any number of bytes once for each byte; so copy by vectors.
COPY_BY_VECTORS = "glibc.cpu.x86_rep_movsb_threshold=1000000000"


def class_of(rows: int) -> str:
    """A sound text of so many rows, all of them in one class."""
    methods = "".join(
        f"    def method_{i}(self, value):\n        if value:\n            return [self.total, value]\n"
        f"        return self.method_{i}(value + 1)\n\n"
        for i in range(rows // 5)
    )
    return f"class Long:\n    total = 0\n\n{methods}\n\nclass Next:\n    pass\n"


def typed_in_class(text: str, count: int) -> list[Edit]:
    """The body of a method in the middle of a class, character by character."""
    rows = text.split("\n")
    row = next(i for i in range(len(rows) // 2, len(rows)) if rows[i].startswith("        return self"))
    column = len(rows[row])
    typed = " + self.method_1([value, 2], 'text') + len(self.total) * [value for value in self]  # x"
    return [Edit((row, column + i), (row, column + i), typed[i]) for i in range(count)]


def _problems(document: Document, _: Change) -> None:
    list(document.analysis.problems)


def _change(document: Document, change: Change) -> None:
    _problems(document, change)
    _ = change.lines_gone, change.lines_come, change.problems_gone, change.problems_come


def _names(document: Document, change: Change) -> None:
    _change(document, change)
    _ = change.occurrences_gone, change.occurrences_come, change.scopes_gone, change.scopes_come


ASKED: dict[str, Callable[[Document, Change], None]] = {
    "problems": _problems,
    "problems and lines": _change,
    "names too": _names,
}


def work(kind: str, asked: str, rows: int, count: int) -> None:
    """So many keystrokes, in a process that valgrind counts."""
    if kind == "class":
        text = class_of(rows)
        edits = typed_in_class(text, count)
    else:
        text = text_of(rows).decode()
        edits = list(replay(text))[:count]
    document = Document(text)
    list(document.analysis.problems)
    for edit in edits:
        start, end = ((place[0] + 1, place[1] + 1) for place in (edit.start, edit.end))
        ASKED[asked](document, document.edit(start, end, edit.text))


def count_of(kind: str, asked: str, rows: int) -> int:
    """Instructions a keystroke."""
    command = [sys.executable, "-P", __file__, "--work", kind, "--asked", asked, "--rows", str(rows)]
    few, many = (instructions([*command, "--count", str(count)]) for count in (FEW, MANY))
    return round((many - few) / (MANY - FEW))


def show(sizes: list[int], asked: list[str]) -> None:
    """A table: what is asked for after a keystroke, by the length of the file."""
    print(f"| thousands of instructions a keystroke | {' | '.join(f'{size:,} rows' for size in sizes)} |")
    print(f"| --- |{' --- |' * len(sizes)}")
    for kind, where in (("file", "in a file"), ("class", "in a class")):
        for question in asked:
            counts = [count_of(kind, question, size) for size in sizes]
            cells = " | ".join(f"{count / 1000:,.0f}" for count in counts)
            print(f"| {where}: {question} | {cells} |", flush=True)


def main() -> None:
    """Count what is asked for."""
    parser = argparse.ArgumentParser(description=(__doc__ or "").partition("\n")[0])
    parser.add_argument("--rows", type=int, action="append", help="the size of a file; may be given again")
    parser.add_argument("--asked", choices=ASKED, action="append", help="may be given again")
    parser.add_argument("--work", choices=("file", "class"), help=argparse.SUPPRESS)
    parser.add_argument("--count", type=int, default=MANY, help=argparse.SUPPRESS)
    options = parser.parse_args()
    if options.work:
        work(options.work, options.asked[0], options.rows[0], options.count)
    elif not can_count():
        parser.error("there is no valgrind")
    else:
        os.environ["GLIBC_TUNABLES"] = COPY_BY_VECTORS
        show(options.rows or list(ROWS), options.asked or list(ASKED))


if __name__ == "__main__":
    main()
