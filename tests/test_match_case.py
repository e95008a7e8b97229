"""Match and case statements: patterns against the interpreter's, bad patterns, quirks, overrides, limits.

The node layouts are in trees/statements_match.tree; which words are keywords is in test_soft_keywords.py.
"""

import ast
import gc
import weakref
from pathlib import Path

import pytest
from hand_made import Parse, Tokens
from hypothesis import given, settings
from hypothesis import strategies as st

from codeloom import treesift
from codeloom.logicalline import kCase, kMatch, kUnknown
from codeloom.optpgen import ParseError
from codeloom.treesift import (
    CAtomExpr,
    CClassArgumentPatternNode,
    CClassPatternNode,
    CExtendedAnalyzer,
    CExtendedMatchCaseParser,
    CExtendedParser,
    CMatchCaseStatementParser,
    CPatternNode,
    CPGenAnalyzerImpl,
    CPGenParserImpl,
    CSequencePatternNode,
)
from codeloom.utils import GetLogicalsFromText

VERSION = (3, 11, 0)
ANALYZER = CPGenAnalyzerImpl(VERSION)
EXTENDED_ANALYZER = CExtendedAnalyzer(VERSION)
DRIVER = CPGenParserImpl(VERSION)
NEWER_DRIVER = CExtendedParser(VERSION)


def Place(text, analyzer=ANALYZER):
    (logical,) = GetLogicalsFromText(text)
    error = analyzer.AnalyzeSingleLogical(logical, False, False)
    return error and (error.lineno, error.offset)


def Tuples(text):
    (logical,) = GetLogicalsFromText(text)
    return logical.fToks, logical.fPositions


def ByHand(text, *between):
    """Tokens with blanks between them, brackets of any kind among them, each with its index as column."""
    toks = tuple(text.split())
    return toks, *between, tuple((0, i) for i in range(len(toks)))


# Patterns against those of the interpreter


def Form(node):
    """A pattern of ours as nested tuples."""
    parts = node.fChildren or []
    texts = [part.fText for part in parts]
    if isinstance(node, CSequencePatternNode) and texts[0] == "{":
        pairs = [Form(part) for part, text in zip(parts, texts, strict=True) if text not in ("{", ":", "}")]
        return ("mapping", *pairs)
    if isinstance(node, CSequencePatternNode):
        return (
            "sequence",
            *(Form(p) for p, text in zip(parts[1:-1], texts[1:-1], strict=True) if text != ","),
        )
    if isinstance(node, CClassPatternNode):
        return ("class", Tokens(parts[0]), *(Form(part) for part in parts[2:] if part.fText != ","))
    if isinstance(node, CClassArgumentPatternNode):
        return ("argument", texts[0], Form(parts[2]))
    if type(node) is not CPatternNode:
        return Tokens(node)
    if "as" in texts:
        return ("as", Form(parts[0]), texts[2])
    if "|" in texts:
        return ("or", *map(Form, parts[::2]))
    return Form(parts[1]) if texts[0] == "(" else Tokens(node)


def ExpectedForm(pattern):
    """The same of a pattern of the interpreter's."""
    match pattern:
        case ast.MatchAs(pattern=None, name=name):
            return name or "_"
        case ast.MatchAs(pattern=inner, name=name):
            return ("as", ExpectedForm(inner), name)
        case ast.MatchOr(patterns=patterns):
            return ("or", *map(ExpectedForm, patterns))
        case ast.MatchStar(name=name):
            return f"* {name or '_'}"
        case ast.MatchSequence(patterns=patterns):
            return ("sequence", *map(ExpectedForm, patterns))
        case ast.MatchMapping(keys=keys, patterns=patterns, rest=rest):
            pairs = [x for key, p in zip(keys, patterns, strict=True) for x in (Spaced(key), ExpectedForm(p))]
            return ("mapping", *pairs, *(["**", rest] if rest else []))
        case ast.MatchClass(cls=cls, patterns=patterns, kwd_attrs=names, kwd_patterns=named):
            arguments = [("argument", n, ExpectedForm(p)) for n, p in zip(names, named, strict=True)]
            return ("class", Spaced(cls), *map(ExpectedForm, patterns), *arguments)
        case ast.MatchValue(value=value) | ast.MatchSingleton(value=value):
            return Spaced(value)


def Spaced(value):
    text = ast.unparse(value) if isinstance(value, ast.AST) else repr(value)
    return text.replace(".", " . ").replace("-", "- ").replace("  ", " ")


