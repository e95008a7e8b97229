"""The operator table of the interpreter's parser generator, for hosts that have no such module.

It holds what `lib2to3.pgen2.pgen.grammar.opmap` holds on CPython 3.11.
"""

from itertools import count
from types import SimpleNamespace

# By their token types, from 7 on.
_OPERATORS = """
    ( ) [ ] : , ; + - * / | & < > = . % ` { } == != <= >= ~ ^ << >> **
    += -= *= /= %= &= |= ^= <<= >>= **= // //= @ @=
"""

grammar = SimpleNamespace(
    opmap={**dict(zip(_OPERATORS.split(), count(7), strict=False)), "<>": 29, "->": 55, ":=": 59}
)
