"""`codeloom hints`: each def with its arguments, their types, and what it gives back."""

import argparse
import json
from abc import ABC, abstractmethod
from collections.abc import Iterable, Iterator, Mapping
from dataclasses import asdict

from codeloom.cli.command import AddFalseHintsArgument, AddSourceArguments, Command, ExitStatus
from codeloom.cli.console import Colour, Console, PrintablePath
from codeloom.cli.files import ReadFiles
from codeloom.excerpt import Printable
from codeloom.signatures import Argument, Signature, SignaturesInBytes, Value

_INDENT = "    "
_CUT = "..."


class HintsCommand(Command):
    """Prints the signatures of each file."""

    NAME = "hints"
    HELP = "show each def with the types of its arguments and what it gives back"
    DESCRIPTION = (
        "Show each def with its arguments: their types from annotations or comments, their defaults, "
        "and what `return` and `yield` are known to give. A def that isn't sound stands in its place "
        "with its fault; other faults are the business of `codeloom check`. The exit status is 0 when "
        "all defs are sound, 1 when some aren't, 2 on wrong use or when a file can't be read."
    )

    def __init__(self) -> None:
        self._fConsole = Console()
        self._fStatus = ExitStatus.SOUND

    @staticmethod
    def AddArguments(parser: argparse.ArgumentParser) -> None:
        """Add the command's own arguments."""
        AddSourceArguments(parser)
        AddFalseHintsArgument(parser)
        parser.add_argument(
            "--format",
            choices=FORMATS,
            default="text",
            help="text; or jsonl, with an object for each def on a row (default: %(default)s)",
        )

    def Run(self, arguments: argparse.Namespace) -> ExitStatus:
        """Print all files; one that can't be read is told, and the others are printed."""
        hints_format = FORMATS[arguments.format](self._fConsole)
        for path, data in ReadFiles(arguments.paths, self._OnFailure):
            for signature in SignaturesInBytes(
                data, arguments.language, path, false_hints=arguments.false_hints
            ):
                hints_format.Add(signature)
                if signature.problem is not None:
                    self._fStatus = max(self._fStatus, ExitStatus.PROBLEMS)
            self._fConsole.Flush()
        return self._fStatus

    def _OnFailure(self, path: str, error: OSError) -> None:
        self._fStatus = ExitStatus.FAILURE
        self._fConsole.PrintFailure(path, error)


class HintsFormat(ABC):
    """Prints signatures one after another."""

    def __init__(self, console: Console) -> None:
        self._fConsole = console

    @abstractmethod
    def Add(self, signature: Signature) -> None:
        """Print one signature."""


class TextFormat(HintsFormat):
    """For people: the def's place and names, and below it a row for whatever has a type."""

    def Add(self, signature: Signature) -> None:
        """Print one signature, or what is wrong with its line."""
        if signature.problem is not None:
            self._fConsole.PrintProblem(signature.problem)
            return
        place = f"{PrintablePath(signature.path)}:{signature.row}:{signature.column}:"
        self._fConsole.PrintRow(
            f"{self._fConsole.Coloured(Colour.BOLD, place)} {Printable(_Head(signature))}"
        )
        rows = [row for row in _Rows(signature) if row[1]]
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


class JsonLinesFormat(HintsFormat):
    """For programs: an object for each def on a row of its own."""

    def Add(self, signature: Signature) -> None:
        """The fields of the signature, with its fault as `error`."""
        fields = asdict(signature)
        problem = fields.pop("problem")
        fields["error"] = problem and {key: problem[key] for key in ("row", "column", "message")}
        self._fConsole.PrintRow(json.dumps(fields))


FORMATS: Mapping[str, type[HintsFormat]] = {"text": TextFormat, "jsonl": JsonLinesFormat}
