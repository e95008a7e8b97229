"""How texts are cut into logical lines, against golden files in tokens/.

A row shows a logical line: the row of the text that it begins on, its type, and its tokens. `/` is before a
token that is on a later row than the one before it, and ERROR(...) around what isn't a token of the
language. Beneath it stand the lines embedded in it, with the row and column where each begins.
"""

from itertools import pairwise
from pathlib import Path

import pytest
from golden import Cases, Check

from codeloom._fastaccess import GetTokenType, kTokenId_ERRORTOKEN
from codeloom.utils import GetLogicalsFromText

FOLDER = Path(__file__).parent / "tokens"


def ReadableToken(token):
    text = token.replace("\n", "\\n")
    return f"ERROR({text})" if GetTokenType(token) == kTokenId_ERRORTOKEN else text


def ReadableTokens(logical):
    words = []
    rows = [row for row, _ in logical.fPositions]
    for token, (last_row, row) in zip(logical.fToks, pairwise([0, *rows]), strict=True):
        words += ["/"] * (row > last_row) + [ReadableToken(token)]
    return " ".join(words)


def ReadableRow(logical):
    marks = [
        name
        for name, is_set in {"in async": logical.fInAsyncDef, "first in def": logical.fFirstInDef}.items()
        if is_set
    ]
    return f"{logical.fFirstLine} {', '.join([logical.fType, *marks])}: {ReadableTokens(logical)}"


def ReadableEmbedded(logical):
    row, column = logical.fOrigin
    return f"    {row}:{column} {logical.fType}: {ReadableTokens(logical)}"


def Readable(text):
    rows = []
    for logical in GetLogicalsFromText(text):
        rows += [ReadableRow(logical), *map(ReadableEmbedded, logical.GetExpLogicals())]
    return "\n".join(["---", *rows])


def CheckPositions(text):
    """Every token, of embedded lines too, is where its position says."""
    rows = text.encode().split(b"\n")

    def Check(token, row, column):
        first = token.encode().split(b"\n")[0]
        assert rows[row][column : column + len(first)] == first, token

    for logical in GetLogicalsFromText(text):
        for token, (row, column) in zip(logical.fToks, logical.fPositions, strict=True):
            Check(token, logical.fFirstLine + row, column)
        for embedded in logical.GetExpLogicals():
            origin_row, origin_column = embedded.fOrigin
            assert origin_row == embedded.fFirstLine
            for token, (row, column) in zip(embedded.fToks, embedded.fPositions, strict=True):
                Check(token, origin_row + row, column if row else origin_column + column)


@pytest.mark.parametrize("case", Cases(FOLDER, ".tokens"))
def test_tokens(case, rewrite):
    CheckPositions(case.source)
    Check(case, Readable(case.source), rewrite)
