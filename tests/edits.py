"""Files of the interpreter's library, each broken by one edit: is it found, where, and what else is blamed?

    python tests/edits.py [--cases 2000] [--seed 1] [--show 10] [--kind ...]

An edit counts when the interpreter refuses the whole file after it.
"""

import argparse
import io
import random
import sys
import tokenize
import warnings
from collections import Counter
from collections.abc import Callable, Iterator
from dataclasses import dataclass
from functools import cached_property
from pathlib import Path

from library import plain_texts

from codeloom import NEWEST, analyze

PYTHON = f"{sys.version_info[0]}.{sys.version_info[1]}"
_SKIPPED = {
    tokenize.COMMENT,
    tokenize.NL,
    tokenize.INDENT,
    tokenize.DEDENT,
    tokenize.ENDMARKER,
    tokenize.NEWLINE,
}


@dataclass(frozen=True)
class Statement:
    """Rows of a logical line, from zero, the last one not included."""

    start: int
    end: int
    depth: int  # columns of its indentation
    is_header: bool


class Source:
    """A sound file: its rows, with their ends, its tokens, and its logical lines."""

    def __init__(self, path: Path, text: str) -> None:
        self.path = path
        self.rows = text.splitlines(keepends=True)
        self.text = text

    @cached_property
    def tokens(self) -> list[tokenize.TokenInfo]:
        found = tokenize.generate_tokens(io.StringIO(self.text).readline)
        return [token for token in found if token.type not in _SKIPPED]

    @cached_property
    def statements(self) -> list[Statement]:
        found: list[Statement] = []
        first, last = None, ""
        for token in tokenize.generate_tokens(io.StringIO(self.text).readline):
            if token.type == tokenize.NEWLINE and first is not None:
                row, column = first.start
                found.append(Statement(row - 1, token.end[0], column, last == ":"))
                first = None
            elif token.type not in _SKIPPED:
                first, last = first or token, token.string
        return found

    def block_of(self, statement_i: int) -> list[Statement]:
        """The statement, and those after it that are as deep or deeper."""
        depth = self.statements[statement_i].depth
        end = statement_i
        while end < len(self.statements) and self.statements[end].depth >= depth:
            end += 1
        return self.statements[statement_i:end]


@dataclass(frozen=True)
class Edit:
    """A text, and the rows (from one) where a report of what was done is right."""

    text: str
    right_rows: range


Kind = Callable[[Source, random.Random], Edit | None]


def _with_rows(source: Source, start: int, end: int, new: list[str]) -> str:
    return "".join([*source.rows[:start], *new, *source.rows[end:]])


def _place(source: Source, token: tokenize.TokenInfo) -> tuple[int, int]:
    """The offsets of a token."""
    before = sum(map(len, source.rows[: token.start[0] - 1]))
    start = before + token.start[1]
    return start, start + len(token.string)


def _rows_from(source: Source, row: int, first_row: int) -> range:
    """From `first_row` to the end of the statement after the one that holds `row`; all from one."""
    after = [statement for statement in source.statements if statement.start + 1 > row]
    return range(first_row, after[0].end + 2 if after else len(source.rows) + 3)


def _edit_token(
    source: Source, chance: random.Random, change: Callable[[int], tuple[int, int, str]]
) -> Edit | None:
    if len(source.tokens) < 2:
        return None
    token_i = chance.randrange(len(source.tokens) - 1)
    start, end, new = change(token_i)
    text = source.text[:start] + new + source.text[end:]
    row = source.tokens[token_i].start[0]
    holder = [statement for statement in source.statements if statement.start < row <= statement.end]
    return Edit(text, _rows_from(source, row, holder[0].start + 1 if holder else row))


def delete_token(source: Source, chance: random.Random) -> Edit | None:
    return _edit_token(source, chance, lambda i: (*_place(source, source.tokens[i]), ""))


def double_token(source: Source, chance: random.Random) -> Edit | None:
    def change(i: int) -> tuple[int, int, str]:
        _, end = _place(source, source.tokens[i])
        return end, end, f" {source.tokens[i].string}"

    return _edit_token(source, chance, change)


def swap_tokens(source: Source, chance: random.Random) -> Edit | None:
    def change(i: int) -> tuple[int, int, str]:
        start, end = _place(source, source.tokens[i])
        next_start, next_end = _place(source, source.tokens[i + 1])
        between = source.text[end:next_start]
        return start, next_end, f"{source.tokens[i + 1].string}{between}{source.tokens[i].string}"

    return _edit_token(source, chance, change)


def _delete_rows(source: Source, statement: Statement, last_row: int | None = None) -> Edit:
    end = statement.end if last_row is None else last_row
    text = _with_rows(source, statement.start, end, [])
    gone = end - statement.start
    rows = _rows_from(source, end, max(1, statement.start))
    return Edit(text, range(rows.start, rows.stop - gone))


def _chosen(source: Source, chance: random.Random, is_meant: Callable[[int], bool]) -> int | None:
    fitting = [i for i in range(len(source.statements)) if is_meant(i)]
    return chance.choice(fitting) if fitting else None


def delete_row(source: Source, chance: random.Random) -> Edit | None:
    row = chance.randrange(len(source.rows))
    rows = _rows_from(source, row + 1, 1)
    holder = [statement for statement in source.statements if statement.start <= row < statement.end]
    start = holder[0].start + 1 if holder else row
    return Edit(_with_rows(source, row, row + 1, []), range(max(1, start - 1), rows.stop - 1))


def delete_header(source: Source, chance: random.Random) -> Edit | None:
    i = _chosen(source, chance, lambda i: source.statements[i].is_header)
    return None if i is None else _delete_rows(source, source.statements[i])


