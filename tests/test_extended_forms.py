"""What each version of the language brought, one row for each form: accepted from there on, named before.

A row is a statement, and after two blanks and `#!` what is said of it to somebody who asks for the version
before.
"""

import ast
import sys

import pytest

from codeloom import VERSIONS as ALL_VERSIONS
from codeloom import analyze
from codeloom.records import FormatRecord, RecordsOfLogical
from codeloom.treesift import CExtendedAnalyzer
from codeloom.utils import GetLogicalsFromText

ONLY_IN_2_7 = r"""
    print 'a', b
    print 'a',
    exec 'a' in b, c
    raise E, 'text', tb
    x = `y` <> 0777 + 10L
    def f(a, (b, (c, d))=e): pass
    [a for b in 1, 2]
    x = 0777
    x = 10L
    x = ur'a'
"""

NEW_IN = {
    # 308 ternary, 341 try with all its parts, 342 yield as an expression, 343 with, 274 and 3127 of 2.7
    "2.7": r"""
    x = a if b else c
    try: a\nexcept B as b: c\nelse: d\nfinally: e
    x = yield a
    with a as b, c as (d, e): f
    with lambda a,: b, (lambda c, *d: e): f
    {a: b for c in d}; {a for b in c}; {a, b}
    0o17 + 0b1 + 00 + 0777.5 + 0777e1 + 0777j
    class A: pass
    @a.b(c)\nclass A: pass
    """,
    # 3102, 3104, 3107, 3109, 3115, 3132
    "3.0": r"""
    def f(a, *, b: c = 1, **d) -> e: pass
    nonlocal a
    raise A from b
    class A(B, metaclass=C): pass
    a, *b = c
    match = case = type; match.case(type)[case]; type is a; type in a; type not in a; type(a)
    """,
    # 380, 414
    "3.3": r"""
    yield from a  #! `yield from` needs Python 3.3
    x = u'a'  #! the prefix `u` of a string needs Python 3.3
    x = rB'a'  #! the prefix `rb` of bytes needs Python 3.3
    with (yield from a) as b: c  #! `yield from` needs Python 3.3
    """,
    # 448, 465, 492
    "3.5": r"""
    f(*a, *b, **c, **d)  #! unpacking in a call anywhere but once at the end needs Python 3.5
    [*a, *b]  #! unpacking in a display or a value needs Python 3.5
    {**a, 'b': c}  #! unpacking in a display or a value needs Python 3.5
    a @ b; a @= b  #! `@` as an operator needs Python 3.5
    async def f(): pass  #! `async` needs Python 3.5
    """,
    # 498, 526, 515, 530
    "3.6": r"""
    x = f'{a!r:>{b}}'  #! an f-string needs Python 3.6
    x: int  #! an annotation of a variable needs Python 3.6
    x = 1_000  #! `_` within a number needs Python 3.6
    def f(*a,): pass  #! a comma after starred parameters needs Python 3.6
    case[a + 1]: int = 3; match[a]: int; type[a]: b = c  #! an annotation of a variable needs Python 3.6
    async def f():\n  async with a as b: await c\n  async for d in e: pass
    async def f(): return [a async for b in c]
    """,
    # 572, 570
    "3.8": r"""
    if (a := b): c  #! `:=` needs Python 3.8
    f(a := b, c)  #! `:=` needs Python 3.8
    def f(a, /, b): pass  #! `/` among parameters needs Python 3.8
    lambda a, /: 0  #! `/` among parameters needs Python 3.8
    return *a, b  #! a starred expression without parentheses after `return` or `yield` needs Python 3.8
    x = f'{a = }'  #! `=` at the end of a field of an f-string needs Python 3.8
    with (a := b) as c, (d): e
    """,
    # 614, 617
    "3.9": r"""
    @a[0].b\ndef f(): pass  #! a decorator that isn't a name or a call of one needs Python 3.9
    @(lambda f: f)\ndef f(): pass  #! a decorator that isn't a name or a call of one needs Python 3.9
    @a.b(c)(d)\nclass A: pass  #! a decorator that isn't a name or a call of one needs Python 3.9
    @lambda a, b: c\ndef f(): pass  #! a decorator that isn't a name or a call of one needs Python 3.9
    @...\ndef f(): pass  #! a decorator that isn't a name or a call of one needs Python 3.9
    @a := b\ndef f(): pass  #! a decorator that isn't a name or a call of one needs Python 3.9
    with (a as b, c): d  #! a `with` whose items are in parentheses needs Python 3.9
    with (a as b, c as d,): e  #! a `with` whose items are in parentheses needs Python 3.9
    async def f():\n  async with (a as b, c): d  #! a `with` whose items are in parentheses needs Python 3.9
    {a := b}  #! invalid syntax
    {*a, b := c}  #! invalid syntax
    {a := b for b in c}  #! invalid syntax
    for a in *b, c: d  #! cannot use starred expression here
    a += *b, c  #! cannot use starred expression here
    f(a := b for b in c)  #! invalid syntax
    """,
    # 634
    "3.10": r"""
    match a:\n  case b: c  #! `match` needs Python 3.10
    match a, *b:\n  case c, *d: e  #! `match` needs Python 3.10
    match a:\n  case *a, b: c\n  case (): d\n  case a,: e  #! `match` needs Python 3.10
    match a:\n  case 'b' 'c': d\n  case {'b' r'c': 'd' 'e' | 'f'}: g  #! `match` needs Python 3.10
    match a:\n  case A(b, c=[d, *_]) | {1: -2j, **e} as f if g: h  #! `match` needs Python 3.10
    match a:\n  case b if lambda c=lambda: 1, *d: c: e  #! `match` needs Python 3.10
    a[b := c]  #! `:=` without its own parentheses in a subscript needs Python 3.10
    a[b := c, d]  #! `:=` without its own parentheses in a subscript needs Python 3.10
    """,
    # 654, 646
    "3.11": r"""
    try: a\nexcept* B as c: d  #! `except*` needs Python 3.11
    try: a\nexcept *(B, C): d  #! `except*` needs Python 3.11
    a[*b]; a[*b, c] = d  #! a starred expression in a subscript needs Python 3.11
    a[*b or c, d:e]  #! a starred expression in a subscript needs Python 3.11
    def f(*args: *Ts): pass  #! a starred annotation needs Python 3.11
    """,
    # 695, 701
    "3.12": r"""
    type A = ...  #! `type` needs Python 3.12
    type A[T] = list[T]  #! `type` needs Python 3.12
    if a: type A[T] = list[T]; type B = A; b = type  #! `type` needs Python 3.12
    class A: type B = lambda a=1, *, b: (a, b)  #! `type` needs Python 3.12
    match a:\n  case b: type A = b  #! `type` needs Python 3.12
    type type = type; type match = case  #! `type` needs Python 3.12
    def f[T: int, *Ts, **P](a: T) -> T: pass  #! a list of type parameters needs Python 3.12
    def f[T: match.a, U: case](): pass  #! a list of type parameters needs Python 3.12
    async def f[T: (int, str)](): pass  #! a list of type parameters needs Python 3.12
    class A[T](B[T]): pass  #! a list of type parameters needs Python 3.12
    x = f'{f'{a['b']}'}'
    x = f'{a\n  # why\n  + b}' f'{'\n'.join(c)}'
    x = f'''{\na = # why\n:>3}'''
    """,
    # 696
    "3.13": r"""
    def f[T = ...](): pass  #! a default of a type parameter needs Python 3.13
    class A[T: int = bool, *B = *b, **P = [int]]: pass  #! a default of a type parameter needs Python 3.13
    type A[T = list[int], U = T] = B[T, U]  #! a default of a type parameter needs Python 3.13
    """,
    # 758, 750
    "3.14": r"""
    try: a\nexcept B, C: d  #! an `except` of several types without parentheses needs Python 3.14
    try: a\nexcept* B, C,: d  #! an `except` of several types without parentheses needs Python 3.14
    x = t'{a}'  #! a t-string needs Python 3.14
    x = Rt'''{a!r:{b}}''' t'c'  #! a t-string needs Python 3.14
    x = f'{t'{a}'}'  #! a t-string needs Python 3.14
    """,
}


