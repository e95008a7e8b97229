"""The defs of a source: their arguments with types and defaults, and what they are known to give back."""

import re
from collections.abc import Iterable, Iterator
from dataclasses import dataclass, field, replace
from typing import Any

from codeloom._analysis import Analysis, Line, LineKind, Problem, Record, RecordKind
from codeloom._literals import EvaluateStringLiteral
from codeloom.line_trees import new_parser
from codeloom.reading.languages import language_of
from codeloom.strutils import AsStr
from codeloom.symbolinfo import JoinTokens, kArgPrefix
from codeloom.treesift import (
    CFuncdefStmt,
    CNode,
    CStringLiteral,
    DropSimpleParens,
    FinishedWithNode,
    GetDefiningArgInfoList,
)
from codeloom.utils import GetLogicalsFromText

_ARGUMENT_PREFIX = kArgPrefix.decode()


@dataclass(frozen=True, slots=True)
class Value:
    """What is known of a value on a row, from 1: its type, the text that it is written as, or both."""

    row: int
    type: str | None
    text: str | None


@dataclass(frozen=True, slots=True)
class Argument:
    """One argument: its stars, its type by annotation or comment, and its default.

    A bare `*` and a `/` are among the arguments without a name.
    """

    name: str | None
    prefix: str = ""
    hint: str | None = None
    default: Value | None = None


@dataclass(frozen=True, slots=True)
class Signature:
    """One def, or what is wrong with its line.

    `name` is that of the def after those of the classes and defs around it. `row` and `column` count
    from 1, the column in characters. Where the parameters are nested too deep to be told, as only those
    of Python 2 can be, `arguments` is None.
    """

    path: str
    row: int
    column: int
    name: str = ""
    is_async: bool = False
    type_parameters: tuple[str, ...] = ()
    arguments: tuple[Argument, ...] | None = ()
    return_hint: str | None = None
    returns: tuple[Value, ...] = ()
    yields: tuple[Value, ...] = ()
    problem: Problem | None = None


def signatures_of(analysis: Analysis) -> list[Signature]:
    """The signatures of the defs in a text, in its order."""
    reader = _SignatureReader(analysis)
    for line in analysis.lines:
        reader.read(line)
    return reader.signatures()


@dataclass
class _Scope:
    """A class or a def whose body is being read; `of_def` is the number of the def, from zero."""

    indent: int
    name: str
    of_def: int | None = None


@dataclass
class _Def:
    """A def, and what its body is known to give so far."""

    signature: Signature
    is_method: bool
    has_body: bool = False
    returns: list[Value] = field(default_factory=list)
    yields: list[Value] = field(default_factory=list)


class _SignatureReader:
    """Reads the logical lines of one text in their order."""

    def __init__(self, analysis: Analysis) -> None:
        self._path = analysis.path
        self._parser = new_parser(language_of(analysis.text, analysis.python))
        self._defs: list[_Def] = []
        self._scopes: list[_Scope] = []

    def signatures(self) -> list[Signature]:
        """What was read so far."""
        return [
            replace(known.signature, returns=tuple(known.returns), yields=tuple(known.yields))
            for known in self._defs
        ]

    def read(self, line: Line) -> None:
        """Read the next line."""
        if line.kind is LineKind.COMMENT:
            self._read_comment(line)
            return
        indent = line.indent
        while indent is not None and self._scopes and self._scopes[-1].indent >= indent:
            self._scopes.pop()
        if line.kind is LineKind.CLASS:
            self._scopes.append(_Scope(indent or 0, _name_after("class", line.text)))
        elif line.kind is LineKind.DEF:
            self._read_def(line, indent or 0)
        elif self._scopes and self._scopes[-1].of_def is not None:
            self._read_body(line, self._defs[self._scopes[-1].of_def])

    # Lines

    def _read_def(self, line: Line, indent: int) -> None:
        """Add the signature of a def, or its fault."""
        is_method = bool(self._scopes) and self._scopes[-1].of_def is None
        self._scopes.append(_Scope(indent, _name_after("def", line.text), len(self._defs)))
        name = ".".join(scope.name for scope in self._scopes)
        place = line.range
        signature = Signature(self._path, place.row, place.column, name, line.text.startswith("async"))
        for problem in line.problems:
            signature = replace(signature, problem=problem)
            break
        else:
            signature = self._filled(signature, line)
        self._defs.append(_Def(signature, is_method))

    def _filled(self, signature: Signature, line: Line) -> Signature:
        (logical,) = GetLogicalsFromText(line.text)
        tree = self._parser.ParseToNode(logical, signature.is_async)
        if tree is None:
            return signature
        try:
            return _filled(signature, tree, line.records)
        except RecursionError:  # as only tuples among the parameters of Python 2 can be nested
            return replace(signature, arguments=None)
        finally:
            FinishedWithNode(tree)

    def _read_body(self, line: Line, known: _Def) -> None:
        """Take what a line in the body of a def gives back."""
        known.has_body = True
        for record in line.records:
            if record.name in _OUTCOMES and record.kind is not RecordKind.GET:
                values = known.returns if record.name == "return" else known.yields
                values.append(_value_of(record, line.range.row))

    def _read_comment(self, line: Line) -> None:
        """Take the hint of a def on the first row of its body."""
        scope = self._scopes[-1] if self._scopes else None
        if scope is None or scope.of_def is None or (line.indent or 0) <= scope.indent:
            return
        known = self._defs[scope.of_def]
        if not known.has_body:
            known.has_body = True
            known.signature = _with_hints_of_body(known.signature, line.records, known.is_method)


