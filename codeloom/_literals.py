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


def EvaluateStringLiteral(text: str) -> str | bytes | None:
    """The value of exactly one string literal; None for anything else and for f-strings."""
    if _LITERAL.fullmatch(text) is None:
        return None
    try:
        with warnings.catch_warnings():
            warnings.simplefilter("ignore")  # of escapes that mean nothing
            value = ast.literal_eval(text)
    except (SyntaxError, ValueError, MemoryError, RecursionError):
        return None
    return value if isinstance(value, str | bytes) else None
