"""An analyzer in which no host code takes part works on plain data: the same records, errors and limits."""

import contextlib
import io
import random
import sysconfig
from functools import cache
from pathlib import Path

import pytest
from sentences import COMMENTS, Sentences

from codeloom import treesift
from codeloom.reading.languages import language_named
from codeloom.treesift import CExtendedAnalyzer
from codeloom.utils import GetLogicalsFromText

VERSIONS = ["3.4", "3.8", "3.11", "3.14"]
LIBRARY = sorted(Path(sysconfig.get_path("stdlib")).glob("*.py"))
# Golden files are good texts to try: lines of Python, sound and broken, between what is none.
GOLDEN = sorted(path for path in Path(__file__).parent.glob("*/*.*") if path.suffix != ".pyc")
# What a wrong edit puts in or takes out.
PIECES = [
    "(",
    ")",
    "[",
    "]",
    "{",
    "}",
    ",",
    ":",
    "=",
    "*",
    "**",
    ".",
    "->",
    ":=",
    "@",
    "not",
    "in",
    "is",
    "if",
]
PIECES += [
    "else",
    "for",
    "lambda",
    "await",
    "async",
    "yield",
    "1",
    "'a'",
    "f'{a}'",
    "x",
    "match",
    "type",
    "\\\n",
]
HINTS = [
    "x = 1  # type: int",
    "x, (y, z) = f()  # type: List[int], (a.b, 'C')",
    "[a, b] = c  # type: (int, str) # more",
    "x[0] = y.z = 1  # type: Dict[str, (int)]",
    "for a, b in c:  # type: int, str",
    "with a as b, c as (d, e):  # type: int, (str, f.g)",
    "x = 1  # type:",
    "x = 1  # type: int; str",
    "x = 1  # type: import os",
    "x = 1  # type: [a for a in b]",
    "x = 1  # type: f(a for a in b, c)",
    "x = 1  # type: ignore[a]",
    "x = 1  # type: int]",
    "x = '''a\x0cb\n'''  # type: str",
    "def f(a, b, *c, d=1, **e):  # type: (int, str, *A, **B) -> c.d",
    "def f(a, (b, c), d):  # type: (int, (a, b), str) -> None",
    "def f():  # type: (int) -> str",
    "def f(self):  # type: (...) -> 'A'",
    "def f(a,  # type: int\n  b,  # type: List[c]\n  d=(1)  # type: e\n  ):  # type: (...) -> f",
    "def f(a,  # type: int\n  b):  # type: str",
    "def f(a: int, b: 'A.B' = 1, *c: *D, **e: [x, y]) -> {'k': 'v'}: pass",
    "async def f(a):  # type: (int) -> str\n  # type: (b) -> c\n  pass",
    "def f(a):\n  # type: (int, x[y]) -> f(z)\n  pass",
    "def f(a):\n  # type: (int] -> z\n  pass",
    "def f[T: (int, str) = int, *Ts, **P](a: T) -> 'B[T]':  # type: (int) -> str",
    "class A[T](B, metaclass=C): x: 'D[T]' = 1",
    "x: 'int | y z' = 1",
    "x = f'{a b}' f'{c:{d!r:>{e f}}}'",
    "x = f'{a  # type: b\n}'",
    "x = f'{lambda a: b}' f'{(y := 1)}' f'{[z for z in q]}'",
    "if a: b: int = c; d = e  # type: f",
    "try: x: 'a' = 1",
    "print(f'{x!r}', a[b:c, ...], *d, **e)",
    "f(a for b in c, d)",
    "except A as b.c:",
    "isinstance(x.y, (A, b.C, (D, E)))",
]
DEEP = [
    "x = " + "(" * 50 + ")" * 50,
    "x = " + "f(" * 45 + ")" * 45,
    "x = " + "[" * 120 + "]" * 120,
    "f(" + "a, " * 6000 + ")",
    "x = 1  # type: " + "A[" * 60 + "int" + "]" * 60,
    "x: '" + "A[" * 60 + "int" + "]" * 60 + "' = 1",
    "x = " + "(" * 900 + "a" + ")" * 900,
    "(" * 400 + "a" + ",)" * 400 + " = b",
]


class Hosted(CExtendedAnalyzer):
    """A class of the host's own has its lines analysed in the hosted form."""


@cache
def Analyzers(version):
    language = language_named(version)
    parameters = language.version_triple, language.grammar_file, language.keywords, language.is_py3
    return CExtendedAnalyzer(*parameters), Hosted(*parameters)


def Seen(analyzer, logical):
    """All that a host sees of an analysis."""
    printed = io.StringIO()
    with contextlib.redirect_stdout(printed):
        error = analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)
    lines = [logical, *logical.GetExpLogicals()]
    records = [(line.fTypeEquivs, line.fArgTypeEquivs, line.fParsed) for line in lines]
    fields = error and (type(error), error.args, error.filename, error.lineno, error.offset, error.text)
    return records, fields, printed.getvalue()


