"""The bytes of a source file into its text, and the faults that keep a file from being text.

A faulty file is still read: what can't be decoded becomes U+FFFD, one for each byte, so that every
place in the text is a place in the file.
"""

import codecs
import re
from bisect import bisect_right
from dataclasses import dataclass

from codeloom.rows import ROW_END, RowTexts

REPLACEMENT = "\N{REPLACEMENT CHARACTER}"

# One fault is reported for a row, up to this many rows; the last one tells of the rest.
MOST_FAULTY_ROWS = 20

_COOKIE = re.compile(rb"[ \t\f]*#.*?coding[:=][ \t]*([-\w.]+)")
_BLANK_OR_COMMENT = re.compile(rb"[ \t\f]*(?:#|$)")
_ROW_END = re.compile(ROW_END.pattern.encode())
_UNUSABLE = re.compile("[\0\ud800-\udfff]")

# The 32-bit marks come first: one of them begins with a 16-bit mark.
_FOREIGN_MARKS = {
    codecs.BOM_UTF32_LE: "UTF-32",
    codecs.BOM_UTF32_BE: "UTF-32",
    codecs.BOM_UTF16_LE: "UTF-16",
    codecs.BOM_UTF16_BE: "UTF-16",
}
_DEFAULT_REMEDY = "save the file as UTF-8, or name its encoding in the first row, as in `# coding: latin-1`"


@dataclass(frozen=True, slots=True)
class SourceFault:
    """What keeps a place from being text; `row` and `column` (in characters) count from 1."""

    row: int
    column: int
    message: str


@dataclass(frozen=True, slots=True)
class Source:
    """The text of a file, without a byte order mark and with its rows ended as in the file.

    `spoiled_rows` are the rows, from zero, in which U+FFFD stands for something that can't be read.
    """

    text: str
    faults: tuple[SourceFault, ...] = ()
    spoiled_rows: frozenset[int] = frozenset()


class RowMap:
    """The rows of a text, counted from zero. They end at LF, CR LF and CR, and at nothing else."""

    def __init__(self, text: str) -> None:
        self._fUtf8 = text.encode()
        self._fStarts = [0, *(match.end() for match in _ROW_END.finditer(self._fUtf8))]
        # One text for all that is asked of a row, which may be as long as the file.
        self._fTexts: dict[int, str] = {}

    def Place(self, row: int, utf8_col: int) -> tuple[int, int]:
        """A row and a column in UTF-8 bytes into a row and a column in characters, all from zero.

        A column behind the end of its row goes on in the rows below.
        """
        byte_pos = min(self._fStarts[row] + utf8_col, len(self._fUtf8))
        row = bisect_right(self._fStarts, byte_pos) - 1
        return row, len(self._fUtf8[self._fStarts[row] : byte_pos].decode(errors="ignore"))

    def Text(self, row: int) -> str:
        """The text of a row, without its end."""
        if row not in self._fTexts:
            end = self._fStarts[row + 1] if row + 1 < len(self._fStarts) else None
            row_bytes = self._fUtf8[self._fStarts[row] : end]
            self._fTexts[row] = row_bytes.decode().rstrip("\r\n")
        return self._fTexts[row]


def SourceFromBytes(data: bytes) -> Source:
    """The text of a file: UTF-8, unless a comment in its first two rows names another encoding."""
    encoding = _EncodingOf(data)
    text = data.removeprefix(codecs.BOM_UTF8).decode(encoding.name, _MARK_UNDECODABLE)
    source = _WithoutUnusable(text, encoding)
    if encoding.fault is None:
        return source
    # What can't be decoded follows from the wrong encoding and is no fault of its own.
    return Source(source.text, (encoding.fault,), source.spoiled_rows)


def SourceFromText(text: str) -> Source:
    """The same for a text string, which may hold NUL and lone surrogates, but no other fault."""
    return _WithoutUnusable(text, None)


@dataclass(frozen=True, slots=True)
class _Encoding:
    """How to decode a file, and what to advise where that fails."""

    name: str = "utf-8"
    remedy: str = _DEFAULT_REMEDY
    fault: SourceFault | None = None


