"""What looks like a type hint and is none isn't reported; broken hints are."""

import pytest

from codeloom import RecordKind, analyze

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


def Hints(text):
    """What is hinted, with the names that are read for it."""
    records = analyze(text).records
    return [str(record) for record in records if record.kind in (RecordKind.HINT, RecordKind.GET)]


@pytest.mark.parametrize("comment", FALSE_COMMENTS)
def test_false_hints_say_nothing(comment):
    assert Hints(f"é = 1  {comment}") == []


@pytest.mark.parametrize(
    ("comment", "hints"),
    [
        ("# type: (int, *str, ** List[*Ts]) -> a  # why", ["int", "str", "List[*Ts]", "a"]),
        ("# type: ( a, b, d) -> ( b[c] ) ", ["a", "b", "d", "b[c]"]),
        ("# type: (a, a, a) -> ... # why", ["a", "a", "a"]),
    ],
)
def test_forms_of_hints_that_the_engine_does_not_know(comment, hints):
    records = analyze(f"def f(a, b, c):  {comment}\n    pass").records
    assert [record.payload for record in records if record.kind is RecordKind.HINT] == hints


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
def test_no_false_problems(text):
    assert not analyze(text).problems


def test_the_engines_own_behaviour():
    text = "def f(a):  # type: ignore[a]\n  x: 'this is some prose' = 1\n"
    assert not analyze(text).problems
    assert [problem.range.row for problem in analyze(text, false_hints=True).problems] == [1, 2]


@pytest.mark.parametrize("comment", FALSE_COMMENTS)
def test_false_hints_are_no_problems(comment):
    text = "def f(a, b):  {}\n    {}\n    x = 1  {}\ndef f(a,  {}\n  b): pass"
    assert not analyze(text.replace("{}", comment)).problems


@pytest.mark.parametrize(
    ("text", "place"),
    [
        # What is missing at the end of a hint is reported at its last token.
        ("x = 1  # type: List[", (1, 20)),
        ("def f(a):  # type: (int] -> str\n  pass", (1, 24)),
        # The line's own fault beside a false hint.
        ("def f(a, b)):  # type: ignore[override]", (1, 12)),
        ("x = f'{a b}'  # type: ignore[a]", (1, 8)),
    ],
)
def test_faults_that_remain(text, place):
    (problem,) = analyze(text).problems
    assert (problem.range.row, problem.range.column) == place


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
    assert len(analyze(f"from typing import Literal as L\n{line}\n").problems) == count


def test_long_lines_take_no_long_time():
    many = "'a b', " * 30_000
    for text in (f"x: '{'a' * 1_000_000}.' = 1", f"from typing import Literal as L\nx: L[{many}]"):
        assert not analyze(text).problems


def test_a_name_counts_only_where_the_file_says_so():
    assert len(analyze("x: L['|O']\n").problems) == 1
