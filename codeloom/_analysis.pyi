# Made by tools/make_stubs.py; don't edit.
import collections.abc
import typing
from collections.abc import Sequence
import enum
from typing import Literal, Self, overload

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

class ParameterKind(enum.Enum):
    """How arguments reach a parameter."""
    POSITIONAL_ONLY = 'positional only'
    POSITIONAL_OR_KEYWORD = 'positional or keyword'
    VAR_POSITIONAL = 'var positional'
    KEYWORD_ONLY = 'keyword only'
    VAR_KEYWORD = 'var keyword'

class HintKind(enum.Enum):
    """What a type hint is about."""
    VARIABLE = 'variable'
    ATTRIBUTE = 'attribute'
    PARAMETER = 'parameter'
    RETURN = 'return'

class Role(enum.Enum):
    """What a name does where it appears; docs/names.md explains each."""
    READ = 'read'
    BIND = 'bind'
    AUGMENT = 'augment'
    DELETE = 'delete'
    IMPORT = 'import'
    PARAMETER = 'parameter'
    TYPE_PARAMETER = 'type parameter'
    GLOBAL = 'global'
    NONLOCAL = 'nonlocal'
    ATTRIBUTE = 'attribute'
    ATTRIBUTE_BIND = 'attribute bind'
    ATTRIBUTE_AUGMENT = 'attribute augment'
    ATTRIBUTE_DELETE = 'attribute delete'
    KEYWORD = 'keyword'
    ORIGIN = 'origin'

class ScopeKind(enum.Enum):
    """What makes a scope; docs/names.md explains each."""
    MODULE = 'module'
    CLASS = 'class'
    FUNCTION = 'function'
    LAMBDA = 'lambda'
    LIST_COMPREHENSION = 'list comprehension'
    SET_COMPREHENSION = 'set comprehension'
    DICT_COMPREHENSION = 'dict comprehension'
    GENERATOR = 'generator'
    TYPE_PARAMETERS = 'type parameters'
    TYPE_ALIAS = 'type alias'
    TYPE_VARIABLE = 'type variable'
    ANNOTATION = 'annotation'

class Resolution(enum.Enum):
    """
    Where a name is bound: in a scope of the text, nowhere in it as a builtin, perhaps (by `import *`, `exec` or `globals()`, or on a line with a fault), or nowhere that can be seen.
    """
    SCOPE = 'scope'
    BUILTIN = 'builtin'
    PERHAPS = 'perhaps'
    UNKNOWN = 'unknown'

class Range:
    """
    A piece of a text. Rows and columns count from 1, columns in characters; the end is after the last character.
    """

    def __init__(self, row: int, column: int, end_row: int, end_column: int) -> None:
        ...

    @property
    def row(self) -> int:
        """The row of its first character."""

    @property
    def column(self) -> int:
        """The column of its first character."""

    @property
    def end_row(self) -> int:
        """The row of its last character."""

    @property
    def end_column(self) -> int:
        """The column after its last character."""

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __repr__(self) -> str:
        ...

    def __reduce__(self) -> tuple[object, ...]:
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

    def __reduce__(self) -> tuple[object, ...]:
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
    def severity(self) -> Literal['error', 'warning']:
        """
        "error" for what the interpreter refuses; "warning" for a type hint that can't be read, a way out of a `finally`, and a line that is too long to analyse.
        """

    @property
    def range(self) -> Range:
        """Where it is: at least one character, unless the text is empty."""

    @property
    def related(self) -> tuple[tuple[Range, str], ...]:
        """Other places that belong to it, each with a few words on why."""

    @property
    def hint(self) -> str | None:
        """What may have been meant; None where that isn't known."""

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

    def __reduce__(self) -> tuple[object, ...]:
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
        """What is wrong with it, in the order of the text."""

    @property
    def records(self) -> Records:
        """What it says of names; empty when it has a problem."""

    @property
    def occurrences(self) -> Occurrences:
        """
        Every appearance of a name on it, in their order; nothing when it has a problem of its grammar.
        """

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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    @property
    def kind(self) -> RecordKind:
        """What is said."""

    @property
    def name(self) -> str:
        """The name; a chain such as `a.b` is one too."""

    @property
    def payload(self) -> str:
        """What else is said, as text; its form depends on the kind."""

    @property
    def value(self) -> None | int | str | tuple[str, str | None]:
        """
        The payload as a value: None, a text, the index of a token, (module, name) or (type, value).
        """

    @property
    def of_argument(self) -> bool:
        """
        True when the name is a parameter or a type parameter of the definition on its line.
        """

    @property
    def range(self) -> Range | None:
        """Where the name is; None if it has no place."""

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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    @property
    def kind(self) -> LimitKind:
        """Which limit it met."""

    @property
    def message(self) -> str:
        """The limit in words."""

    @property
    def line(self) -> Line:
        """The line that is too much."""

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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    def __arrow_c_stream__(self, requested_schema: object=None) -> object:
        """
        The items as a table, for libraries that know the Arrow C stream interface; docs/tables.md lists its columns. No other schema is made on request.
        """

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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    def __arrow_c_stream__(self, requested_schema: object=None) -> object:
        """
        The items as a table, for libraries that know the Arrow C stream interface; docs/tables.md lists its columns. No other schema is made on request.
        """

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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    def __arrow_c_stream__(self, requested_schema: object=None) -> object:
        """
        The items as a table, for libraries that know the Arrow C stream interface; docs/tables.md lists its columns. No other schema is made on request.
        """

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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    def __arrow_c_stream__(self, requested_schema: object=None) -> object:
        """
        The items as a table, for libraries that know the Arrow C stream interface; docs/tables.md lists its columns. No other schema is made on request.
        """

