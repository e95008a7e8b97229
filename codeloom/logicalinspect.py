"""Looking at logical lines."""

from codeloom._neighbours import CLogicalLine
from codeloom.rows import RowTexts


def TextFromTokens(logical: CLogicalLine) -> str:
    """The source text of a logical, rebuilt from its tokens.

    Tokens are at their rows and columns, and blanks fill the gaps, so that a column of the
    logical, in UTF-8 bytes, is a column of this text. Removed tokens leave blanks.
    """
    pieces: list[str] = []
    row = col = 0
    for token, (token_row, token_col) in zip(logical.fToks, logical.fPositions, strict=True):
        if token is None:
            continue
        if token_row > row:
            pieces.append("\n" * (token_row - row))
            row, col = token_row, 0
        pieces.append(" " * (token_col - col) + token)
        row, col = _Behind(token, row, token_col)
    return "".join(pieces)


def _Behind(token: str, row: int, col: int) -> tuple[int, int]:
    """The place just after a token that starts at (row, col)."""
    *rows_above, last_row = RowTexts(token)
    if rows_above:
        col = 0
    return row + len(rows_above), col + len(last_row.encode("utf-8", "surrogatepass"))
