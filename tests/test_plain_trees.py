"""The plain parser gives the trees and the faults that the hosted parser gives."""

import random
import re
from pathlib import Path

import pytest
from golden import Cases
from library import library_files
from plain_trees import Differences
from sentences import COMMENTS, WORDS, Sentences

from codeloom._analysis import DumpTrees

TESTS = Path(__file__).parent
VERSIONS = ["2.7", "3.4", "3.6", "3.8", "3.11", "3.14"]
MARKS = re.findall(
    r"\S+", "match case type with def class if lambda except as for ( ) [ ] { } : , ; = | * ** @ :="
)
MARKS += ["async", "yield", "\\\n"]


def Snippets():
    """The snippets of all files, and the sources of the golden files."""
    for path in sorted((TESTS / "snippets").glob("*.snippets")):
        yield from (row.replace("\\n", "\n") for row in path.read_text("utf-8").splitlines())
    for folder, suffix in [("trees", ".tree"), ("trees/extended", ".tree"), ("records", ".records")]:
        yield from (case.values[0].source for case in Cases(TESTS / folder, suffix))


def Spoilt(text, chance):
    """`text` with up to three words and marks taken out, put in or replaced."""
    words = re.findall(r"\w+|\s+|[^\w\s]", text)
    for _ in range(chance.randrange(1, 4)):
        at = chance.randrange(len(words) + 1)
        words[at : at + chance.randrange(2)] = [chance.choice(MARKS)] * chance.randrange(2)
    return " ".join(words)


def InAsyncDef(text):
    return "async def f():\n  " + text.replace("\n", "\n  ")


def AssertSame(texts, version):
    for text in texts:
        difference = next(Differences(text, version), None)
        assert difference is None, (version, text, difference)


@pytest.mark.parametrize("version", VERSIONS)
def test_snippets(version, seed):
    chance = random.Random(seed)
    for text in Snippets():
        AssertSame([text, Spoilt(text, chance), InAsyncDef(text)], version)


@pytest.mark.parametrize("version", VERSIONS)
def test_sentences_of_the_grammars(version, seed):
    chance = random.Random(seed)
    words = {**WORDS, "NEWLINE": ["\n", *COMMENTS]}
    for grammar in ("2.7", "3.8", "3.14"):
        sentences = Sentences(grammar, chance, words)
        for text in (sentences.Text() for _ in range(200)):
            AssertSame([text, Spoilt(text, chance)], version)


@pytest.mark.parametrize("version", VERSIONS)
def test_the_library(version, seed):
    paths = library_files()
    texts = (path.read_text("utf-8", "replace") for path in random.Random(seed).sample(paths, 20))
    AssertSame(texts, version)


# Bounds of type parameters hold statements in no text that means anything; the hosted parser has no limit.
@pytest.mark.parametrize(
    "text",
    [
        "(" * 100_000 + ")" * 100_000,
        "(" * 100_000,
        "x = " + "[" * 100_000 + "]" * 100_000,
        "case " + "(" * 100_000 + "a" + ")" * 100_000 + ": pass",
        "case " + "[" * 100_000 + "]" * 100_000 + ":",
        "match " + "(" * 100_000 + "a" + ")" * 100_000 + ":",
        "@a[0]" + "(" * 100_000 + ")" * 100_000,
        "def f[" + "T: int = str, " * 100_000 + "](): pass",
        "if a: " + "type X[T: int] = list[T]; " * 100_000,
        "def f[T: " * 100_000,
        "def f[T = class A[" * 100_000 + "T" + "]: pass" * 100_000,
        "with (" + "a as b, " * 100_000 + "): pass",
        "x = " + "not " * 100_000 + "a",
        "x = " + "lambda: " * 100_000 + "a",
        "a" + " if b else c" * 100_000,
    ],
    ids=lambda text: text[:20],
)
def test_hostile_lines_end_soon(text):
    (outcome,) = DumpTrees(text, 314)[-1:]
    assert outcome
