"""The interpreter's `lib2to3`, or from 3.13 on, which has none, the package that carries it on."""

import sys
import warnings
from pathlib import Path

with warnings.catch_warnings():
    warnings.simplefilter("ignore", DeprecationWarning)
    if sys.version_info < (3, 13):
        from lib2to3 import pygram, pytree
        from lib2to3.pgen2 import driver, grammar, parse, pgen, token
        from lib2to3.pgen2.tokenize import TokenError
    else:
        from fissix import pygram, pytree
        from fissix.pgen2 import driver, grammar, parse, pgen, token
        from fissix.pgen2.tokenize import TokenError

__all__ = [
    "PYTHON2_TEXT",
    "TokenError",
    "driver",
    "grammar",
    "parse",
    "pgen",
    "pygram",
    "pytree",
    "token",
]

_FOLDER = Path(pytree.__file__).parent
# A text with every form of Python 2.
PYTHON2_TEXT = next(
    path
    for folder in (_FOLDER / "tests", _FOLDER.parent / "test/test_lib2to3")
    if (path := folder / "data/py2_test_grammar.py").exists()
)
