"""The analyzer's error policy, embedded expressions, and syntax errors with their places."""

from types import SimpleNamespace

import pytest

from codeloom import treesift
from codeloom.logicalline import (
    CLogicalLine,
    kAssignment,
    kComment,
    kCommentedTypeHint,
    kFstringFieldExp,
    kStringifiedTypeHint,
)
from codeloom.treesift import CPGenAnalyzerImpl, CreateSyntaxError
from codeloom.utils import GetLogicalsFromText

VERSION = (3, 8, 0)
ANALYZER = CPGenAnalyzerImpl(VERSION)


def Logical(text):
    (logical,) = GetLogicalsFromText(text)
    return logical


def ByHand(text, type=kAssignment, first_line=0, exp_logicals=()):
    """A logical of blank-separated tokens on one row."""
    toks = tuple(text.split())
    columns = [sum(len(tok) + 1 for tok in toks[:i]) for i in range(len(toks))]
    return CLogicalLine(type, toks, tuple((0, col) for col in columns), first_line, exp_logicals)


def Analyze(logical, in_async_def=False, first_in_def=False):
    return ANALYZER.AnalyzeSingleLogical(logical, in_async_def, first_in_def)


def Place(error):
    return (error.filename, error.lineno, error.offset, error.text)


class Failing(CPGenAnalyzerImpl):
    """An analyzer whose walk leaves a record and then raises an error."""

    def __init__(self, error=None):
        super().__init__(VERSION)
        self.error = error
        self.seen = []

    def _InspectEmbeddedExpressions(self, logical, node, in_async_def, first_in_def):
        self.seen.append((logical, node))
        logical.AppendTypeEquiv(b"x", b"y")
        if self.error is not None:
            raise self.error


@pytest.mark.parametrize(
    ("text", "row", "offset"),
    [
        ("x = (", 1, 6),  # after the last token
        (") = 1", 1, 1),
        ("x = = 1", 1, 5),
        ("f(a,\n  b,\n  c d)", 3, 5),
        ("é = = 1", 1, 6),  # columns count bytes
        ("x = 'abc", 1, 5),
        ("class", 1, 6),
        ("x = 1 \\ y", 1, 7),
        ("else x", 1, 6),
        ("@ = 1", 1, 3),
        ("try: x = = 1", 1, 10),
        ("x = '\u2028\x0b' y", 1, 12),  # neither of them ends a row
    ],
)
def test_place_of_a_syntax_error(text, row, offset):
    error = Analyze(Logical(text))
    assert type(error) is SyntaxError and error.msg == "invalid syntax"
    assert Place(error) == ("<string>", row, offset, text)


def test_an_error_is_reported_once():
    logical = Logical("x = = 1")
    assert Analyze(logical) is not None and logical.fParsed
    assert Analyze(logical) is None
    logical.MarkParsed(False)
    assert Analyze(logical) is not None


def test_an_analyzed_logical_is_left_alone():
    logical = Logical("x = 1")
    logical.MarkParsed(True)
    logical.AppendTypeEquiv(b"x", b"y")
    assert Analyze(logical) is None and logical.fTypeEquivs == [(b"x", b"y")]


def test_logicals_of_nothing():
    for toks, positions in (((), ()), ((None, None), ((0, 0), (0, 1)))):
        assert Analyze(CLogicalLine(kAssignment, toks, positions)) is None


def test_a_comment_is_not_parsed_but_inspected():
    analyzer, comment = Failing(), Logical("# = = =")
    assert analyzer.AnalyzeSingleLogical(comment, False) is None
    assert analyzer.seen == [(comment, None)]


@pytest.mark.parametrize("error", [TypeError("odd"), KeyboardInterrupt(), SyntaxError("rejected"), None])
def test_the_outcome_of_a_walk(error, caplog):
    analyzer, logical = Failing(error), Logical("x = f(1)")
    is_returned = isinstance(error, SyntaxError)
    assert analyzer.AnalyzeSingleLogical(logical, False) is (error if is_returned else None)
    assert (logical.fTypeEquivs is None) == (error is not None)
    ((_, node),) = analyzer.seen  # it has gone back in any case
    assert (node.fText, node.fChildren) == (None, None) and node.fClsInfo.fFirstFree is node
    logged = [record.exc_info for record in caplog.records]
    assert len(logged) == (error is not None and not is_returned)
    if isinstance(error, KeyboardInterrupt):
        assert logged[0][1] is error  # as it is, like all that isn't an Exception
    if isinstance(error, TypeError):
        assert str(logged[0][1]) == (
            "Could not analyze logical -- inner exception is TypeError('odd')\n  logical tokens: x = f ( 1 )"
        )
        assert caplog.text.count("in _InspectEmbeddedExpressions") == 2  # the outer one has its traceback