def Rows(text):
    for row in filter(None, map(str.strip, text.splitlines())):
        statement, _, told = row.partition("  #! ")
        yield statement.replace("\\n", "\n").replace("'\n'", r"'\n'"), told


ROWS = [(since, *row) for since, text in NEW_IN.items() for row in Rows(text)]
# Of what else may be refused, what the grammar refuses: stars, order and parentheses of parameters.
OF_THE_GRAMMAR = {"CL407", "CL436", "CL438"}
VERSIONS = [name for name in ALL_VERSIONS if name != "2.7"]


def Messages(statement, version):
    problems = analyze(f"{statement}\n", python=version).problems
    # Where a statement may stand, and what else a compiler refuses, isn't asked here.
    return [
        problem.message
        for problem in problems
        if problem.code in OF_THE_GRAMMAR or not "CL300" <= problem.code < "CL600"
    ]


@pytest.mark.parametrize(("since", "statement", "told"), ROWS, ids=[statement for _, statement, _ in ROWS])
def test_accepted_from_its_version_on_and_named_before(since, statement, told):
    assert since != "2.7" or Messages(statement, "2.7") == []
    first = VERSIONS.index(since) if since != "2.7" else 0
    for version in VERSIONS[first:]:
        assert Messages(statement, version) == [], version
    if told:
        assert any(told in message for message in Messages(statement, VERSIONS[first - 1]))


