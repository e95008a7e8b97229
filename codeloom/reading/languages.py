"""The versions of Python that can be analysed, and what the engine needs to know of each."""

import re
from collections.abc import Iterable
from functools import cache

_NEWEST_MINOR = 15

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
_VERSION_NAME = re.compile(r"(?:py(?:thon)?-?)?(?P<major>[23])(?:\.?(?P<minor>\d+)(?:\.\d+)*)?")
_CLAUSE = re.compile(r"(?P<operator>===?|~=|!=|<=?|>=?)\s*(?P<version>\d+(?:\.\d+)*)(?P<wildcard>\.\*)?\S*")
_PRINT_FUNCTION = re.compile(
    r"^from[ \t]+__future__[ \t]+import\b(?:[^\n(#]|\([^)]*)*\bprint_function\b", re.MULTILINE
)


def version_number(name: str) -> int:
    """A version as one number: 207 for "2.7", 312 for "3.12".

    ValueError for a version that isn't among `VERSIONS`, and TypeError for what isn't text.
    """
    if not isinstance(name, str):
        raise TypeError(f'python must be a str such as "{NEWEST}", not {type(name).__name__}')
    if name not in VERSIONS:
        raise ValueError(
            f"python: unknown version {name!r}: choose 2.7, or one from {VERSIONS[1]} to {NEWEST}"
        )
    major, minor = name.split(".")
    return int(major) * 100 + int(minor)


def version_named(name: str) -> str:
    """One of `VERSIONS`, from any way in which tools write it: "3.12", "3.12.4", "py312" or "python3.12".

    A "3" is the newest version of Python 3, a "2" that of Python 2. ValueError for an unknown one.
    """
    match = _VERSION_NAME.fullmatch(name.strip().lower())
    if match is None:
        version_number(name)  # raises what is wrong
        return name
    major, minor = match["major"], match["minor"]
    if minor is None:
        minor = VERSIONS[-1 if major == "3" else 0].partition(".")[2]
    try:
        version_number(f"{major}.{minor}")
    except ValueError:
        version_number(name)
    return f"{major}.{minor}"


def oldest_admitted(requirement: str) -> str | None:
    """The oldest version that a `requires-python` such as ">=3.9,<4" admits; None for none.

    Python 3 goes before Python 2: code for both is written for the newer one.
    """
    clauses = [_CLAUSE.fullmatch(clause.strip()) for clause in requirement.split(",") if clause.strip()]
    if None in clauses:
        return None
    for name in (*VERSIONS[1:], VERSIONS[0]):
        number = tuple(map(int, name.split(".")))
        if all(_is_admitted(number, clause) for clause in clauses if clause is not None):
            return name
    return None


def _is_admitted(version: tuple[int, ...], clause: re.Match[str]) -> bool:
    """True when a clause admits any patch release of a version."""
    operator, wildcard = clause["operator"], clause["wildcard"]
    named = tuple(map(int, clause["version"].split(".")))
    bound = (*named, 0)[:2]
    match operator:
        case ">=" | ">":
            return version >= bound
        case "<=":
            return version[: len(named)] <= named[:2]
        case "<":
            return version < bound or (version == bound and any(named[2:]))
        case "~=":
            return version == bound if len(named) > 2 else version >= bound and version[0] == bound[0]
        case "!=":
            return not (wildcard and version[: len(named)] == named)
        case _:
            return version[: len(named)] == named[:2]


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
