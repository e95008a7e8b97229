"""Records to read: what the engine says about the names of a line, as values and as lines of text.

A line of text is a word for the kind, the name, and two blanks before the payload where there is
one. In front is `arg` when the record is about an argument of a definition:

    set  f
    arg set  a
    arg literal a  int: 1
    hint x  int

`FormatRecord` writes such a line and `ParseRecord` reads it back, without loss. A name or a payload
that would be mistaken is a bytes literal: `get  b'a  b'`.
"""

import re
from collections.abc import Iterable
from dataclasses import dataclass

from codeloom._neighbours import CLogicalLine, _RecordKinds

__all__ = [
    "CRecord",
    "CRecordKind",
    "FormatRecord",
    "FormatRecords",
    "ParseRecord",
    "RecordOfPair",
    "RecordsOfLogical",
    "kRecordKinds",
]


@dataclass(frozen=True, slots=True)
class CRecordKind:
    """One kind of records.

    `word` stands for it in readable lines. `payload` tells the form of what follows the prefix:
    none, text, index (of a token), import (a module, a blank and a name) or literal (a type, a
    colon, and a value where that is known). `source` is a line of Python that yields such a
    record, empty where the engine writes none, and `example` the record.
    """

    name: str
    prefix: bytes
    kind: int
    word: str
    payload: str
    meaning: str
    source: str
    example: str


kRecordKinds = tuple(CRecordKind(*row) for row in _RecordKinds())
"""All kinds; the last one is the plain equiv, a record without any prefix."""

_PLAIN = kRecordKinds[-1]
# What starts like a prefix and is none of ours. It is kept whole.
_UNKNOWN = CRecordKind("Unknown", b"", 0, "raw", "text", "A record of no known kind.", "", "")
_BY_PREFIX = {kind.prefix: kind for kind in kRecordKinds[:-1]}
_BY_WORD = {kind.word: kind for kind in (*kRecordKinds, _UNKNOWN)}
_PREFIX_LENGTH = len(_PLAIN.prefix)


@dataclass(frozen=True, slots=True)
class CRecord:
    """One record: a name, what is said about it, and whether the name is an argument's.

    Bytes that aren't UTF-8 are in `name` and `payload` as the lone surrogates that the
    interpreter's `surrogateescape` makes of them.
    """

    name: str
    kind: CRecordKind
    payload: str = ""
    of_arg: bool = False

    @property
    def value(self) -> str | int | tuple[str, str] | tuple[str, str | None] | None:
        """The payload by its form: None, a text, a token index, (module, name) or (type, value).

        A literal's value is None when it isn't known. A payload that hasn't its form is a text.
        """
        match self.kind.payload:
            case "none" if not self.payload:
                return None
            case "index" if self.payload.isdecimal():
                return int(self.payload)
            case "import" if " " in self.payload:
                module, _, name = self.payload.rpartition(" ")
                return module, name
            case "literal":
                type_name, _, text = self.payload.partition(":")
                return type_name, text.removeprefix(" ") or None
        return self.payload

    def ToPair(self) -> tuple[bytes, bytes]:
        """The record as the engine keeps it: the name and the info bytes."""
        prefix = b"" if self.kind is _PLAIN else self.kind.prefix
        return _Encode(self.name), prefix + _Encode(self.payload)

    def __str__(self) -> str:
        return FormatRecord(self)


def RecordOfPair(name: bytes, ibytes: bytes, of_arg: bool = False) -> CRecord:
    """The record of a pair as the engine keeps it."""
    kind = _BY_PREFIX.get(ibytes[:_PREFIX_LENGTH])
    if kind is not None:
        payload = ibytes[_PREFIX_LENGTH:]
    else:
        kind = _UNKNOWN if len(ibytes) > 1 and ibytes[0] == ord(":") and ibytes[1] else _PLAIN
        payload = ibytes
    return CRecord(_Decode(name), kind, _Decode(payload), of_arg)


def RecordsOfLogical(logical: CLogicalLine) -> list[CRecord]:
    """The records of an analyzed logical in order of arrival, those of arguments last."""
    return [
        RecordOfPair(name, ibytes, of_arg)
        for pairs, of_arg in ((logical.fTypeEquivs, False), (logical.fArgTypeEquivs, True))
        for name, ibytes in pairs or ()
    ]


def FormatRecord(record: CRecord) -> str:
    """The record as one line of text."""
    owner = "arg " if record.of_arg else ""
    name = _Quoted(record.name) if "  " in record.name else _Shown(record.name)
    payload = "  " + _Shown(record.payload) if record.payload else ""
    return f"{owner}{record.kind.word:<4} {name}{payload}"


def FormatRecords(records: Iterable[CRecord]) -> str:
    """Records as lines of text, each with its line end."""
    return "".join(FormatRecord(record) + "\n" for record in records)


_QUOTED = r"""b'(?:[^'\\]|\\.)*'|b"(?:[^"\\]|\\.)*\""""
_LINE = re.compile(
    rf"(?P<arg>arg )?(?P<word>\S+) +(?P<name>{_QUOTED}|\S+(?: \S+)*)(?:  (?P<payload>\S.*))?",
    re.DOTALL,
)


def ParseRecord(line: str) -> CRecord:
    """The record of a line that FormatRecord wrote. ValueError for anything else."""
    found = _LINE.fullmatch(line)
    if found is None:
        raise ValueError(f"not a record line: {line!r}; expected: word name, or word name  payload")
    kind = _BY_WORD.get(found["word"])
    if kind is None:
        words = ", ".join(_BY_WORD)
        raise ValueError(f"unknown kind of record in {line!r}; expected one of {words}")
    payload = found["payload"]
    return CRecord(
        _Read(found["name"]),
        kind,
        "" if payload is None else _Read(payload),
        found["arg"] is not None,
    )


def _Decode(utf8: bytes) -> str:
    return utf8.decode("utf-8", "surrogateescape")


def _Encode(text: str) -> bytes:
    return text.encode("utf-8", "surrogateescape")


def _Quoted(text: str) -> str:
    return repr(_Encode(text))


def _Shown(text: str) -> str:
    """The text itself where it can't be mistaken, otherwise quoted."""
    is_plain = text.isprintable() and text == text.strip() and text != ""
    return text if is_plain and not text.startswith(("b'", 'b"')) else _Quoted(text)


def _Read(shown: str) -> str:
    if not shown.startswith(("b'", 'b"')):
        return shown
    import ast  # rarely needed

    return _Decode(ast.literal_eval(shown))