def Differences(text, version):
    plain, hosted = Analyzers(version)
    pairs = zip(GetLogicalsFromText(text), GetLogicalsFromText(text), strict=True)
    for one, other in pairs:
        seen, expected = Seen(plain, one), Seen(hosted, other)
        if seen != expected:
            yield " ".join(one.fToks)[:200], seen, expected


def AssertAlike(texts, version):
    assert [difference for text in texts for difference in Differences(text, version)] == []


def Mutated(text, pick):
    """The lines of a text, each with a token lost, doubled or put in."""
    for logical in GetLogicalsFromText(text):
        toks = list(logical.fToks)
        i = pick.randrange(len(toks))
        toks[i : i + 1] = pick.choice(
            [[], [toks[i], toks[i]], [pick.choice(PIECES), toks[i]], [pick.choice(PIECES)]]
        )
        yield " ".join(toks) + "\n"


@pytest.mark.parametrize("version", VERSIONS)
def test_hints_and_limits(version):
    AssertAlike([text + "\n" for text in HINTS + DEEP], version)
    AssertAlike([f"{text}{comment}" for text in HINTS for comment in COMMENTS], version)


@pytest.mark.parametrize("version", VERSIONS)
def test_golden_files(version):
    AssertAlike([path.read_text(encoding="utf-8") for path in GOLDEN], version)


@pytest.mark.parametrize("version", VERSIONS)
def test_generated_lines(version):
    sentences = Sentences("3.14", random.Random(version))
    AssertAlike([sentences.Text() for _ in range(3000)], version)


@pytest.mark.parametrize("version", VERSIONS)
def test_the_interpreters_library(version):
    texts = [path.read_text(encoding="utf-8") for path in LIBRARY[:: len(VERSIONS)]]
    AssertAlike(texts, version)
    pick = random.Random(version)
    AssertAlike(["".join(Mutated(text, pick)) for text in texts[::4]], version)


@pytest.fixture
def analyzer():
    return CExtendedAnalyzer((3, 14, 0))


def Records(analyzer, text):
    (logical,) = GetLogicalsFromText(text)
    assert analyzer.AnalyzeSingleLogical(logical, False) is None
    return logical.fTypeEquivs


@pytest.mark.parametrize(
    ("module", "name", "text"),
    [
        ("utils", "GetLogicalsFromText", "x = 1  # type: int"),
        ("logicalline", "IsScopeStartLogical", "def f[T](): pass"),
        ("logicalline", "FindMatchOrCaseType", "match x:"),
        ("logicalinspect", "TextFromTokens", "x = = 1"),
    ],
)
def test_a_replaced_neighbour_is_asked(monkeypatch, analyzer, module, name, text):
    original, asked = getattr(getattr(treesift, module), name), []

    def Replaced(*arguments):
        asked.append(name)
        return original(*arguments)

    monkeypatch.setattr(getattr(treesift, module), name, Replaced)
    (logical,) = GetLogicalsFromText(text)
    analyzer.AnalyzeSingleLogical(logical, False)
    assert asked


def test_what_a_host_sets_counts(analyzer):
    assert Records(analyzer, "x: int = 'a'")[-1] == (b"x", b":h:int")
    analyzer._fNodeWalker._fIncludeExprText = False
    assert (b"x", b":l:str:") in Records(analyzer, "x = 'a'")
    analyzer._fTypeHintWalker._fDispatchDict[treesift.CExprStmt] = False
    assert (b"x", b":h:int") not in Records(analyzer, "x: int = 'a'")


def test_other_node_classes_count(monkeypatch):
    class COwnStmt(treesift.CExprStmt):
        def GetEqualCount(self):
            return 0

    monkeypatch.setitem(treesift.CPGenParserImpl.kClsForState, "expr_stmt", COwnStmt)
    assert (b"x", b":s:") not in Records(CExtendedAnalyzer((3, 14, 0)), "x = 1")


def test_records_belong_to_the_host_once_it_looks(analyzer):
    (logical,) = GetLogicalsFromText("x = f'{y}'")
    analyzer.AnalyzeSingleLogical(logical, False)
    logical.AppendTypeEquiv(b"a", b"b")
    assert logical.fTypeEquivs[-1] == (b"a", b"b") and logical.fTypeEquivs is logical.fTypeEquivs
    (embedded,) = logical.GetExpLogicals()
    assert embedded.fTypeEquivs == [(b"y", b":g:")]
    logical.ClearDerivedInfo()
    assert logical.fTypeEquivs is None and embedded.fTypeEquivs is None
    assert analyzer.AnalyzeSingleLogical(logical, False) is None and logical.fTypeEquivs is None
    logical.MarkParsed(False)
    analyzer.AnalyzeSingleLogical(logical, False)
    assert len(logical.fTypeEquivs) == 3 and len(embedded.fTypeEquivs) == 1