def test_a_removed_token_spoils_the_log_text(caplog):
    logical = CLogicalLine(kAssignment, ("x", None, "=", "1"), ((0, 0), (0, 1), (0, 2), (0, 4)))
    assert Failing(ValueError("odd")).AnalyzeSingleLogical(logical, False) is None
    assert isinstance(caplog.records[0].exc_info[1], TypeError)


def test_the_report_is_looked_up_at_the_call_and_its_failure_is_raised(monkeypatch):
    def Report(**options):
        raise OSError(options)

    monkeypatch.setattr(treesift, "reflect", SimpleNamespace(ReportCurrentException=Report))
    with pytest.raises(OSError, match=r"{'suppress_gui': True}"):
        Failing(KeyboardInterrupt()).AnalyzeSingleLogical(Logical("x"), False)


# Embedded expressions


@pytest.mark.parametrize(
    ("type", "message"),
    [(kFstringFieldExp, "invalid syntax"), (kStringifiedTypeHint, "invalid syntax in stringified type hint")],
)
def test_messages_of_embedded_errors(type, message):
    inner = ByHand("a b", type, first_line=7)
    logical = ByHand("x = 1", first_line=5, exp_logicals=(ByHand("a"), inner))
    error = Analyze(logical)
    assert error.msg == message
    assert Place(error) == (message, 3, 3, "a b")
    with pytest.raises(SyntaxError, match=message):
        ANALYZER._InspectSingleLogical(logical, False)
    assert logical.fTypeEquivs is None


def test_commented_hints_are_left_to_the_hint_walker():
    assert Analyze(ByHand("x = 1", exp_logicals=(ByHand("a b", kCommentedTypeHint),))) is None


def test_equivs_are_lifted_in_order():
    class Analyzer(CPGenAnalyzerImpl):
        def _InspectSingleLogical(
            self, logical, in_async_def, in_embedded_expression=False, first_in_def=False
        ):
            if in_embedded_expression:
                logical.AppendTypeEquiv(logical.fToks[0].encode(), b"seen")
                logical.AppendArgTypeEquiv(b"not", b"lifted")
            return super()._InspectSingleLogical(logical, in_async_def, in_embedded_expression, first_in_def)

    logical = ByHand("x = 1", exp_logicals=(ByHand("a", kFstringFieldExp), ByHand("b", kStringifiedTypeHint)))
    assert Analyzer(VERSION).AnalyzeSingleLogical(logical, False) is None
    names = [name for name, equiv in logical.fTypeEquivs if equiv == b"seen"]
    assert names == [b"a", b"b"] and logical.fArgTypeEquivs is None


def test_embedded_logicals_have_no_embedded_logicals_of_their_own():
    inner = ByHand("a", kFstringFieldExp, exp_logicals=(ByHand("b c", kFstringFieldExp),))
    assert Analyze(ByHand("x = 1", exp_logicals=(inner,))) is None


def test_records_may_change_while_they_are_lifted():
    class Line(CLogicalLine):
        def GetExpLogicals(self):
            return (self.inner or self,)

        def AppendTypeEquiv(self, name, equiv):
            if self.inner:
                self.inner.ClearDerivedInfo()
            super().AppendTypeEquiv(name, equiv)

    class Analyzer(CPGenAnalyzerImpl):
        def _InspectSingleLogical(self, logical, *arguments):
            logical.AppendTypeEquiv(b"x", b"y")
            assert len(logical.fTypeEquivs) < 3  # now they are a list of the host's
            return logical.fToks == ("a",) or super()._InspectSingleLogical(logical, *arguments)

    for inner, count in ((None, 4), (ByHand("a"), 2)):
        logical = Line(kAssignment, ("1",), ((0, 0),))
        logical.inner = inner
        assert Analyzer(VERSION).AnalyzeSingleLogical(logical, False) is None
        assert logical.fTypeEquivs == [(b"x", b"y")] * count