class Scope:
    """
    A module, class, function or other part of a text that has names of its own.
    """

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def __reduce__(self) -> tuple[object, ...]:
        ...

    @property
    def kind(self) -> ScopeKind:
        """What makes it a scope."""

    @property
    def name(self) -> str:
        """Of a class, a function or an alias; empty for others."""

    @property
    def parent(self) -> Scope | None:
        """The scope around it; None for the module."""

    @property
    def range(self) -> Range:
        """From its header or expression to the end of its last line."""

    @property
    def symbols(self) -> tuple[Symbol, ...]:
        """Its names, in the order in which they first appear."""

    def __repr__(self) -> str:
        ...

class Symbol:
    """
    A name in a scope. It answers as the interpreter's module `symtable` does.
    """

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    @property
    def name(self) -> str:
        """The name, as the class around it mangles it."""

    @property
    def scope(self) -> Scope:
        """The scope that it is a name of."""

    @property
    def is_local(self) -> bool:
        """The scope binds it."""

    @property
    def is_global(self) -> bool:
        """It is a name of the module, or isn't bound in the text."""

    @property
    def is_free(self) -> bool:
        """A function around the scope binds it."""

    @property
    def is_declared_global(self) -> bool:
        """A `global` names it."""

    @property
    def is_nonlocal(self) -> bool:
        """A `nonlocal` names it."""

    @property
    def is_referenced(self) -> bool:
        """The scope reads it."""

    @property
    def is_assigned(self) -> bool:
        """It gets a value, other than by an import or as a parameter."""

    @property
    def is_parameter(self) -> bool:
        """It is a parameter."""

    @property
    def is_imported(self) -> bool:
        """An import binds it."""

    @property
    def is_annotated(self) -> bool:
        """It is annotated."""

    @property
    def is_type_parameter(self) -> bool:
        """It is a type parameter."""

    @property
    def is_namespace(self) -> bool:
        """A definition right in the scope binds it."""

    def __repr__(self) -> str:
        ...

class Occurrence:
    """One appearance of a name in a text."""

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def __reduce__(self) -> tuple[object, ...]:
        ...

    @property
    def name(self) -> str:
        """The name as written; `*` for what `import *` binds."""

    @property
    def role(self) -> Role:
        """What the name does there."""

    @property
    def range(self) -> Range:
        """Where it is."""

    @property
    def line(self) -> Line:
        """The line that it is on."""

    @property
    def scope(self) -> Scope:
        """The scope that it is in."""

    @property
    def resolution(self) -> Resolution | None:
        """
        Where its name is bound; None for what belongs to no scope, such as an attribute.
        """

    @property
    def home(self) -> Scope | None:
        """
        The scope that binds its name; None where no scope of the text is known to.
        """

    @property
    def symbol(self) -> Symbol | None:
        """Its name in its scope; None for what belongs to no scope."""

    @property
    def object(self) -> Range | None:
        """Of an attribute, what it hangs on: `a` for the `b` of `a.b`."""

    @property
    def mangled(self) -> str:
        """
        The name as the class around mangles it: `_A__x` for `__x`, else the name itself.
        """

    @property
    def is_definition(self) -> bool:
        """It is the name of a `def` or a `class`."""

    @property
    def in_f_string(self) -> bool:
        """It is in a field of an f-string."""

    @property
    def in_quotes(self) -> bool:
        """It is in a hint in quotes."""

    @property
    def in_comment(self) -> bool:
        """It is in a hint in a comment."""

    def __repr__(self) -> str:
        ...

