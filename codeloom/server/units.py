"""What a client counts columns in: bytes of UTF-8, units of UTF-16, or characters."""

from collections.abc import Callable

from lsprotocol.types import PositionEncodingKind


def _utf8_length(text: str) -> int:
    return len(text.encode("utf-8", "surrogatepass"))


def _utf16_length(text: str) -> int:
    return len(text) + sum(character > "\uffff" for character in text)


_LENGTHS: dict[str, Callable[[str], int]] = {
    PositionEncodingKind.Utf8.value: _utf8_length,
    PositionEncodingKind.Utf16.value: _utf16_length,
    PositionEncodingKind.Utf32.value: len,
}


class Units:
    """The units of one encoding, which is "utf-8", "utf-16" or "utf-32"."""

    def __init__(self, encoding: str) -> None:
        self.encoding = encoding
        self._length = _LENGTHS[encoding]

    def length(self, text: str) -> int:
        """How many units a text has."""
        return len(text) if text.isascii() else self._length(text)

    def characters(self, text: str, units: int) -> int:
        """How many characters of a text begin before so many units of it; all of them for more."""
        if self._length is len or text.isascii():
            return min(units, len(text))
        count = 0
        while units > 0 and count < len(text):
            units -= self._length(text[count])
            count += 1
        return count
