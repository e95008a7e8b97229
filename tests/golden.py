"""Golden files: cases of a title, a source, and what comes out, in a form one can read.

    == the title of the case
    the source, on one row or more
    ---
    what comes out

`pytest --rewrite` writes what comes out into the files. Read the difference before committing it.
"""

import difflib
from collections.abc import Iterator
from pathlib import Path
from typing import NamedTuple

import pytest

_TITLE_MARK = "== "
_OUTPUT_MARK = "---"


class Case(NamedTuple):
    path: Path
    title: str
    source: str
    output: str
    """From the row that begins with `---` on."""


def Cases(folder: Path, suffix: str) -> list:
    """The cases of all files in `folder`, as parameters of a test, each with its title as its name."""
    return [
        pytest.param(case, id=f"{path.stem}: {case.title}")
        for path in sorted(folder.glob(f"*{suffix}"))
        for case in _CasesOf(path)
    ]


def _CasesOf(path: Path) -> Iterator[Case]:
    titles = set()
    for text in f"\n{path.read_text('utf-8')}".split(f"\n{_TITLE_MARK}")[1:]:
        title, _, body = text.partition("\n")
        source, mark, output = body.partition(f"\n{_OUTPUT_MARK}")
        assert title not in titles, f"{path.name} has two cases called {title!r}"
        titles.add(title)
        yield Case(path, title, source.rstrip("\n"), f"{mark.lstrip()}{output}".rstrip("\n"))


def Check(case: Case, output: str, rewrite: bool) -> None:
    """Compare what came out with the file, or write it there."""
    if output == case.output:
        return
    if rewrite:
        _Rewrite(case, output)
        return
    rows = difflib.unified_diff(
        case.output.splitlines(), output.splitlines(), case.path.name, "what comes out", lineterm="", n=2
    )
    pytest.fail("\n".join([*rows, "To accept all of it: pytest --rewrite"]), pytrace=False)


def _Rewrite(case: Case, output: str) -> None:
    text = f"\n{case.path.read_text('utf-8')}"
    head = f"\n{_TITLE_MARK}{case.title}\n{case.source}\n"
    before, found, rest = text.partition(head)
    assert found, f"{case.path.name} has changed meanwhile"
    _, mark, after = rest.partition(f"\n{_TITLE_MARK}")
    case.path.write_text(f"{before}{head}{output}\n{mark}{after}"[1:], "utf-8")
