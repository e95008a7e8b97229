"""The table-driven parser and its grammar loader, on small grammars."""

import contextlib
import gc
import itertools
import pickle
import random
import weakref
from pathlib import Path

import pytest
from golden import Cases, Check
from grammar_tools import ORACLE, Feed, LoadOracle, ParseWithOracle, ParseWithOurs

from codeloom import optpgen

NAMES = {0: "ENDMARKER", 1: "NAME", 2: "NUMBER", 4: "NEWLINE"}
OPERATORS = {"+": 14, "-": 15, "*": 16, "(": 7, ")": 8, ",": 12, "!=": 29, "<>": 29}

SUMS = """
line: sum NEWLINE           # the start symbol
sum: product (('+' | '-')   # goes on in brackets
     product)*
product: atom ('*' atom)*
atom: NAME | NUMBER | '(' sum ')' | 'not' atom
"""


@pytest.fixture
def load(tmp_path):
    """Makes the grammar of a text."""

    def Load(text, names=NAMES, operators=OPERATORS):
        path = tmp_path / "Grammar"
        path.write_text(text)
        return optpgen.ParserGenerator(path, names, operators).make_grammar()

    return Load


def Tokens(text):
    """Blanks part tokens."""
    return [(1 if word.isalpha() else OPERATORS.get(word, 2), word) for word in text.split()]


def Texts(node):
    """A raw tree as nested lists of rule numbers and token texts."""
    type, value, _, children = node
    return value if children is None else [type - 256, *map(Texts, children)]


class Recorder(optpgen.NodeConverter):
    """Notes what it is called for; its nodes are texts."""

    def __init__(self):
        super().__init__()
        self.calls = []

    def convert(self, grammar, type, value, context, children):
        self.calls.append((type, value, context, children and list(children)))
        return value or f"<{' '.join(children)}>"


# Grammar files


def test_grammar_numbers_its_rules(load):
    grammar = load(SUMS)
    assert grammar.symbol2number == {"line": 256, "atom": 257, "product": 258, "sum": 259}
    assert grammar.number2symbol == {256: "line", 257: "atom", 258: "product", 259: "sum"}
    assert repr(grammar) == "<Grammar of line: 4 rules, 12 states>"


@pytest.mark.parametrize("case", Cases(Path(__file__).parent / "grammars", ".grammars"))
def test_faults_of_a_grammar_name_their_row(load, tmp_path, case, rewrite):
    with pytest.raises(ValueError) as caught:
        load(f"{case.source}\n")
    path, _, said = str(caught.value).partition(":")
    assert path == str(tmp_path / "Grammar")
    Check(case, f"---\n{said}", rewrite)


def test_wrong_files_and_tables(tmp_path, load):
    with pytest.raises(FileNotFoundError, match="no_such_grammar"):
        optpgen.ParserGenerator(tmp_path / "no_such_grammar", NAMES, OPERATORS)
    for text, fault in [("", "expected a rule"), ("a: " + "(" * 200 + "NAME" + ")" * 200, "nested too deep")]:
        with pytest.raises(ValueError, match=fault):
            load(text)
    with pytest.raises(ValueError, match=":1: a keyword needs a kind of token called NAME"):
        load("a: 'if'", {2: "NUMBER"})
    with pytest.raises(ValueError, match=":1: the type of NAME is 256, but must be from 0 to 255"):
        load("a: NAME", {256: "NAME"})
    for names, operators in [({1: 2}, {}), ({"1": "NAME"}, {}), ({}, {"+": "14"}), (None, {}), ({}, [])]:
        with pytest.raises(TypeError):
            load("a: NAME", names, operators)


def test_repetition_within_an_option(load):
    """What repeats may be first in brackets that may be left out."""
    parser = optpgen.CreateParser(load("a: NAME ['+'* '-']"), None)
    for text in ("x", "x -", "x + + -"):
        Feed(parser, Tokens(text))
    for text in ("x +", "x + +", "x - -"):
        with pytest.raises(optpgen.ParseError):
            Feed(parser, Tokens(text))


# Trees


