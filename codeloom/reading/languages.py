"""The versions of Python that can be analysed, and what the engine needs to know of each."""

import re
from collections.abc import Iterable
from functools import cache

_NEWEST_MINOR = 14

# The names of the versions, oldest first.
VERSIONS = ("2.7", *(f"3.{minor}" for minor in range(_NEWEST_MINOR + 1)))
NEWEST = VERSIONS[-1]

# fmt: off
_KEYWORDS = frozenset({
    "and", "as", "assert", "break", "class", "continue", "def", "del", "elif", "else", "except",
    "finally", "for", "from", "global", "if", "import", "in", "is", "lambda", "not", "or", "pass",
    "raise", "return", "try", "while", "with", "yield",
})
# fmt: on
_PY2_KEYWORDS = _KEYWORDS | {"exec", "print"}
_PY2_GRAMMAR = "Python-Grammar-2.7"
_PY3_KEYWORDS = _KEYWORDS | {"False", "None", "True", "nonlocal"}
_ASYNC_KEYWORDS = frozenset({"async", "await"})
_PRINT_FUNCTION = re.compile(
    r"^from[ \t]+__future__[ \t]+import\b(?:[^\n(#]|\([^)]*)*\bprint_function\b", re.MULTILINE
)


def version_number(name: str) -> int:
    """A version as one number: 207 for "2.7", 312 for "3.12".

    ValueError for a version that isn't among `VERSIONS`, and TypeError for what is no text.
    """
    if not isinstance(name, str):
        raise TypeError(f'python must be a str such as "{NEWEST}", not {type(name).__name__}')
    if name not in VERSIONS:
        raise ValueError(
            f"python: unknown version {name!r}: choose 2.7, or one from {VERSIONS[1]} to {NEWEST}"
        )
    major, minor = name.split(".")
    return int(major) * 100 + int(minor)


class Language:
    """One version of Python, in the terms of the engine's constructors."""

    __slots__ = ("grammar_file", "keywords", "version_triple")

    def __init__(
        self, version_triple: tuple[int, int, int], grammar_file: str, keywords: Iterable[str]
    ) -> None:
        self.version_triple = version_triple
        self.grammar_file = grammar_file
        self.keywords = tuple(sorted(keywords))

    @property
    def is_py3(self) -> bool:
        """True for any version but 2.7."""
        return self.version_triple[0] == 3


@cache
def language_named(name: str) -> Language:
    """The language version called `name`, such as "2.7" or "3.12"; errors as from `version_number`."""
    major, minor = divmod(version_number(name), 100)
    if major == 2:
        return Language((2, minor, 0), _PY2_GRAMMAR, _PY2_KEYWORDS)
    grammar_file = "Python-Grammar-3.14" if minor > 8 else "Python-Grammar-3.8"
    keywords = _PY3_KEYWORDS | _ASYNC_KEYWORDS if minor >= 7 else _PY3_KEYWORDS
    return Language((3, minor, 0), grammar_file, keywords)


def language_of(text: str, name: str) -> Language:
    """The language that a source text is written in, given the version of Python.

    A text of Python 2 that imports `print_function` from the future has a grammar of its own, in
    which `print` is a name.
    """
    language = language_named(name)
    if language.is_py3 or not _PRINT_FUNCTION.search(text):
        return language
    return _language_with_print_function()


@cache
def _language_with_print_function() -> Language:
    return Language((2, 7, 0), f"{_PY2_GRAMMAR}-print-function", _PY2_KEYWORDS - {"print"})
