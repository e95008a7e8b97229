"""The ways in which one logical line of a sound text gets broken."""

import re
from collections.abc import Callable, Iterator
from dataclasses import dataclass
from random import Random

from codeloom.logicalline import CLogicalLine

OPENERS, CLOSERS = "([{", ")]}"
QUOTES = "\"'"
HEADER = re.compile(r"(async +)?(def|class|if|elif|else|for|while|with|try|except|finally|match|case)\b")


@dataclass(frozen=True)
class Token:
    """A token and where it is in the text."""

    text: str
    start: int
    end: int


@dataclass(frozen=True)
class Line:
    """A logical line of an ASCII text; comments and backslashes aren't tokens of it."""

    source: str
    tokens: list[Token]
    first_row: int
    end_row: int

    @property
    def start(self) -> int:
        return self.tokens[0].start

    @property
    def end(self) -> int:
        return self.tokens[-1].end

    @property
    def text(self) -> str:
        return self.source[self.start : self.end]

    @property
    def indent(self) -> str:
        """The blanks before the line, and nothing else."""
        row_start = self.source.rfind("\n", 0, self.start) + 1
        return self.source[row_start : self.start]


@dataclass(frozen=True)
class Edit:
    """What is from `start` up to `end` of a text is replaced."""

    start: int
    end: int
    new: str


def Lines(text: str, logicals: list[CLogicalLine]) -> list[Line]:
    """The lines that begin their row; those after a semicolon are left out."""
    row_starts = [0, *(match.end() for match in re.finditer("\n", text))]
    lines = []
    for logical in logicals:
        tokens = []
        for token, (row, column) in zip(logical.fToks, logical.fPositions, strict=True):
            start = row_starts[logical.fFirstLine + row] + column
            if token[0] not in "#\\":
                tokens.append(Token(token, start, start + len(token)))
        if tokens:
            last_row = text.count("\n", 0, tokens[-1].end)
            lines.append(Line(text, tokens, logical.fFirstLine, last_row + 1))
    return [line for line in lines if not line.indent.strip()]


Kind = Callable[[Line, Random, list[Line]], Edit | None]


def _Chosen(line: Line, source: Random, is_meant: Callable[[str], bool]) -> Token | None:
    tokens = [token for token in line.tokens if is_meant(token.text)]
    return source.choice(tokens) if tokens else None


def _IsBracket(text: str) -> bool:
    return text in OPENERS + CLOSERS


def _IsTriple(text: str) -> bool:
    return text.endswith(('"""', "'''"))


def _IsQuoted(text: str) -> bool:
    return text[-1] in QUOTES and not _IsTriple(text)


def _DeleteBracket(bracket: str) -> Kind:
    def Delete(line: Line, source: Random, others: list[Line]) -> Edit | None:
        token = _Chosen(line, source, bracket.__eq__)
        return token and Edit(token.start, token.end, "")

    return Delete