def Joined(parts, open, close, least=0):
    return st.lists(parts, min_size=least, max_size=3).map(lambda some: f"{open}{', '.join(some)}{close}")


NAMES = st.sampled_from(["a", "b", "match", "case", "_x"])
STARRED = NAMES.map("*{}".format)
VALUES = st.sampled_from(["1", "-1", "2j", "1 + 2j", "-1 - 2j", "'s'", "a.b", "a.case.b", "None", "True"])
SINGLE = st.one_of(NAMES, VALUES, st.just("_"), NAMES.map("{}()".format))


def Larger(patterns):
    """Patterns made of smaller ones."""
    arguments = st.one_of(patterns, st.tuples(NAMES, patterns).map("=".join))
    pairs = st.tuples(VALUES, patterns).map(": ".join)
    return st.one_of(
        Joined(st.one_of(patterns, STARRED), "[", "]"),
        Joined(patterns, "(", ",)", least=1),
        patterns.map("({})".format),
        Joined(arguments, "a.b(", ")"),
        Joined(pairs, "{", "}"),
        st.tuples(Joined(pairs, "{", ", **", least=1), NAMES).map(lambda both: f"{''.join(both)}}}"),
        st.tuples(patterns.map("({})".format), patterns.map("({})".format)).map(" | ".join),
        st.tuples(patterns.map("({})".format), NAMES).map(" as ".join),
    )


@settings(max_examples=500)
@given(st.recursive(SINGLE, Larger, max_leaves=8))
def test_patterns_have_the_structure_that_the_interpreter_sees(pattern):
    try:
        tree = ast.parse(f"match x:\n case {pattern}: pass")
    except SyntaxError:
        return  # such as a positional argument after a named one
    expected = tree.body[0].cases[0].pattern
    assert Form(Parse(f"case {pattern}:").GetPattern()) == ExpectedForm(expected)


@settings(max_examples=300)
@given(st.lists(st.one_of(st.recursive(SINGLE, Larger, max_leaves=4), STARRED), min_size=1, max_size=3))
def test_open_sequences_have_it_too(patterns):
    pattern = ", ".join(patterns) if len(patterns) > 1 else f"{patterns[0]},"
    try:
        tree = ast.parse(f"match x:\n case {pattern}: pass")
    except SyntaxError:
        return
    node = Parse(f"case {pattern}:", driver=NEWER_DRIVER).GetPattern()
    assert type(node) is CSequencePatternNode
    parts = tuple(Form(part) for part in node.fChildren if part.fText != ",")
    assert ("sequence", *parts) == ExpectedForm(tree.body[0].cases[0].pattern)


# Bad patterns, each with the place of its fault: those of bad_patterns.places that the extended parser takes.
NO_LONGER_BAD = {"case ():", "case a, b:", "case *a, b:", 'case "a" "b":'}


def PlacesIn(file):
    """Lines, each with the place of the caret beneath it."""
    rows = (Path(__file__).parent / "snippets" / f"{file}.places").read_text("utf-8").splitlines()
    for text, caret in zip(rows[::2], rows[1::2], strict=True):
        yield text, (1, len(text[: caret.index("^")].encode()) + 1)


def Tables(*files):
    pairs = [pair for file in files for pair in PlacesIn(file)]
    return pytest.mark.parametrize(("text", "place"), pairs, ids=[text for text, _ in pairs])


@Tables("bad_patterns")
def test_the_place_of_the_fault(text, place):
    assert Place(text) == place


@Tables("bad_patterns", "bad_for_newer")
def test_the_place_of_the_fault_for_the_extended_parser(text, place):
    assert Place(text, EXTENDED_ANALYZER) == (None if text in NO_LONGER_BAD else place)


def test_places_in_lines_of_several_rows():
    """Comments and backslashes are taken out first; the places are still those of the text."""
    assert Place("case [a,  # one\n      # two\n  b 1]:") == (3, 5)
    assert Place("case \\\n  a \\\n  b:") == (3, 3)
    assert Place("case é, b:") == (1, 8)  # columns are bytes
    for text, place in [
        ("case [a,  # one\n  b] if c d:", (2, 11)),
        ("match (a,  # one\n  b c):", (2, 5)),
        ("match \\\n  a \\\n  b:", (3, 3)),
        ("case é, \\\n  b: c d", (2, 8)),
    ]:
        assert Place(text, EXTENDED_ANALYZER) == place


def test_brackets_of_unlike_kinds():
    lines = {"case [ a ) :": 3, "case ( a , b ] :": 5, "case ( a ] :": 3, "case { 1 : a ] :": 5}
    for line, error_i in lines.items():
        with pytest.raises(ParseError) as caught:
            DRIVER.ParseToksToNode(*ByHand(line, False))
        assert caught.value.args == ("Invalid syntax", 0, line.split()[error_i], (0, error_i))


