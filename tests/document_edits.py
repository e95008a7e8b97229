"""Edits a document at random, and sees that it always says what `analyze` says of its text.

    python tests/document_edits.py [--edits 100000] [--seed 1] [--rows 60]

Characters and rows come and go, blocks are pasted, quotes and brackets are opened and closed, statements
are typed character by character, and all of it is undone now and then. A failure prints the seed, the text
before and the edit.
"""

import argparse
import random
import sysconfig
from collections.abc import Iterator
from functools import cache
from pathlib import Path
from typing import Any

import pyarrow

from codeloom import VERSIONS, Analysis, Document, Range, analyze
from codeloom._analysis import table_kinds

# So many edits lie between two whose items are compared one by one; the others are compared by tables.
CLOSE_LOOK = 25

MARKS = ["'", '"', '"""', "'''", "(", ")", "[", "]", "{", "}", ":", ",", "=", "\\", "#", ";", ".", "@", "*"]
BLANKS = [" ", "    ", "\t", "\n", "\n", "\r\n", "\r", "\x0c", "\n    ", "\n        "]
ODD = ["é", "\U0001f600", "\0", "\ud800", "\ufeff", "\u2028", "f'{", "}'", "# type: int", "-> 'a.b'"]
STATEMENTS = """
def f(a, *, b: 'int' = 1):
async def g():
class C(D, metaclass=M):
if a := b:
elif c:
else:
for x, y in z:
while True:
try:
except* (A, B) as e:
finally:
with open(f) as g, (h):
match x:
case [1, {**rest}] if a:
return x
yield
await f()
break
continue
pass
global a, b
nonlocal a
import a.b as c
from . import *
from __future__ import annotations
from __future__ import print_function
x = 1
x: int = y
x += (yield)
del x, y
lambda a: (b for a in c)
@decorated
type X[T] = list[T]
print 'x'
raise E from None
f"{x!r:>{y}} {'"""


class Editor:
    """A document under random edits."""

    def __init__(self, seed: int, rows: int = 60) -> None:
        self.random = random.Random(seed)
        self.rows = rows
        self.count = 0
        self.undo: list[tuple[int, str, str]] = []  # where, what went, what came
        python = self.random.choice([*VERSIONS[-1:] * 3, *VERSIONS])
        self.document = Document(self._piece(rows), python=python)

    def step(self) -> None:
        """One edit, or one typed statement, each compared."""
        for start, end, new_text in self._edits():
            self._apply(start, end, new_text)

    def _apply(self, start: int, end: int, new_text: str) -> None:
        before = self.document.text
        if is_within_row_end(before, start):
            start, new_text = start - 1, "\r" + new_text
        if is_within_row_end(before, end):
            end, new_text = end + 1, new_text + "\n"
        self.undo.append((start, before[start:end], new_text))
        change = self.document.edit(place(before, start), place(before, end), new_text)
        try:
            after = before[:start] + new_text + before[end:]
            assert self.document.text == after
            self.count += 1
            is_close_look = self.count % CLOSE_LOOK == 0
            (compare if is_close_look else compare_natively)(
                self.document.analysis, analyze(after, python=self.document.python)
            )
            check_change(change)
        except AssertionError as error:
            error.add_note(f"edit of {before!r}: from {start} to {end}: {new_text!r}")
            raise

    def _edits(self) -> Iterator[tuple[int, int, str]]:
        kind = self.random.random()
        if kind < 0.15 and self.undo:
            for _ in range(min(self.random.randrange(1, 6), len(self.undo))):
                start, went, came = self.undo.pop()
                yield start, start + len(came), went
                self.undo.pop()
            return
        text = self.document.text
        here = self.random.randrange(len(text) + 1)
        if kind < 0.30 and len(text) < 60 * self.rows:
            start = text.rfind("\n", 0, here) + 1
            typed = " " * 4 * self.random.randrange(3) + self.random.choice(STATEMENTS.split("\n")) + "\n"
            for i, character in enumerate(typed):
                yield start + i, start + i, character
        elif kind < 0.40:
            end = self._row_end(here, self.random.randrange(1, 4))
            yield text.rfind("\n", 0, here) + 1, end, ""
        elif kind < 0.50 and len(text) < 60 * self.rows:
            start = text.rfind("\n", 0, here) + 1
            yield start, start, self._piece(self.random.randrange(1, 12))
        elif kind < 0.55:
            end = self._row_end(here, self.random.randrange(1, 9))
            start = text.rfind("\n", 0, here) + 1
            blanks = self.random.choice(["    ", "\t", " "])
            rows = text[start:end].splitlines(keepends=True)
            if self.random.random() < 0.5:
                yield start, end, "".join(blanks + row for row in rows)
            else:
                yield start, end, "".join(row.removeprefix(blanks) for row in rows)
        elif kind < 0.75:
            yield here, min(here + self.random.choice([1, 1, 1, 2, 5, 30]), len(text)), ""
        else:
            end = min(here + self.random.choice([0, 0, 0, 1, 3]), len(text))
            choices = self.random.choices([MARKS, BLANKS, ODD, list("abcdef01")], [6, 3, 1, 2])[0]
            yield here, end, self.random.choice(choices)

    def _row_end(self, here: int, rows: int) -> int:
        text = self.document.text
        for _ in range(rows):
            here = text.find("\n", here) + 1
            if here == 0:
                return len(text)
        return here

    def _piece(self, rows: int) -> str:
        """Some rows of the interpreter's library."""
        lines = library_text(self.random.choice(library())).splitlines(keepends=True)
        start = self.random.randrange(max(1, len(lines) - rows))
        return "".join(lines[start : start + rows])