class Occurrences(Sequence[Occurrence]):

    def __len__(self) -> int:
        ...

    @typing.overload
    def __getitem__(self, i: typing.SupportsIndex, /) -> Occurrence:
        ...

    @typing.overload
    def __getitem__(self, i: slice, /) -> typing.Self:
        ...

    def __iter__(self) -> collections.abc.Iterator[Occurrence]:
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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    def __arrow_c_stream__(self, requested_schema: object=None) -> object:
        """
        The items as a table, for libraries that know the Arrow C stream interface; docs/tables.md lists its columns. No other schema is made on request.
        """

class Scopes(Sequence[Scope]):

    def __len__(self) -> int:
        ...

    @typing.overload
    def __getitem__(self, i: typing.SupportsIndex, /) -> Scope:
        ...

    @typing.overload
    def __getitem__(self, i: slice, /) -> typing.Self:
        ...

    def __iter__(self) -> collections.abc.Iterator[Scope]:
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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    def __arrow_c_stream__(self, requested_schema: object=None) -> object:
        """
        The items as a table, for libraries that know the Arrow C stream interface; docs/tables.md lists its columns. No other schema is made on request.
        """

class Hint:
    """
    A type hint: an annotation (PEP 3107, PEP 526), or one in a comment (PEP 484).
    """

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def __reduce__(self) -> tuple[object, ...]:
        ...

    @property
    def text(self) -> str:
        """The hint as written, quotes included."""

    @property
    def range(self) -> Range:
        """Where it is."""

    @property
    def kind(self) -> HintKind:
        """What it is about."""

    @property
    def name(self) -> str:
        """
        The name or chain that it is about; of what a function returns, that of the function.
        """

    @property
    def target(self) -> Range:
        """Where that name is."""

    @property
    def in_comment(self) -> bool:
        """It is in a comment."""

    @property
    def line(self) -> Line:
        """The line that it is on."""

    def __repr__(self) -> str:
        ...

class Parameter:
    """A parameter of a `def`."""

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    @property
    def name(self) -> str:
        """Its name."""

    @property
    def range(self) -> Range:
        """Where the name is."""

    @property
    def kind(self) -> ParameterKind:
        """How arguments reach it, in the words of `inspect`."""

    @property
    def default(self) -> Range | None:
        """Where its default is; None without one."""

    @property
    def hint(self) -> Hint | None:
        """Its annotation, else its hint in a comment; None without any."""

    def __repr__(self) -> str:
        ...

class Signature:
    """The header of a `def`."""

    def __eq__(self, other: object, /) -> bool:
        ...

    def __hash__(self) -> int:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    def __reduce__(self) -> tuple[object, ...]:
        ...

    @property
    def name(self) -> str:
        """The function's name."""

    @property
    def range(self) -> Range:
        """Where the name is."""

    @property
    def line(self) -> Line:
        """The line of the header."""

    @property
    def is_async(self) -> bool:
        """It is an `async def`."""

    @property
    def is_method(self) -> bool:
        """It is right in the body of a class."""

    @property
    def parameters(self) -> tuple[Parameter, ...]:
        """Its parameters; those within a tuple of Python 2 one by one."""

    @property
    def return_hint(self) -> Hint | None:
        """The hint of what it returns; None without one."""

    def __repr__(self) -> str:
        ...

class Hints(Sequence[Hint]):

    def __len__(self) -> int:
        ...

    @typing.overload
    def __getitem__(self, i: typing.SupportsIndex, /) -> Hint:
        ...

    @typing.overload
    def __getitem__(self, i: slice, /) -> typing.Self:
        ...

    def __iter__(self) -> collections.abc.Iterator[Hint]:
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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    def __arrow_c_stream__(self, requested_schema: object=None) -> object:
        """
        The items as a table, for libraries that know the Arrow C stream interface; docs/tables.md lists its columns. No other schema is made on request.
        """

class Signatures(Sequence[Signature]):

    def __len__(self) -> int:
        ...

    @typing.overload
    def __getitem__(self, i: typing.SupportsIndex, /) -> Signature:
        ...

    @typing.overload
    def __getitem__(self, i: slice, /) -> typing.Self:
        ...

    def __iter__(self) -> collections.abc.Iterator[Signature]:
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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    def __arrow_c_stream__(self, requested_schema: object=None) -> object:
        """
        The items as a table, for libraries that know the Arrow C stream interface; docs/tables.md lists its columns. No other schema is made on request.
        """

