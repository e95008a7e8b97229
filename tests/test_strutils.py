"""The text primitives, compared with what the interpreter itself makes of texts and bytes."""

import pytest
from hypothesis import given
from hypothesis import strategies as st

from codeloom import strutils, treesift
from codeloom.strutils import (
    AsStr,
    AsUtf8,
    BytesForInteger,
    IsUtf8LeadByte,
    TextPosInfo,
    Utf8Concat5,
    Utf8Len,
    _CTextPosInfo,
    _NonInlineUcs4CharAtUtf8Pos,
)

ANY_TEXT = st.text(st.characters(exclude_categories=()))  # lone surrogates included
SHORT_CODES = st.sampled_from("aZ_0 \t\x1c\x85é߿ࠀ퟿￿٣²Ⅷ𝟘\u0301\u3000𐀀\U0010ffff\0")
TEXT = st.text(SHORT_CODES | st.characters())
BYTES = st.binary(max_size=12) | st.lists(
    st.sampled_from([b"a", b"\xc3", b"\xa9", b"\xe2", b"\x82", b"\xed", b"\xa0", b"\xf0", b"\xf4", b"\x90"]),
    max_size=8,
).map(b"".join)


@pytest.fixture(params=[strutils, treesift], ids=["strutils", "treesift"])
def module(request):
    return request.param


def IsLead(utf8: bytes, pos: int) -> bool:
    return not 0 <= pos < len(utf8) or utf8[pos] & 0xC0 != 0x80


def CharAt(utf8: bytes, pos: int) -> str:
    for length in range(1, 5):
        try:
            return utf8[pos : pos + length].decode("utf-8", "surrogatepass")[:1] or "\0"
        except UnicodeDecodeError:
            continue
    return "\ufffd"


# Positions


@given(TEXT.filter(len), st.data())
def test_adjusting_a_position_counts_characters(text, data):
    starts = [len(text[:i].encode("utf-8", "surrogatepass")) for i in range(len(text) + 1)]
    utf8 = text.encode("utf-8", "surrogatepass")
    char_i = data.draw(st.integers(0, len(text) - 1))
    pos = data.draw(st.integers(starts[char_i], starts[char_i + 1] - 1))  # inside the character too
    diff = data.draw(st.integers(-len(text) - 2, len(text) + 2))
    wanted_i = char_i + diff
    wanted = -1 if wanted_i < 0 else starts[min(wanted_i, len(text))]
    assert strutils.AdjustUtf8Pos(utf8, pos, diff, len(utf8)) == wanted


@given(BYTES, st.integers(-4, 16), st.integers(-6, 6))
def test_adjusting_steps_one_byte_at_a_time_outside_the_buffer(utf8, pos, diff):
    end_pos = len(utf8)
    wanted = pos
    while not IsLead(utf8, wanted):
        wanted -= 1
    for _ in range(diff if wanted < end_pos else 0):
        if wanted < end_pos:
            wanted += 1
            while not IsLead(utf8, wanted):
                wanted += 1
    for _ in range(-diff):
        if wanted >= 0:
            wanted -= 1
            while not IsLead(utf8, wanted):
                wanted -= 1
    assert strutils.AdjustUtf8Pos(utf8, pos, diff, end_pos) == wanted


def test_adjusting_at_the_edges(module):
    utf8 = "aé€".encode()  # offsets 0, 1, 3
    assert [module.AdjustUtf8Pos(utf8, pos, diff, 6) for pos, diff in [(5, 0), (6, -3), (-1, 1)]] == [3, 0, 0]
    far = 2**62
    assert module.AdjustUtf8Pos(utf8, -far, 2 * far - 1, 6) == 6
    assert module.AdjustUtf8Pos(utf8, far, -2 * far, 6) == -1
    assert module.AdjustUtf8Pos("aé€", 2, 0, 6) == 1  # a text string stands for its UTF-8 form


# Characters and their classes


@given(BYTES | ANY_TEXT.map(AsUtf8), st.data())
def test_a_character_is_what_the_interpreter_decodes(utf8, data):
    end_pos = data.draw(st.integers(0, len(utf8)))
    pos = data.draw(st.integers(-2, len(utf8) + 2))
    inside = 0 <= pos < end_pos
    wanted = CharAt(utf8[:end_pos], pos) if inside else "\0"
    assert strutils.Ucs4CharAtUtf8Pos(utf8, pos, end_pos) == wanted
    if inside:
        assert _NonInlineUcs4CharAtUtf8Pos(utf8, pos, end_pos) == wanted


def ClassesOf(char: str) -> dict[str, bool]:
    """What the interpreter says of a character; of ASCII the platform's classes."""
    is_digit = char.isdigit()
    return {
        "space": char in " \t\n\v\f\r" if char < "\x80" else char.isspace(),
        "digit": is_digit,
        "alnum": char.isalnum(),
        "initial": char.isidentifier(),
        "name": char.isidentifier() or is_digit,
    }


@given(SHORT_CODES | st.characters(exclude_categories=()), st.text(max_size=2))
def test_classes_are_the_interpreters(char, before):
    utf8, pos = AsUtf8(before + char), len(before.encode())
    where = (utf8, pos, len(utf8))
    assert ClassesOf(char) == {
        "space": strutils.IsSpaceAtUtf8Pos(*where),
        "digit": strutils.IsDigitAtUtf8Pos(*where),
        "alnum": strutils.IsAlnumAtUtf8Pos(*where),
        "initial": strutils.IsIdentifierCharAtUtf8Pos(*where, True),
        "name": strutils.IsIdentifierCharAtUtf8Pos(*where, False),
    }


