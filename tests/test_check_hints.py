"""What looks like a type hint and is none isn't reported; broken hints are."""

import pytest

from codeloom.check import CheckText
from codeloom.false_hints import FalseHintRemover
from codeloom.utils import GetLogicalsFromText

FALSE_COMMENTS = [
    "# type: ignore[attr-defined]",
    "#type:ignore [a, b]  # noqa",
    "# type: ignore[a]  # type: ignore[b]",
    "# type: ignore, because",
    "# type: the kind of thing",
    "# type: str, optional text",
    "# type: 'a' text",
    "# type: <class 'int'>",
    "# type: int?",
]
TRUE_COMMENTS = [
    "# type: int",
    "# type: ignore",
    "# type: List[int]  # a list of them",
    "# type: Optional['a b'] or not None",
    "# type: (int, *str) -> Dict[str, int]",
    "# type: List[",
    "# note: no type: int at all",
    "# typed",
]


def _Only(text):
    (logical,) = GetLogicalsFromText(text)
    return logical


@pytest.mark.parametrize("comment", FALSE_COMMENTS)
def test_false_hints_are_blanked_in_place(comment):
    text = f"é = f(1)  {comment}"
    logical = _Only(text)
    plain = FalseHintRemover(text).Without(logical)
    assert "type:" not in plain.fToks[-1] and len(plain.fToks[-1]) == len(comment)
    assert plain.fToks[:-1] == logical.fToks[:-1]
    assert (plain.fPositions, plain.fTokTypes) == (logical.fPositions, logical.fTokTypes)
    assert (plain.fType, plain.fFirstLine) == (logical.fType, logical.fFirstLine)


@pytest.mark.parametrize("comment", TRUE_COMMENTS)
def test_other_comments_are_left_alone(comment):
    text = f"x = f(1)  {comment}"
    assert FalseHintRemover(text).Without(_Only(text)) is None


@pytest.mark.parametrize("comment", FALSE_COMMENTS)
@pytest.mark.parametrize("line", ["def f(a, b):  {}\n    {}", "x = 1  {}", "def f(a,  {}\n  b): pass"])
def test_false_hints_are_no_problems(line, comment):
    assert CheckText(line.replace("{}", comment)) == []


@pytest.mark.parametrize(
    ("text", "place"),
    [
        # What is missing at the end of a hint is told at its last token.
        ("x = 1  # type: List[", (1, 20)),
        ("def f(a):  # type: (int] -> str\n  pass", (1, 24)),
        # The line's own fault beside a false hint.
        ("def f(a, b)):  # type: ignore[override]", (1, 12)),
        ("x = f'{a b}'  # type: ignore[a]", (1, 10)),
    ],
)
def test_faults_that_remain(text, place):
    (problem,) = CheckText(text)
    assert (problem.row, problem.column) == place


@pytest.mark.parametrize(
    ("line", "count"),
    [
        ("x: L['<f4', '|O'] | None", 0),
        ("def f(a: Final[L['r+', 'a b']], b: L[\n  '(n),()->()']) -> L['?']: ...", 0),
        ("x: typing.Literal['|O']", 0),
        ("x: M['|O']", 1),
        ("x: L['|O'] | M['|O']", 1),
        ("x: L['|O'] | 'M[L['", 1),
        ("x: (L[1], '|O')", 1),
    ],
)
def test_values_of_literals_under_another_name(line, count):
    assert len(CheckText(f"from typing import Literal as L\n{line}\n")) == count


def test_a_name_counts_only_where_the_file_says_so():
    assert len(CheckText("x: L['|O']\n")) == 1
