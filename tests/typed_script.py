"""A user's script, for mypy alone: it must find nothing of the face to be `Any`."""

from collections.abc import Sequence
from pathlib import Path

from codeloom import (
    NEWEST,
    Analysis,
    Change,
    Document,
    Line,
    Notebook,
    Occurrence,
    Problem,
    Range,
    Record,
    analyze,
    analyze_file,
    analyze_paths,
    read_notebook,
)


def places(problems: Sequence[Problem]) -> list[tuple[str, int, int]]:
    return [(problem.code, problem.range.row, problem.range.column) for problem in problems]


def report(error: OSError) -> None:
    print(error.strerror)


analysis: Analysis = analyze("x = 1", path=Path("a.py"), python=NEWEST)
print(places(analysis.problems), places(analysis.problems[1:]), analyze_file("a.py").text)
for one in analyze_paths([Path("."), "a"], jobs=2, on_error=report):
    line: Line = one.lines[0]
    record: Record | None = next(iter(line.records), None)
    value = None if record is None else record.value
    if isinstance(value, tuple):
        print(value[0].upper(), value[1])
    related: tuple[tuple[Range, str], ...] = one.problems[0].related
    unused: tuple[Occurrence, ...] = one.unused()
    print(related, [name.scope.name for name in unused], one.limits[0].kind.value)
notebook: Notebook = read_notebook("a.ipynb")
print(notebook.place(1)[0] + 1)
document = Document("x = 1", encoding="utf-8")
change: Change = document.edit((1, 1), document.end, "y")
print([scope.name for scope in change.scopes_come], change.lines_gone[0].text, document.analysis.problems[0])
