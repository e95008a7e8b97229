"""Lines that are too long for the engine: which they are, and that every reader tells them."""

import pytest

from codeloom import line_length
from codeloom.check import CheckText
from codeloom.languages import LanguageNamed
from codeloom.line_length import TooLong
from codeloom.line_names import NamesInText
from codeloom.line_trees import LineTrees
from codeloom.source import SourceFromText
from codeloom.utils import GetLogicalsFromText


@pytest.mark.parametrize(
    ("text", "reason"),
    [
        ("x = [" + "1, " * 400_000 + "]", None),
        ("x = [" + "1, " * 500_000 + "]", "1,000,004 tokens"),
        ("x = '" + "x" * 3_000_000 + "'", None),
        ("a" + ".b" * 3_000, None),
        ("a" + ".b" * 5_000, "parts in a chain"),
        ("a" + ".b(c.d, [e.f])[0]" * 2_000, "parts in a chain"),
        ("f(g(a" + ".b" * 5_000 + "))", "parts in a chain"),
        ("[" + ", ".join("a" + ".b" * 1_000 for _ in range(21)) + "]", "parts in a chain"),
        ("f'{a" + ".b" * 5_000 + "}'", "parts in a chain"),
        ("x: 'a" + ".b" * 5_000 + "'", "parts in a chain"),
        ("x = 1  # type: a" + ".b" * 5_000, "parts in a chain"),
        ("'" + "x" * 1_000_000 + "'" + ".a" * 100, "parts in a chain"),
        ("x = [" + "a.b.c(1), " * 20_000 + "]", None),
        ("x = " + " or ".join(["a.b.c"] * 5_000), None),
        ("x = f(" + "a=b.c," * 20_000 + ")", None),
        ("a = " * 10_000 + "[" + "1," * 10_000 + "]", "many targets"),
        ("a, " * 10_000 + "= '" + "x" * 10_000 + "'", "many targets"),
        ("a = " * 50_000 + "1", None),
        ("(" * 10_000 + ")" * 10_000, None),
        (")" * 300, None),
    ],
    ids=range(20),
)
def test_which_lines_are_too_long(text, reason):
    (logical,) = GetLogicalsFromText(text)
    complaint = TooLong(logical)
    assert (complaint is None) == (reason is None)
    if reason is not None:
        assert reason in complaint.message and "split it" in complaint.message


def test_every_reader_tells_of_them(monkeypatch):
    monkeypatch.setattr(line_length, "MOST_TOKENS", 300)
    text = "if x:\n\ty = [" + "1, " * 150 + "]\nz = 1"
    language = LanguageNamed("3.12")
    (problem,) = CheckText(text, language)
    assert (problem.row, problem.column) == (2, 2)
    assert problem.message == (
        "this logical line is too long and isn't analysed: it has 304 tokens, more than 300; "
        "split it into several"
    )
    for lines in (
        LineTrees(SourceFromText(text), language, "<string>"),
        NamesInText(text, language),
    ):
        assert [line.problem for line in lines] == [None, problem, None]