@pytest.mark.parametrize(
    ("statement", "records"),
    [
        ("def f() -> ...: pass", ["set  f", "arg hint return  ..."]),
        (
            "def f(a):  # type: (b) -> ...",
            ["set  f", "get  b", "arg set  a", "arg hint a  b", "arg hint return  ..."],
        ),
        ("a, b = ..., 1", ["set  a", "set  b", "literal b  int: 1"]),
        (
            "isinstance(a, (..., B))",
            [
                "is   a  B:",
                "called isinstance  (a,(..., B))",
                *map("get  {}".format, ("isinstance", "a", "B")),
            ],
        ),
    ],
)
def test_three_dots_are_an_expression(statement, records):
    (logical,) = GetLogicalsFromText(statement)
    assert CExtendedAnalyzer((3, 14)).AnalyzeSingleLogical(logical, False) is None
    assert [FormatRecord(record) for record in RecordsOfLogical(logical)] == records


@pytest.mark.filterwarnings("ignore")
@pytest.mark.parametrize(("since", "statement", "told"), ROWS, ids=[statement for _, statement, _ in ROWS])
def test_rows_say_the_truth_of_this_interpreter(since, statement, told):
    is_known = tuple(map(int, since.split("."))) <= sys.version_info[:2]
    try:
        ast.parse(statement)
    except SyntaxError:
        assert not is_known
    else:
        assert is_known


NEVER = r"""
    with a, b,: c
    with (a as b), c: d
    with (a as b) as c: d
    async with (a as b, c: d
    @a, b\ndef f(): pass
    @*a\ndef f(): pass
    @yield\ndef f(): pass
    @a = b\ndef f(): pass
    @a for a in b\ndef f(): pass
    @\ndef f(): pass
    type A
    type A = b, c
    type A = b = c
    type A[B]
    type A[] = b
    def f[](): pass
    if a: type B = c = d; e
    if a: b: type C = d
    lambda: type A = b
    type in = b
    type A: int = b
    def f[A = ](): pass
    def f[A = b, c = d = e](): pass
    def f[A = b, c for c in d](): pass
    class A[= b]: pass
    try: a\nexcept B, C as d: e
    try: a\nexcept* B, C as d: e
    [*a or b]
"""


@pytest.mark.parametrize("statement", [statement for statement, _ in Rows(NEVER)])
def test_what_is_never_sound(statement):
    assert all(Messages(statement, version) for version in VERSIONS)


@pytest.mark.parametrize("statement", [statement for statement, _ in Rows(ONLY_IN_2_7)])
def test_what_went_with_2_7(statement):
    assert Messages(statement, "2.7") == []
    for version in VERSIONS:
        assert Messages(statement, version)


@pytest.mark.parametrize(
    ("text", "column", "message"),
    [
        ("x = 1 + 0777", 9, "an octal number without `0o` ended with Python 2"),
        ("f'{é + 10l}'", 8, "the suffix `L` of a number ended with Python 2"),
        ("f(a, uR'b')", 6, "the prefix `ur` of a string ended with Python 2"),
    ],
)
def test_what_ended_with_python_2_is_named(text, column, message):
    (problem,) = analyze(text, python="3.8").problems
    assert (problem.message, problem.range.column) == (message, column)