class Table:
    """
    Rows in columns. Libraries that know the Arrow C stream interface take it as it is: `pyarrow.table(t)`, `polars.DataFrame(t)`.
    """

    @property
    def name(self) -> str:
        """Such as "lines"."""

    @property
    def column_names(self) -> tuple[str, ...]:
        """The names of its columns."""

    def __len__(self) -> int:
        ...

    def __arrow_c_stream__(self, requested_schema: object=None) -> object:
        """
        The table as a stream of one batch. No other schema is made on request.
        """

    def __repr__(self) -> str:
        ...

def table_kinds() -> list[tuple[str, str, list[tuple[str, str, bool, str]]]]:
    """
    For each table its name, its meaning and its columns: name, type, whether it may hold nulls, meaning.
    """

def file_columns() -> list[tuple[str, str, bool, str]]:
    """The same for the columns of the table `files`, which only a batch has."""

class SourceBatch:
    """For `codeloom.corpus`: the sources in a table of another library."""

    @overload
    def __init__(self, table: object, path: str, content: str, python: str) -> None:
        ...

    @overload
    def __init__(self, paths: list[str], contents: list[bytes | None], pythons: list[str | None]) -> None:
        ...

    def __len__(self) -> int:
        ...

    def path(self, i: int) -> str | None:
        ...

    def python(self, i: int) -> str | None:
        ...

    def size(self, i: int) -> int | None:
        ...

    def content(self, i: int) -> bytes | None:
        ...

    def digest(self, i: int, hash: object) -> str | None:
        """
        The hash of the content by a function of hashlib, in hexadecimal digits.
        """

    @property
    def holds_text(self) -> bool:
        """True where contents are text, not bytes."""

    def is_plain(self, i: int) -> bool:
        """True where the content needs no decoding."""

    def take(self, i: int, file_id: int, path: str, sha256: str | None, python: str, version: int) -> None:
        """Says how a source is called and which version it is read as."""

    def take_decoded(self, utf8: bytes, faults: list[tuple[int, int, str]], unreadable: list[int]) -> None:
        """The text of the source that was taken last."""

    def mark(self, state: str, reason: str) -> None:
        """What is wrong with the source that was taken last."""

    def analyze(self, tables: list[str], false_hints: bool, with_source: bool, max_seconds: float) -> dict[str, Table]:
        ...

class Analysis:
    """What a text says. Each part is worked out when it is first asked for."""

    def __init__(self, utf8: bytes, path: str, python: str, version: int, false_hints: bool, faults: list[tuple[int, int, str]], unreadable: list[int]) -> None:
        """
        For `codeloom.analyze`, which decodes. `faults` are places that aren't text, and `unreadable` the offset of each character that stands for something unreadable.
        """

    @property
    def path(self) -> str:
        """The name of the text, which is in its problems."""

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

    def __reduce__(self) -> tuple[object, ...]:
        ...

    def __copy__(self) -> Self:
        ...

    def __deepcopy__(self, memo: object) -> Self:
        ...

    @property
    def occurrences(self) -> Occurrences:
        """
        Every appearance of a name, in the order of the text. Names that are only made at run time, by `exec`, `globals()` or `setattr`, don't appear.
        """

    @property
    def scopes(self) -> Scopes:
        """The scopes, in the order in which they begin; the module is the first."""

    def definitions(self, name: str) -> tuple[Occurrence, ...]:
        """
        Where the name gets a value, in any scope. Which of these runs isn't known.
        """

    def references(self, occurrence: Occurrence) -> tuple[Occurrence, ...]:
        """
        All occurrences of the name that its scope binds, this one included; none for an attribute, whose object isn't known. ValueError for one of another analysis.
        """

    def occurrence_at(self, row: int, column: int) -> Occurrence | None:
        """
        The occurrence at a place, or the one that ends there. Row and column count from 1, columns in characters; ValueError for less than 1.
        """

    def unused(self, *, parameters: bool=False) -> tuple[Occurrence, ...]:
        """
        The first binding of each import and of each local name of a function that nothing in the text reads; with `parameters` theirs too. Names that begin with `_` are left out, and what `__all__` lists. What other modules read isn't known, nor which names are looked up as text.
        """

    def undefined(self) -> tuple[Occurrence, ...]:
        """
        What is read although nothing in the text binds it and no builtin has the name; what `import *` or a line with a fault may bind is left out. Whether a binding runs before isn't known.
        """

    @property
    def signatures(self) -> Signatures:
        """The header of each `def` that is sound, in the order of the text."""

    @property
    def hints(self) -> Hints:
        """
        Every type hint of the text, line by line: those of variables, attributes, parameters and of what functions return, in annotations and in comments.
        """

    def table(self, name: str) -> Table:
        """
        One of the tables of docs/tables.md, such as "lines", whole; ValueError for an unknown name.
        """

