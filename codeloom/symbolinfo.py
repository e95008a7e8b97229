"""The vocabulary of symbol records: what is said about a name, and how it is written.

A record is a UTF-8 byte string: a prefix, which is `:`, a kind byte and `:`, and after it a
payload whose form the kind decides. Anything else is a plain equiv, the text of what the name
stands for. Kinds are integers from 0 to 255, as a byte string gives them by index.

`codeloom.records` turns records into something to read.
"""

from codeloom._neighbours import (
    BuildLiteralInfo,
    CKindFilter,
    EncodeStringLiteral,
    EnsureScopeNameIndicies,
    GetInfoBytesKind,
    GetInstanceNameForClass,
    IsDefKind,
    IsDefLineScope,
    IsParentOfDefLineScope,
    IsTopLevelModuleScope,
    JoinTokens,
    NextNonNestedUtf8PtrIndex,
    _NonInlineNextNonNestedUtf8PtrIndex,
    _SymbolConstants,
)
from codeloom._plain_record import CPlainRecord
from codeloom.strutils import AsStr, AsUtf8, BytesForInteger

__all__ = [
    "BuildArgInfo",
    "BuildLiteralInfo",
    "CArgTextInfo",
    "CDefInfo",
    "CFullyScopedName",
    "CInfoBytesBuilder",
    "CKindFilter",
    "CLocationCache",
    "CSingleResolvedInfo",
    "EncodeStringLiteral",
    "EnsureScopeNameIndicies",
    "GetInfoBytesKind",
    "GetInstanceNameForClass",
    "IsDefKind",
    "IsDefLineScope",
    "IsParentOfDefLineScope",
    "IsTopLevelModuleScope",
    "JoinTokens",
    "NextNonNestedUtf8PtrIndex",
    "ObjectForStringLiteral",
    "_NonInlineNextNonNestedUtf8PtrIndex",
    "gInfoBytesBuilder",
]

_CONSTANTS = _SymbolConstants()
globals().update(_CONSTANTS)
__all__ += _CONSTANTS


class CInfoBytesBuilder:
    """Composes records from a prefix and texts."""

    def Build(self, prefix: bytes, *pieces: bytes | str | None) -> bytes:
        """The prefix and the pieces, joined as UTF-8; None contributes nothing."""
        return b"".join([prefix, *(AsUtf8(piece) for piece in pieces if piece is not None)])


gInfoBytesBuilder = CInfoBytesBuilder()
"""The builder that all of the system shares."""


def BuildArgInfo(i: int, name: bytes | str | None) -> bytes:
    """The record that stands for an argument by its index from zero, with its name if known."""
    blank = None if name is None else b" "
    return gInfoBytesBuilder.Build(_CONSTANTS["kArgPrefix"], BytesForInteger(i), blank, name)


def ObjectForStringLiteral(text: bytes | str) -> str | bytes | None:
    """The value of a string literal, as the interpreter evaluates it; nothing is executed.

    None for what isn't exactly one string literal, for one that the interpreter refuses, and for
    an f-string, whose value isn't in its text. TypeError for what isn't text.
    """
    from codeloom._literals import EvaluateStringLiteral  # not needed to load the engine

    return EvaluateStringLiteral(AsStr(text))


class CFullyScopedName(CPlainRecord):
    """The name of a definition: the module, the scope in it, and the name in that scope."""

    module_name: str
    scope: str
    name: str

    def __init__(self, module_name: str, scope: str, name: str) -> None:
        self.module_name = module_name
        self.scope = scope
        self.name = name


class CDefInfo(CPlainRecord):
    """A definition: its name, its kind, and the row from zero that it is on."""

    name: CFullyScopedName
    kind: int
    first_line: int

    def __init__(self, name: CFullyScopedName, kind: int, first_line: int) -> None:
        self.name = name
        self.kind = kind
        self.first_line = first_line


class CArgTextInfo(CPlainRecord):
    """The texts of one argument: prefix, name, hint and default, each None when there is none."""

    prefix: str | None
    name: str | None
    type_text: str | None
    value_text: str | None

    def __init__(
        self,
        prefix: str | None,
        name: str | None,
        type_text: str | None,
        value_text: str | None,
    ) -> None:
        self.prefix = prefix
        self.name = name
        self.type_text = type_text
        self.value_text = value_text


class CSingleResolvedInfo(CPlainRecord):
    """What one record was found to mean: the record, and the location that it leads to."""

    ibytes: bytes
    loc: object

    def __init__(self, ibytes: bytes, loc: object) -> None:
        self.ibytes = ibytes
        self.loc = loc


class CLocationCache:
    """Locations that are looked up once. A location is shared: equal ones are the same object."""

    def __init__(self) -> None:
        self._fBuiltinLoc: object = None

    def _InitBuiltinLoc(self) -> None:
        """Set the location of the builtins. A host's cache puts its own here."""
        self._fBuiltinLoc = CFullyScopedName("builtins", "", "")

    def GetBuiltinLoc(self) -> object:
        """The location of the builtins."""
        if self._fBuiltinLoc is None:
            self._InitBuiltinLoc()
        return self._fBuiltinLoc