@pytest.mark.parametrize("name", ["IsSpace", "IsDigit", "IsAlnum", "IsIdentifierChar"])
def test_nothing_is_of_a_class_outside_the_buffer_or_malformed(module, name):
    test = getattr(module, f"{name}AtUtf8Pos")
    initial = (False,) if name == "IsIdentifierChar" else ()
    assert not any(test(b"a1 ", pos, 3, *initial) for pos in (3, 4, -1, -(2**60), 2**60))
    malformed = [b"\xff", b"\xc3", b"\xa9", b"\xe2\x82", b"\xc0\xb1", b"\xf5\x80\x80\x80"]
    assert not any(test(utf8, 0, len(utf8), *initial) for utf8 in malformed)
    assert not test("é".encode(), 0, 1, *initial)  # its second byte lies after the end
    with pytest.raises(ValueError, match="outside the buffer of 3 bytes"):
        test(b"a1 ", 0, 4, *initial)
    assert not test(b"a1 ", 0, -1, *initial) and not test(b"a1 ", 7, 7, *initial)


def test_a_combining_mark_continues_no_name(module):
    utf8 = "e\u0301".encode()
    assert not module.IsIdentifierCharAtUtf8Pos(utf8, 1, len(utf8), False)


# Single bytes and searches


def test_ord_at_follows_the_hosts_index_rule(module):
    assert (module.OrdAt("aé", 1), module.OrdAt(b"a\xff", 1), module.OrdAt("aé", -2)) == (233, 255, 97)
    for s, i in [("", 0), (b"", -1), ("ab", 2), (b"ab", -3)]:
        with pytest.raises(IndexError):
            module.OrdAt(s, i)
    for s in (None, 3, bytearray(b"a")):
        with pytest.raises(TypeError):
            module.OrdAt(s, 0)


@given(st.binary(min_size=1), st.integers(0, 255), st.data())
def test_finding_a_byte_is_bytes_find(haystack, byte, data):
    start = data.draw(st.integers(0, len(haystack) - 1))
    assert strutils.BytesFindByte(haystack, byte, start) == haystack.find(byte, start)
    length = data.draw(st.integers(start + 1, len(haystack)))
    assert strutils.PtrFindByte(haystack, length, byte, start) == haystack.find(byte, start, length)


def test_a_search_refuses_a_bad_start(module):
    for start in (-1, 3, 4):
        with pytest.raises(ValueError, match=r"^Invalid start$"):
            module.BytesFindByte(b"abc", "a", start)
        with pytest.raises(ValueError, match=r"^Invalid start$"):
            module.PtrFindByte("abc", 3, b"a", start)
    with pytest.raises(ValueError, match=r"^Invalid start$"):
        module.BytesFindByte(b"", "a")
    with pytest.raises(ValueError, match="length 4 lies outside the buffer"):
        module.PtrFindByte(b"abc", 4, "a", 0)
    with pytest.raises(TypeError, match=r"^expected bytes, NoneType found$"):
        module.BytesFindByte(None, "a")
    with pytest.raises(TypeError, match=r"^b must be bytes"):
        module.BytesFindByte("abc", "a")
    for no_byte in ("é", "ab", b"", 256, -1, None):
        with pytest.raises(TypeError):
            module.BytesFindByte(b"abc", no_byte)


# Strings of the host


@given(ANY_TEXT)
def test_texts_pass_both_ways(text):
    utf8 = AsUtf8(text)
    assert utf8 == text.encode("utf-8", "surrogatepass") == strutils.GetUtf8Ptr(text)
    assert AsStr(utf8) == text
    assert AsUtf8(utf8) is utf8 and AsStr(text) is text
    assert Utf8Len(text) == len(utf8) and Utf8Len(utf8) == len(text)


@given(st.binary())
def test_every_byte_but_a_continuation_byte_counts_as_a_character(utf8):
    assert Utf8Len(utf8) == sum(map(IsUtf8LeadByte, utf8)) == sum(b & 0xC0 != 0x80 for b in utf8)


@given(st.lists(st.none() | ANY_TEXT | st.binary(), min_size=5, max_size=5))
def test_joining_is_joining_of_utf8(pieces):
    joined = [b"".join(AsUtf8(piece) for piece in pieces[:n] if piece is not None) for n in range(6)]
    assert Utf8Concat5(*pieces) == joined[5]
    for count in (2, 3, 4):
        assert getattr(strutils, f"Utf8Concat{count}")(*pieces[:count]) == joined[count]


def test_what_is_no_string_is_refused(module):
    for operation in (AsUtf8, AsStr, Utf8Len, module.GetUtf8Ptr, lambda s: module.Utf8Concat2(s, b"")):
        for no_string in (3, bytearray(b"a"), ["a"]):
            with pytest.raises(TypeError, match="str or bytes"):
                operation(no_string)
    for operation in (AsUtf8, AsStr, module.GetUtf8Ptr):
        with pytest.raises(TypeError):
            operation(None)
    with pytest.raises(UnicodeDecodeError):
        AsStr(b"a\xff")


@given(st.integers(-(2**63), 2**63 - 1))
def test_digits_of_an_integer(value):
    assert BytesForInteger(value) == str(value).encode()


def test_a_place_in_a_text_is_a_record():
    place = TextPosInfo(1, -1, 7)
    assert (place.lineno, place.pos, place.utf8_col) == (1, -1, 7)
    assert place == _CTextPosInfo(1, -1, 7) != TextPosInfo()
