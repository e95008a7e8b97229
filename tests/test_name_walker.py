"""The walk for names over plain trees, against the engine's walker, whose nodes a host may look into."""

import random
import sysconfig
from contextlib import redirect_stdout
from functools import cache
from io import StringIO
from pathlib import Path

import pytest
from golden import Cases
from sentences import Sentences

from codeloom._analysis import DumpNames
from codeloom.line_trees import new_parser
from codeloom.reading.languages import language_named
from codeloom.reading.source import source_from_bytes
from codeloom.symbolinfo import kCalledPrefix, kFromImportPrefix, kWithinExprPrefix
from codeloom.treesift import CNodeWalker
from codeloom.utils import GetLogicalsFromText

# As EFault and ELimit number them.
PARSE_FAULTS = (1, 3)
FAULTS = {"Generator expression must be": 4, "Name in except clause must": 5}
LIMITS = {"Maximum number of calls": 1, "Maximum recurse count": 2, "RecursionError": 2}
RECORDS = Cases(Path(__file__).parent / "records", ".records")


@cache
def Engine(version):
    language = language_named(version)
    return new_parser(language), CNodeWalker(language.version_triple)


def NumberIn(numbers, text):
    return next((number for key, number in numbers.items() if key in text), 0)


def WalkedByEngine(part, in_async_def, version):
    """The fault, the limit and the records; None for what doesn't parse."""
    parser, walker = Engine(version)
    printed = StringIO()
    with redirect_stdout(printed):
        try:
            node = parser.ParseToNode(part, in_async_def)
        except Exception:
            return None
        try:
            walker.Walk(node, part)
        except SyntaxError as error:
            return NumberIn(FAULTS, error.msg), 0, None
    if node is not None:
        parser.DiscardNode(node)
    limit = NumberIn(LIMITS, printed.getvalue())
    assert bool(limit) == bool(printed.getvalue())
    return 0, limit, (list(part.fTypeEquivs or ()), list(part.fArgTypeEquivs or ()))


def Walked(text, version):
    """Fault, limit and placed records of each line, and of each expression in it."""
    number = int(version.replace(".", "", 1) if len(version) > 3 else version.replace(".", "0"))
    lines = DumpNames(text, number)
    without_records = DumpNames(text, number, with_records=False)
    assert [line[:3] for line in lines] == [line[:3] for line in without_records]
    return [(fault, limit, records) for fault, _, limit, records in lines]


def Compare(text, version):
    parts = [
        (part, logical.fInAsyncDef)
        for logical in GetLogicalsFromText(text)
        for part in (logical, *logical.GetExpLogicals())
    ]
    for (part, in_async_def), (fault, limit, records) in zip(parts, Walked(text, version), strict=True):
        expected = WalkedByEngine(part, in_async_def, version)
        if expected is None or fault in PARSE_FAULTS:
            continue  # the parsers are compared elsewhere
        pairs = tuple(
            [(name, info) for name, info, of_arg, *_ in records if of_arg == wanted]
            for wanted in (False, True)
        )
        assert (fault, limit, None if fault else pairs) == expected, part.fToks


