"""The grammars of Python 2.7, 3.8 and 3.14: what they accept, what they refuse, how they number."""

import ast
import random
import sysconfig
import tokenize
from pathlib import Path

import pytest
from grammar_tools import (
    ENGINE,
    ORACLE,
    Feed,
    GrammarPath,
    LoadGrammar,
    LoadOracle,
    ParseWithOracle,
    ParseWithOurs,
    Tokens,
)

from codeloom import optpgen
from codeloom.treesift import CPGenParserImpl

GRAMMARS = {version: LoadGrammar(GrammarPath(version)) for version in ("2.7", "3.8", "3.14")}
PARSERS = {version: optpgen.CreateParser(loaded, None) for version, loaded in GRAMMARS.items()}

IN_BOTH = r"""
    pass; break; continue
    x; y;
    x, = y = z, 1
    x += 1; x //= 2; x **= 3; x <<= 4; x >>= 5; x %= yield; x |= y, z
    del a, b[0], (c.d)
    assert x, 'no'
    global a, b
    return
    return a, b
    raise
    raise E
    x = yield
    yield a, b
    import a, b.c as d
    from a.b import c as d, e
    from . import a
    from .a import (b, c as d,)
    from ...a.b import *
    if a: b
    if a: b; c
    if a:\n  b\n  c\nelif d:\n  e\nelse: f
    while a: b
    while a:\n  b\nelse:\n  c
    for a, b in c, d: e
    for a in b:\n  for c in d:\n    e\nelse: f
    try: a\nexcept (B, C) as d: e\nexcept F: g\nexcept: h\nelse: i\nfinally: j
    try: a\nfinally: b
    with a: b
    with a as b, c() as (d, e), f: g
    class A: pass
    class A(): pass
    class A(B, C.D): x = 1
    def f(): pass
    def f(a, b,): pass
    def f(a, b=1, c=2, *d, **e): return a
    def f(*a, **b): pass
    def f(**a): pass
    @a.b(c, d=1)\n@e()\n@f\ndef g(): pass
    @a\nclass B: pass
    lambda: 0
    lambda a, b=lambda: c, *d, **e: a if b else c
    a if b else c if d else e
    a or b and not c
    a < b <= c == d != e >= f > g is h is not i in j not in k
    a | b ^ c & d << e >> f + g - h * i / j // k % l
    -a ** -b; +~a
    a.b[c](d)[e:f, :, ::, g:h:i, ...].j(**k)
    f(a, b=c, *d, **e)
    f(a for b in c if d for e in f)
    (); (a); (a,); (a, b); (yield); (yield a)
    []; [a]; [a, b,]; [a for b in c if d if e for f in g]
    {}; {a: b}; {a: b, c: d,}; {a: b for c in d}; {a}; {a, b,}; {a for b in c}
    'a' "b" r'c'
    (a for b, c in d if lambda: e)
"""

ONLY_IN_3_8 = r"""
    x: int
    x: A[b] = yield
    x: int = *a, b
    x @= y
    *a, b = *c, d
    del *a, b
    nonlocal a, b
    return *a, b
    raise A from b
    yield *a, b
    yield from a
    from .... import a
    from ... import a
    def f(a: int = 1, *b: c, d, e=2, **g: h) -> i: pass
    def f(a, /): pass
    def f(a, /, b, c=1, *, d, e=2, f, **g,): pass
    def f(a, b=1, /, c=2, *d,): pass
    def f(*, a): pass
    class A(B, metaclass=C, *d, **e): pass
    async def f(): await a
    async def f():\n  async with a as b, c: d\n  async for e in f: g\n  else: h
    async with a: b
    @a\nasync def b(): pass
    lambda a, /, b=1, *, c, d=2, **e: 0
    lambda *a, b: 0
    a @ b
    await a.b ** -await c
    if a := b: c
    while (a := b): c
    f(a := b, *c, d, e=f, *g, **h, **i)
    (a := b, *c); [*a, b := c]; [a := b for c in d]
    {*a, b}; {**a, b: c, **d,}
    [a async for b in c if d async for e in f]
    (a async for b in c)
    None; True; False; ...
    print(a, file=b, end='')
    exec(a)
    with a, b,: c
"""

