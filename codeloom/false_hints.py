"""What looks like a type hint and is none.

The engine takes every comment that begins with "type:" for a hint, save a bare "# type: ignore".
But people write "# type: ignore[code]" and plain prose there too, and forms of hints that the
engine doesn't know. It takes strings in annotations for hints, save within `Literal[...]`; but
people write prose there too, and the engine sees one line at a time and can't know that a file says
`from typing import Literal as L`. The upper layers take such things out of a line for it.
"""

import re
from bisect import bisect_left
from functools import cached_property

from codeloom import logicalline
from codeloom.logicalinspect import TextFromTokens
from codeloom.logicalline import CLogicalLine
from codeloom.rows import RowTexts

_MARK = "type:"
_BLANKS = " " * len(_MARK)

_OPERATORS = r"(?:and|or|not|in|is|if|else)\b"

# "ignore" and more behind it that doesn't continue the word, such as a code in brackets.
_IGNORE_WITH_MORE = re.compile(r"ignore\W")
_STRING_LITERAL = re.compile(r"""(?<!\w)[a-zA-Z]{0,2}("[^"]*"|'[^']*')""")
# Two words in a row that no operator joins, a word directly behind a closing bracket, dots behind a word, a
# quote within one, a character that no expression holds, or a beginning that no expression has: that of a
# statement among others.
_STATEMENT = (
    r"(?:assert|break|class|continue|def|del|except|finally|for|from|global|import|nonlocal|pass|raise"
    r"|return|try|while|with|yield)\b|[\w.]+\s*=(?!=)"
)
_PROSE = re.compile(
    rf"\b(?!{_OPERATORS}|lambda\b)\w+\s+(?!{_OPERATORS})\w"
    rf"|[)\]}}]\s*(?!{_OPERATORS})\w|\w\s*\.\.|\w'"
    r"|[?!$;`\u2013\u2014\u2026\u2192]"
    rf"|^(?:[<>=/%&|^@,:)\]}}\\]|(?!not\b){_OPERATORS}|{_STATEMENT})"
)
_CONDITION = re.compile(r"\b(?:if|else)\b")
# In quotes a sentence: such words in front of any bracket and three of them in all, or the mark at
# its end. What is shorter is taken for a hint with a fault.
_QUOTED_PROSE = re.compile(
    rf"[^][(){{}}]*?\b(?!{_OPERATORS}|lambda\b)\w+\s+(?!{_OPERATORS})\w.*" + r"|.*\w[.!?]\s*", re.DOTALL
)
_THREE_WORDS = re.compile(r"\b(?:\w+\W+){2}\w")
_LITERAL_ALIAS = re.compile(r"\bLiteral\s+as\s+(\w+)")
# The return type of a function's hint in brackets of its own; those of a tuple can't be done without.
_BRACKETED_RESULT = re.compile(r"->\s*\((?P<type>[^(),]*)\)\s*$")
_TUPLE_RESULT = re.compile(r"->\s*\([^()]*,")
# A type that says nothing; the trees of 2.7 have no place for it.
_DOTS_RESULT = re.compile(r"->\s*\.\.\.\s*$")
_HINT_WITH_ARGUMENTS = re.compile(r"\(\s*(?!\)|\.\.\.)")


class _Subscripts:
    """The names in front of the brackets around the places of a line."""

    def __init__(self, logical: CLogicalLine) -> None:
        self._fLogical = logical

    def NameAround(self, place: tuple[int, int]) -> str | None:
        """The token before the innermost bracket around `place`, a row of the file and a column."""
        i = bisect_left(self._fPlaces, place)
        return self._fNames[i - 1] if i else None

    @cached_property
    def _fPlaces(self) -> list[tuple[int, int]]:
        """The places of the tokens."""
        return [(self._fLogical.fFirstLine + row, col) for row, col in self._fLogical.fPositions]

    @cached_property
    def _fNames(self) -> list[str | None]:
        """For each token what stands before the innermost bracket that is open behind it."""
        names: list[str | None] = []
        open_names: list[str | None] = []
        last_token = None
        for token in self._fLogical.fToks:
            if token in ("(", "[", "{"):
                open_names.append(last_token)
            elif token in (")", "]", "}") and open_names:
                open_names.pop()
            names.append(open_names[-1] if open_names else None)
            last_token = token
        return names


