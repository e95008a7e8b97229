"""The bytes of a source file as UTF-8 text, and what keeps a file from being text.

A faulty file is still read: what can't be decoded becomes U+FFFD, one for each byte, so that every
place in the text is a place in the file.
"""

import codecs
import re

# One fault is reported for a row, up to this many rows; the last one tells of the rest.
MOST_FAULTY_ROWS = 20

_COOKIE = re.compile(rb"[ \t\f]*#.*?coding[:=][ \t]*([-\w.]+)")
_BLANK_OR_COMMENT = re.compile(rb"[ \t\f]*(?:#|$)")
_ROW_END = re.compile(rb"\r\n|\r|\n")
# NUL, and the lone surrogates that stand for what can't be decoded.
_UNUSABLE = re.compile(rb"\0|\xed[\xa0-\xbf][\x80-\xbf]")
_REPLACEMENT = "\N{REPLACEMENT CHARACTER}".encode()

# The 32-bit marks come first: one of them begins with a 16-bit mark.
_FOREIGN_MARKS = {
    codecs.BOM_UTF32_LE: "UTF-32",
    codecs.BOM_UTF32_BE: "UTF-32",
    codecs.BOM_UTF16_LE: "UTF-16",
    codecs.BOM_UTF16_BE: "UTF-16",
}
_FIRST_OF_FOREIGN_MARKS = tuple({mark[:1] for mark in _FOREIGN_MARKS})
_DEFAULT_REMEDY = "save the file as UTF-8, or name its encoding in the first row, as in `# coding: latin-1`"


# From where to where in a text, and what is wrong there.
Fault = tuple[int, int, str]


class Source:
    """The text of a file in UTF-8, without a byte order mark and with its rows ended as in the file.

    `faults` are places that keep the file from being text: from where to where in `utf8`, and what is
    wrong.
    `unreadable` are the offsets of all characters that stand for something that can't be read.
    """

    __slots__ = ("faults", "unreadable", "utf8")

    def __init__(
        self, utf8: bytes, faults: list[Fault] | None = None, unreadable: list[int] | None = None
    ) -> None:
        self.utf8 = utf8
        self.faults = faults or []
        self.unreadable = unreadable or []


def source_from_bytes(data: bytes) -> Source:
    """The text of a file: UTF-8, unless a comment in its first two rows names another encoding."""
    encoding = _encoding_of(data)
    data = data.removeprefix(codecs.BOM_UTF8)
    if encoding.name == "utf-8" and _is_utf8(data):
        source = Source(data) if b"\0" not in data else _without_unusable(data, encoding)
    else:
        source = _encoded(data.decode(encoding.name, _MARK_UNDECODABLE), encoding)
    if encoding.fault is not None:
        # What can't be decoded follows from the wrong encoding and isn't a fault of its own.
        source.faults = [encoding.fault]
    return source


def source_from_text(text: str) -> Source:
    """The same for a text string, which may hold NUL and lone surrogates, but no other fault."""
    return _encoded(text, None)


class _Encoding:
    """How to decode a file, and what to advise where that fails."""

    def __init__(
        self, name: str = "utf-8", remedy: str = _DEFAULT_REMEDY, fault: Fault | None = None
    ) -> None:
        self.name = name
        self.remedy = remedy
        self.fault = fault


def _encoding_of(data: bytes) -> _Encoding:
    for mark, name in _FOREIGN_MARKS.items() if data.startswith(_FIRST_OF_FOREIGN_MARKS) else ():
        if data.startswith(mark):
            message = f"the file is {name}, which Python doesn't read as source: save it as UTF-8"
            return _Encoding(name, fault=(0, 0, message))
    has_mark = data.startswith(codecs.BOM_UTF8)
    cookie = _cookie(data.removeprefix(codecs.BOM_UTF8))
    if cookie is None:
        return _Encoding()
    row, offset, declared = cookie
    name = _normal_name(declared)
    if has_mark and name != "utf-8":
        message = (
            f"the file begins with the byte order mark of UTF-8, but names {declared!r} as its "
            "encoding: remove one of the two"
        )
    elif not _can_hold_source(name):
        message = f"{declared!r} isn't an encoding of source text: name the one of the file, or utf-8"
    else:
        return _Encoding(name, f"correct the name {declared!r} in row {row}, or save the file so")
    return _Encoding(fault=(offset, offset + len(declared), message))


