"""Whole texts in the tokenizer: nothing is lost, and the interpreter agrees.

How single lines are cut is in tokens/, read by test_tokens.py; that a fault stays where it is, in
test_broken_lines.py.
"""

import io
import random
import tokenize
import warnings
from bisect import bisect_right

import pytest
from host_tokens import host_tokens
from hypothesis import given, settings
from hypothesis import strategies as st
from library import library_files
from test_tokens import CheckPositions

from codeloom._fastaccess import GetTokenType, kTokenId_ERRORTOKEN
from codeloom.logicalline import kComment
from codeloom.utils import GetLogicalsFromText

WORDS = """
def f class return if else for in lambda async match case type x y é 1 0x1F 10L 1_0 1e5 ( ) [ ] { } , : ; = :=
== -> ** ... . @ ! $ ? ` <> \\ 'a' "b" ' " \""" ''' f" f' f\""" {x!r:>{y}} { } {{ }} rb' ur" \\N{D} #
"""
BLANKS = [" ", "    ", "\t", "\f", "\n", "\r", "\r\n", "\\\n", "\n    ", "# type: int\n"]
PIECES = [*WORDS.split(), *BLANKS, "\0", "\ufeff", "\u00a0", "\ud800", "\u0301"]
UNCLOSED = ["(\n", "x = f(\n", "(]\n", "(", ")", "if (\n", "x\n  a)\n", "(a\n# x\n", "x: a['b', "]
UNQUOTED = ["'a\n", '"""a b\n', '\\"""\n', '""" a b ', "f'{(\n", 'f"{', "f'{f\"{"]


def LibraryTexts(count, seed):
    """The texts of `count` files of the interpreter's library; all that it compiles, so all sound."""
    paths = library_files()
    source = random.Random(seed)
    while count:
        try:
            text = source.choice(paths).read_text("utf-8")
            with warnings.catch_warnings():
                warnings.simplefilter("ignore")
                compile(text, "", "exec", dont_inherit=True)
        except (SyntaxError, ValueError):
            continue
        if 2_000 < len(text) < 100_000 and text.isascii():
            count -= 1
            yield text


def TokenLists(text):
    return [logical.fToks for logical in GetLogicalsFromText(text)]


def Solid(text):
    return [char for char in text if char not in " \t\f\r\n;\ufeff"]


@pytest.mark.parametrize("row_end", ["\n", "\r\n", "\r"])
def test_row_ends_of_all_systems(row_end):
    text = "def f(a,\n      b):\n    '''c\n\n    d'''\n\n    x = \\\n  1  # e\n\ny"
    expected = GetLogicalsFromText(text)
    found = GetLogicalsFromText(text.replace("\n", row_end))
    assert [line.fFirstLine for line in found] == [line.fFirstLine for line in expected] == [0, 2, 6, 9]
    assert [line.fPositions for line in found] == [line.fPositions for line in expected]
    tokens = [tuple(token.replace(row_end, "\n") for token in line.fToks) for line in found]
    assert tokens == TokenLists(text)


def test_a_byte_order_mark_is_no_column():
    (line,) = GetLogicalsFromText("\ufeffé = x")
    assert line.fToks == ("é", "=", "x")
    assert line.fPositions == ((0, 0), (0, 3), (0, 5))


@pytest.mark.parametrize("char", ["\0", "\ufeff", "\u00a0", "\u2028", "\x1a", "\ud800", "\udc80", "€", "$"])
def test_what_is_no_part_of_the_language_is_an_error_of_one_character(char):
    lines = GetLogicalsFromText(f"x = {char}1\ny = '{char}'  # {char}")
    assert [line.fToks for line in lines] == [("x", "=", char, "1"), ("y", "=", f"'{char}'", f"# {char}")]
    assert lines[0].fTokTypes[2] == kTokenId_ERRORTOKEN


def test_texts_without_lines():
    for text in ["", "\n", " ", "\n \t\f\r\n", "\ufeff"]:
        assert not GetLogicalsFromText(text)


@settings(max_examples=400)
@given(st.lists(st.sampled_from(PIECES), max_size=40), st.sampled_from(["", " "]))
def test_nothing_is_lost(pieces, between):
    text = between.join(pieces)
    lines = GetLogicalsFromText(text)
    assert Solid("".join(token for line in lines for token in line.fToks)) == Solid(text)
    for line in lines:
        assert line.fToks
        assert line.fTokTypes == tuple(map(GetTokenType, line.fToks))
        assert list(line.fPositions) == sorted(line.fPositions)
        assert all(embedded.fToks for embedded in line.GetExpLogicals())
    if not {"\r", "\ufeff", "\ud800"} & set(text):
        CheckPositions(text)


LINE_END = "the end of a line"


def ExpectedTokens(text):
    """(row, byte column, token) of each token as the interpreter's tokenizer has them, and LINE_END after
    each statement, or after those that semicolons separate.
    """
    rows = io.StringIO(text).readlines()
    for token in host_tokens(text):
        if token.type == tokenize.NEWLINE:
            yield LINE_END
        elif token.string.strip() and token.string != ";":
            row, column = token.start
            yield row - 1, len(rows[row - 1][:column].encode()), token.string


def FoundTokens(text):
    """The same of ours, but for the backslashes."""
    lines = GetLogicalsFromText(text)
    next_rows = [line.fFirstLine for line in lines[1:]] + [-1]
    for line, next_row in zip(lines, next_rows, strict=True):
        for token, (row, column) in zip(line.fToks, line.fPositions, strict=True):
            if token not in (";", "\\"):
                yield line.fFirstLine + row, column, token
        if line.fType != kComment and next_row != line.fFirstLine + line.fPositions[-1][0]:
            yield LINE_END


def test_the_interpreter_finds_the_same_tokens(seed):
    for text in LibraryTexts(30, seed):
        assert list(FoundTokens(text)) == list(ExpectedTokens(text)), seed


@pytest.mark.parametrize(
    "piece", [*UNCLOSED, *UNQUOTED, ";", "a;", "\\", "\\\n", "# x\n", "lambda x: "], ids=repr
)
def test_hostile_texts_are_read_to_their_end(piece):
    text = piece * 20_000
    lines = GetLogicalsFromText(text)
    starts = [0]
    for row in text.split("\n"):
        starts.append(starts[-1] + len(row) + 1)
    last_row = bisect_right(starts, len(text.rstrip()) - 1) - 1
    row, column = lines[-1].fPositions[-1]
    end = starts[lines[-1].fFirstLine + row] + column + len(lines[-1].fToks[-1])
    assert lines[-1].fFirstLine <= last_row
    assert not text[end:].strip("; \n")
