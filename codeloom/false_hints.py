"""What looks like a type hint and is none.

The engine takes every comment that begins with "type:" for a hint, save a bare "# type: ignore".
But people write "# type: ignore[code]" and plain prose there too. It takes strings in
annotations for hints, save within `Literal[...]`; it sees one line at a time and can't know that a
file says `from typing import Literal as L`. The upper layers take such things out of a line for it.
"""

import re
from functools import cached_property

from codeloom import logicalline
from codeloom.logicalline import CLogicalLine

_MARK = "type:"
_BLANKS = " " * len(_MARK)

# "ignore" and more behind it that doesn't continue the word, such as a code in brackets.
_IGNORE_WITH_MORE = re.compile(r"ignore\W")
_STRING_LITERAL = re.compile(r"""(?<!\w)[a-zA-Z]{0,2}("[^"]*"|'[^']*')""")
# Two words in a row that no operator joins, a character that no expression holds, or a beginning
# that no expression has.
_PROSE = re.compile(
    r"\b(?!(?:and|or|not|in|is|if|else|lambda)\b)\w+\s+(?!(?:and|or|not|in|is|if|else)\b)\w"
    r"|[?!$;]"
    r"|^[<>=/%&|^@,:)\]}]"
)
_LITERAL_ALIAS = re.compile(r"\bLiteral\s+as\s+(\w+)")


class FalseHintRemover:
    """Takes the false hints out of the lines of one file."""

    def __init__(self, text: str) -> None:
        self._fText = text

    def Without(self, logical: CLogicalLine) -> CLogicalLine | None:
        """`logical` without its false hints; None when it has none.

        Tokens keep their lengths and places. What the tokenizer knows beyond the line's own record
        (`fOrigin`, `fInAsyncDef`, `fFirstInDef`) stays on `logical` alone.
        """
        toks = tuple(_WithoutFalseHint(token) for token in logical.fToks)
        exp_logicals = logical.GetExpLogicals()
        kept = tuple(exp for exp in exp_logicals if not self._IsLiteralValue(exp, logical))
        if toks == logical.fToks and len(kept) == len(exp_logicals):
            return None
        return CLogicalLine(
            logical.fType, toks, logical.fPositions, logical.fFirstLine, kept, logical.fTokTypes
        )

    @cached_property
    def _fLiteralNames(self) -> frozenset[str]:
        """The names under which the file knows `Literal`, beside its own."""
        return frozenset(_LITERAL_ALIAS.findall(self._fText))

    def _IsLiteralValue(self, exp_logical: CLogicalLine, logical: CLogicalLine) -> bool:
        if exp_logical.fType != logicalline.kStringifiedTypeHint or not self._fLiteralNames:
            return False
        return _SubscriptedName(logical, exp_logical.fOrigin) in self._fLiteralNames


def _WithoutFalseHint(token: str | None) -> str | None:
    if token is None or not token.startswith("#"):
        return token
    before, mark, behind = token.partition(_MARK)
    if not mark or not before.rstrip().endswith("#"):
        return token
    if not _IsFalse(behind.partition("#")[0].strip()):
        return token
    return before + _BLANKS + behind.replace(_MARK, _BLANKS)


def _IsFalse(hint: str) -> bool:
    if _IGNORE_WITH_MORE.match(hint):
        return True
    return _PROSE.search(_STRING_LITERAL.sub("text", hint)) is not None


def _SubscriptedName(logical: CLogicalLine, place: tuple[int, int]) -> str | None:
    """The token before the innermost bracket around `place`, a row of the file and a column."""
    heads: list[str | None] = []
    last_token = None
    for token, (row, col) in zip(logical.fToks, logical.fPositions, strict=True):
        if (logical.fFirstLine + row, col) >= place:
            break
        if token in ("(", "[", "{"):
            heads.append(last_token)
        elif token in (")", "]", "}") and heads:
            heads.pop()
        last_token = token
    return heads[-1] if heads else None