def Library(count):
    files = sorted(Path(sysconfig.get_path("stdlib")).glob("*.py"))
    chosen = files[:: max(1, len(files) // count)]
    return [source_from_bytes(path.read_bytes()).utf8.decode() for path in chosen]


@pytest.mark.parametrize("version", ["3.11", "3.14"])
def test_the_library(version):
    for text in Library(30):
        Compare(text, version)


@pytest.mark.parametrize("case", RECORDS)
@pytest.mark.parametrize("version", ["2.7", "3.8", "3.14"])
def test_golden_sources(case, version):
    if (case.title, version) != ("with", "2.7"):  # where the engine takes a tuple for items
        Compare(case.source, version)


@pytest.mark.parametrize("version", ["2.7", "3.8", "3.14"])
def test_any_statement_of_the_grammar(version):
    sentences = Sentences(version, random.Random(5))
    for most_tokens in (12, 40, 120):
        for _ in range(300):
            Compare(sentences.Text(most_tokens), version)


# Visits by the thousand, depth, and what is read without being visited.
@pytest.mark.parametrize(
    "text",
    [
        "f(" + "a, " * 6000 + "b)",
        "x = " + "[" * 39 + "a" + "]" * 39,
        "x = " + "[" * 40 + "a" + "]" * 40,
        "x = f(b, " + "[" * 45 + "a" + "]" * 45 + ")",
        "with x as " + "[a, " * 200 + "b" + "]" * 200 + ": pass",
        "v = " + "(" * 300 + "a" + ")" * 300,
        "f(x for x in y, 1)",
        "f(" + "[" * 45 + "]" * 45 + ", x for x in y)",
    ],
    ids=lambda text: text[:20],
)
def test_limits(text):
    Compare(text, "3.11")


@pytest.mark.parametrize(
    "head, open_, close, tail",
    [
        ("with x as ", "(a, ", ")", ": f(x for x in y, 1)"),
        ("with x as ", "a[", "]", ": f(x for x in y, 1)"),
        ("v = ", "f(", ")", ""),
        ("v = ", "[", "]", ""),
        ("v = ", "- ", "", ""),
        ("v", "[", "]", " = 1"),
        ("def f(a=", "f[", "]", "): pass"),
    ],
)
def test_what_is_too_deep_hits_a_limit_in_a_small_stack(in_small_thread, head, open_, close, tail):
    text = head + open_ * 10_000 + "a" + close * 10_000 + tail
    (line,) = in_small_thread(lambda: Walked(text, "3.11"))
    assert line[:2] == (0, LIMITS["RecursionError"])


def TextsAtPlaces(text, version="3.14"):
    """Each record with the text at its place."""
    utf8 = text.encode()
    return [
        (name.decode(), info.decode(), utf8[start:end].decode())
        for _, _, records in Walked(text, version)
        for name, info, _, start, end in records
    ]


# Strings are shortened in names, and blanks in chains made even.
def test_every_record_has_its_place():
    for text in Library(30):
        for name, info, place in TextsAtPlaces(text):
            if name.isidentifier() or name == "*":
                assert name == place
            else:
                assert place[0] == name[0] or place[0] in "'\"bBrRuUfF([{", (name, info)
                assert place[-1] == name[-1]


@pytest.mark.parametrize(
    "text, kind, expected",
    [
        ("a.b(c).d", "", [("a.b", "a.b"), ("a", "a"), ("a.b", "a.b"), ("c", "c"), ("a.b(c).d", "a.b(c).d")]),
        ("(a.b)(c)", kCalledPrefix.decode(), [("a.b", "a.b")]),
        ("@a.b\n", kCalledPrefix.decode(), [("a.b", "a.b")]),
        ("(a\n .b)", "", [("a", "a"), ("a.b", "a\n .b")]),
        ("import a.b, c.d as e", "", [("a", "a"), ("a", "a"), ("e", "e"), ("e", "e"), ("e", "e")]),
        ("from a import *", kFromImportPrefix.decode(), [("*", "*")]),
        ("[x for x.a in x for x.a in y]", kWithinExprPrefix.decode(), [("x.a", "x.a")] * 2),
        ("def f(a, *b: c): return", "", [("f", "f"), ("a", "a"), ("b", "b"), ("b", "b"), ("c", "c")]),
        ("x[0], *(y) = z", "", [("x[0]", "x[0]"), ("y", "y"), ("y", "y"), ("x", "x"), ("z", "z")]),
        ("yield (yield)", "", [("yield", "yield")]),
        ("isinstance((a), B)", "", [("a", "a"), *[("isinstance",) * 2] * 2, ("a", "a"), ("B", "B")]),
    ],
)
def test_places(text, kind, expected):
    placed = TextsAtPlaces(text)
    assert [(name, place) for name, info, place in placed if info.startswith(kind)] == expected


def test_the_first_place_of_a_name_that_is_read_counts():
    (_, _, records), _ = Walked("a = x.y + x\nx", "3.14")
    assert [record[3:] for record in records if record[0] == b"x"] == [(4, 5)]