# Statements


def test_the_subject_and_the_body():
    for text, subject in [
        ("match (a)[0]:  # one", "( a ) [ 0 ]"),
        ("match (a,\n  # one\n  b) \\\n :", "( a , b )"),
        ("match await a:", "await a"),
        ("match (a).b + (c):", "( a ) . b + ( c )"),
    ]:
        assert Tokens(Parse(text).GetTestExpression()) == subject
    node = DRIVER.ParseToksToNode(*ByHand("match a ) + ( b :", False))
    assert Tokens(node.GetTestExpression()) == "( a ) + ( b )"  # in two brackets it stays whole
    assert Parse("case 1:  # c").GetBody() is None
    assert Tokens(Parse("case a if b: c  # d").GetBody()) == "c"


def test_names_take_the_ordinary_road():
    parser = DRIVER._fMatchCaseStatementParser
    for text in ["match = 3", "match(x)", "case.x", "match[x]: y"]:
        assert parser.ParseMatchStmt(*Tuples(text)) is parser.ParseCaseStmt(*Tuples(text)) is None
        assert Place(text) is None


def test_the_decision_is_looked_up_at_the_call(monkeypatch):
    calls = []

    def Decide(toks, start, end):
        calls.append((toks, start, end))
        return kMatch

    monkeypatch.setattr(treesift.logicalline, "FindMatchOrCaseType", Decide)
    assert Tokens(Parse("match(  # one\n x):").GetTestExpression()) == "( x )"
    assert calls == [(("match", "(", "x", ")", ":"), 0, 5)]
    assert type(Parse("match(x)")) is CAtomExpr  # there is no colon
    monkeypatch.setattr(treesift.logicalline, "FindMatchOrCaseType", lambda *_: kCase)
    assert Place("case if b:") == (1, 1)  # a pattern of no tokens
    monkeypatch.setattr(treesift.logicalline, "FindMatchOrCaseType", lambda *_: kUnknown)
    assert Place("case a:") == (1, 6)


# The parser as the host sees it


def Recorded(name, calls):
    def Operation(self, *arguments):
        calls.append((name, *arguments))
        return getattr(CMatchCaseStatementParser, name)(self, *arguments)

    return Operation


def test_overrides_at_every_depth():
    names = {name for name in vars(CMatchCaseStatementParser) if "__" not in name}
    calls = []
    operations = {name: Recorded(name, calls) for name in names}
    parser = type("Recording", (CMatchCaseStatementParser,), operations)(DRIVER)
    parser.ParseCaseStmt(*Tuples("case A(a.b, c=-1) | [d, {'e': _}]:"))
    patterns = [call for call in calls if call[0].startswith("_NodeFor")]
    assert " ".join(f"{name[8:]} {start_i}-{end_i}" for name, start_i, end_i, *_ in patterns) == (
        "Pattern 1-22 Pattern 1-12 ClassPattern 1-12 DottedNameValue 1-2 Pattern 3-6 DottedNameValue 3-6 "
        "Pattern 9-11 NumberPattern 9-11 Pattern 13-22 SequencePattern 13-22 Pattern 14-15 Pattern 16-21 "
        "MappingPattern 16-21 Pattern 17-18 Pattern 19-20"
    )
    assert [start_i for _, start_i, *_, allow_as in patterns if allow_as is False] == [1, 13]
    with pytest.raises(ParseError):
        parser.ParseCaseStmt(*Tuples("case 1 2:"))
    parser.ParseMatchStmt(*Tuples("match a:"))
    assert {name for name, *_ in calls} == names


def test_overrides_of_the_extended_parser():
    calls = []

    class Parser(CExtendedMatchCaseParser):
        def _NodeForPattern(self, start_i, end_i, allow_as=True):
            calls.append((start_i, end_i, allow_as))
            return super()._NodeForPattern(start_i, end_i, allow_as)

        def ParseCaseStmt(self, toks, positions):  # leaves out what the class keeps of the line
            return CMatchCaseStatementParser.ParseCaseStmt(self, toks, positions)

    node = Parser(NEWER_DRIVER).ParseCaseStmt(*Tuples("case a, (), 'b' 'c' as d, [*e, f] if g: h"))
    assert calls == [
        *((1, 17, True), (1, 2, True), (3, 5, True), (6, 10, True), (6, 8, False)),
        *((11, 17, True), (12, 14, True), (15, 16, True)),
    ]
    assert [Tokens(part) for part in (node.GetGuard(), node.GetBody())] == ["if g : pass", "h"]


