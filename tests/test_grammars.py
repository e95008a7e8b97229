"""The grammars of Python 2.7, 3.8 and 3.14: what they accept, what they refuse, how they number."""

import ast
import random
from pathlib import Path

import pytest
from grammar_tools import (
    ORACLE,
    Feed,
    GrammarPath,
    LoadGrammar,
    LoadOracle,
    ParseWithOracle,
    ParseWithOurs,
    Tokens,
)

from codeloom import optpgen
from codeloom.treesift import CPGenParserImpl

GRAMMARS = {version: LoadGrammar(GrammarPath(version)) for version in ("2.7", "3.8", "3.14")}
PARSERS = {version: optpgen.CreateParser(loaded, None) for version, loaded in GRAMMARS.items()}


def Snippets(*files):
    """The snippets of files in snippets/, one on a row, with `\\n` for the ends of their own rows."""
    rows = [row for file in files for row in (FOLDER / f"{file}.snippets").read_text().splitlines()]
    return [row.replace("\\n", "\n") for row in rows]


def ByVersion(files):
    return [(version, text) for version in files for text in Snippets(*files[version].split())]


FOLDER = Path(__file__).parent / "snippets"
ACCEPTED = ByVersion({"2.7": "both only_2.7", "3.8": "both only_3.8", "3.14": "both only_3.8 only_3.14"})
REFUSED = ByVersion({"2.7": "neither not_2.7", "3.8": "neither not_3 only_3.14", "3.14": "neither not_3"})


@pytest.mark.parametrize(("version", "text"), ACCEPTED)
def test_accepted(version, text):
    Feed(PARSERS[version], Tokens(text, version))


@pytest.mark.parametrize(("version", "text"), REFUSED)
def test_refused(version, text):
    with pytest.raises(optpgen.ParseError):
        Feed(PARSERS[version], Tokens(text, version))


def test_snippets_are_what_they_are_said_to_be():
    """The interpreter agrees, but where its syntax isn't that of the grammars."""
    differ = {"with a, b,: c", "del *a, b", "(a for b, c in d if lambda: e)"}
    differ.add("try: a\nexcept B, C: d\nexcept D,: e")
    for text in Snippets("both", "only_3.8", "only_3.14"):
        if text not in differ:
            ast.parse(text)
    for text in Snippets("neither", "not_3"):
        with pytest.raises(SyntaxError):
            ast.parse(text)


def test_every_rule_with_a_class_is_there():
    driver = CPGenParserImpl((3, 8, 0))  # completes the table
    names = {name for name in driver.kClsForState if not name.isupper()}
    by_version = {version: set(loaded.symbol2number) for version, loaded in GRAMMARS.items()}
    assert names <= by_version["2.7"] | by_version["3.8"]
    assert names - by_version["3.8"] == {"fpdef", "fplist", "list_for", "listmaker"}
    assert by_version["3.14"] - by_version["3.8"] == {"fpdef", "star_test"}
    assert by_version["3.8"] <= by_version["3.14"]
    assert names - by_version["2.7"] == {
        *("annassign", "atom_expr", "namedexpr_test", "nonlocal_stmt", "star_expr"),
        *("sync_comp_for", "testlist_star_expr", "tfpdef", "typedargslist", "yield_arg"),
    }
    # The highest number is of a rule with a single child, which never becomes a node.
    assert {max(loaded.number2symbol.items())[1] for loaded in GRAMMARS.values()} == {"yield_stmt"}


def Mutated(tokens, all_tokens, choice):
    """A line with a token or two lost, doubled or replaced."""
    mutated = list(tokens)
    for _ in range(choice.randrange(3)):
        place = choice.randrange(len(mutated))
        mutated[place : place + choice.randrange(2)] = choice.sample(all_tokens, choice.randrange(2))
    return mutated


@pytest.mark.parametrize("version", GRAMMARS)
def test_same_as_oracle_on_lines(version):
    """The same nodes in the same order, on the snippets and on what one gets by spoiling them."""
    ours, oracle = LoadGrammar(GrammarPath(version), ORACLE), LoadOracle(GrammarPath(version))
    assert ours.symbol2number == oracle.symbol2number
    snippets = [text for known, text in ACCEPTED if known == version]
    lines = [Tokens(text, version, ORACLE) for text in snippets]
    all_tokens = [token for line in lines for token in line]
    choice = random.Random(20)
    for promotes in (True, False):
        for line in lines * 10:
            tokens = Mutated(line, all_tokens, choice)
            assert ParseWithOurs(ours, tokens, promotes) == ParseWithOracle(oracle, tokens, promotes), tokens
