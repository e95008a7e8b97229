"""The defs of a source: their arguments with types and defaults, and what they are known to give back."""

from collections.abc import Iterable, Iterator, Sequence
from dataclasses import dataclass, field, replace
from os import PathLike, fspath
from pathlib import Path
from typing import Any

from codeloom import logicalline
from codeloom.check import Problem
from codeloom.engine import Analysis, AnalyzerOf, Complaint, ComplaintOf, LineAnalyzer
from codeloom.languages import DEFAULT_LANGUAGE_NAME, Language, LanguageOf
from codeloom.line_length import TooLong
from codeloom.line_reader import LineReader
from codeloom.logicalline import CLogicalLine
from codeloom.records import CRecord, RecordsOfLogical
from codeloom.scopes import ScopeReader, WithSelfLeftOut
from codeloom.source import Source, SourceFromBytes, SourceFromText
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


@dataclass(frozen=True, slots=True)
class Value:
    """What is known of a value on a row, from 1: its type, the text that it is written as, or both."""

    row: int
    type: str | None
    text: str | None


@dataclass(frozen=True, slots=True)
class Argument:
    """One argument: its stars, its type by annotation or comment, and its default.

    A bare `*` and a `/` stand among the arguments without a name.
    """

    name: str | None
    prefix: str = ""
    hint: str | None = None
    default: Value | None = None


@dataclass(frozen=True, slots=True)
class Signature:
    """One def, or what is wrong with its line.

    `name` is that of the def behind those of the classes and defs around it. `row` and `column`
    count from 1, the column in characters.
    """

    path: str
    row: int
    column: int
    name: str = ""
    is_async: bool = False
    type_parameters: tuple[str, ...] = ()
    arguments: tuple[Argument, ...] = ()
    return_hint: str | None = None
    returns: tuple[Value, ...] = ()
    yields: tuple[Value, ...] = ()
    problem: Problem | None = None


def SignaturesInFile(
    path: str | PathLike[str],
    language: Language | str = DEFAULT_LANGUAGE_NAME,
    *,
    false_hints: bool = False,
) -> list[Signature]:
    """The signatures in a file, in its order; OSError when it can't be read.

    `language` is the version of Python that it is written in, such as "3.12". With `false_hints`
    all that looks like a type hint is taken for one, as the engine itself does.
    """
    return SignaturesInBytes(Path(path).read_bytes(), language, fspath(path), false_hints=false_hints)


def SignaturesInText(
    text: str,
    language: Language | str = DEFAULT_LANGUAGE_NAME,
    path: str = "<string>",
    *,
    false_hints: bool = False,
) -> list[Signature]:
    """The same for a source text; `path` is the name that its lines bear."""
    return _Signatures(SourceFromText(text), language, path, false_hints)


def SignaturesInBytes(
    data: bytes, language: Language | str, path: str, *, false_hints: bool = False
) -> list[Signature]:
    """The same for the bytes of a file, decoded as the file says; `path` is its name."""
    return _Signatures(SourceFromBytes(data), language, path, false_hints)


def _Signatures(source: Source, language: Language | str, path: str, false_hints: bool) -> list[Signature]:
    language = LanguageOf(source.text, language)
    reader = _SignatureReader(source, language, path, false_hints)
    with Analysis():
        for logical in GetLogicalsFromText(source.text):
            reader.Read(logical)
    return reader.Signatures()


@dataclass
class _Outcomes:
    returns: list[Value] = field(default_factory=list)
    yields: list[Value] = field(default_factory=list)


