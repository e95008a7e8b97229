"""Golden files of problems: source rows, and beneath each faulty row what is wrong with it.

    == the title of the case
      f(a, b
    !  ^ CL101 '(' was never closed

    == a title with the version that the source is written in @ 2.7
      print x
      print >>y, z

Every row of the source has two blanks before it, so that the carets below it line up; only an empty row
may lack them. A row that begins with `!` tells of a problem in the row above: carets below its range, its
code and its message. `...` after the carets means that the range goes on in the rows below. Beneath it may
follow other places that it has to do with, by their rows and columns, and a hint:

    !    related 1:4 '(' was opened here
    !    hint: close it

To add a case, write its title and its source, and let `pytest --rewrite` add the rest.
"""

import re
from collections import defaultdict
from collections.abc import Iterable, Iterator
from pathlib import Path
from typing import NamedTuple

from codeloom import Problem, analyze

_TITLE_MARK = "== "
_SOURCE_MARK, _PROBLEM_MARK = "  ", "! "
_VERSION = re.compile(r"(.*) @ ([\d.]+)")


class Case(NamedTuple):
    """One text with the problems that are expected of it."""

    title: str
    rows: list[str]

    @property
    def source(self) -> str:
        """The text, each of its rows with its end."""
        rows = (row for row in self.rows if not row.startswith(_PROBLEM_MARK.rstrip()))
        return "".join(f"{row[len(_SOURCE_MARK) :]}\n" for row in rows)

    @property
    def options(self) -> dict[str, str]:
        """What to hand to the analysis."""
        named = _VERSION.fullmatch(self.title)
        return {"python": named[2]} if named else {}

    def found(self) -> list[str]:
        """The rows of the case as they should be: its source, and what is found in it."""
        return list(_rows_with_problems(self.source, analyze(self.source, **self.options).problems))


def cases_of(path: Path) -> list[Case]:
    """All cases of a file, in their order. AssertionError where the file isn't in its form."""
    before, *parts = f"\n{path.read_text('utf-8')}".split(f"\n{_TITLE_MARK}")
    assert not before.strip(), f"{path.name} begins with something other than a title"
    cases = []
    for part in parts:
        title, *rows = part.rstrip("\n").split("\n")
        for row in rows:
            assert row[:2] in ("", _SOURCE_MARK) or row[0] == "!", f"{path.name}, {title}: {row!r}"
        cases.append(Case(title, rows))
    titles = [case.title for case in cases]
    assert len(set(titles)) == len(titles), f"{path.name} has two cases with the same title"
    return cases


def write_cases(path: Path, cases: Iterable[Case]) -> None:
    """Write a file of cases with what is found in each."""
    texts = ("\n".join([f"{_TITLE_MARK}{case.title}", *case.found()]) for case in cases)
    path.write_text("\n\n".join(texts) + "\n", "utf-8")


def _rows_with_problems(source: str, problems: Iterable[Problem]) -> Iterator[str]:
    rows = source.split("\n")[:-1]
    by_row = defaultdict(list)
    for problem in problems:
        by_row[min(problem.range.row, len(rows))].append(problem)
    for row_number, row in enumerate(rows, 1):
        yield f"{_SOURCE_MARK}{row}".rstrip() if not row else f"{_SOURCE_MARK}{row}"
        for problem in by_row[row_number]:
            for text in _rows_of(problem, row, row_number):
                yield f"{_PROBLEM_MARK}{text}"


def _rows_of(problem: Problem, row: str, row_number: int) -> Iterator[str]:
    place = problem.range
    column = place.column if place.row == row_number else len(row) + 2  # after the last row
    goes_on = place.end_row > row_number
    end = max(len(row) + 1, column + 1) if goes_on else place.end_column
    blanks = re.sub(r"[^\t]", " ", row[: column - 1]).ljust(column - 1)
    carets = "^" * (end - column) or "|"
    yield f"{blanks}{carets}{'...' if goes_on else ''} {problem.code} {problem.message}"
    for where, text in problem.related:
        yield f"{blanks}  related {where.row}:{where.column} {text}"
    if problem.hint is not None:
        yield f"{blanks}  hint: {problem.hint}"
