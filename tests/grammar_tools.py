"""What the tests of grammars and parser share: token tables, a small tokenizer, an oracle.

The oracle is the interpreter's own pgen. It reads the same grammar files, and its driver calls the
converter for the same nodes in the same order as ours has to.
"""

import re
from pathlib import Path
from typing import NamedTuple
from unittest.mock import patch

from lib2to3_of_host import grammar, parse, pgen, token

import codeloom
from codeloom import _fastaccess, optpgen


class TokenTables(NamedTuple):
    names: dict[int, str]
    operators: dict[str, int]

    def NumberOf(self, name):
        return next(number for number, known in self.names.items() if known == name)


def _NamesOf(module, prefix=""):
    return {
        number: name.removeprefix(prefix)
        for name, number in vars(module).items()
        if name.startswith(prefix) and isinstance(number, int) and number < 256
    }


# As the engine's driver composes them; two pairs of operators share a number.
ENGINE = TokenTables(_NamesOf(_fastaccess, "kTokenId_"), {**grammar.opmap, "...": 52, "->": 51, ":=": 53})
ORACLE = TokenTables(_NamesOf(token), {**grammar.opmap, "...": 61})

OPERATORS = sorted(ORACLE.operators, key=len, reverse=True)
TOKEN = re.compile(
    r"""(?P<STRING>[a-zA-Z]{0,2}("[^"\n]*"|'[^'\n]*'))
      | (?P<NUMBER>\d[\w.]*) | (?P<NAME>\w+) | (?P<NEWLINE>\n[ ]*) | (?P<COMMENT>\#.*)
      | (?P<OPERATOR>"""
    + "|".join(map(re.escape, OPERATORS))
    + ")",
    re.VERBOSE,
)


def GrammarPath(version):
    folder = Path(codeloom.__file__).parent / "resources" / "pgen-grammars"
    return str(folder / f"Python-Grammar-{version}")


def LoadGrammar(path, tables=ENGINE):
    return optpgen.ParserGenerator(path, tables.names, tables.operators).make_grammar()


def LoadOracle(path):
    with patch.dict(grammar.opmap, ORACLE.operators):
        return pgen.ParserGenerator(path).make_grammar()


def Tokens(text, version="3.8", tables=ENGINE):
    """Types and texts of the tokens of a source, with indents, dedents and the end marker."""
    found, indents, depth = [], [0], 0
    for match in TOKEN.finditer(text + "\n"):
        kind, value = match.lastgroup, match.group()
        depth += (value in "([{") - (value in ")]}")
        if kind == "COMMENT" or (kind == "NEWLINE" and depth):
            continue
        if kind == "OPERATOR":
            split = value == "..." and version == "2.7"
            found += [(tables.operators["."], ".")] * 3 if split else [(tables.operators[value], value)]
            continue
        if kind == "NAME" and value in ("async", "await") and version != "2.7":
            kind = value.upper()
        found.append((tables.NumberOf(kind), value[:1] if kind == "NEWLINE" else value))
        if kind == "NEWLINE":
            indent = len(value) - 1
            if indent > indents[-1]:
                indents.append(indent)
                found.append((tables.NumberOf("INDENT"), value[1:]))
            while indent < indents[-1]:
                indents.pop()
                found.append((tables.NumberOf("DEDENT"), ""))
    return [*found, (tables.NumberOf("ENDMARKER"), None)]


def Feed(parser, tokens, start=None):
    """The root of a parse; each token's context is its index."""
    parser.setup(start)
    for index, (type, value) in enumerate(tokens):
        parser.addtoken(type, value, index)
    return parser.finish()


class Outcome(NamedTuple):
    calls: list  # of the converter: (type, value, context, number of children or None)
    root: tuple | None
    end: int | None  # the index of the token that was refused, or that completed the start symbol


class _RecordingConverter(optpgen.NodeConverter):
    def __init__(self):
        super().__init__()
        self.calls = []

    def convert(self, grammar, type, value, context, children):
        self.calls.append((type, value, context, children and len(children)))
        return super().convert(grammar, type, value, context, children)


def ParseWithOurs(loaded, tokens, promotes, start=None):
    converter = _RecordingConverter()
    parser = optpgen.CreateParser(loaded, converter, promotes)
    parser.setup(start)
    for index, (type, value) in enumerate(tokens):
        try:
            if parser.addtoken(type, value, index):
                return Outcome(converter.calls, parser.finish(), index)
        except optpgen.ParseError as error:
            assert (error.type, error.value, error.context) == (type, value, index)
            return Outcome(converter.calls, None, index)
    return Outcome(converter.calls, None, None)


class _OracleNode(tuple):
    """The oracle's parser puts an attribute on its root."""


def ParseWithOracle(loaded, tokens, promotes, start=None):
    calls = []

    def Convert(_, node):
        type, value, context, children = node
        if promotes and children and len(children) == 1:
            return children[0]
        context = 0 if context is None else context  # it gives the start symbol none
        calls.append((type, value, context, children and len(children)))
        return _OracleNode((type, value, context, children))

    parser = parse.Parser(loaded, Convert)
    parser.setup(start)
    for index, (type, value) in enumerate(tokens):
        try:
            if parser.addtoken(type, value, index):
                return Outcome(calls, parser.rootnode, index)
        except parse.ParseError:
            return Outcome(calls, None, index)
    return Outcome(calls, None, None)
