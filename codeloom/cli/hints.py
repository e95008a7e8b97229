"""`codeloom hints`: each def with its arguments, their types, and what it gives back."""

from collections.abc import Iterable, Iterator
from typing import TYPE_CHECKING, Any

from codeloom.cli.console import Colour, Console
from codeloom.cli.excerpt import on_one_row, printable
from codeloom.cli.items import Finding, Item
from codeloom.cli.source import Source
from codeloom.cli.source_command import SourceCommand

if TYPE_CHECKING:
    from codeloom.cli.defs import Argument, Def, Value

_INDENT = "    "
_CUT = "..."


class SignatureItem(Item):
    """A def that is sound."""

    def __init__(self, source: Source, signature: "Def") -> None:
        self._source = source
        self._signature = signature

    def show(self, console: Console) -> None:
        """The def's place and names, and below it a row for whatever has a type."""
        place = console.coloured(Colour.BOLD, self._source.label(self._signature.range))
        console.print_row(f"{place} {printable(_head(self._signature))}")
        rows = [(label, on_one_row(text)) for label, text in _rows(self._signature) if text]
        width = max((len(label) for label, _ in rows), default=0)
        room = console.width - width - 2
        for label, text in rows:
            shown = text if len(text) <= room else text[: room - len(_CUT)] + _CUT
            label = console.coloured(Colour.CYAN, f"{printable(label):<{width}}")
            console.print_row(f"{_INDENT}{label}  {printable(shown)}")

    def rows(self) -> Iterator[str]:
        """The def's place and names, and what has a type after it."""
        types = "; ".join(f"{label} {on_one_row(text)}" for label, text in _rows(self._signature) if text)
        row = f"{self._source.label(self._signature.range)} {_head(self._signature)}"
        yield printable(f"{row}: {types}" if types else row)

    def fields(self) -> Iterator[dict[str, Any]]:
        """An object with all that is known of the def."""
        signature = self._signature
        arguments = signature.arguments
        yield {
            "type": "signature",
            **self._source.fields(signature.range),
            "name": signature.name,
            "is_async": signature.is_async,
            "type_parameters": list(signature.type_parameters),
            "arguments": None if arguments is None else [self._argument(argument) for argument in arguments],
            "return_hint": signature.return_hint,
            "returns": [self._value(value) for value in signature.returns],
            "yields": [self._value(value) for value in signature.yields],
        }

    def _argument(self, argument: "Argument") -> dict[str, Any]:
        return {
            "name": argument.name,
            "prefix": argument.prefix,
            "hint": argument.hint,
            "default": argument.default and self._value(argument.default),
        }

    def _value(self, value: "Value") -> dict[str, Any]:
        return {"row": self._source.cell_and_row(value.row)[1], "type": value.type, "text": value.text}


def _head(signature: "Def") -> str:
    arguments = signature.arguments
    names = ", ".join(argument.prefix + (argument.name or "") for argument in arguments or ())
    if arguments is None:  # nested too deep to be listed
        names = _CUT
    parameters = ", ".join(signature.type_parameters)
    head = f"{'async ' if signature.is_async else ''}def {signature.name}"
    return f"{head}{f'[{parameters}]' if parameters else ''}({names})"


def _rows(signature: "Def") -> Iterator[tuple[str, str]]:
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


class HintsCommand(SourceCommand):
    """Shows the signatures of each file."""

    NAME = "hints"
    DESCRIPTION = (
        "List each def with its arguments: their types from annotations or comments, their defaults, and "
        "what `return` and `yield` are known to give. A broken def is shown with its fault; `codeloom check` "
        "reports the other faults. "
        "The exit status is 0 if there is no problem, 1 if there are some, 2 for wrong use or a file "
        "that can't be read."
    )
    EXAMPLES = (
        "codeloom hints src/a.py",
        "codeloom hints --format json src |",
        "    jq '.items[] | select(.return_hint == null).name'",
    )
    NEEDS_RECORDS = True
    NEEDS_NAMES = True

    def items(self, source: Source, findings: list[Finding]) -> Iterator[Item]:
        """The defs, and the problems of those that aren't sound."""
        from codeloom.cli.defs import defs_of  # only this command needs it

        by_place = {(finding.range, finding.code): finding for finding in findings}
        for line, found in defs_of(source.analysis):
            if found is not None:
                yield SignatureItem(source, found)
                continue
            for problem in line.problems[:1]:
                if finding := by_place.get((problem.range, problem.code)):
                    yield finding