@cache
def library() -> list[Path]:
    return sorted(Path(sysconfig.get_path("stdlib")).glob("*.py"))


@cache
def library_text(path: Path) -> str:
    return path.read_text(encoding="utf-8", errors="replace")


def place(text: str, offset: int) -> tuple[int, int]:
    """The row and column of a character, as a document counts them."""
    before = text[:offset].replace("\r\n", " \n").replace("\r", "\n")
    return before.count("\n") + 1, len(before) - before.rfind("\n")


def is_within_row_end(text: str, offset: int) -> bool:
    return text[offset - 1 : offset + 1] == "\r\n"


SEQUENCES = ("lines", "problems", "records", "limits", "occurrences", "scopes", "signatures", "hints")


def compare(one: Analysis, other: Analysis) -> None:
    """Holds all that two analyses show against each other, item by item."""
    assert one.text == other.text
    for sequence in SEQUENCES:
        ours, theirs = (list(map(shown, getattr(each, sequence))) for each in (one, other))
        assert ours == theirs, (
            sequence,
            [pair for pair in zip(ours, theirs, strict=False) if len({*pair}) > 1],
        )


def compare_natively(one: Analysis, other: Analysis) -> None:
    """The same by sequences and by tables, which is much faster; only a difference is looked at closely."""
    same = one.text == other.text
    same = same and all(getattr(one, name) == getattr(other, name) for name in SEQUENCES)
    same = same and all(_table(one, kind) == _table(other, kind) for kind, _, _ in table_kinds())
    same = same and [problem.related for problem in one.problems] == [
        problem.related for problem in other.problems
    ]
    if not same:
        compare(one, other)
        raise AssertionError("sequences or tables differ where their items don't")


def _table(analysis: Analysis, kind: str) -> pyarrow.Table:
    return pyarrow.table(analysis.table(kind))


def shown(item: Any) -> tuple[Any, ...]:
    """The attributes of an item, and of the items in it their sign."""
    return tuple(_plain(getattr(item, name)) for name in attributes(type(item)))


@cache
def attributes(item_type: type) -> tuple[str, ...]:
    return tuple(name for name in sorted(vars(item_type)) if isinstance(vars(item_type)[name], property))


def _plain(value: Any) -> Any:
    match value:
        case None | bool() | int() | str() | Range():
            return value
        case tuple() if value and type(value[0]).__module__ == "codeloom._analysis":
            return tuple(map(shown, value)) if type(value[0]).__name__ == "Symbol" else repr(value)
        case _:
            return repr(value) if type(value).__module__ == "codeloom._analysis" else str(value)


def check_change(change: Any) -> None:
    """What is after an edit is what was before it, without what has gone and with what has come."""
    for name in ("lines", "problems", "occurrences", "scopes"):
        before, after = getattr(change.before, name), getattr(change.after, name)
        gone, come = getattr(change, f"{name}_gone"), getattr(change, f"{name}_come")
        assert len(before) - len(gone) == len(after) - len(come)
        moved = [change.moved(item.range) for item in before if item not in set(gone)]
        assert moved == [item.range for item in after if item not in set(come)] or name == "scopes"


def main() -> None:
    parser = argparse.ArgumentParser(description=__doc__.split("\n")[0])
    parser.add_argument("--edits", type=int, default=100_000)
    parser.add_argument("--seed", type=int, default=random.randrange(1 << 30))
    parser.add_argument("--rows", type=int, default=60)
    arguments = parser.parse_args()
    done = 0
    seed = arguments.seed
    while done < arguments.edits:
        print(f"--seed {seed}: {done} edits", flush=True)
        editor = Editor(seed, arguments.rows * (10 if seed % 10 == 0 else 1))
        while editor.count < min(1000, arguments.edits - done):
            editor.step()
        done += editor.count
        seed += 1
    print(f"{done} edits, and each time the document said what `analyze` says")


if __name__ == "__main__":
    main()