def _cookie(data: bytes) -> tuple[int, int, str] | None:
    """The name of the encoding in the coding comment, after its row, from 1, and its offset."""
    second_row_end = data.find(b"\n", data.find(b"\n") + 1)
    if data.find(b"coding", 0, second_row_end) < 0:  # nearly all files
        return None
    start = 0
    for row in (1, 2):
        row_end = _ROW_END.search(data, start)
        row_bytes = data[start : row_end.start() if row_end else None]
        match = _COOKIE.match(row_bytes)
        if match:
            return row, start + match.start(1), match[1].decode()
        if row_end is None or not _BLANK_OR_COMMENT.match(row_bytes):
            return None
        start = row_end.end()
    return None


def _normal_name(declared: str) -> str:
    """The encoding's name without what editors add, such as the end of rows in "utf-8-unix"."""
    name = declared.lower().replace("_", "-")
    for plain in ("utf-8", "latin-1", "iso-8859-1", "iso-latin-1"):
        if name == plain or name.startswith(plain + "-"):
            return plain
    return name


def _can_hold_source(encoding: str) -> bool:
    """True for a text encoding in which ASCII text reads as such."""
    try:
        return b"coding".decode(encoding, _MARK_UNDECODABLE) == "coding"
    except (LookupError, ValueError):
        return False


def _is_utf8(data: bytes) -> bool:
    if data.isascii():
        return True
    try:
        data.decode()
    except UnicodeDecodeError:
        return False
    return True


def _encoded(text: str, encoding: _Encoding | None) -> Source:
    """The text in UTF-8; the encoding is None for a host's text."""
    try:
        utf8 = text.encode()
    except UnicodeEncodeError:  # lone surrogates
        return _without_unusable(text.encode("utf-8", "surrogatepass"), encoding)
    return Source(utf8) if b"\0" not in utf8 else _without_unusable(utf8, encoding)


def _without_unusable(utf8: bytes, encoding: _Encoding | None) -> Source:
    """`utf8` with U+FFFD for what the engine can't take."""
    pieces, faults, unreadable = [], [], []
    end = length = 0
    end_of_faulty_row = 0
    for match in _UNUSABLE.finditer(utf8):
        pieces += [utf8[end : match.start()], _REPLACEMENT]
        length += match.start() - end
        unreadable.append(length)
        if match.start() >= end_of_faulty_row:
            faults.append((length, length + len(_REPLACEMENT), _fault_message(match[0], encoding)))
            row_end = _ROW_END.search(utf8, match.end())
            end_of_faulty_row = row_end.end() if row_end else len(utf8)
        length += len(_REPLACEMENT)
        end = match.end()
    return Source(b"".join(pieces) + utf8[end:], _shortened(faults), unreadable)


def _fault_message(unusable: bytes, encoding: _Encoding | None) -> str:
    if unusable == b"\0":
        return "a NUL byte, which Python source can't hold: remove it"
    code = ord(unusable.decode("utf-8", "surrogatepass"))
    if encoding is None:
        return f"the lone surrogate U+{code:04X} isn't a character: replace it"
    return f"byte 0x{code & 0xFF:02X} can't be read as {encoding.name}: {encoding.remedy}"


def _shortened(faults: list[Fault]) -> list[Fault]:
    rest = len(faults) - MOST_FAULTY_ROWS
    if rest <= 0:
        return faults
    start, end, message = faults[MOST_FAULTY_ROWS - 1]
    plural = "s" if rest > 1 else ""
    message = f"{message} ({rest} more row{plural} below with such a fault)"
    return [*faults[: MOST_FAULTY_ROWS - 1], (start, end, message)]


def _mark_undecodable(error: UnicodeError) -> tuple[str, int]:
    """Each byte that can't be decoded becomes a lone surrogate, which no sound text holds."""
    if not isinstance(error, UnicodeDecodeError):
        raise error
    return "".join(chr(0xDC00 | byte) for byte in error.object[error.start : error.end]), error.end


_MARK_UNDECODABLE = "codeloom.mark-undecodable"
codecs.register_error(_MARK_UNDECODABLE, _mark_undecodable)
