"""The values of string literals."""

import ast
import re
import warnings

# One literal from its prefix to its closing quotes, whatever the prefix.
_LITERAL = re.compile(
    r"""[A-Za-z]{0,2}
    (?: '''(?: \\. | (?!''')[^\\] )*'''
      | \"""(?: \\. | (?!\""")[^\\] )*\"""
      | '(?!'') (?: \\\r\n | \\. | [^\\'\r\n] )*'
      | "(?!"") (?: \\\r\n | \\. | [^\\"\r\n] )*"
    )""",
    re.DOTALL | re.VERBOSE,
)

# What the raw texts of Python 2, `ur'...'`, know as an escape.
_UNICODE_ESCAPE = re.compile(r"\\(?:u[0-9a-fA-F]{4}|U[0-9a-fA-F]{8}|.)", re.DOTALL)


def EvaluateStringLiteral(text: str) -> str | bytes | None:
    """The value of exactly one string literal; None for anything else and for f-strings."""
    if _LITERAL.fullmatch(text) is None:
        return None
    is_raw_unicode = text[:2].lower() == "ur"
    try:
        with warnings.catch_warnings():
            warnings.simplefilter("ignore")  # of escapes that mean nothing
            value = ast.literal_eval(text[1:] if is_raw_unicode else text)
        if is_raw_unicode:
            value = _UNICODE_ESCAPE.sub(_Unescaped, value)
    except (SyntaxError, ValueError, OverflowError, MemoryError, RecursionError):
        return None
    return value if isinstance(value, str | bytes) else None


def _Unescaped(escape: re.Match[str]) -> str:
    """What an escape of a raw text stands for: itself, but for the number of a character."""
    digits = escape[0][2:]
    if escape[0][1] in "uU":
        return chr(int(digits, 16))  # ValueError without digits: the interpreter refuses it too
    return escape[0]