class FalseHintRemover:
    """Takes the false hints out of the lines of one file; `text` is the whole of it.

    With `keep` it takes out nothing, and all is as the engine itself sees it.
    """

    def __init__(self, text: str, keep: bool = False) -> None:
        self._fText = text
        self._fKeep = keep

    def Without(self, logical: CLogicalLine) -> CLogicalLine | None:
        """`logical` without its false hints; None when it has none.

        Tokens keep their lengths and places. What the tokenizer knows beyond the line's own record
        (`fOrigin`, `fInAsyncDef`, `fFirstInDef`) stays on `logical` alone.
        """
        exp_logicals = logical.GetExpLogicals()
        has_mark = self._HasMark(logical)
        if self._fKeep or not (exp_logicals or has_mark):
            return None
        toks = logical.fToks
        if has_mark:
            takes_nothing = logical.fType == logicalline.kFunctionDef and _TakesNothing(toks)
            toks = tuple(_WithoutFalseHint(token, takes_nothing) for token in toks)
        subscripts = _Subscripts(logical)
        kept = tuple(exp for exp in exp_logicals if not self._IsFalseQuotedHint(exp, subscripts))
        if toks == logical.fToks and len(kept) == len(exp_logicals):
            return None
        return CLogicalLine(
            logical.fType, toks, logical.fPositions, logical.fFirstLine, kept, logical.fTokTypes
        )

    @cached_property
    def _fMarkRows(self) -> list[int]:
        """The rows that hold the mark of a hint."""
        if _MARK not in self._fText:
            return []
        return [row for row, text in enumerate(RowTexts(self._fText)) if _MARK in text]

    def _HasMark(self, logical: CLogicalLine) -> bool:
        """True when a row of the line holds the mark; most lines are told apart without a look at them."""
        rows = self._fMarkRows
        i = bisect_left(rows, logical.fFirstLine)
        if i == len(rows) or not logical.fTokenCount:
            return False
        return rows[i] == logical.fFirstLine or rows[i] <= logical.fFirstLine + logical.fPositions[-1][0]

    @cached_property
    def _fLiteralNames(self) -> frozenset[str]:
        """The names under which the file knows `Literal`, beside its own."""
        return frozenset(_LITERAL_ALIAS.findall(self._fText))

    def _IsFalseQuotedHint(self, exp_logical: CLogicalLine, subscripts: _Subscripts) -> bool:
        if exp_logical.fType != logicalline.kStringifiedTypeHint:
            return False
        text = TextFromTokens(exp_logical)
        if _QUOTED_PROSE.fullmatch(text) and (_THREE_WORDS.search(text) or not text.rstrip()[-1].isalnum()):
            return True
        return bool(self._fLiteralNames) and (
            subscripts.NameAround(exp_logical.fOrigin) in self._fLiteralNames
        )


def _TakesNothing(toks: tuple[str | None, ...]) -> bool:
    """True for a `def` with empty brackets."""
    opener = toks.index("(") if "(" in toks else len(toks)
    return toks[opener + 1 : opener + 2] == (")",)


def _WithoutFalseHint(token: str | None, takes_nothing: bool) -> str | None:
    """A token with blanks in place of what is no hint; `takes_nothing` for those of a `def f()`."""
    if token is None or not token.startswith("#"):
        return token
    before, mark, behind = token.partition(_MARK)
    if not mark or not before.rstrip().endswith("#"):
        return token
    hint = behind.partition("#")[0]
    if _IsFalse(hint.strip()) or (takes_nothing and _HINT_WITH_ARGUMENTS.match(hint.strip())):
        return before + _BLANKS + behind.replace(_MARK, _BLANKS)
    readable = _ReadableFunctionHint(hint) if hint.lstrip().startswith("(") else hint
    return before + mark + readable + behind[len(hint) :]


def _IsFalse(hint: str) -> bool:
    if _IGNORE_WITH_MORE.match(hint) or _TUPLE_RESULT.search(hint):
        return True
    text = _STRING_LITERAL.sub("text", hint)
    conditions = _CONDITION.findall(text)
    return _PROSE.search(text) is not None or conditions.count("if") > conditions.count("else")


def _ReadableFunctionHint(hint: str) -> str:
    """`(int, *str) -> (bool)` with blanks for what the engine doesn't know: stars, and the last brackets."""
    chars = list(hint)
    depth, last = 0, ""
    for i, char in enumerate(hint):
        depth += (char in "([{") - (char in ")]}")
        if char == "*" and depth == 1 and last in "(,":
            chars[i] = " "
        elif not char.isspace():
            last = char
        if depth == 0 and char == ")":
            break
    result = _BRACKETED_RESULT.search(hint)
    if result is not None:
        chars[result.start("type") - 1] = chars[result.end("type")] = " "
    dots = _DOTS_RESULT.search(hint)
    if dots is not None:
        chars[dots.start() : dots.end()] = " " * len(dots.group())
    return "".join(chars)