def _EncodingOf(data: bytes) -> _Encoding:
    for mark, name in _FOREIGN_MARKS.items():
        if data.startswith(mark):
            message = f"the file is {name}, which Python doesn't read as source: save it as UTF-8"
            return _Encoding(name, fault=SourceFault(1, 1, message))
    cookie = _Cookie(data.removeprefix(codecs.BOM_UTF8))
    if cookie is None:
        return _Encoding()
    row, column, declared = cookie
    name = _NormalName(declared)
    if data.startswith(codecs.BOM_UTF8) and name != "utf-8":
        message = (
            f"the file begins with the byte order mark of UTF-8, but names {declared!r} as its "
            "encoding: remove one of the two"
        )
    elif not _CanHoldSource(name):
        message = f"{declared!r} is no encoding of source text: name the one of the file, or utf-8"
    else:
        return _Encoding(name, f"correct the name {declared!r} in row {row}, or save the file so")
    return _Encoding(fault=SourceFault(row, column, message))


def _Cookie(data: bytes) -> tuple[int, int, str] | None:
    """The name of the encoding in the coding comment, behind its row and column, both from 1."""
    for row, row_bytes in enumerate(_ROW_END.split(data, 2)[:2], start=1):
        match = _COOKIE.match(row_bytes)
        if match:
            before = row_bytes[: match.start(1)]
            return row, len(before.decode(errors="replace")) + 1, match[1].decode()
        if not _BLANK_OR_COMMENT.match(row_bytes):
            return None
    return None


def _NormalName(declared: str) -> str:
    """The encoding's name without what editors add, such as the end of rows in "utf-8-unix"."""
    name = declared.lower().replace("_", "-")
    for plain in ("utf-8", "latin-1", "iso-8859-1", "iso-latin-1"):
        if name == plain or name.startswith(plain + "-"):
            return plain
    return name


def _CanHoldSource(encoding: str) -> bool:
    """True for a text encoding in which ASCII text reads as such."""
    try:
        return b"coding".decode(encoding, _MARK_UNDECODABLE) == "coding"
    except (LookupError, ValueError):
        return False


def _WithoutUnusable(text: str, encoding: _Encoding | None) -> Source:
    """`text` with U+FFFD for what the engine can't take; the encoding is None for a host's text."""
    if "\0" not in text and _IsEncodable(text):
        return Source(text)
    faults: dict[int, SourceFault] = {}
    for row, row_text in enumerate(RowTexts(text)):
        match = _UNUSABLE.search(row_text)
        if match:
            message = _FaultMessage(match[0], encoding)
            faults[row] = SourceFault(row + 1, match.start() + 1, message)
    return Source(_UNUSABLE.sub(REPLACEMENT, text), _Shortened(list(faults.values())), frozenset(faults))


def _FaultMessage(char: str, encoding: _Encoding | None) -> str:
    if char == "\0":
        return "a NUL byte, which Python source can't hold: remove it"
    if encoding is None:
        return f"the lone surrogate U+{ord(char):04X} is no character: replace it"
    return f"byte 0x{ord(char) & 0xFF:02X} can't be read as {encoding.name}: {encoding.remedy}"


def _Shortened(faults: list[SourceFault]) -> tuple[SourceFault, ...]:
    rest = len(faults) - MOST_FAULTY_ROWS
    if rest <= 0:
        return tuple(faults)
    last = faults[MOST_FAULTY_ROWS - 1]
    plural = "s" if rest > 1 else ""
    message = f"{last.message} ({rest} more row{plural} below with such a fault)"
    return (*faults[: MOST_FAULTY_ROWS - 1], SourceFault(last.row, last.column, message))


def _IsEncodable(text: str) -> bool:
    try:
        text.encode()
    except UnicodeEncodeError:
        return False
    return True


def _MarkUndecodable(error: UnicodeError) -> tuple[str, int]:
    """Each byte that can't be decoded becomes a lone surrogate, which no sound text holds."""
    if not isinstance(error, UnicodeDecodeError):
        raise error
    return "".join(chr(0xDC00 | byte) for byte in error.object[error.start : error.end]), error.end


_MARK_UNDECODABLE = "codeloom.mark-undecodable"
codecs.register_error(_MARK_UNDECODABLE, _MarkUndecodable)