class _SignatureReader(LineReader):
    """Reads the logical lines of one text in their order."""

    def __init__(self, source: Source, language: Language, path: str, false_hints: bool) -> None:
        super().__init__(source, path)
        self._fAnalyzer = LineAnalyzer(source.text, language, false_hints)
        self._fParse = AnalyzerOf(language).ParseToNode
        self._fSignatures: list[Signature] = []
        self._fOutcomes: list[_Outcomes] = []
        self._fScopes = ScopeReader(self._fRowMap)

    def Signatures(self) -> list[Signature]:
        """What was read so far."""
        return [
            replace(signature, returns=tuple(outcomes.returns), yields=tuple(outcomes.yields))
            for signature, outcomes in zip(self._fSignatures, self._fOutcomes, strict=True)
        ]

    def Read(self, logical: CLogicalLine) -> None:
        """Read the next line."""
        is_comment = logical.fType == logicalline.kComment
        if not logical.fTokenCount or (is_comment and not logical.fFirstInDef):
            return
        self._fScopes.Read(logical)
        if logical.fType == logicalline.kFunctionDef:
            self._ReadDef(logical)
        elif logical.fType != logicalline.kClassDef and not TooLong(logical):
            self._ReadBodyLine(logical)

    # Lines

    def _ReadDef(self, logical: CLogicalLine) -> None:
        """Add the signature of a def, or its fault."""
        row, column = self._FirstPlace(logical, (logical.fFirstLine, 0))
        signature = Signature(
            self._fPath, row, column, self._fScopes.name, is_async=logical.fToks[0] == "async"
        )
        problem = self._Hindrance(logical, logical.fFirstLine)
        self._fOutcomes.append(_Outcomes())
        self._fSignatures.append(
            self._Analyzed(signature, logical) if problem is None else replace(signature, problem=problem)
        )

    def _Analyzed(self, signature: Signature, logical: CLogicalLine) -> Signature:
        plain, error = self._fAnalyzer.Analyze(logical)
        if error is not None:
            return replace(signature, problem=self._Problem(ComplaintOf(error, plain)))
        tree = self._fParse(plain, logical.fInAsyncDef)
        if tree is None:
            return signature
        records: Sequence[CRecord] = RecordsOfLogical(plain)
        if self._fScopes.is_method:
            records = WithSelfLeftOut(records, plain)
        try:
            return _Filled(signature, tree, records)
        except RecursionError:  # as only tuples among the parameters of Python 2 can be nested
            row, column = logical.fPositions[0]
            complaint = Complaint(logical.fFirstLine + row, column, "the parameters are nested too deep")
            return replace(signature, problem=self._Problem(complaint))
        finally:
            FinishedWithNode(tree)

    def _ReadBodyLine(self, logical: CLogicalLine) -> None:
        """Take what a line in the body of a def gives back, and its hint for the def."""
        scope = self._fScopes.innermost
        if scope is None or scope.of_def is None:
            return
        plain, error = self._fAnalyzer.Analyze(logical)
        if error is not None:
            return
        records = RecordsOfLogical(plain)
        if logical.fType == logicalline.kComment:
            signature = self._fSignatures[scope.of_def]
            self._fSignatures[scope.of_def] = _WithHintsOfBody(signature, records, self._fScopes.is_method)
            return
        outcomes = self._fOutcomes[scope.of_def]
        for record in records:
            if record.name in ("return", "yield") and record.kind.name != "Get":
                values = outcomes.returns if record.name == "return" else outcomes.yields
                values.append(_ValueOf(record, logical.fFirstLine + 1))


def _ValueOf(record: CRecord, row: int) -> Value:
    if record.kind.payload != "literal":
        return Value(row, None, record.payload)
    type_name, text = record.value if isinstance(record.value, tuple) else (record.payload, None)
    return Value(row, type_name, text)


# The signature of one def


def _Filled(signature: Signature, tree: CNode, records: Iterable[CRecord]) -> Signature:
    """A signature with what the tree and the records say of its def."""
    of_arguments: dict[str, list[CRecord]] = {}
    for record in records:
        if record.of_arg:
            of_arguments.setdefault(record.name, []).append(record)
    funcdef = tree
    while not isinstance(funcdef, CFuncdefStmt):  # it stands last behind `async` and type parameters
        funcdef = funcdef.fChildren[-1]
    return replace(
        signature,
        type_parameters=tuple(_TypeParameters(of_arguments)),
        arguments=tuple(_Arguments(funcdef, of_arguments, signature.row)),
        return_hint=_Hint(funcdef.GetReturnType(), of_arguments.get("return", ())),
    )


