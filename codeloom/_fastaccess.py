"""Fast access to bytes, numbers, the clock and tokens.

Among them are the classification of tokens, `GetTokenType` with its numbers `kTokenId_...`, and
`CNonNestedSearch`, which skips the strings and parentheses of Python source.
"""

import time

from codeloom import _neighbours
from codeloom._neighbours import (
    CNonNestedSearch,
    CStringTokenizer,
    DoubleValueForPyIntBits,
    DoubleValueForULongLongBits,
    FindNextNonNestedStruct,
    GetNowTime,
    GetTokenType,
    InitNonNestedStruct,
    IsAlnum,
    IsDigit,
    LocationsEqual,
    OutOfTime,
    StrInStr,
    ULongLongValueForDoubleBits,
    _FindStringEndNonNested,
)

__all__ = [
    "CLogger",
    "CNonNestedSearch",
    "CStringTokenizer",
    "DoubleValueForPyIntBits",
    "DoubleValueForULongLongBits",
    "FindNextNonNestedStruct",
    "GetNowTime",
    "GetTokenType",
    "InitNonNestedStruct",
    "IsAlnum",
    "IsDigit",
    "LocationsEqual",
    "OutOfTime",
    "StrInStr",
    "ULongLongValueForDoubleBits",
    "_FindStringEndNonNested",
]

_TOKEN_IDS = {name: value for name, value in vars(_neighbours).items() if name.startswith("kTokenId_")}
globals().update(_TOKEN_IDS)
__all__ += _TOKEN_IDS

__TimeFunc = time.time
"""What GetNowTime calls; a host or a test may put another clock here."""


class CLogger:
    """Writes to the logger "codeloom" in three levels by number: the higher, the more detail.

    Each operation takes a text, with `%` places for `args`; None as the text logs nothing.
    """

    def Log1(self, s: str | None, args: tuple[object, ...] | None = None) -> None:
        """Log a warning."""
        self._Log("warning", s, args)

    def Log2(self, s: str | None, args: tuple[object, ...] | None = None) -> None:
        """Log what goes on."""
        self._Log("info", s, args)

    def Log3(self, s: str | None, args: tuple[object, ...] | None = None) -> None:
        """Log a detail, for those who look for a fault."""
        self._Log("debug", s, args)

    def _Log(self, level: str, s: str | None, args: tuple[object, ...] | None) -> None:
        if s is None:
            return
        import logging  # not needed to load the engine

        getattr(logging.getLogger("codeloom"), level)(s, *(args or ()))
