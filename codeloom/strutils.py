"""Text as UTF-8 bytes: the primitives that walk it by byte offset, and conversions.

Every position is a byte offset, every end is exclusive. A pointer argument is a byte string or a
text string; a code point comes back as a text string of one character. Malformed bytes read as
U+FFFD, and no byte outside the buffer is ever read.
"""

from codeloom._neighbours import (
    AdjustUtf8Pos,
    AsStr,
    AsUtf8,
    BytesFindByte,
    BytesForInteger,
    GetUtf8Ptr,
    IsAlnumAtUtf8Pos,
    IsDigitAtUtf8Pos,
    IsIdentifierCharAtUtf8Pos,
    IsSpaceAtUtf8Pos,
    IsUtf8LeadByte,
    OrdAt,
    PtrFindByte,
    Ucs4CharAtUtf8Pos,
    Utf8Concat2,
    Utf8Concat3,
    Utf8Concat4,
    Utf8Concat5,
    Utf8Len,
    _NonInlineUcs4CharAtUtf8Pos,
)
from codeloom._plain_record import CPlainRecord

__all__ = [
    "AdjustUtf8Pos",
    "AsStr",
    "AsUtf8",
    "BytesFindByte",
    "BytesForInteger",
    "GetUtf8Ptr",
    "IsAlnumAtUtf8Pos",
    "IsDigitAtUtf8Pos",
    "IsIdentifierCharAtUtf8Pos",
    "IsSpaceAtUtf8Pos",
    "IsUtf8LeadByte",
    "OrdAt",
    "PtrFindByte",
    "TextPosInfo",
    "Ucs4CharAtUtf8Pos",
    "Utf8Concat2",
    "Utf8Concat3",
    "Utf8Concat4",
    "Utf8Concat5",
    "Utf8Len",
    "_CTextPosInfo",
    "_NonInlineUcs4CharAtUtf8Pos",
]


class _CTextPosInfo(CPlainRecord):
    """A place in a piece of text, which may span several rows.

    `lineno` is the row within the text, from zero, `pos` the byte offset in the text, -1 when it
    isn't known, and `utf8_col` the column in its row, in UTF-8 bytes from zero.
    """

    lineno: int
    pos: int
    utf8_col: int

    def __init__(self, lineno: int, pos: int, utf8_col: int) -> None:
        self.lineno = lineno
        self.pos = pos
        self.utf8_col = utf8_col


def TextPosInfo(lineno: int = 0, pos: int = -1, utf8_col: int = 0) -> _CTextPosInfo:
    """A place in a piece of text, as CreateSyntaxError takes it for a place within a token."""
    return _CTextPosInfo(lineno, pos, utf8_col)
