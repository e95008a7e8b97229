"""What `codeloom hints` says of a def: its arguments as they are written, and what its body gives back."""

import ast
from collections.abc import Iterator
from dataclasses import dataclass, field

from codeloom._analysis import (
    Analysis,
    Hint,
    Line,
    LineKind,
    Parameter,
    ParameterKind,
    Range,
    Record,
    RecordKind,
    Scope,
    ScopeKind,
    Signature,
)
from codeloom._literals import EvaluateStringLiteral
from codeloom.rows import RowTexts

_STARS = {ParameterKind.VAR_POSITIONAL: "*", ParameterKind.VAR_KEYWORD: "**"}
_OUTCOMES = ("return", "yield")
_KINDS_OF_NAMES = (RecordKind.GET, RecordKind.HINT)  # whatever its name, not an outcome
_MOST_PARENTHESES = 50  # that are looked through


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


@dataclass(slots=True)
class Def:
    """One def that is sound.

    `name` is that of the def after those of the classes and defs around it, `range` that of its header.
    Where the parameters are nested too deep to be shown, as only those of Python 2 can be, `arguments` is
    None.
    """

    range: Range
    name: str
    is_async: bool
    type_parameters: tuple[str, ...]
    arguments: tuple[Argument, ...] | None
    return_hint: str | None
    returns: list[Value] = field(default_factory=list)
    yields: list[Value] = field(default_factory=list)


def defs_of(analysis: Analysis) -> Iterator[tuple[Line, Def | None]]:
    """The header of each def of a text, in its order, and the def where it has no problem."""
    reader = _Reader(analysis)
    defs = {_start(signature.line.range): reader.read(signature) for signature in analysis.signatures}
    reader.read_bodies(defs)
    for line in analysis.lines:
        if line.kind is LineKind.DEF:
            yield line, None if line.problems else defs.get(_start(line.range))


class _Reader:
    """Reads the signatures of one text, and then what the bodies give back."""

    def __init__(self, analysis: Analysis) -> None:
        self._analysis = analysis
        self._rows = RowTexts(analysis.text)
        self._scopes = {
            _start(scope.range): scope for scope in analysis.scopes if scope.kind is ScopeKind.FUNCTION
        }
        self._limited = {limit.line.range for limit in analysis.limits}

    def read(self, signature: Signature) -> Def:
        line = signature.line
        scope = self._scopes.get(_start(line.range))
        records = [record for record in line.records if record.of_argument]
        arguments = tuple(self._arguments(signature, records))
        return Def(
            line.range,
            signature.name if scope is None else _full_name(scope),
            signature.is_async,
            tuple(_type_parameters(records)),
            None if not arguments and line.range in self._limited else arguments,
            _shown_hint(signature.return_hint),
        )

    def read_bodies(self, defs: dict[tuple[int, int], Def]) -> None:
        """Add to each def what the lines of its body give back."""
        waiting = sorted(self._scopes.items(), reverse=True)
        around: list[tuple[tuple[int, int], Scope]] = []
        for record in self._analysis.records:
            if record.name not in _OUTCOMES or record.kind in _KINDS_OF_NAMES or record.of_argument:
                continue
            row, column = _start(record.line.range)
            while waiting and waiting[-1][0] < (row, column):
                around.append(waiting.pop())
            while around and (around[-1][1].range.end_row, around[-1][1].range.end_column) <= (row, column):
                around.pop()
            if around and (known := defs.get(around[-1][0])):
                (known.returns if record.name == "return" else known.yields).append(_value(record, row))

    def _arguments(self, signature: Signature, records: list[Record]) -> Iterator[Argument]:
        types = _types_of_defaults(records)
        previous: ParameterKind | None = None
        for parameter in signature.parameters:
            yield from _marks_between(previous, parameter.kind)
            previous = parameter.kind
            yield Argument(
                parameter.name,
                _STARS.get(previous, ""),
                _shown_hint(parameter.hint),
                self._default(parameter, types),
            )
        yield from _marks_between(previous, None)

    def _default(self, parameter: Parameter, types: dict[str, str]) -> Value | None:
        place = parameter.default
        if place is None:
            return None
        text = _without_parentheses(self._at(place))
        return Value(parameter.range.row, types.get(parameter.name), text)

    def _at(self, place: Range) -> str:
        """The text of a range."""
        rows = self._rows[place.row - 1 : place.end_row]
        rows[-1] = rows[-1][: place.end_column - 1]
        rows[0] = rows[0][place.column - 1 :]
        return "\n".join(rows)


def _start(place: Range) -> tuple[int, int]:
    return place.row, place.column


def _full_name(scope: Scope) -> str:
    """The name of a function after those of the classes and functions around it."""
    names = [scope.name]
    while (scope := scope.parent or scope).kind is not ScopeKind.MODULE:
        if scope.kind in (ScopeKind.CLASS, ScopeKind.FUNCTION):
            names.append(scope.name)
    return ".".join(reversed(names))


def _marks_between(previous: ParameterKind | None, kind: ParameterKind | None) -> Iterator[Argument]:
    """The `/` and the bare `*` that lie between parameters of two kinds."""
    if previous is ParameterKind.POSITIONAL_ONLY and kind is not previous:
        yield Argument(None, "/")
    if kind is ParameterKind.KEYWORD_ONLY and previous not in (kind, ParameterKind.VAR_POSITIONAL):
        yield Argument(None, "*")


def _types_of_defaults(records: list[Record]) -> dict[str, str]:
    types: dict[str, str] = {}
    for record in records:
        if record.kind is RecordKind.LITERAL and isinstance(record.value, tuple):
            types.setdefault(record.name, record.value[0])
    return types


def _type_parameters(records: list[Record]) -> Iterator[str]:
    for record in records:
        if record.kind is RecordKind.TYPEPARAM:
            bound = record.payload.lstrip("* ")
            stars = record.payload[: len(record.payload) - len(record.payload.lstrip("*"))]
            yield stars + record.name + (f": {bound}" if bound else "")


def _value(record: Record, row: int) -> Value:
    value = record.value
    if record.kind is not RecordKind.LITERAL or not isinstance(value, tuple):
        return Value(row, None, record.payload)
    return Value(row, *value)


def _shown_hint(hint: Hint | None) -> str | None:
    """A hint as it is written; one in quotes without these."""
    if hint is None:
        return None
    text = _without_parentheses(hint.text)
    value = EvaluateStringLiteral(text)
    return value if isinstance(value, str) else text


def _without_parentheses(text: str) -> str:
    """`a` for `(a)`; a tuple and a generator keep theirs."""
    if not text.startswith("(") or not text.endswith(")") or text.startswith("(" * _MOST_PARENTHESES):
        return text
    inner = text[1:-1].strip()
    try:
        node = ast.parse(inner.replace("\n", " "), mode="eval").body  # `a)(b` and generators fail
    except (SyntaxError, ValueError, RecursionError, MemoryError):
        return text
    return text if isinstance(node, ast.Tuple) else _without_parentheses(inner)