def delete_below_header(source: Source, chance: random.Random) -> Edit | None:
    i = _chosen(source, chance, lambda i: i > 0 and source.statements[i - 1].is_header)
    return None if i is None else _delete_rows(source, source.statements[i])


def delete_def_below_decorator(source: Source, chance: random.Random) -> Edit | None:
    def is_meant(i: int) -> bool:
        return i > 0 and source.rows[source.statements[i - 1].start].lstrip().startswith("@")

    i = _chosen(source, chance, is_meant)
    return None if i is None else _delete_rows(source, source.statements[i])


def _move(rows: list[str], by: int) -> list[str] | None:
    moved = []
    for row in rows:
        blanks = len(row) - len(row.lstrip(" "))
        if row.strip() and by < 0 and blanks < -by:
            return None
        moved.append(row if not row.strip() else " " * max(0, blanks + by) + row.lstrip(" "))
    return moved


def _moving(by: int, is_block: bool) -> Kind:
    def move(source: Source, chance: random.Random) -> Edit | None:
        i = chance.randrange(len(source.statements))
        part = source.block_of(i) if is_block else [source.statements[i]]
        start, end = part[0].start, part[-1].end
        moved = _move(source.rows[start:end], by)
        if moved is None:
            return None
        rows = _rows_from(source, end, max(1, start))
        return Edit(_with_rows(source, start, end, moved), rows)

    return move


def tab_for_blanks(source: Source, chance: random.Random) -> Edit | None:
    i = _chosen(source, chance, lambda i: source.statements[i].depth >= 4)
    if i is None:
        return None
    statement = source.statements[i]
    row = source.rows[statement.start]
    new = f"\t{row[4:]}" if row.startswith("    ") else row
    return Edit(
        _with_rows(source, statement.start, statement.start + 1, [new]),
        _rows_from(source, statement.end, statement.start + 1),
    )


KINDS: dict[str, Kind] = {
    "delete a token": delete_token,
    "double a token": double_token,
    "swap two tokens": swap_tokens,
    "delete a row": delete_row,
    "delete a header": delete_header,
    "delete below a header": delete_below_header,
    "delete a def below a decorator": delete_def_below_decorator,
    **{
        f"{'indent' if by > 0 else 'dedent'} a {'block' if is_block else 'row'} by {abs(by)}": _moving(
            by, is_block
        )
        for is_block in (False, True)
        for by in (1, 2, 4, -1, -2, -4)
    },
    "a tab for blanks": tab_for_blanks,
}


def is_refused(text: str) -> bool:
    try:
        with warnings.catch_warnings():
            warnings.simplefilter("ignore")
            compile(text, "<text>", "exec", dont_inherit=True)
    except SyntaxError:
        return True
    except ValueError:
        return False
    return False


def sound_sources(chance: random.Random) -> Iterator[Source]:
    for path, text in plain_texts(chance, 60_000):
        if not is_refused(text) and not analyze(text, python=PYTHON).problems:
            yield Source(path, text)


@dataclass(frozen=True)
class Outcome:
    """What was found in one broken file: rows with problems, and whether one of them is right."""

    kind: str
    source: Source
    edit: Edit
    rows: list[int]

    @property
    def is_right(self) -> bool:
        return any(row in self.edit.right_rows for row in self.rows)

    def __str__(self) -> str:
        first = max(0, self.edit.right_rows.start - 4)
        rows = self.edit.text.splitlines()[first : self.edit.right_rows.stop + 3]
        shown = "\n".join(f"  {first + i + 1:5} {row}" for i, row in enumerate(rows[:40]))
        return (
            f"{self.kind}: {self.source.path}, reported in {self.rows}, right {self.edit.right_rows}\n{shown}"
        )


def outcomes(count: int, seed: int, kinds: list[str] | None = None) -> Iterator[Outcome]:
    """`count` broken files, all kinds alike."""
    chance = random.Random(seed)
    for source in sound_sources(chance):
        for kind in kinds or KINDS:
            edit = KINDS[kind](source, chance) if source.statements else None
            if edit is None or not is_refused(edit.text):
                continue
            problems = analyze(edit.text, python=PYTHON).problems
            yield Outcome(kind, source, edit, sorted({problem.range.row for problem in problems}))
            count -= 1
            if count == 0:
                return


def main() -> None:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--cases", type=int, default=2000)
    parser.add_argument("--seed", type=int, default=random.randrange(1 << 30))
    parser.add_argument("--show", type=int, default=0, help="print so many of the cases that went wrong")
    parser.add_argument("--kind", action="append", choices=KINDS)
    options = parser.parse_args()
    totals: Counter[str] = Counter()
    by_kind: dict[str, Counter[str]] = {kind: Counter() for kind in KINDS}
    for outcome in outcomes(options.cases, options.seed, options.kind):
        facts = {
            "broken": 1,
            "found": bool(outcome.rows),
            "rows": len(outcome.rows),
            "right": outcome.is_right,
        }
        totals.update(facts)
        by_kind[outcome.kind].update(facts)
        if options.show and (len(outcome.rows) != 1 or not outcome.is_right):
            options.show -= 1
            print(outcome)
    print(f"seed {options.seed}, Python {PYTHON} of {NEWEST}")
    for kind, counts in {**by_kind, "all": totals}.items():
        if broken := counts["broken"]:
            found, right = (f"{counts[name] / broken:.1%}" for name in ("found", "right"))
            rows = f"{counts['rows'] / broken:.2f} rows"
            print(f"  {kind:32} {broken:5} broken, {found} found, {rows}, {right} right")


if __name__ == "__main__":
    main()
