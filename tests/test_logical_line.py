"""Logical lines of the tokenizer: host objects are made when the host first looks, and stay the same."""

import gc
import sys

import pytest

from codeloom._fastaccess import kTokenId_NAME
from codeloom.treesift import CExtendedAnalyzer
from codeloom.utils import GetLogicalsFromText

ANALYZER = CExtendedAnalyzer((3, 11, 0))
TEXT = 'def f(é: "int", x=f"{y}{z}"): # type: (...) -> str\n    return é + \\\n        x; del z\n'


def Looks(line):
    return [line.fToks, line.fPositions, line.fTokTypes, line.GetExpLogicals(), line.fType]


@pytest.mark.parametrize("analyzed_first", [False, True])
def test_what_was_looked_at_stays_the_same_object(analyzed_first):
    for line in GetLogicalsFromText(TEXT):
        if analyzed_first:
            assert ANALYZER.AnalyzeSingleLogical(line, False, False) is None
        seen = Looks(line)
        assert line.GetTokenType(0) == seen[2][0] == kTokenId_NAME
        assert ANALYZER.AnalyzeSingleLogical(line, False, False) is None
        line.ClearDerivedInfo()
        assert all(one is other for one, other in zip(seen, Looks(line), strict=True))


def test_names_are_interned():
    first, second = (GetLogicalsFromText(text)[0] for text in ["name == 1", "x = name"])
    assert first.fToks[0] is second.fToks[2] is sys.intern("".join(["na", "me"]))


@pytest.mark.parametrize("char", ["x", "é", "\ud800", "\U0001f600"])
def test_a_line_outlives_its_text_and_its_neighbours(char):
    text = "".join(["a = 1\n", f"b = '{char}' + f'{{{char}}}'\n"])
    line = GetLogicalsFromText(text)[1]
    del text
    gc.collect()
    assert line.fToks[:4] == ("b", "=", f"'{char}'", "+")
    assert line.GetExpLogicals()[0].fToks[0] == char
    assert line.GetExpLogicals()[0].fOrigin == (1, line.fPositions[4][1] + 3)


def test_clearing_reaches_embedded_lines_looked_at_or_not():
    for looks in [False, True]:
        line = GetLogicalsFromText('x: "int" = 1')[0]
        (hint,) = line.GetExpLogicals() if looks else (None,)
        ANALYZER.AnalyzeSingleLogical(line, False, False)
        assert line.fTypeEquivs
        line.ClearDerivedInfo()
        assert line.fTypeEquivs is None
        assert hint is None or hint.fTypeEquivs is None
        assert line.GetExpLogicals()[0].fTypeEquivs is None