def test_logicals_far_apart_and_deep():
    inner = ByHand("a b", kFstringFieldExp, first_line=2**31 - 1)
    assert Analyze(ByHand("x", first_line=-(2**31), exp_logicals=(inner,))).lineno == 2**32
    for _ in range(100_000):
        inner = ByHand("a", exp_logicals=(inner,))
    with pytest.raises(RecursionError):
        inner.ClearDerivedInfo()


def test_exp_logicals_must_be_a_tuple(caplog):
    class Odd(CLogicalLine):
        def GetExpLogicals(self):
            return None

    assert Analyze(Odd(kAssignment, ("x",), ((0, 0),))) is None
    assert "TypeError" in caplog.text


# Syntax errors


def Attributes(**changed):
    logical = {"fToks": ("ab", "é\ncd"), "fPositions": ((0, 0), (0, 3)), "fTokenCount": 2}
    return SimpleNamespace(**logical | changed)


SAME_ROW = SimpleNamespace(lineno=0, utf8_col=2)
LATER_ROW = SimpleNamespace(lineno=2, utf8_col=1)


@pytest.mark.parametrize(
    ("context", "place_in_token", "lineno", "offset"),
    [
        (0, None, 1, 1),
        (1, None, 1, 4),
        (-1, None, 1, 4),
        (2, None, 1, 9),
        (99, None, 1, 9),
        ((4, 2), None, 5, 3),
        (1, SAME_ROW, 1, 6),
        (1, LATER_ROW, 3, 2),
        ((4, 2), LATER_ROW, 5, 3),  # a given place isn't refined
        (2, LATER_ROW, 1, 9),  # nor is the end
    ],
)
def test_create_syntax_error(context, place_in_token, lineno, offset):
    error = CreateSyntaxError("message", Attributes(), context, place_in_token)
    assert error.msg == "message" and Place(error) == ("<string>", lineno, offset, "ab é\ncd")


def test_a_removed_token_has_its_place():
    toks, positions = ("x", None, "=", None), ((0, 0), (0, 2), (0, 4), (1, 6))
    error = Analyze(CLogicalLine(kAssignment, toks, positions))
    assert Place(error) == ("<string>", 2, 7, "x   =")


def test_an_empty_logical_is_at_its_start():
    error = CreateSyntaxError("m", Attributes(fToks=(), fPositions=(), fTokenCount=0), None)
    assert Place(error) == ("<string>", 1, 1, "")


@pytest.mark.parametrize(
    ("logical", "context", "failure"),
    [
        (Attributes(), None, TypeError),
        (Attributes(), "x", TypeError),
        (Attributes(), (1, 2, 3), ValueError),
        (Attributes(fPositions=((0, 0), (0, 1, 2))), 1, ValueError),
        (Attributes(fTokenCount=3, fPositions=((0, 0),) * 3), 2, IndexError),
        (SimpleNamespace(), 0, AttributeError),
    ],
)
def test_broken_places(logical, context, failure):
    with pytest.raises(failure):
        CreateSyntaxError("m", logical, context)


def test_wrong_types_are_refused():
    for call in [
        lambda: CPGenAnalyzerImpl("3.8"),
        lambda: CPGenAnalyzerImpl(None),
        lambda: CPGenAnalyzerImpl(VERSION, 7),
        lambda: ANALYZER.AnalyzeSingleLogical("x = 1", False),
        lambda: ANALYZER.AnalyzeSingleLogical(None, False),
        lambda: ANALYZER.ParseTokenListToNode("x"),
        lambda: CLogicalLine(1, (), ()),
        lambda: CLogicalLine(kComment, [], []),
        lambda: CLogicalLine(kComment, (1,), ((0, 0),)),
        lambda: CLogicalLine(kComment, (), (), 0, ("x",)),
        lambda: CLogicalLine(kComment, ("x",), ((0, 0),), tok_types=("x",)).GetTokenType(0),
    ]:
        with pytest.raises(TypeError):
            call()
    with pytest.raises(ValueError, match="one length"):
        CLogicalLine(kComment, ("x",), ())
