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
    "# type: return",
    "# type: kind = a",
    "# type: (int) -> (str, bool)",
    "# type: (int, str) pairs",
    "# type: or None",
    "# type: it's",
    "# type: `int`",
    "# type: str...",
    "# type: str or None if a",
    "# type: \\",
]
TRUE_COMMENTS = [
    "# type: int",
    "# type: ignore",
    "# type: returns == a",
    "# type: List[int]  # a list of them",
    "# type: Optional['a b'] or not None",
    "# type: (int, List[*Ts], a ** b) -> Dict[str, (int)]",
    "# type: (Callable[..., a], Tuple[(b), ...]) if a else f()in b",
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


@pytest.mark.parametrize(
    ("comment", "readable"),
    [
        ("# type: (int, *str, ** List[*Ts]) -> a  # why", "# type: (int,  str,    List[*Ts]) -> a  # why"),
        ("# type: ( *a) -> ( b[c] ) ", "# type: (  a) ->   b[c]   "),
        ("# type: (a) -> ... # why", "# type: (a)        # why"),
    ],
)
def test_forms_of_hints_that_the_engine_does_not_know(comment, readable):
    text = f"def f(a, b):  {comment}"
    assert FalseHintRemover(text).Without(_Only(text)).fToks[-1] == readable


@pytest.mark.parametrize(
    "text",
    [
        "def f():  # type: (int) -> str\n  pass",
        "def f(a, *b, **c):  # type: (int, *str, **Any) -> (bool)\n  pass",
        "x: Literal['a b'] = 1",
        "def f(a: Annotated[int, 'free text']) -> Annotated['A', 'more of it', f('a b')]: ...",
        "x: int = Field(description='what it is')",
        "def f(a: 'This is the first one', b: 'not a type', c: 'Optional.') -> 'the sum, in kg': ...",
        "'List[int'",
        "def f(): 'a docstring'",
    ],
)
def test_no_false_problems(text, caplog):
    assert CheckText(text) == [] and not caplog.records


def test_the_engines_own_behaviour():
    text = "def f(a):  # type: ignore[a]\n  x: 'this is some prose' = 1\n"
    assert CheckText(text) == []
    assert [problem.row for problem in CheckText(text, false_hints=True)] == [1, 2]


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


def test_long_lines_take_no_long_time():
    many = "'a b', " * 30_000
    for text in (f"x: '{'a' * 1_000_000}.' = 1", f"from typing import Literal as L\nx: L[{many}]"):
        assert CheckText(text) == []


def test_a_name_counts_only_where_the_file_says_so():
    assert len(CheckText("x: L['|O']\n")) == 1