def _DoubleBracket(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = _Chosen(line, source, _IsBracket)
    return token and Edit(token.start, token.start, token.text)


def _ReplaceBracket(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = _Chosen(line, source, _IsBracket)
    return token and Edit(token.start, token.end, source.choice(OPENERS + CLOSERS))


def _Insert(choices: str) -> Kind:
    def Insert(line: Line, source: Random, others: list[Line]) -> Edit | None:
        token = source.choice(line.tokens)
        pos = source.choice([token.start, token.end])
        return Edit(pos, pos, source.choice(choices))

    return Insert


def _AppendCloser(line: Line, source: Random, others: list[Line]) -> Edit | None:
    return Edit(line.end, line.end, source.choice(CLOSERS))


def _DeleteOpeningQuote(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = _Chosen(line, source, _IsQuoted)
    pos = token and token.start + token.text.index(token.text[-1])
    return token and Edit(pos, pos + 1, "")


def _DeleteClosingQuote(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = _Chosen(line, source, _IsQuoted)
    return token and Edit(token.end - 1, token.end, "")


def _DeleteOpeningTriple(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = _Chosen(line, source, _IsTriple)
    pos = token and token.start + token.text.index(token.text[-3:])
    return token and Edit(pos, pos + 3, "")


def _DeleteClosingTriple(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = _Chosen(line, source, _IsTriple)
    return token and Edit(token.end - 3, token.end, "")


def _DeleteOneOfThree(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = _Chosen(line, source, _IsTriple)
    return token and Edit(token.end - 1, token.end, "")


def _DeleteLastColon(line: Line, source: Random, others: list[Line]) -> Edit | None:
    last = line.tokens[-1]
    return Edit(last.start, last.end, "") if last.text == ":" else None


def _CloserAndNoColon(line: Line, source: Random, others: list[Line]) -> Edit | None:
    last = line.tokens[-1]
    return Edit(last.start, last.end, source.choice(["", *CLOSERS])) if last.text == ":" else None


def _CutHeader(line: Line, source: Random, others: list[Line]) -> Edit | None:
    """The rest of a header is lost from a place inside its brackets."""
    if not HEADER.match(line.text):
        return None
    depth = 0
    ends = []
    for token in line.tokens:
        depth += (token.text in OPENERS) - (token.text in CLOSERS)
        if depth > 0:
            ends.append(token.end)
    return Edit(source.choice(ends), line.end, "") if ends else None


def _Cut(line: Line, source: Random, others: list[Line]) -> Edit | None:
    pos = source.randrange(line.start + 1, line.end + 1)
    return Edit(pos, line.end, "") if line.source[pos - 1] != "\\" else None


def _DeleteRow(line: Line, source: Random, others: list[Line]) -> Edit | None:
    ends = [line.start, *(line.start + match.end() for match in re.finditer("\n", line.text)), line.end]
    row_i = source.randrange(1, len(ends) - 1) if len(ends) > 2 else 0
    return Edit(ends[row_i], ends[row_i + 1], "") if row_i else None


def _DeleteToken(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = source.choice(line.tokens)
    return Edit(token.start, token.end, "")


def _DoubleToken(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = source.choice(line.tokens)
    return Edit(token.end, token.end, f" {token.text}")


def _ReplaceToken(line: Line, source: Random, others: list[Line]) -> Edit | None:
    token = source.choice(line.tokens)
    new = source.choice(source.choice(others).tokens).text
    return Edit(token.start, token.end, f"{new} " if token.start == line.start else f" {new} ")


def _TypeLine(line: Line, source: Random, others: list[Line]) -> Edit | None:
    """A line is being typed above a sound one."""
    typed = _FirstRow(source.choice(others))
    cut = typed[: source.randrange(1, len(typed) + 1)]
    if cut.endswith("\\") or _IsTriple(cut):
        return None
    return Edit(line.start, line.start, f"{cut}\n{line.indent}")


def _OpenTriple(line: Line, source: Random, others: list[Line]) -> Edit | None:
    """A docstring is being typed above a sound line."""
    quotes = source.choice(['"""', "'''"])
    words = source.choice(["", "Say what", "Say what.", "The end of it: x, and (so) on."])
    return Edit(line.start, line.start, f"{quotes}{words}\n{line.indent}")


def _FirstRow(line: Line) -> str:
    return line.text.partition("\n")[0]


KINDS: dict[str, Kind] = {
    **{f"delete {bracket}": _DeleteBracket(bracket) for bracket in OPENERS + CLOSERS},
    "double a bracket": _DoubleBracket,
    "replace a bracket": _ReplaceBracket,
    "insert an opener": _Insert(OPENERS),
    "insert a closer": _Insert(CLOSERS),
    "append a closer": _AppendCloser,
    "delete an opening quote": _DeleteOpeningQuote,
    "delete a closing quote": _DeleteClosingQuote,
    "insert a quote": _Insert(QUOTES),
    "delete opening triple quotes": _DeleteOpeningTriple,
    "delete closing triple quotes": _DeleteClosingTriple,
    "delete one of three quotes": _DeleteOneOfThree,
    "open triple quotes above": _OpenTriple,
    "delete the last colon": _DeleteLastColon,
    "a closer for the last colon": _CloserAndNoColon,
    "cut a header in its brackets": _CutHeader,
    "cut anywhere": _Cut,
    "delete a row": _DeleteRow,
    "delete a token": _DeleteToken,
    "double a token": _DoubleToken,
    "replace a token": _ReplaceToken,
    "type a line above": _TypeLine,
}


def OpensTriple(line: Line, edit: Edit) -> bool:
    """The edit changes how many triple quotes there are: those that follow change their roles."""
    old = line.source[max(edit.start - 2, 0) : edit.end + 2]
    new = line.source[max(edit.start - 2, 0) : edit.start] + edit.new + line.source[edit.end : edit.end + 2]
    return any((old.count(quotes) - new.count(quotes)) % 2 for quotes in ('"""', "'''"))


def TypedAbove(line: Line, typed: Line) -> Iterator[Edit]:
    """The first row of `typed` as it grows above `line`, character by character, up to triple quotes."""
    row = _FirstRow(typed)
    for length in range(1, len(row) + 1):
        if re.search("\"\"\"|'''", row[:length]):
            return
        if row[length - 1] != "\\":
            yield Edit(line.start, line.start, f"{row[:length]}\n{line.indent}")