# Beyond what 3.8 has.
ONLY_IN_3_14 = r"""
    a[b := c]; a[b := c, d:e]
    a[*b]; a[*b or c, d]; a[d, *b] = e
    {a := b}; {a := b, *c, d := e,}; {*a, b := c}; {a := b for b in c}
    def f(*a: *b): pass
    def f(a, *b: *c, d=e, **f): pass
    for a in *b, c: d
    a += *b, c
    f(a := b for b in c)
    try: a\nexcept B, C: d\nexcept D,: e
"""

ONLY_IN_2_7 = r"""
    print
    print a, b,
    print >>a
    print >>a, b, c,
    print(a), b
    exec a
    exec a in b, c
    raise A, b, c
    a <> b
    `a, b`
    try: a\nexcept B, c: d
    def f(a, (b, (c, d)), (e,)=f): pass
    lambda (a, b), c=1: 0
    [a for b in c, d]
    [a for b in lambda: c, d if e]
    None = a.True
    nonlocal = async = await
    x[...]
    def None(True): pass
"""

IN_NEITHER = r"""
    x = = y
    x = 1 = += 2
    x y
    x = y += z
    (
    )
    (a, b
    a b c
    (a for b)
    [a, , b]
    f(a, , b)
    f(**a, *b, c for)
    {a: b, c}
    {a, b: c}
    {a: b, **}
    a..b
    a.1
    a[]
    a[b:c:d:e]
    x if y
    x if y else
    not
    a not b
    a is is b
    lambda a b: c
    lambda (: 0
    def f: pass
    def f(a b): pass
    def f(a, a.b): pass
    def f(a=1, b): pass
    def f(*a, *b): pass
    def f(**a, b): pass
    def f(): 
    def (a): pass
    class A(B: pass
    class: pass
    if a b
    if: a
    else: a
    elif a: b
    for a b: c
    for a in: b
    while: a
    try: a
    try: a\nelse: b
    except: a
    with: a
    with a as: b
    import
    import a as b.c
    import a.*
    from a import
    from a import b,
    from a import (b
    from a import ()
    from . import
    from .. import (*)
    import .a
    global
    global a.b
    del
    assert
    raise a from
    return = 1
    pass pass
    @a def f(): pass
    @a\nx = 1
    @a b\ndef f(): pass
    x = $
    \n  x
    if a:\nb
"""

NOT_IN_PY3 = r"""
    print a
    exec a
    a <> b
    `a`
    raise A, b
    def f(a, (b, c)): pass
    def f(*): pass
    def f(*, **a): pass
    def f(/, a): pass
    def f(a, /, b, /): pass
    def f(a=1, /, b): pass
    def f() @= a: pass
    lambda *: 0
    lambda a=1, b: 0
    [*a for b in c]
    {**a for b in c}
    f(*a for b in c)
    x -> y
    x: y: z
    x: int += 1
    a.None
    def True(): pass
    await = 1
    async = 1
    async x
    async if a: b
    yield from a, b
    nonlocal
    for a in: b
    def f(a: *b): pass
    def f(**a: *b): pass
    [*a or b]
    a[**b]
    a[*b:c]
    except* B: c
"""

ONLY_REFUSED_IN_2_7 = r"""
    x: int
    def f(a: int): pass
    def f() -> int: pass
    def f(*, a): pass
    def f(*a, b): pass
    def f(*a,): pass
    nonlocal a
    yield from a
    (a := b)
    a @ b
    print(a, file=b)
    raise A from b
    *a, b = c
    {**a}
    with a, b,: c
    class A(b=c): pass
    f(**a, b=c)
    async def f(): pass
"""


def Snippets(text):
    return [line.strip(" ").replace("\\n", "\n") for line in text.splitlines() if line.strip()]


def ForVersions(**blocks):
    return [
        (version.removeprefix("in_").replace("_", "."), text)
        for version, texts in blocks.items()
        for text in Snippets("".join(texts))
    ]


ACCEPTED = ForVersions(
    in_2_7=(IN_BOTH, ONLY_IN_2_7),
    in_3_8=(IN_BOTH, ONLY_IN_3_8),
    in_3_14=(IN_BOTH, ONLY_IN_3_8, ONLY_IN_3_14),
)
REFUSED = ForVersions(
    in_2_7=(IN_NEITHER, ONLY_REFUSED_IN_2_7),
    in_3_8=(IN_NEITHER, NOT_IN_PY3, ONLY_IN_3_14),
    in_3_14=(IN_NEITHER, NOT_IN_PY3),
)


