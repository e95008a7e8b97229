# Made by tools/make_stubs.py; don't edit.
import time
from codeloom import _neighbours
from codeloom._neighbours import CNonNestedSearch, CStringTokenizer, DoubleValueForPyIntBits, DoubleValueForULongLongBits, FindNextNonNestedStruct, GetNowTime, GetTokenType, InitNonNestedStruct, IsAlnum, IsDigit, LocationsEqual, OutOfTime, StrInStr, ULongLongValueForDoubleBits, _FindStringEndNonNested
__all__ = ['CLogger', 'CNonNestedSearch', 'CStringTokenizer', 'DoubleValueForPyIntBits', 'DoubleValueForULongLongBits', 'FindNextNonNestedStruct', 'GetNowTime', 'GetTokenType', 'InitNonNestedStruct', 'IsAlnum', 'IsDigit', 'LocationsEqual', 'OutOfTime', 'StrInStr', 'ULongLongValueForDoubleBits', '_FindStringEndNonNested', 'kTokenId_ENDMARKER', 'kTokenId_NAME', 'kTokenId_NUMBER', 'kTokenId_STRING', 'kTokenId_NEWLINE', 'kTokenId_INDENT', 'kTokenId_DEDENT', 'kTokenId_LPAR', 'kTokenId_RPAR', 'kTokenId_LSQB', 'kTokenId_RSQB', 'kTokenId_COLON', 'kTokenId_COMMA', 'kTokenId_SEMI', 'kTokenId_PLUS', 'kTokenId_MINUS', 'kTokenId_STAR', 'kTokenId_SLASH', 'kTokenId_VBAR', 'kTokenId_AMPER', 'kTokenId_LESS', 'kTokenId_GREATER', 'kTokenId_EQUAL', 'kTokenId_DOT', 'kTokenId_PERCENT', 'kTokenId_BACKQUOTE', 'kTokenId_LBRACE', 'kTokenId_RBRACE', 'kTokenId_EQEQUAL', 'kTokenId_NOTEQUAL', 'kTokenId_LESSEQUAL', 'kTokenId_GREATEREQUAL', 'kTokenId_TILDE', 'kTokenId_CIRCUMFLEX', 'kTokenId_LEFTSHIFT', 'kTokenId_RIGHTSHIFT', 'kTokenId_DOUBLESTAR', 'kTokenId_PLUSEQUAL', 'kTokenId_MINEQUAL', 'kTokenId_STAREQUAL', 'kTokenId_SLASHEQUAL', 'kTokenId_PERCENTEQUAL', 'kTokenId_AMPEREQUAL', 'kTokenId_VBAREQUAL', 'kTokenId_CIRCUMFLEXEQUAL', 'kTokenId_LEFTSHIFTEQUAL', 'kTokenId_RIGHTSHIFTEQUAL', 'kTokenId_DOUBLESTAREQUAL', 'kTokenId_DOUBLESLASH', 'kTokenId_DOUBLESLASHEQUAL', 'kTokenId_AT', 'kTokenId_ATEQUAL', 'kTokenId_RARROW', 'kTokenId_ELLIPSIS', 'kTokenId_COLONEQUAL', 'kTokenId_ERRORTOKEN', 'kTokenId_AWAIT', 'kTokenId_ASYNC', 'kTokenId_COMMENT', 'kTokenId_BACKSLASH']
kTokenId_ENDMARKER: int
kTokenId_NAME: int
kTokenId_NUMBER: int
kTokenId_STRING: int
kTokenId_NEWLINE: int
kTokenId_INDENT: int
kTokenId_DEDENT: int
kTokenId_LPAR: int
kTokenId_RPAR: int
kTokenId_LSQB: int
kTokenId_RSQB: int
kTokenId_COLON: int
kTokenId_COMMA: int
kTokenId_SEMI: int
kTokenId_PLUS: int
kTokenId_MINUS: int
kTokenId_STAR: int
kTokenId_SLASH: int
kTokenId_VBAR: int
kTokenId_AMPER: int
kTokenId_LESS: int
kTokenId_GREATER: int
kTokenId_EQUAL: int
kTokenId_DOT: int
kTokenId_PERCENT: int
kTokenId_BACKQUOTE: int
kTokenId_LBRACE: int
kTokenId_RBRACE: int
kTokenId_EQEQUAL: int
kTokenId_NOTEQUAL: int
kTokenId_LESSEQUAL: int
kTokenId_GREATEREQUAL: int
kTokenId_TILDE: int
kTokenId_CIRCUMFLEX: int
kTokenId_LEFTSHIFT: int
kTokenId_RIGHTSHIFT: int
kTokenId_DOUBLESTAR: int
kTokenId_PLUSEQUAL: int
kTokenId_MINEQUAL: int
kTokenId_STAREQUAL: int
kTokenId_SLASHEQUAL: int
kTokenId_PERCENTEQUAL: int
kTokenId_AMPEREQUAL: int
kTokenId_VBAREQUAL: int
kTokenId_CIRCUMFLEXEQUAL: int
kTokenId_LEFTSHIFTEQUAL: int
kTokenId_RIGHTSHIFTEQUAL: int
kTokenId_DOUBLESTAREQUAL: int
kTokenId_DOUBLESLASH: int
kTokenId_DOUBLESLASHEQUAL: int
kTokenId_AT: int
kTokenId_ATEQUAL: int
kTokenId_RARROW: int
kTokenId_ELLIPSIS: int
kTokenId_COLONEQUAL: int
kTokenId_ERRORTOKEN: int
kTokenId_AWAIT: int
kTokenId_ASYNC: int
kTokenId_COMMENT: int
kTokenId_BACKSLASH: int
class CLogger:
    """Writes to the logger "codeloom" in three levels by number: the higher, the more detail.

    Each operation takes a text, with `%` places for `args`; None as the text logs nothing.
    """

    def Log1(self, s: str | None, args: tuple[object, ...] | None=None) -> None:
        """Log a warning."""
        ...

    def Log2(self, s: str | None, args: tuple[object, ...] | None=None) -> None:
        """Log what goes on."""
        ...

    def Log3(self, s: str | None, args: tuple[object, ...] | None=None) -> None:
        """Log a detail, for those who look for a fault."""
        ...

    def _Log(self, level: str, s: str | None, args: tuple[object, ...] | None) -> None:
        ...