class DocumentEdit:
    """For `codeloom.Document`: what an edit replaced."""

    @property
    def range(self) -> Range:
        """What was replaced, in the text before."""

    @property
    def new_range(self) -> Range:
        """What is there now."""

class DocumentChange:
    """
    For `codeloom.Change`: what an edit has changed. Each question is answered by two tuples: what is gone, and what came.
    """

    def __init__(self, before: Analysis, after: Analysis, edit: DocumentEdit) -> None:
        ...

    def moved(self, range: Range) -> Range | None:
        """
        Where a range of the text before is now; None where the edit has cut into it.
        """

    @property
    def lines(self) -> tuple[tuple[Line, ...], tuple[Line, ...]]:
        """Logical lines."""

    @property
    def problems(self) -> tuple[tuple[Problem, ...], tuple[Problem, ...]]:
        """Problems."""

    @property
    def occurrences(self) -> tuple[tuple[Occurrence, ...], tuple[Occurrence, ...]]:
        """Appearances of names."""

    @property
    def scopes(self) -> tuple[tuple[Scope, ...], tuple[Scope, ...]]:
        """Scopes."""

class DocumentText:
    """
    For `codeloom.Document`: a text that changes, in pieces that keep what they say.
    """

    def __init__(self, text: str, path: str, python: str, version: int, false_hints: bool, encoding: str) -> None:
        ...

    @property
    def text(self) -> str:
        """The text as it is now."""

    @property
    def analysis(self) -> Analysis | None:
        """What the text says; None for a text with NUL or lone surrogates."""

    @property
    def end(self) -> tuple[int, int]:
        """The row and the column after the last character."""

    def column_of(self, row: int, column: int) -> int:
        """
        A column in characters as one of the document. ValueError for an unknown place.
        """

    def character_column_of(self, row: int, column: int) -> int:
        """
        A column of the document as one in characters: the end of the row for one after it.
        """

    @property
    def row_count(self) -> int:
        """How many rows the text has."""

    def row(self, row: int) -> str:
        """The text of a row, without its end."""

    def between(self, start: tuple[int, int], end: tuple[int, int]) -> str:
        """The text between two places in characters."""

    def edit(self, start: tuple[int, int], end: tuple[int, int], new_text: str) -> DocumentEdit:
        """Put a text in the place of a range, and say what was replaced."""

class FileReader:
    """
    For `codeloom.analyze_paths`: files read and analysed by `jobs` threads, that which takes them included, with their problems worked out, with `with_records` their records, and with `with_names` their occurrences, scopes, signatures and hints.
    """

    def __init__(self, jobs: int, python: str, version: int, false_hints: bool, with_records: bool, with_names: bool) -> None:
        ...

    def submit(self, paths: list[str]) -> None:
        """Some files to read. An empty path is none."""

    def take(self) -> list[Analysis | None]:
        """
        What the files say that were submitted first. None for one that can't be read or that has to be decoded: the Python layer reads these.
        """

    def close(self) -> None:
        """Ends the threads. What is left is read when it is taken."""

def DumpNames(text: str, version: int, has_print_function: bool=False, with_records: bool=True) -> list[tuple[int, int, int, list[tuple[bytes, bytes, bool, int, int]]]]:
    """
    For developers: what the walk for names records of each logical line of a text, and of each expression embedded in it.

    Each is the kind of its fault (0 for none), the token at fault, the limit that the walk hit (0 for none), and the records: name, info bytes, whether of an argument, and the bytes of the text at which the name is. `version` is 312 for Python 3.12.
    """

def DumpJoinedNames(text: str, version: int, starts: list[int]) -> tuple[str, str]:
    """
    For developers: the names of a text joined from those of its parts, which begin at these bytes, and those of the text in one go. Both are the same where each part begins with a statement of the module.
    """

def DumpTrees(text: str, version: int, has_print_function: bool=False) -> list[tuple[str, str | None, int]]:
    """
    For developers: the tree of each logical line of a text, and of each expression embedded in it, as text.

    Each is (dump, None, -1), or ("", what is wrong, the index of the token at fault). `version` is 312 for Python 3.12.
    """