@pytest.mark.parametrize(("version", "text"), ACCEPTED)
def test_accepted(version, text):
    Feed(PARSERS[version], Tokens(text, version))


@pytest.mark.parametrize(("version", "text"), REFUSED)
def test_refused(version, text):
    with pytest.raises(optpgen.ParseError):
        Feed(PARSERS[version], Tokens(text, version))


def test_snippets_are_what_they_are_said_to_be():
    """The interpreter agrees, but where its syntax isn't that of the grammars."""
    differ = {
        "with a, b,: c",
        "del *a, b",
        "(a for b, c in d if lambda: e)",
        r"try: a\nexcept B, C: d\nexcept D,: e",
    }
    for text in Snippets(IN_BOTH + ONLY_IN_3_8 + ONLY_IN_3_14):
        if text.replace("\n", r"\n") not in differ:
            ast.parse(text)
    for text in Snippets(IN_NEITHER + NOT_IN_PY3):
        with pytest.raises(SyntaxError):
            ast.parse(text)


@pytest.mark.parametrize("version", GRAMMARS)
def test_numbers(version):
    numbers = GRAMMARS[version].symbol2number
    names = list(numbers)
    assert list(numbers.values()) == list(range(256, 256 + len(names)))
    assert names[0] == "file_input"
    assert names[1:] == sorted(names[1:])
    assert GRAMMARS[version].number2symbol == {number: name for name, number in numbers.items()}
    assert names[-1] == "yield_stmt"  # has a single child, so that it never becomes a node


def test_every_rule_with_a_class_is_there():
    driver = CPGenParserImpl((3, 8, 0))  # completes the table
    names = {name for name in driver.kClsForState if not name.isupper()}
    by_version = {version: set(loaded.symbol2number) for version, loaded in GRAMMARS.items()}
    assert names <= by_version["2.7"] | by_version["3.8"]
    assert names - by_version["3.8"] == {"fpdef", "fplist", "list_for", "listmaker"}
    assert by_version["3.14"] - by_version["3.8"] == {"fpdef", "star_test"}
    assert by_version["3.8"] <= by_version["3.14"]
    assert names - by_version["2.7"] == {
        *("annassign", "atom_expr", "namedexpr_test", "nonlocal_stmt", "star_expr"),
        *("sync_comp_for", "testlist_star_expr", "tfpdef", "typedargslist", "yield_arg"),
    }


def Mutated(tokens, all_tokens, choice):
    """A line with a token or two lost, doubled or replaced."""
    mutated = list(tokens)
    for _ in range(choice.randrange(3)):
        place = choice.randrange(len(mutated))
        mutated[place : place + choice.randrange(2)] = choice.sample(all_tokens, choice.randrange(2))
    return mutated


@pytest.mark.parametrize("version", GRAMMARS)
def test_same_as_oracle_on_lines(version):
    """The same nodes in the same order, on the snippets and on what one gets by spoiling them."""
    ours, oracle = LoadGrammar(GrammarPath(version), ORACLE), LoadOracle(GrammarPath(version))
    assert ours.symbol2number == oracle.symbol2number
    snippets = [text for known, text in ACCEPTED if known == version]
    lines = [Tokens(text, version, ORACLE) for text in snippets]
    all_tokens = [token for line in lines for token in line]
    choice = random.Random(20)
    for promotes in (True, False):
        for line in lines * 10:
            tokens = Mutated(line, all_tokens, choice)
            assert ParseWithOurs(ours, tokens, promotes) == ParseWithOracle(oracle, tokens, promotes), tokens


def test_the_interpreters_library():
    """Whole files, with their indents; two of them have a `match` statement."""
    parser = optpgen.CreateParser(GRAMMARS["3.8"], None)
    refused = set()
    for path in sorted(Path(sysconfig.get_path("stdlib")).glob("*.py")):
        with path.open("rb") as file:
            found = [t for t in tokenize.tokenize(file.readline) if t.type < tokenize.COMMENT]
        tokens = [TokenOf(token) for token in found if token.type != tokenize.NL]
        try:
            Feed(parser, tokens)
        except optpgen.ParseError:
            refused.add(path.name)
    assert refused == {"dataclasses.py", "traceback.py"}


def TokenOf(token):
    name = tokenize.tok_name[token.type]
    if name == "OP":
        return ENGINE.operators[token.string], token.string
    if token.string in ("async", "await"):
        name = token.string.upper()
    return ENGINE.NumberOf(name), token.string