@pytest.mark.parametrize(
    ("operation", "answer", "failure"),
    [
        ("_RemoveSkipToks", None, TypeError),
        ("_RemoveSkipToks", ((),), ValueError),
        ("_RemoveSkipToks", ([], ()), TypeError),
        ("_ParseExceptionAt", KeyError("odd"), KeyError),
        ("_ParseExceptionAt", None, TypeError),
        ("_ParseExceptionAt", KeyError, TypeError),
    ],
)
def test_answers_of_overrides_that_do_not_fit(operation, answer, failure):
    parser = type("Parser", (CMatchCaseStatementParser,), {operation: lambda *_: answer})(DRIVER)
    with pytest.raises(failure):
        parser.ParseCaseStmt(*Tuples("case ...:"))


def test_searches_that_go_back_are_refused():
    def Back(self, target, *arguments):
        return {",": 2, ":": 6, "]": 6}.get(target, -1)

    for base, search in [
        (CMatchCaseStatementParser, lambda cls: cls(DRIVER).ParseCaseStmt(*Tuples("case [a, b]:"))),
        (CPGenParserImpl, lambda cls: Parse("def f[T, U](): pass", driver=cls(VERSION))),
    ]:
        with pytest.raises(ValueError, match=r"return -1 or an index in \[\d, \d\), not 2"):
            search(type("Parser", (base,), {"_NonNestedFindTokenIndex": Back}))


def test_tokens_are_kept_during_a_parse_only():
    class Parser(CMatchCaseStatementParser):
        def _NodeForPattern(self, start_i, end_i, allow_as=True):
            self.ParseMatchStmt(*Tuples("match a:"))
            return super()._NodeForPattern(start_i, end_i, allow_as)

    with pytest.raises(TypeError, match="no match or case statement"):
        Parser(DRIVER).ParseCaseStmt(*Tuples("case a:"))
    parser = DRIVER._fMatchCaseStatementParser
    for text in ("case a:", "case a b:"):
        Place(text)
        for ask in (parser._TokNode, parser._ParseExceptionAt, lambda i: parser._NodeForPattern(i, 1)):
            with pytest.raises(TypeError):
                ask(0)
        with pytest.raises(TypeError):
            parser._NonNestedFindTokenIndex("a", 0, 1)


def test_skipped_tokens():
    remove = CMatchCaseStatementParser(None)._RemoveSkipToks
    toks, rows = ("case", "# a", "\\", "1", "\\", ":", "\\"), (0, 0, 1, 2, 2, 2, 2)
    positions = tuple((row, i) for i, row in enumerate(rows))
    assert remove(toks, positions) == (
        ("case", "1", "\\", ":", "\\"),
        ((0, 0), (2, 3), (2, 4), (2, 5), (2, 6)),
    )
    for toks, failure in [((None,), TypeError), (("",), IndexError), (("a", "b"), IndexError)]:
        with pytest.raises(failure):
            remove(toks, ((0, 0),))


def test_searches_outside_brackets():
    class Parser(CMatchCaseStatementParser):
        def _ParseCaseStmtImpl(self):
            self.found = [self._NonNestedFindTokenIndex(*search) for search in self.searches]

    toks, positions = ByHand("x ( x [ x } x ) , ) x ( , ) (")
    parser = Parser(DRIVER)
    parser.searches = [(tok, start, 15) for tok in "x(),[" for start in range(15)] + [("x", 3, 3)]
    parser.ParseCaseStmt(toks, positions)
    found = [DRIVER._NonNestedFindTokenIndex(tok, toks, *ends) for tok, *ends in parser.searches]
    assert parser.found == found and {-1, 10, 14} < set(found)


def test_a_parser_without_a_driver():
    with pytest.raises(AttributeError):
        CMatchCaseStatementParser(None).ParseCaseStmt(*Tuples("case a:"))
    with pytest.raises(TypeError):
        CMatchCaseStatementParser("driver")
    with pytest.raises(AttributeError):
        DRIVER._fMatchCaseStatementParser = None


def test_driver_and_parser_are_collected():
    driver = type("Driver", (CPGenParserImpl,), {})(VERSION)
    gone = weakref.ref(driver)
    del driver
    gc.collect()
    assert gone() is None


def test_these_statements_need_positions():
    with pytest.raises(TypeError):
        DRIVER.ParseToksToNode(("case", "1", ":"), False, None)
