"""The versions of Python that can be analysed, and what the engine needs to know of each."""

import re
import sys
from dataclasses import dataclass, replace
from functools import cache

_OLDEST_PY3_MINOR = 0
_NEWEST_PY3_MINOR = 14

# fmt: off
_KEYWORDS = frozenset({
    "and", "as", "assert", "break", "class", "continue", "def", "del", "elif", "else", "except",
    "finally", "for", "from", "global", "if", "import", "in", "is", "lambda", "not", "or", "pass",
    "raise", "return", "try", "while", "with", "yield",
})
# fmt: on
_PY2_KEYWORDS = _KEYWORDS | {"exec", "print"}
_PY3_KEYWORDS = _KEYWORDS | {"False", "None", "True", "nonlocal"}
_ASYNC_KEYWORDS = frozenset({"async", "await"})
_FIRST_ASYNC_VERSION = (3, 7, 0)
_FIRST_VERSION_BEYOND_3_8 = (3, 9, 0)
_PRINT_FUNCTION = re.compile(
    r"^from[ \t]+__future__[ \t]+import\b(?:[^\n(#]|\([^)]*)*\bprint_function\b", re.MULTILINE
)

# The names that `LanguageNamed` takes, oldest first.
LANGUAGE_NAMES = (
    "2.7",
    *(f"3.{minor}" for minor in range(_OLDEST_PY3_MINOR, _NEWEST_PY3_MINOR + 1)),
)
DEFAULT_LANGUAGE_NAME = f"{sys.version_info.major}.{sys.version_info.minor}"


class UnknownLanguageError(ValueError):
    """Raised for a version that isn't among `LANGUAGE_NAMES`; the message names the choices."""


@dataclass(frozen=True)
class Language:
    """One version of Python, in the terms of the engine's constructor."""

    name: str
    version_triple: tuple[int, int, int]
    grammar_file: str
    keywords: tuple[str, ...]
    is_py3: bool


@cache
def LanguageNamed(name: str = DEFAULT_LANGUAGE_NAME) -> Language:
    """The language version called `name`, such as "2.7" or "3.12".

    Without a name it is the version of the interpreter that runs this. An unknown name raises
    UnknownLanguageError.
    """
    if name not in LANGUAGE_NAMES:
        raise UnknownLanguageError(
            f"unknown Python version {name!r}: choose 2.7, "
            f"or one from 3.{_OLDEST_PY3_MINOR} to 3.{_NEWEST_PY3_MINOR}"
        )
    major, minor = map(int, name.split("."))
    triple = (major, minor, 0)
    return Language(
        name=name,
        version_triple=triple,
        grammar_file=_GrammarOf(triple),
        keywords=tuple(sorted(_KeywordsOf(triple))),
        is_py3=major == 3,
    )


def _GrammarOf(triple: tuple[int, int, int]) -> str:
    if triple[0] == 2:
        return "Python-Grammar-2.7"
    return "Python-Grammar-3.14" if triple >= _FIRST_VERSION_BEYOND_3_8 else "Python-Grammar-3.8"


def _KeywordsOf(triple: tuple[int, int, int]) -> frozenset[str]:
    if triple[0] == 2:
        return _PY2_KEYWORDS
    return _PY3_KEYWORDS | _ASYNC_KEYWORDS if triple >= _FIRST_ASYNC_VERSION else _PY3_KEYWORDS


def LanguageOf(text: str, language: Language | str) -> Language:
    """The language that a source text is written in, given the version of Python.

    That is `language` itself, but for a text of Python 2 that imports `print_function` from the
    future, where `print` is a name. An unknown name raises UnknownLanguageError.
    """
    if isinstance(language, str):
        language = LanguageNamed(language)
    if language.is_py3 or not _PRINT_FUNCTION.search(text):
        return language
    return replace(
        language,
        grammar_file=f"{language.grammar_file}-print-function",
        keywords=tuple(word for word in language.keywords if word != "print"),
    )
