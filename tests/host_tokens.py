"""The interpreter's tokens, with each f-string as one, which it takes apart from 3.12 on."""

import io
import tokenize
from collections.abc import Iterator

_BEGINS = {number for name, number in vars(tokenize).items() if name in ("FSTRING_START", "TSTRING_START")}
_ENDS = {number for name, number in vars(tokenize).items() if name in ("FSTRING_END", "TSTRING_END")}


def host_tokens(text: str) -> Iterator[tokenize.TokenInfo]:
    """As `tokenize.generate_tokens` gives them up to 3.11."""
    rows = io.StringIO(text).readlines()
    begun: list[tokenize.TokenInfo] = []
    for token in tokenize.generate_tokens(io.StringIO(text).readline):
        if token.type in _BEGINS:
            begun.append(token)
        elif token.type in _ENDS:
            first = begun.pop()
            token = _whole(first, token, rows)
        if not begun:
            yield token


def _whole(first: tokenize.TokenInfo, last: tokenize.TokenInfo, rows: list[str]) -> tokenize.TokenInfo:
    (first_row, start), (last_row, end) = first.start, last.end
    within = rows[first_row - 1 : last_row]
    within[-1] = within[-1][:end]
    within[0] = within[0][start:]
    return first._replace(type=tokenize.STRING, string="".join(within), end=last.end)