def _Arguments(funcdef: CFuncdefStmt, of_arguments: dict[str, list[CRecord]], row: int) -> list[Argument]:
    arguments = []
    for info in _Flat(GetDefiningArgInfoList(funcdef.GetParameters())):
        name = None if info.name is None else info.name.fText
        records = of_arguments.get(name, ()) if name else ()
        hint, default = _Hint(info.type_expr, records), _Default(info.value, records, row)
        arguments.append(Argument(name, info.prefix or "", hint, default))
    slash_i = _SlashIndex(funcdef)
    if slash_i is not None:
        arguments.insert(slash_i, Argument(None, "/"))
    return arguments


def _SlashIndex(funcdef: CFuncdefStmt) -> int | None:
    """The number of arguments in front of a `/`."""
    parameters = funcdef.GetParameters()
    inner = parameters.GetChild(1) if parameters is not None else None
    texts = [child.fText for child in (inner and inner.fChildren) or ()]
    return texts[: texts.index("/")].count(",") if "/" in texts else None


def _Flat(infos: Iterable[Any]) -> Iterator[Any]:
    for info in infos:
        if isinstance(info, list):
            yield from _Flat(info)
        else:
            yield info


def _Hint(annotation: CNode | None, records: Iterable[CRecord]) -> str | None:
    """The annotation, without its quotes, or the hint in a comment."""
    if annotation is None:
        return next((record.payload for record in records if record.kind.name == "TypeHint"), None)
    annotation = DropSimpleParens(annotation)
    if isinstance(annotation, CStringLiteral):
        return annotation.GetStringContents()
    return _Written(annotation)


def _Default(default: CNode | None, records: Iterable[CRecord], row: int) -> Value | None:
    if default is None:
        return None
    value = Value(row, None, _Written(default))
    for record in records:
        if record.kind.payload == "literal":
            known = _ValueOf(record, row)
            return known if known.text is not None else replace(value, type=known.type)
    return value


def _Written(expression: CNode) -> str:
    """An expression as it is written, but for its blanks; it may be nested to any depth."""
    texts, pending = [], [DropSimpleParens(expression)]
    while pending:
        node = pending.pop()
        if node.fChildren is None:
            texts.append(node.fText)
        else:
            pending.extend(reversed(node.fChildren))
    return AsStr(JoinTokens(texts))


def _TypeParameters(of_arguments: dict[str, list[CRecord]]) -> Iterator[str]:
    for name, records in of_arguments.items():
        for record in records:
            if record.kind.name == "TypeParameter":
                bound = record.payload.lstrip("* ")
                stars = record.payload[: len(record.payload) - len(record.payload.lstrip("*"))]
                yield stars + name + (f": {bound}" if bound else "")


def _WithHintsOfBody(signature: Signature, records: Iterable[CRecord], is_method: bool) -> Signature:
    """A signature with the hints of a comment on the first row of the body, which knows no names."""
    hints = {record.name: record.payload for record in records if record.kind.name == "TypeHint"}
    return_hint = hints.pop("return", None)
    named = [argument for argument in signature.arguments if argument.name]
    skipped = 1 if is_method and len(hints) == len(named) - 1 else 0
    by_name = {
        argument.name: hints.get(f"{kArgPrefix.decode()}{i}") for i, argument in enumerate(named[skipped:])
    }
    return replace(
        signature,
        return_hint=signature.return_hint or return_hint,
        arguments=tuple(
            replace(argument, hint=argument.hint or by_name.get(argument.name))
            for argument in signature.arguments
        ),
    )