_OUTCOMES = ("return", "yield")


def _name_after(keyword: str, text: str) -> str:
    _, _, rest = text.partition(f"{keyword} ")
    return next(iter(re.findall(r"\w+", rest)), "?")


def _value_of(record: Record, row: int) -> Value:
    value = record.value
    if record.kind is not RecordKind.LITERAL or not isinstance(value, tuple):
        return Value(row, None, record.payload)
    return Value(row, *value)


# The signature of one def


def _filled(signature: Signature, tree: CNode, records: Iterable[Record]) -> Signature:
    """A signature with what the tree and the records say of its def."""
    of_arguments: dict[str, list[Record]] = {}
    for record in records:
        if record.of_argument:
            of_arguments.setdefault(record.name, []).append(record)
    funcdef = tree
    while not isinstance(funcdef, CFuncdefStmt):  # it is last, after `async` and type parameters
        funcdef = funcdef.fChildren[-1]
    return replace(
        signature,
        type_parameters=tuple(_type_parameters(of_arguments)),
        arguments=tuple(_arguments(funcdef, of_arguments, signature.row)),
        return_hint=_hint(funcdef.GetReturnType(), of_arguments.get("return", ())),
    )


def _arguments(funcdef: CFuncdefStmt, of_arguments: dict[str, list[Record]], row: int) -> list[Argument]:
    arguments = []
    for info in _flat(GetDefiningArgInfoList(funcdef.GetParameters())):
        name = None if info.name is None else info.name.fText
        records = of_arguments.get(name, ()) if name else ()
        hint, default = _hint(info.type_expr, records), _default(info.value, records, row)
        arguments.append(Argument(name, info.prefix or "", hint, default))
    slash_i = _slash_index(funcdef)
    if slash_i is not None:
        arguments.insert(slash_i, Argument(None, "/"))
    return arguments


def _slash_index(funcdef: CFuncdefStmt) -> int | None:
    """The number of arguments in front of a `/`."""
    parameters = funcdef.GetParameters()
    inner = parameters.GetChild(1) if parameters is not None else None
    texts = [child.fText for child in (inner and inner.fChildren) or ()]
    return texts[: texts.index("/")].count(",") if "/" in texts else None


def _flat(infos: Iterable[Any]) -> Iterator[Any]:
    for info in infos:
        if isinstance(info, list):
            yield from _flat(info)
        else:
            yield info


def _hint(annotation: CNode | None, records: Iterable[Record]) -> str | None:
    """The annotation, the value of one in quotes, or the hint in a comment."""
    if annotation is None:
        return next((record.payload for record in records if record.kind is RecordKind.HINT), None)
    annotation = DropSimpleParens(annotation)
    value = EvaluateStringLiteral(annotation.fText) if isinstance(annotation, CStringLiteral) else None
    return value if isinstance(value, str) else _written(annotation)


def _default(default: CNode | None, records: Iterable[Record], row: int) -> Value | None:
    if default is None:
        return None
    literals = (record for record in records if record.kind is RecordKind.LITERAL)
    known = next((_value_of(record, row).type for record in literals), None)
    return Value(row, known, _written(default))


def _written(expression: CNode) -> str:
    """An expression as it is written, but for its blanks; it may be nested to any depth."""
    texts, pending = [], [DropSimpleParens(expression)]
    while pending:
        node = pending.pop()
        if node.fChildren is None:
            texts.append(node.fText)
        else:
            pending.extend(reversed(node.fChildren))
    return AsStr(JoinTokens(texts))


def _type_parameters(of_arguments: dict[str, list[Record]]) -> Iterator[str]:
    for name, records in of_arguments.items():
        for record in records:
            if record.kind is RecordKind.TYPEPARAM:
                bound = record.payload.lstrip("* ")
                stars = record.payload[: len(record.payload) - len(record.payload.lstrip("*"))]
                yield stars + name + (f": {bound}" if bound else "")


def _with_hints_of_body(signature: Signature, records: Iterable[Record], is_method: bool) -> Signature:
    """A signature with the hints of a comment on the first row of the body, which knows no names.

    There must be as many as arguments; those of a method may leave out the first.
    """
    hints = {record.name: record.payload for record in records if record.kind is RecordKind.HINT}
    return_hint = hints.pop("return", None)
    arguments = signature.arguments or ()
    named = [argument.name for argument in arguments if argument.name]
    if is_method and len(hints) == len(named) - 1:
        named = named[1:]
    if hints and len(hints) != len(named):
        return signature
    by_name = {name: hints.get(f"{_ARGUMENT_PREFIX}{i}") for i, name in enumerate(named)}
    return replace(
        signature,
        return_hint=signature.return_hint or return_hint,
        arguments=tuple(
            replace(argument, hint=argument.hint or by_name.get(argument.name or ""))
            for argument in arguments
        ),
    )
