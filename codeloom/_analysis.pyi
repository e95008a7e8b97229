# Made by tools/make_stubs.py; don't edit.
import collections.abc
import typing
from collections.abc import Sequence
import enum
from typing import Any, Self

class RecordKind(enum.Enum):
    """What a record says of its name; docs/records.md lists all kinds."""
    SET = 'set'
    GET = 'get'
    GLOBAL = 'global'
    NONLOCAL = 'nonlocal'
    WITHIN = 'within'
    IMPORT = 'import'
    FROM = 'from'
    AS = 'as'
    CALLED = 'called'
    LITERAL = 'literal'
    EXPRESSION = 'expression'
    TYPEPARAM = 'typeparam'
    HINT = 'hint'
    SET_HINT = 'set-hint'
    DECORATOR = 'decorator'
    SCOPE = 'scope'
    URL = 'url'
    BUILTIN_MODULE = 'builtin-module'
    TYPING_MODULE = 'typing-module'
    BUILTIN_CLASS = 'builtin-class'
    ARGUMENT = 'argument'
    METHOD = 'method'
    UNBOUND_METHOD = 'unbound-method'
    FUNCTION = 'function'
    CLASS = 'class'
    SELF = 'self'
    INSTANCE = 'instance'
    MODULE = 'module'
    INFERRED_HINT = 'inferred-hint'
    CONDITIONAL = 'conditional'
    TYPE_ALIAS = 'type-alias'
    DEF_LINE = 'def-line'
    IS = 'is'

class LineKind(enum.Enum):
    """What kind of statement a line holds or begins."""
    UNKNOWN = 'unknown'
    CLASS = 'class'
    DEF = 'def'
    STRING_EXPRESSION = 'string expression'
    ASSIGNMENT = 'assignment'
    IF = 'if'
    ELSE = 'else'
    WHILE = 'while'
    FOR = 'for'
    PASS = 'pass'
    RAISE = 'raise'
    TRY = 'try'
    EXCEPT = 'except'
    FINALLY = 'finally'
    ASSERT = 'assert'
    RETURN = 'return'
    IMPORT = 'import'
    FROM_IMPORT = 'from import'
    PRINT = 'print'
    DEL = 'del'
    ELIF = 'elif'
    COMMENT = 'comment'
    BLANK_LINE = 'blank line'
    BREAK = 'break'
    CONTINUE = 'continue'
    WITH = 'with'
    MATCH = 'match'
    CASE = 'case'
    F_STRING_FIELD = 'f-string field'
    COMMENTED_TYPE_HINT = 'commented type hint'
    STRINGIFIED_TYPE_HINT = 'stringified type hint'
    TYPE = 'type'
    ERROR_TOKEN = 'error token'

class LimitKind(enum.Enum):
    """Why a line has not all of its records."""
    TOO_MANY_NODES = 'too many nodes'
    TOO_DEEP = 'too deep'

class Range:
    """
    A piece of a text. Rows and columns count from 1, columns in characters; the end is after the last character.
    """

    def __init__(self, row: int, column: int, end_row: int, end_column: int) -> None:
        ...

    @property
    def row(self) -> int:
        ...

    @property
    def column(self) -> int:
        ...

    @property
    def end_row(self) -> int:
        ...

    @property
    def end_column(self) -> int:
        ...

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __repr__(self) -> str:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

class Problem:
    """A fault of a text."""

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

    @property
    def path(self) -> str:
        """The path of its text."""

    @property
    def message(self) -> str:
        """What is wrong, in words."""

    @property
    def code(self) -> str:
        """What kind of fault it is, such as "CL201"."""

    @property
    def range(self) -> Range:
        """What it is about; empty for a place between characters."""

    @property
    def related(self) -> tuple[tuple[Range, str], ...]:
        """Other places that it has to do with, each with what it is."""

    @property
    def hint(self) -> str | None:
        """What may have been meant, where that can be told."""

    @property
    def source_row(self) -> str:
        """The text of the row in which it begins."""

    def __str__(self) -> str:
        ...

    def __repr__(self) -> str:
        ...

class Line:
    """
    A logical line: a statement, the header of one, or a comment on rows of its own.
    """

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

    @property
    def range(self) -> Range:
        """From its first character to its last one."""

    @property
    def kind(self) -> LineKind:
        """What kind of statement it holds or begins."""

    @property
    def text(self) -> str:
        """Its text, as written."""

    @property
    def indent(self) -> int | None:
        """
        The width of the blanks before it; None after another line on the same row.
        """

    @property
    def problems(self) -> Problems:
        """What is wrong with it."""

    @property
    def records(self) -> Records:
        """What it says of names; nothing when it has a problem."""

    def __repr__(self) -> str:
        ...

