"""Rows of source as they are shown: tabs, wide characters, long rows, control characters."""

import pytest

from codeloom.cli.excerpt import excerpt, wrapped


def At(column):
    """A mark of no width."""
    return [(column, column, "^")]


@pytest.mark.parametrize(
    ("row", "column", "shown", "caret"),
    [
        ("x = (1))", 8, "x = (1))", "       ^"),
        ("x = (", 6, "x = (", "     ^"),
        ("", 1, "", "^"),
        ("x", 99, "x", " ^"),
        ("\tx\ty", 2, "    x   y", "    ^"),
        ("\tx\ty", 4, "    x   y", "        ^"),
        ("日本 = )", 6, "日本 = )", "       ^"),
        ("\uff45 )", 3, "\uff45 )", "   ^"),
        ("e\u0301 )", 4, "e\u0301 )", "  ^"),
        ("🙂 )", 3, "🙂 )", "   ^"),
        ("\x1b[2J\u202e)\x0c\0", 6, "\ufffd[2J\ufffd) \ufffd", "     ^"),
    ],
)
def test_rows_that_fit(row, column, shown, caret):
    assert excerpt(row, At(column)) == (shown, caret)


def test_marks():
    """Ranges, also over wide characters and tabs, what is cut, what overlaps, what goes on below."""
    assert excerpt("\tx = 日本", [(2, 3, "^"), (6, 8, "-")]) == ("    x = 日本", "    ^   ----")
    assert excerpt("a\tb", [(2, 3, "^")]) == ("a   b", " ^^^")
    assert excerpt("x = 1", [(1, 99, "^")]) == ("x = 1", "^^^^^")
    assert excerpt("x = 1", [(3, 4, "^"), (1, 6, "-")]) == ("x = 1", "--^--")
    shown, marked = excerpt("x" * 100, [(50, 90, "^"), (1, 2, "-")], width=20)
    assert (len(shown), marked) == (20, " " * 10 + "^" * 7)


@pytest.mark.parametrize("column", [1, 2, 49, 50, 51, 97, 98, 100, 101])
@pytest.mark.parametrize("unit", ["abcdefghij", "äöü日本\tghij", "日本語日本語日本語日"])
def test_long_rows_are_cut_around_the_place(unit, column):
    row = unit * 10
    shown, caret = excerpt(row, At(column), width=40)
    assert _ShownWidth(shown) <= 40 and len(caret) <= 41
    if column <= len(row):
        at_caret = _AtColumn(shown, len(caret) - 1)
        assert at_caret == row[column - 1].replace("\t", " ")
    assert shown.startswith("...") == (column > 40)
    assert shown.endswith("...") == (column < 80)


def test_a_row_as_long_as_a_file():
    shown, caret = excerpt("x" * 10_000_000 + ")" + "y" * 10_000_000, At(10_000_001), width=20)
    assert shown == "...xxxxxxx)yyyyyy..."
    assert caret == "          ^"


def test_what_a_terminal_lacks_is_shown_by_its_number():
    assert excerpt("é )", At(3), encoding="ascii") == ("\\xe9 )", "     ^")
    assert excerpt("é日 )", At(4), encoding="latin-1") == ("é\\u65e5 )", "        ^")


def _Widths(shown):
    return [2 if char in "日本語" else 1 for char in shown]


def _ShownWidth(shown):
    return sum(_Widths(shown))


def _AtColumn(shown, col):
    for char, width in zip(shown, _Widths(shown), strict=True):
        if col < width:
            return char
        col -= width
    return None


@pytest.mark.parametrize(
    ("text", "rows"),
    [
        ("a bc", ["a bc"]),
        ("a bcd efg hijkl m", ["a", "bcd", "efg", "hijkl", "m"]),
        ("abcdef", ["", "abcdef"]),
        ("日本 日", ["日本", "日"]),
        ("", [""]),
    ],
)
def test_text_is_broken_between_words(text, rows):
    assert list(wrapped(text, 4, 5)) == rows
