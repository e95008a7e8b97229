"""Faults of indentation and placement: each marked once, and no row after it blamed."""

import pytest

from codeloom import analyze


def Found(text, **options):
    return [f"{problem.range.row} {problem.code}" for problem in analyze(text, **options).problems]


@pytest.mark.parametrize(
    ("text", "found"),
    [
        # An indent that no header asks for, and a block pasted one level too deep.
        ("a\n  b\nc\n", ["2 CL301"]),
        ("a\n    b\n    c\nd\n", ["2 CL301"]),
        ("def f():\n    a\n      if b:\n      c\n    return d\n", ["3 CL301"]),
        # A header without its block; what comes deeper after it is the block.
        ("def f():\nx = 1\n", ["2 CL302"]),
        ("def f():\nx = 1\n    return 2\ny\n", ["2 CL302"]),
        ("if a:\n", ["1 CL302"]),
        # A dedent between two depths, of a row and of a block.
        ("if a:\n    b\n  c\n    d\ne\n", ["3 CL303"]),
        ("def f():\n    a\n  b\n  if c:\n    d\n  return e\n", ["3 CL303"]),
        # Tabs that only count as deep as blanks in one way: reported once a block.
        ("if a:\n\tx\n        y\n        z\n", ["3 CL304"]),
        # Clauses without what they belong to.
        ("x\nelse:\n  y\n", ["2 CL305"]),
        ("for a in b:\n  c\nfinally:\n  d\n", ["3 CL305"]),
        ("try:\n  x\ny\n", ["3 CL306"]),
        ("try:\n  x\nexcept:\n  y\nexcept A:\n  z\n", ["3 CL307"]),
        ("try:\n  x\nexcept A:\n  y\nexcept* B:\n  z\n", ["5 CL308"]),
        ("case 1:\n  x\n", ["1 CL309"]),
        ("match a:\n  x\n", ["2 CL310"]),
        ("@a\nx = 1\n", ["2 CL311"]),
        # A broken line may have been any header, and a lost `if` takes its `else` along.
        ("if a\n    b\nelse:\n    c\n", ["1 CL201"]),
        ("iff a b:\n    c\nelse:\n    d\n", ["1 CL201"]),
        ("    b\nelse:\n    c\n", ["1 CL301"]),
        # A header that was moved isn't followed by complaints about its body.
        ("class A:\ndef f(self):\n    return 1\n", ["2 CL302"]),
        ("if a:\n    b\nelif c:\n    d\n  e\n", ["5 CL303"]),
    ],
)
def test_blocks(text, found):
    assert Found(text) == found


@pytest.mark.parametrize(
    ("text", "found"),
    [
        ("return 1\nclass A:\n    yield 2\n", ["1 CL321", "3 CL321"]),
        ("lambda: (yield)\ndef f(a=(yield)): pass\n", ["2 CL321"]),
        ("def f():\n    await a\n    async with b: pass\n", ["2 CL322", "3 CL322"]),
        ("def f():\n    return [a async for a in b], (c async for c in d)\n", ["2 CL322"]),
        ("def f():\n    return (a for a in await b), (await a for a in b)\n", ["2 CL322"]),
        ("async def f():\n    yield 1\n    return 2\nasync def g():\n    return 2\n", ["3 CL324"]),
        ("async def f():\n    yield from a\n", ["2 CL323"]),
        ("for a in b:\n    def f(): break\nelse: break\n", ["2 CL325", "3 CL325"]),
        ("while a:\n    if b: continue\n    class C:\n        continue\n", ["4 CL325"]),
        ("for a in b:\n  try: c\n  except* D: break\n  except* E:\n    for a in b: break\n", ["3 CL327"]),
        ("def f():\n    from m import *\n", ["2 CL328"]),
        ("'doc'\nfrom __future__ import annotations, nothing\n", ["2 CL330"]),
        ("import a\nfrom __future__ import annotations\n", ["2 CL329"]),
        ("nonlocal a\n", ["1 CL331"]),
        # Nothing is said where a fault has lost the header.
        ("    return 1\n", ["1 CL301"]),
        ("def f(:\n    return 1\n", ["1 CL201"]),
    ],
)
def test_placement(text, found):
    assert Found(text) == found


def test_versions_of_placement():
    text = "for a in b:\n  try: c\n  finally:\n    continue\n"
    assert (Found(text, python="3.7"), Found(text, python="3.8")) == (["4 CL326"], [])
    star = "def f():\n    from m import *\n"
    assert Found(star, python="2.7") == []


def test_a_problem_names_the_place_that_it_comes_from():
    (problem,) = analyze("if a:\n    try:\n        b\n    c\n").problems
    assert problem.message == "expected 'except' or 'finally' block"
    ((place, text),) = problem.related
    assert (place.row, place.column, text) == (2, 5, "the 'try' that lacks its handler")
