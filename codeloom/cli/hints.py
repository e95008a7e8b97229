"""`codeloom hints`: each def with its arguments, their types, and what it gives back."""

import json
from abc import abstractmethod
from collections.abc import Iterable, Iterator, Mapping
from typing import TYPE_CHECKING, Any, ClassVar

from codeloom._analysis import Analysis
from codeloom.cli.console import Colour, printable_path
from codeloom.cli.excerpt import on_one_row, printable
from codeloom.cli.item_command import ItemCommand, ItemFormat

if TYPE_CHECKING:
    from codeloom.signatures import Argument, Signature, Value

_INDENT = "    "
_CUT = "..."


class HintsFormat(ItemFormat):
    """Prints each def."""

    def add(self, analysis: Analysis) -> bool:
        """Print the defs of a file, or what is wrong with their lines."""
        from codeloom.signatures import signatures_of  # it loads the engine

        signatures = signatures_of(analysis)
        for signature in signatures:
            self._add_signature(signature)
        return all(signature.problem is None for signature in signatures)

    @abstractmethod
    def _add_signature(self, signature: "Signature") -> None:
        """Print one def."""


class TextFormat(HintsFormat):
    """For people: the def's place and names, and below it a row for whatever has a type."""

    def _add_signature(self, signature: "Signature") -> None:
        if signature.problem is not None:
            self._console.print_problem(signature.problem)
            return
        place = f"{printable_path(signature.path)}:{signature.row}:{signature.column}:"
        self._console.print_row(f"{self._console.coloured(Colour.BOLD, place)} {printable(_head(signature))}")
        rows = [(label, on_one_row(text)) for label, text in _rows(signature) if text]
        width = max((len(label) for label, _ in rows), default=0)
        room = self._console.width - width - 2
        for label, text in rows:
            shown = text if len(text) <= room else text[: room - len(_CUT)] + _CUT
            label = self._console.coloured(Colour.CYAN, f"{printable(label):<{width}}")
            self._console.print_row(f"{_INDENT}{label}  {printable(shown)}")


def _head(signature: "Signature") -> str:
    arguments = signature.arguments
    names = ", ".join(argument.prefix + (argument.name or "") for argument in arguments or ())
    if arguments is None:  # nested too deep to be told
        names = _CUT
    parameters = ", ".join(signature.type_parameters)
    head = f"{'async ' if signature.is_async else ''}def {signature.name}"
    return f"{head}{f'[{parameters}]' if parameters else ''}({names})"


def _rows(signature: "Signature") -> Iterator[tuple[str, str]]:
    for argument in signature.arguments or ():
        yield argument.prefix + (argument.name or ""), _described(argument)
    yield "returns", signature.return_hint or ""
    yield "gives", _known(signature.returns)
    yield "yields", _known(signature.yields)


def _described(argument: "Argument") -> str:
    default = argument.default
    if default is None:
        return argument.hint or ""
    shown = f"= {default.text or _CUT}"
    if argument.hint is not None:
        return f"{argument.hint} {shown}"
    return shown if default.type in (None, default.text) else f"{shown}, {default.type}"


def _known(values: Iterable["Value"]) -> str:
    """What is known of values, equal ones once."""
    return ", ".join(dict.fromkeys(map(_shown, values)))


def _shown(value: "Value") -> str:
    if value.type in (None, value.text):
        return value.text or _CUT
    return value.type if value.text is None else f"{value.type} {value.text}"


class JsonLinesFormat(HintsFormat):
    """For programs: an object for each def on a row of its own."""

    def _add_signature(self, signature: "Signature") -> None:
        """The fields of the signature, with its fault as `error`."""
        self._console.print_row(json.dumps(_fields(signature)))


def _fields(signature: "Signature") -> dict[str, Any]:
    problem = signature.problem
    arguments = signature.arguments
    return {
        "path": signature.path,
        "row": signature.row,
        "column": signature.column,
        "name": signature.name,
        "is_async": signature.is_async,
        "type_parameters": signature.type_parameters,
        "arguments": None if arguments is None else [_argument_fields(argument) for argument in arguments],
        "return_hint": signature.return_hint,
        "returns": [_value_fields(value) for value in signature.returns],
        "yields": [_value_fields(value) for value in signature.yields],
        "error": problem
        and {"row": problem.range.row, "column": problem.range.column, "message": problem.message},
    }


def _argument_fields(argument: "Argument") -> dict[str, Any]:
    return {
        "name": argument.name,
        "prefix": argument.prefix,
        "hint": argument.hint,
        "default": argument.default and _value_fields(argument.default),
    }


def _value_fields(value: "Value") -> dict[str, Any]:
    return {"row": value.row, "type": value.type, "text": value.text}


class HintsCommand(ItemCommand):
    """Prints the signatures of each file."""

    NAME = "hints"
    HELP = "show each def with the types of its arguments and what it gives back"
    DESCRIPTION = (
        "Show each def with its arguments: their types from annotations or comments, their defaults, "
        "and what `return` and `yield` are known to give. A def that isn't sound stands in its place "
        "with its fault; other faults are the business of `codeloom check`. The exit status is 0 when "
        "all defs are sound, 1 when some aren't, 2 on wrong use or when a file can't be read."
    )
    FORMATS: ClassVar[Mapping[str, type[ItemFormat]]] = {"text": TextFormat, "jsonl": JsonLinesFormat}
    FORMAT_HELP = "text; or jsonl, with an object for each def on a row"
