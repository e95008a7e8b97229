"""The plain trees of a text beside those of the hosted parser: node classes, rules, places, texts, faults.

Run it to compare whole files; tests/test_plain_trees.py holds what came out.

    python tests/plain_trees.py [--versions 2.7,3.8,3.14] [FILE...]
"""

import argparse
from collections.abc import Iterator
from functools import cache
from pathlib import Path
from typing import NamedTuple

from library import library_files

from codeloom._analysis import DumpTrees
from codeloom.line_trees import new_parser
from codeloom.logicalline import CLogicalLine
from codeloom.optpgen import ParseError
from codeloom.reading.languages import Language, language_of
from codeloom.treesift import CNode, CPGenParserImpl
from codeloom.utils import GetLogicalsFromText

_MOST_INDENTS = 50


class Outcome(NamedTuple):
    """A tree as rows of text, or what is wrong at which token."""

    dump: str
    fault: str | None
    token: int


class Difference(NamedTuple):
    tokens: tuple[str, ...]
    hosted: Outcome
    plain: Outcome


def Differences(text: str, version: str) -> Iterator[Difference]:
    """The lines of `text`, embedded ones too, of which the two parsers think differently."""
    language = language_of(text, version)
    major, minor, _ = language.version_triple
    has_print_function = language.grammar_file.endswith("print-function")
    plain_trees = iter(DumpTrees(text, 100 * major + minor, has_print_function))
    for logical in GetLogicalsFromText(text):
        for line in (logical, *logical.GetExpLogicals()):
            plain = Outcome(*next(plain_trees))
            if _IsMisplaced(line, language):
                continue
            hosted = _HostedOutcome(line, logical.fInAsyncDef, language)
            if plain != hosted and not _IsTakenByGrammar(line, language, hosted, plain):
                yield Difference(line.fToks, hosted, plain)
    assert next(plain_trees, None) is None


def _IsMisplaced(line: CLogicalLine, language: Language) -> bool:
    """True where the hosted parser of 2.7 counts tokens from elsewhere, or stumbles over removed ones."""
    return not language.is_py3 and not {"match", "case"}.isdisjoint(line.fToks)


def _IsTakenByGrammar(line: CLogicalLine, language: Language, hosted: Outcome, plain: Outcome) -> bool:
    """True where the hosted parser of 2.7 refuses `with ():` or `type is x`, which the grammar takes."""
    is_unusual = not language.is_py3 and not {"with", "type"}.isdisjoint(line.fToks[:2])
    return is_unusual and hosted.fault is not None and plain.fault is None


@cache
def _HostedParser(language: Language) -> CPGenParserImpl:
    return new_parser(language)


def _HostedOutcome(line: CLogicalLine, in_async_def: bool, language: Language) -> Outcome:
    parser = _HostedParser(language)
    try:
        node = parser.ParseToNode(line, in_async_def)
    except ParseError as error:
        return Outcome("", "invalid syntax", _TokenIndex(error.args[3], line))
    except SyntaxError as error:
        assert error.lineno is not None and error.offset is not None
        form = error.msg.partition(" needs Python ")[0].partition(" ended with Python ")[0]
        return Outcome("", form, _TokenIndex((error.lineno - 1, error.offset - 1), line))
    if node is None:
        return Outcome("", None, -1)
    dump = _Dump(node, line)
    parser.DiscardNode(node)
    return Outcome(dump, None, -1)


def _TokenIndex(context: int | tuple[int, int], line: CLogicalLine) -> int:
    """That of a node or an error; the parser that reads patterns gives positions."""
    index = line.fPositions.index(context) if isinstance(context, tuple) else context
    return min(index, line.fTokenCount)


def _Dump(root: CNode, line: CLogicalLine) -> str:
    rows = []
    pending = [(root, 0)]
    while pending:
        node, depth = pending.pop()
        number = 0 if node.fClsInfo is None else node.fClsInfo.fNodeType
        text = "" if node.fText is None else " " + node.fText.replace("\n", "\\n")
        indent = "  " * min(depth, _MOST_INDENTS)
        rows.append(f"{indent}{type(node).__name__} {number} @{_FirstToken(node, line)}{text}\n")
        pending += [(child, depth + 1) for child in reversed(node.fChildren or ())]
    return "".join(rows)


def _FirstToken(node: CNode, line: CLogicalLine) -> int:
    if node.fContext is not None:
        return _TokenIndex(node.fContext, line)
    # A node that no rule makes has no place of its own.
    return min(_FirstToken(child, line) for child in node.fChildren)


def main() -> None:
    arguments = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    arguments.add_argument("--versions", default="2.7,3.4,3.6,3.8,3.11,3.14")
    arguments.add_argument("files", nargs="*", type=Path, default=None)
    options = arguments.parse_args()
    files = options.files or library_files()
    for version in options.versions.split(","):
        count = 0
        for path in files:
            for difference in Differences(path.read_text("utf-8", "replace"), version):
                count += 1
                print(path, version, *difference, sep="\n  ")
        print(f"{version}: {len(files)} files, {count} differences", flush=True)


if __name__ == "__main__":
    main()
