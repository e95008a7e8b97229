"""The classes and defs around each line of a text, and the hints of methods."""

import re
from collections.abc import Sequence
from dataclasses import dataclass, replace
from itertools import pairwise

from codeloom import logicalline
from codeloom.logicalline import CLogicalLine
from codeloom.records import CRecord
from codeloom.source import RowMap

_FUNCTION_HINT = re.compile(r"#\s*type:\s*\(")


@dataclass
class Scope:
    """A class or a def whose body is being read; `of_def` is the number of the def, from zero."""

    indent: int
    name: str
    of_def: int | None = None


class ScopeReader:
    """Follows the scopes through the lines of one text, which are read in their order."""

    def __init__(self, row_map: RowMap) -> None:
        self._fRowMap = row_map
        self._fScopes: list[Scope] = []
        self._fDefCount = 0

    def Read(self, logical: CLogicalLine) -> None:
        """Take the next line; a class or a def is then the innermost scope."""
        if not logical.fTokenCount or logical.fType == logicalline.kComment:
            return
        indent = self._Indent(logical)
        while indent is not None and self._fScopes and self._fScopes[-1].indent >= indent:
            self._fScopes.pop()
        if logical.fType == logicalline.kClassDef:
            self._fScopes.append(Scope(indent or 0, _NameBehind("class", logical)))
        elif logical.fType == logicalline.kFunctionDef:
            self._fScopes.append(Scope(indent or 0, _NameBehind("def", logical), self._fDefCount))
            self._fDefCount += 1

    @property
    def innermost(self) -> Scope | None:
        """The scope that the next line stands in, unless it is less indented."""
        return self._fScopes[-1] if self._fScopes else None

    @property
    def is_method(self) -> bool:
        """True when the innermost scope is a def right in a class."""
        return len(self._fScopes) > 1 and self._fScopes[-2].of_def is None

    @property
    def name(self) -> str:
        """The name of the innermost scope behind those of the scopes around it."""
        return ".".join(scope.name for scope in self._fScopes)

    def _Indent(self, logical: CLogicalLine) -> int | None:
        """The width of the blanks before a line; None behind another line on the same row."""
        row, col = logical.fPositions[0]
        before = self._fRowMap.Text(logical.fFirstLine + row).encode()[:col].decode()
        return None if before.strip() else len(before.rpartition("\f")[2].expandtabs())


def _NameBehind(keyword: str, logical: CLogicalLine) -> str:
    toks = [tok for tok in logical.fToks if tok and tok[0] not in "#\\"]
    behind = toks[toks.index(keyword) + 1 :] if keyword in toks else []
    return behind[0] if behind else "?"


def WithSelfLeftOut(records: Sequence[CRecord], logical: CLogicalLine) -> Sequence[CRecord]:
    """The records of a method, whose hint in a comment may leave out the first argument.

    There the engine gives each hint to the argument before the one it is meant for.
    """
    if not any(tok and _FUNCTION_HINT.match(tok) for tok in logical.fToks):
        return records
    arguments = [record.name for record in records if record.of_arg and record.kind.name == "Set"]
    if [record.name for record in records if _IsHintOfArgument(record)] != arguments[:-1]:
        return records
    meant = dict(pairwise(arguments))
    return [
        replace(record, name=meant[record.name]) if _IsHintOfArgument(record) else record
        for record in records
    ]


def _IsHintOfArgument(record: CRecord) -> bool:
    return record.of_arg and record.kind.name == "TypeHint" and record.name != "return"
