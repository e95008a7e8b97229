"""The trees of statements and the answers of their accessors, against golden files in trees/.

A row of a tree shows a node: its class, the grammar state, the text of a leaf, the index of its first
token. Beneath it, after dots, are the answers to what its class can be asked, and for brackets those of
the functions, a node as its tokens; None, False, an empty list and the node itself aren't shown. An operation
that takes an index is asked for one after another. Behind `---` stand the grammars; where both give the same
tree it is there once. The files in trees/extended/ hold what the extended parser alone takes.
"""

import re
from itertools import groupby
from pathlib import Path

import pytest
from golden import Cases, Check
from hand_made import DRIVERS, Parse, Tokens

from codeloom import treesift
from codeloom.optpgen import ParseError
from codeloom.treesift import (
    CAtom,
    CExpression,
    CExtendedParser,
    CNode,
    DropSimpleParens,
    IsGenExpression,
    IsSetLiteral,
    IsTupleLiteralNode,
)


def TokensInARow(node):
    return Tokens(node).replace("\n", "NEWLINE")


def IsRecord(value):
    return type(value).__module__ == CNode.__module__


def Readable(answer):
    if isinstance(answer, CNode):
        return TokensInARow(answer)
    if isinstance(answer, list | tuple):
        return f"[{' | '.join(map(Readable, answer))}]"
    if IsRecord(answer):
        values = ((name, getattr(answer, name)) for name in dir(answer) if not name.startswith("__"))
        fields = (f"{name}={Readable(value)}" for name, value in values if not callable(value))
        return " ".join([type(answer).__name__, *fields])
    return repr(answer)


def Accessors(cls):
    """The operations that a class adds to those of all nodes, with the types of their arguments."""
    for declaring in reversed(cls.__mro__[: cls.__mro__.index(CNode)]):
        # Every expression can be asked for sub-expressions; shown is what answers in its own way.
        if declaring is CExpression:
            continue
        for name, operation in vars(declaring).items():
            if not name.startswith("__") and callable(operation):
                ((signature, *_),) = operation.__nb_signature__
                yield name, re.findall(r", \w+: (\w+)", signature)


def IndexedAnswers(ask, count):
    """The answers for each index from 0 up to the first that has none."""
    for i in range(count):
        try:
            answer = ask(i)
        except ValueError:
            return
        if answer is None:
            return
        yield Readable(answer)


def Answers(node):
    for name, types in Accessors(type(node)):
        ask = getattr(node, name)
        if not types:
            answer = ask()
            if answer is not None and answer is not False and answer != []:
                yield f"{name}: {Readable(answer)}"
        elif types in (["int"], ["object"]):
            answers = list(IndexedAnswers(ask, node.GetChildCount()))
            if answers:
                yield f"{name}: {' | '.join(answers)}"
    for question in QUESTIONS if isinstance(node, CAtom) else ():
        answer = question(node)
        if answer is not False and answer is not node:
            yield f"{question.__name__}: {Readable(answer)}"


# What can be asked of brackets beside their accessors.
QUESTIONS = DropSimpleParens, IsSetLiteral, IsGenExpression, IsTupleLiteralNode


def Rows(node, indent=""):
    text = "" if node.fText is None else f" {node.fText!r}"
    yield f"{indent}{type(node).__name__} {node.GetStateName()}{text} @{node.fContext}"
    for answer in Answers(node):
        yield f"{indent}    . {answer}"
    for child in node.fChildren or ():
        yield from Rows(child, indent + "  ")


def Outcome(source, driver):
    try:
        tree = Parse(source, driver=driver)
    except ParseError as error:
        return f"refused at token {error.context}"
    outcome = "\n".join(Rows(tree))
    driver.DiscardNode(tree)
    return outcome


def Output(source):
    outcomes = [(version, Outcome(source, driver)) for version, driver in DRIVERS.items()]
    sections = [
        (", ".join(version for version, _ in same), outcome)
        for outcome, same in groupby(outcomes, key=lambda pair: pair[1])
    ]
    return "\n".join(f"--- {versions}\n{outcome}" for versions, outcome in sections)


# What no logical line of source yields: classes that nothing makes, and those that take more than one line.
NEVER_SHOWN = {"CTestExpr", "CBinaryOp", "CMappingPatternNode", "CPassStmt", "IsTwoPlusStringLiterals"}
NEVER_SHOWN |= {"CMultipleDecorators", "GetElseBody"}

CASES = Cases(Path(__file__).parent / "trees", ".tree")
EXTENDED_CASES = Cases(Path(__file__).parent / "trees/extended", ".tree")
NEWER_DRIVER = CExtendedParser((3, 14, 0))
# What ended with Python 2, and an empty list.
NEWER_REFUSES = {
    "an old octal number",
    "an old long number",
    "prefixes of strings",
    "no type parameters of a def",
}


@pytest.mark.parametrize("case", CASES)
def test_tree(case, rewrite):
    Check(case, Output(case.source), rewrite)


@pytest.mark.parametrize("case", EXTENDED_CASES)
def test_tree_of_the_extended_parser(case, rewrite):
    Check(case, f"--- 3.14\n{Outcome(case.source, NEWER_DRIVER)}", rewrite)


def Shape(outcome):
    """The rows of a tree without the names of grammar states and the places of single tokens."""
    outcome = outcome.replace("CExpression ELLIPSIS", "CNode ELLIPSIS")  # as the extended parser has it
    return re.sub(r"(?m)^( *\w+) \w+(.*?)(?: @\S.*)?$", r"\1\2", outcome)


@pytest.mark.parametrize("case", CASES)
def test_the_extended_parser_keeps_trees_and_answers(case):
    outcome = Outcome(case.source, DRIVERS["3.8"])
    if case.title in NEWER_REFUSES:
        with pytest.raises((SyntaxError, ParseError)):
            Parse(case.source, driver=NEWER_DRIVER)
    elif case.title == "with brackets around an expression":
        assert "( a ) as b" in Outcome(case.source, NEWER_DRIVER)  # the other one takes them off
    elif not outcome.startswith("refused") and case.title != "a list of an ellipsis":  # here an expression
        assert Shape(Outcome(case.source, NEWER_DRIVER)) == Shape(outcome)


def test_every_class_and_accessor_is_shown():
    rows = "\n".join(case.values[0].output for case in CASES)
    shown = set(re.findall(r"^ *(?:\. )?(\w+)", rows, re.MULTILINE))
    classes = [cls for cls in vars(treesift).values() if isinstance(cls, type) and issubclass(cls, CNode)]
    bases = {cls for cls in classes if any(cls in other.__bases__ for other in classes)}
    missing = {cls.__name__ for cls in classes if cls not in bases} - shown
    missing |= {name for cls in classes for name, _ in Accessors(cls)} - shown
    assert missing == NEVER_SHOWN