def test_any_rule_can_be_the_start(load):
    grammar = load(SUMS)
    parser = optpgen.CreateParser(grammar, None)
    start = grammar.symbol2number["sum"]
    assert Texts(Feed(parser, Tokens("a + b"), start)) == [3, "a", "+", "b"]
    assert Texts(Feed(parser, Tokens("a"), start)) == "a"
    with pytest.raises(optpgen.ParseError) as caught:
        Feed(parser, Tokens("a + b )"), start)
    assert caught.value.context == 3
    for wrong in (255, 260, -1):
        with pytest.raises(ValueError, match=f"no rule with the number {wrong}"):
            parser.setup(wrong)
    with pytest.raises(TypeError):
        parser.setup("sum")


def test_depth_is_no_matter(load):
    depth = 10_000
    parser = optpgen.CreateParser(load(SUMS), None, promotesinglechild=False)
    node = Feed(parser, [*Tokens("( " * depth + "x" + " )" * depth), (4, "\n")])[3][0]
    levels = 0
    while node[3] is not None:
        node = node[3][len(node[3]) // 2]
        levels += 1
    assert levels == 3 * (depth + 1)
    with pytest.raises(optpgen.ParseError):
        Feed(parser, Tokens("( " * depth))


# Labels


def test_keywords_are_found_by_text(load):
    """Whether a text is interned, of a subclass, or like a keyword in part only."""

    class Text(str):
        pass

    parser = optpgen.CreateParser(load("a: 'if' | 'in' NAME | 'inner'"), None)
    made = "".join(["i", "f"])
    for keyword in ("if", made, Text("if")):
        assert Feed(parser, [(1, keyword)])[1] is keyword
    for name in ("iff", "i", "IF", "", "innen", "if\0", "\u0131f", "\ud800", Text("x"), None):
        Feed(parser, [(1, "in"), (1, name)])
        with pytest.raises(optpgen.ParseError):
            Feed(parser, [(1, name)])
        with pytest.raises(optpgen.ParseError):
            Feed(parser, [(1, "in"), (1, made)])


def test_operators_of_one_type_are_told_apart_by_text(load):
    parser = optpgen.CreateParser(load("a: NAME '!=' NAME"), None)
    Feed(parser, [(1, "a"), (29, "!="), (1, "b")])
    for text in ("<>", "", None):
        with pytest.raises(optpgen.ParseError):
            Feed(parser, [(1, "a"), (29, text), (1, "b")])
    both = optpgen.CreateParser(load("a: '!=' NAME | '<>' NUMBER"), None)
    Feed(both, [(29, "!="), (1, "b")])
    Feed(both, [(29, "<>"), (2, "1")])
    with pytest.raises(optpgen.ParseError):
        Feed(both, [(29, "<>"), (1, "b")])


def test_types_decide_where_texts_dont(load):
    parser = optpgen.CreateParser(load(SUMS), None)
    assert Texts(Feed(parser, [(2, "if"), (14, "plus"), (2, None), (4, "")])) == [
        0,
        [3, "if", "plus", None],
        "",
    ]
    for type in (3, 99, 255, 256, 1_000_000, -1):
        with pytest.raises(optpgen.ParseError) as caught:
            Feed(parser, [(type, "x")])
        assert caught.value.type == type


# Failures


def test_parse_error():
    error = optpgen.ParseError("wrong", 1, "x", [7])
    assert (error.msg, error.type, error.value, error.context) == ("wrong", 1, "x", [7])
    assert str(error) == "wrong: 'x' (token type 1), context [7]"
    assert isinstance(error, Exception)
    assert vars(pickle.loads(pickle.dumps(error))) == vars(error)
    assert optpgen.ParseError(msg="m", type=None, value=None, context=3).context == 3
    with pytest.raises(TypeError):
        optpgen.ParseError("wrong")


def test_refused_token_ends_the_parse(load):
    parser = optpgen.CreateParser(load(SUMS), None)
    parser.setup()
    parser.addtoken(1, "a", 0)
    context = object()
    with pytest.raises(optpgen.ParseError) as caught:
        parser.addtoken(1, "b", context)
    assert (caught.value.type, caught.value.value) == (1, "b")
    assert caught.value.context is context
    with pytest.raises(RuntimeError, match="setup comes first"):
        parser.addtoken(14, "+", 2)
    assert Texts(Feed(parser, [(1, "a"), (4, "")])) == [0, "a", ""]


def test_operations_out_of_order(load):
    parser = optpgen.CreateParser(load(SUMS), None)
    for wrong in (lambda: parser.addtoken(1, "a", 0), parser.finish):
        with pytest.raises(RuntimeError, match="setup comes first"):
            wrong()
    parser.setup()
    with pytest.raises(optpgen.ParseError, match="ends too early"):
        parser.finish()
    parser.setup()
    for index, (type, value) in enumerate(Tokens("a + ( b")):
        parser.addtoken(type, value, index)
    with pytest.raises(optpgen.ParseError, match="ends too early") as caught:
        parser.finish()
    assert caught.value.context == 2  # where the innermost rule that isn't complete begins
    parser.setup()
    parser.addtoken(1, "a", 0)
    assert parser.addtoken(4, "\n", 1)
    with pytest.raises(optpgen.ParseError, match="goes on beyond its end"):
        parser.addtoken(4, "\n", 2)
    assert Texts(parser.finish()) == [0, "a", "\n"]
    with pytest.raises(RuntimeError, match="setup comes first"):
        parser.finish()


def test_wrong_types(load):
    grammar = load(SUMS)
    with pytest.raises(TypeError):
        optpgen.CreateParser(None, None)
    with pytest.raises(TypeError):
        optpgen.CreateParser(grammar, Recorder)
    parser = optpgen.CreateParser(grammar, None)
    for type, value in [("1", "a"), (None, "a"), (1, b"a"), (1, 1), (2, 2)]:
        parser.setup()
        with pytest.raises(TypeError):
            parser.addtoken(type, value, 0)


@pytest.mark.parametrize("failing_type", [1, 2, 256, 257, 259])
def test_converter_that_raises(load, failing_type):
    """The parse is over, nothing is kept, and the next one begins anew."""

    class Failing(Recorder):
        fails = True

        def convert(self, grammar, type, value, context, children):
            if self.fails and type == failing_type:
                raise ZeroDivisionError(type)
            return super().convert(grammar, type, value, context, children)

    converter = Failing()
    parser = optpgen.CreateParser(load(SUMS), converter)
    tokens = [*Tokens("( a ) + 1"), (4, "\n")]
    with pytest.raises(ZeroDivisionError):
        Feed(parser, tokens)
    with pytest.raises(RuntimeError, match="setup comes first"):
        parser.addtoken(1, "a", 0)
    converter.fails = False
    assert Feed(parser, tokens) == "<<<( a )> + 1> \n>"


def test_operations_from_within_convert(load):
    class Reentrant(Recorder):
        def convert(self, grammar, type, value, context, children):
            for operation in (parser.setup, parser.finish, lambda: parser.addtoken(1, "b", 1)):
                with pytest.raises(RuntimeError, match="the parser is busy"):
                    operation()
            return super().convert(grammar, type, value, context, children)

    parser = optpgen.CreateParser(load(SUMS), Reentrant())
    assert Feed(parser, [*Tokens("a + b"), (4, "\n")]) == "<<a + b> \n>"


def test_nodes_that_use_the_parser_when_they_die(load):
    """A parse that is dropped drops its nodes while the parser is busy."""
    died = []

    class Node:
        def __del__(self):
            with pytest.raises(RuntimeError):
                parser.addtoken(1, "x", 0)
            died.append(gc.collect())

    class Nodes(optpgen.NodeConverter):
        def convert(self, grammar, type, value, context, children):
            return Node()

    parser = optpgen.CreateParser(load(SUMS), Nodes())
    for drop in (parser.setup, lambda: parser.addtoken(1, "d", Node())):
        parser.setup()
        for index, (type, value) in enumerate(Tokens("a + ( b * c")):
            parser.addtoken(type, value, index)
        died.clear()
        with contextlib.suppress(optpgen.ParseError):
            drop()
        assert len(died) >= 6
    parser.setup()


# Life in the host


def test_converter_lives_as_long_as_its_parser(load):
    converter = Recorder()
    parser = optpgen.CreateParser(load(SUMS), converter)
    converter.parser = parser
    alive = weakref.ref(converter)
    parser.setup()
    parser.addtoken(1, "a", converter)
    del converter
    gc.collect()
    assert alive() is not None
    parser.addtoken(4, "\n", 1)
    parser.finish()
    del parser
    gc.collect()
    assert alive() is None


def test_subclasses_of_the_host(load):
    grammar = load(SUMS)

    class Counting(type(optpgen.CreateParser(grammar, None))):
        count = 0

        def addtoken(self, type, value, context):
            self.count += 1
            return super().addtoken(type, value, context)

    parser = Counting(grammar, Recorder())
    assert isinstance(parser, optpgen.Parser)
    assert Feed(parser, [*Tokens("a + b"), (4, "\n")]) == "<<a + b> \n>"
    assert parser.count == 4
    with pytest.raises(NotImplementedError):
        optpgen.Parser().setup()
    assert optpgen.NodeConverter().convert(None, 1, "a", 0, None) == (1, "a", 0, None)


# Against the oracle


def RandomGrammar(choice):
    """The text of a small grammar. Many of them leave choices, and are refused."""
    keywords = [f"'{keyword}'" for keyword in "abcdefgh"]
    names = [f"r{number}" for number in range(choice.randrange(2, 7))]

    def Item(rules, depth):
        kind = choice.randrange(8 if depth else 4)
        if kind < 4:
            return choice.choice(keywords + rules * 3)
        if kind == 4:
            # The oracle goes wrong on an option that begins or ends with a repetition.
            first, last = choice.choices(keywords, k=2)
            return f"[{first} {Sequence(rules, depth - 1)} {last}]"
        if kind == 5:
            return f"({Sequence(rules, depth - 1)} | {Sequence(rules, depth - 1)})"
        return f"({choice.choice(keywords)} {Sequence(rules, depth - 1)}){'*+'[kind - 6]}"

    def Sequence(rules, depth):
        return " ".join(Item(rules, depth) for _ in range(choice.randrange(1, 4)))

    def Alternatives(rules):
        return " | ".join(Sequence(rules, 2) for _ in range(choice.randrange(1, 3)))

    return "".join(f"{name}: {Alternatives(names[at + 1 :])}\n" for at, name in enumerate(names))


def test_same_as_oracle_on_random_grammars(tmp_path):
    """The same nodes in the same order, or the same token refused."""
    choice = random.Random(7)
    path = tmp_path / "Grammar"
    grammar_count = outcome_count = complete_count = 0
    while grammar_count < 40:
        path.write_text(RandomGrammar(choice))
        try:
            ours = optpgen.ParserGenerator(path, ORACLE.names, ORACLE.operators).make_grammar()
        except ValueError:
            continue
        grammar_count += 1
        oracle = LoadOracle(str(path))
        starts = list(ours.symbol2number.values())
        for _, start in itertools.product(range(10), starts):
            tokens = Likely(ours, start, choice)
            for promotes in (True, False):
                outcome = ParseWithOurs(ours, tokens, promotes, start)
                assert outcome == ParseWithOracle(oracle, tokens, promotes, start), path.read_text()
                outcome_count += 1
                complete_count += outcome.root is not None
    assert complete_count > outcome_count / 10


def Likely(grammar, start, choice):
    """Tokens that the grammar allows, as long as there is one, and then a wrong one."""
    parser = optpgen.CreateParser(grammar, None)
    tokens = []
    while len(tokens) < 20:
        for keyword in choice.sample("abcdefgh", 8):
            parser.setup(start)
            try:
                is_complete = [parser.addtoken(*token, 0) for token in [*tokens, (1, keyword)]][-1]
            except optpgen.ParseError:
                continue
            tokens.append((1, keyword))
            if is_complete:
                return tokens
            break
        else:
            return [*tokens, (1, choice.choice("abcdefgh"))]
    return tokens