class Record:
    """What a line says of one name."""

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

    @property
    def kind(self) -> RecordKind:
        """What is said."""

    @property
    def name(self) -> str:
        """The name; a chain such as `a.b` is one too."""

    @property
    def payload(self) -> str:
        """What is said besides the kind, as text."""

    @property
    def value(self) -> None | int | str | tuple[str, str | None]:
        """
        The payload by its form: None, a text, the index of a token, (module, name) or (type, value).
        """

    @property
    def of_argument(self) -> bool:
        """
        True when the name is an argument or a type parameter of the definition on its line.
        """

    @property
    def range(self) -> Range | None:
        """Where the name stands; None where it stands nowhere."""

    @property
    def line(self) -> Line:
        """The line that says it."""

    def __str__(self) -> str:
        ...

    def __repr__(self) -> str:
        ...

class Limit:
    """
    A line that was too much for a full walk and lacks some of its records.
    """

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

    @property
    def kind(self) -> LimitKind:
        """Which limit it met."""

    @property
    def message(self) -> str:
        """The same in words."""

    @property
    def line(self) -> Line:
        """The line."""

    def __repr__(self) -> str:
        ...

class Problems(Sequence[Problem]):

    def __len__(self) -> int:
        ...

    @typing.overload
    def __getitem__(self, i: typing.SupportsIndex, /) -> Problem:
        ...

    @typing.overload
    def __getitem__(self, i: slice, /) -> typing.Self:
        ...

    def __iter__(self) -> collections.abc.Iterator[Problem]:
        ...

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def index(self, value: object, start: int=0, stop: int | None=None) -> int:
        ...

    def count(self, value: object) -> int:
        ...

    def __repr__(self) -> str:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

class Lines(Sequence[Line]):

    def __len__(self) -> int:
        ...

    @typing.overload
    def __getitem__(self, i: typing.SupportsIndex, /) -> Line:
        ...

    @typing.overload
    def __getitem__(self, i: slice, /) -> typing.Self:
        ...

    def __iter__(self) -> collections.abc.Iterator[Line]:
        ...

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def index(self, value: object, start: int=0, stop: int | None=None) -> int:
        ...

    def count(self, value: object) -> int:
        ...

    def __repr__(self) -> str:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

class Records(Sequence[Record]):

    def __len__(self) -> int:
        ...

    @typing.overload
    def __getitem__(self, i: typing.SupportsIndex, /) -> Record:
        ...

    @typing.overload
    def __getitem__(self, i: slice, /) -> typing.Self:
        ...

    def __iter__(self) -> collections.abc.Iterator[Record]:
        ...

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def index(self, value: object, start: int=0, stop: int | None=None) -> int:
        ...

    def count(self, value: object) -> int:
        ...

    def __repr__(self) -> str:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

class Limits(Sequence[Limit]):

    def __len__(self) -> int:
        ...

    @typing.overload
    def __getitem__(self, i: typing.SupportsIndex, /) -> Limit:
        ...

    @typing.overload
    def __getitem__(self, i: slice, /) -> typing.Self:
        ...

    def __iter__(self) -> collections.abc.Iterator[Limit]:
        ...

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def index(self, value: object, start: int=0, stop: int | None=None) -> int:
        ...

    def count(self, value: object) -> int:
        ...

    def __repr__(self) -> str:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

class Analysis:
    """What a text says. Each part is worked out when it is first asked for."""

    def __init__(self, utf8: bytes, path: str, python: str, version: int, false_hints: bool, faults: list[tuple[int, int, str]], unreadable: list[int]) -> None:
        """
        For `codeloom.analyze`, which decodes. `faults` are places that are no text, and `unreadable` the offset of each character that stands for something unreadable.
        """

    @property
    def path(self) -> str:
        """The name that problems bear."""

    @property
    def python(self) -> str:
        """The version of Python that the text is written in."""

    @property
    def text(self) -> str:
        """The source text, with U+FFFD for what can't be read."""

    @property
    def problems(self) -> Problems:
        """What is wrong, in the order of the text."""

    @property
    def lines(self) -> Lines:
        """The logical lines, in the order of the text."""

    @property
    def records(self) -> Records:
        """What the lines say of names."""

    @property
    def limits(self) -> Limits:
        """The lines that lack some of their records."""

    def __repr__(self) -> str:
        ...

    def __reduce__(self) -> tuple[Any, ...]:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

def DumpNames(text: str, version: int, has_print_function: bool=False, with_records: bool=True) -> list[tuple[int, int, int, list[tuple[bytes, bytes, bool, int, int]]]]:
    """
    For developers: what the walk for names records of each logical line of a text, and of each expression embedded in it.

    Each is the kind of its fault (0 for none), the token at fault, the limit that the walk hit (0 for none), and the records: name, info bytes, whether of an argument, and the bytes of the text at which the name stands. `version` is 312 for Python 3.12.
    """

def DumpTrees(text: str, version: int, has_print_function: bool=False) -> list[tuple[str, str | None, int]]:
    """
    For developers: the tree of each logical line of a text, and of each expression embedded in it, as text.

    Each is (dump, None, -1), or ("", what is wrong, the index of the token at fault). `version` is 312 for Python 3.12.
    """
