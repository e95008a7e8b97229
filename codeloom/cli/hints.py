"""`codeloom hints`: each def with its arguments, their types, and what it gives back."""

import json
from collections.abc import Iterable, Iterator, Mapping
from dataclasses import asdict
from typing import ClassVar

from codeloom.cli.console import Colour, PrintablePath
from codeloom.cli.item_command import ItemCommand, ItemFormat
from codeloom.excerpt import OnOneRow, Printable
from codeloom.languages import Language
from codeloom.signatures import Argument, Signature, SignaturesInBytes, Value

_INDENT = "    "
_CUT = "..."


class TextFormat(ItemFormat[Signature]):
    """For people: the def's place and names, and below it a row for whatever has a type."""

    def Add(self, signature: Signature, /) -> None:
        """Print one signature, or what is wrong with its line."""
        if signature.problem is not None:
            self._fConsole.PrintProblem(signature.problem)
            return
        place = f"{PrintablePath(signature.path)}:{signature.row}:{signature.column}:"
        self._fConsole.PrintRow(
            f"{self._fConsole.Coloured(Colour.BOLD, place)} {Printable(_Head(signature))}"
        )
        rows = [(label, OnOneRow(text)) for label, text in _Rows(signature) if text]
        width = max((len(label) for label, _ in rows), default=0)
        room = self._fConsole.width - width - 2
        for label, text in rows:
            shown = text if len(text) <= room else text[: room - len(_CUT)] + _CUT
            label = self._fConsole.Coloured(Colour.CYAN, f"{Printable(label):<{width}}")
            self._fConsole.PrintRow(f"{_INDENT}{label}  {Printable(shown)}")


def _Head(signature: Signature) -> str:
    names = ", ".join(argument.prefix + (argument.name or "") for argument in signature.arguments)
    parameters = ", ".join(signature.type_parameters)
    head = f"{'async ' if signature.is_async else ''}def {signature.name}"
    return f"{head}{f'[{parameters}]' if parameters else ''}({names})"


def _Rows(signature: Signature) -> Iterator[tuple[str, str]]:
    for argument in signature.arguments:
        yield argument.prefix + (argument.name or ""), _Described(argument)
    yield "returns", signature.return_hint or ""
    yield "gives", _Known(signature.returns)
    yield "yields", _Known(signature.yields)


def _Described(argument: Argument) -> str:
    default = argument.default
    if default is None:
        return argument.hint or ""
    shown = f"= {default.text or _CUT}"
    if argument.hint is not None:
        return f"{argument.hint} {shown}"
    return shown if default.type in (None, default.text) else f"{shown}, {default.type}"


def _Known(values: Iterable[Value]) -> str:
    """What is known of values, equal ones once."""
    return ", ".join(dict.fromkeys(map(_Shown, values)))


def _Shown(value: Value) -> str:
    if value.type in (None, value.text):
        return value.text or _CUT
    return value.type if value.text is None else f"{value.type} {value.text}"


class JsonLinesFormat(ItemFormat[Signature]):
    """For programs: an object for each def on a row of its own."""

    def Add(self, signature: Signature, /) -> None:
        """The fields of the signature, with its fault as `error`."""
        fields = asdict(signature)
        problem = fields.pop("problem")
        fields["error"] = problem and {key: problem[key] for key in ("row", "column", "message")}
        self._fConsole.PrintRow(json.dumps(fields))


class HintsCommand(ItemCommand[Signature]):
    """Prints the signatures of each file."""

    NAME = "hints"
    HELP = "show each def with the types of its arguments and what it gives back"
    DESCRIPTION = (
        "Show each def with its arguments: their types from annotations or comments, their defaults, "
        "and what `return` and `yield` are known to give. A def that isn't sound stands in its place "
        "with its fault; other faults are the business of `codeloom check`. The exit status is 0 when "
        "all defs are sound, 1 when some aren't, 2 on wrong use or when a file can't be read."
    )
    FORMATS: ClassVar[Mapping[str, type[ItemFormat[Signature]]]] = {
        "text": TextFormat,
        "jsonl": JsonLinesFormat,
    }
    FORMAT_HELP = "text; or jsonl, with an object for each def on a row"

    def Items(self, data: bytes, language: Language, path: str, false_hints: bool) -> list[Signature]:
        """The signatures of a file."""
        return SignaturesInBytes(data, language, path, false_hints=false_hints)
