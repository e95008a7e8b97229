"""The trees of statements and the answers of their accessors, against golden files in trees/.

A row of a tree shows a node: its class, the grammar state, the text of a leaf, the index of its first
token. Beneath it, behind dots, stand the answers to what its class can be asked, a node as its tokens;
None, False and an empty list aren't shown. An operation that takes an index is asked for one after another.
Behind `---` stand the grammars; where both give the same tree it is there once.
"""

import re
from itertools import groupby
from pathlib import Path

import pytest
from golden import Cases, Check

from codeloom.languages import LanguageNamed
from codeloom.optpgen import ParseError
from codeloom.treesift import CExpression, CNode, CPGenParserImpl
from codeloom.utils import GetLogicalsFromText

GRAMMARS = ("3.8", "2.7")


def Driver(name):
    language = LanguageNamed(name)
    return CPGenParserImpl(language.version_triple, language.grammar_file, language.keywords, language.is_py3)


DRIVERS = {name: Driver(name) for name in GRAMMARS}


def Tokens(node):
    if node.fChildren is None:
        return "NEWLINE" if node.fText == "\n" else node.fText
    return " ".join(map(Tokens, node.fChildren))


def IsRecord(value):
    return type(value).__module__ == CNode.__module__


def Readable(answer):
    if isinstance(answer, CNode):
        return Tokens(answer)
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
            if answer not in (None, False, []) or type(answer) is int:
                yield f"{name}: {Readable(answer)}"
        elif types in (["int"], ["object"]):
            answers = list(IndexedAnswers(ask, node.GetChildCount()))
            if answers:
                yield f"{name}: {' | '.join(answers)}"


def Rows(node, indent=""):
    text = "" if node.fText is None else f" {node.fText!r}"
    yield f"{indent}{type(node).__name__} {node.GetStateName()}{text} @{node.fContext}"
    for answer in Answers(node):
        yield f"{indent}    . {answer}"
    for child in node.fChildren or ():
        yield from Rows(child, indent + "  ")


def Outcome(source, driver):
    (logical,) = GetLogicalsFromText(source)
    try:
        tree = driver.ParseToNode(logical, in_async_def=True)
    except ParseError as error:
        return f"refused at token {error.context}"
    outcome = "\n".join(Rows(tree))
    driver.DiscardNode(tree)
    return outcome


def Output(source):
    outcomes = [(name, Outcome(source, driver)) for name, driver in DRIVERS.items()]
    sections = [
        (", ".join(name for name, _ in same), outcome)
        for outcome, same in groupby(outcomes, key=lambda pair: pair[1])
    ]
    return "\n".join(f"--- {names}\n{outcome}" for names, outcome in sections)


@pytest.mark.parametrize("case", Cases(Path(__file__).parent / "trees", ".tree"))
def test_tree(case, rewrite):
    Check(case, Output(case.source), rewrite)
