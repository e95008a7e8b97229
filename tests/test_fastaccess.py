"""Bytes, bits, clock, tokens, and the search outside brackets beside a plain model of it."""

import logging
import math
import struct
import sys
import time

import pytest
from hypothesis import given
from hypothesis import strategies as st
from run_python import RunPython

from codeloom import _fastaccess, treesift
from codeloom._fastaccess import (
    CLogger,
    CNonNestedSearch,
    CStringTokenizer,
    GetTokenType,
    _FindStringEndNonNested,
)


@pytest.fixture(params=[_fastaccess, treesift], ids=["_fastaccess", "treesift"])
def module(request):
    return request.param


# The search


def Hits(text, to_find, start=0, end=None) -> list[int]:
    search = CNonNestedSearch()
    size = len(text if isinstance(text, bytes) else text.encode("utf-8", "surrogatepass"))
    assert search.InitWith(text, to_find, start, size if end is None else end) == 0
    hits = []
    while (hit := search.FindNext()) != -1:
        hits.append(hit)
    assert search.FindNext() == -1
    return hits


def test_the_search_as_two_functions(module):
    search = CNonNestedSearch()
    assert module.InitNonNestedStruct(search, "f(a=1), b=2", b"=", 0, 11) == 0
    assert [module.FindNextNonNestedStruct(search) for _ in range(3)] == [9, -1, -1]
    assert module.InitNonNestedStruct(search, None, b"=", 0, 5) == 0
    assert module.FindNextNonNestedStruct(search) == -1
    with pytest.raises(AssertionError):
        module.InitNonNestedStruct(search, b"a", b"=", 0, 5)
    with pytest.raises(TypeError):
        module.InitNonNestedStruct(search, 1, b"=", 0, 1)


def StringEnd(text: bytes, quote_i: int) -> int:
    quote = text[quote_i : quote_i + 1]
    if text[quote_i : quote_i + 3] == quote * 3:
        quote *= 3
    i = quote_i + len(quote)
    while i < len(text):
        if text[i : i + 1] == b"\\":
            i += 2
        elif text.startswith(quote, i):
            return i + len(quote)
        elif len(quote) == 1 and text[i : i + 1] == b"\n":
            return i
        else:
            i += 1
    return len(text)


def ModelHits(text: bytes, to_find: bytes) -> list[int]:
    hits, depth, i = [], 0, 0
    while i < len(text) and to_find:
        c = text[i : i + 1]
        if depth == 0 and text.startswith(to_find, i):
            hits.append(i)
            i += len(to_find)
            continue
        depth += (c in b"([{") - (c in b")]}")
        i = StringEnd(text, i) if c in b"\"'" else i + 1
    return hits


SOURCE = st.lists(st.sampled_from([*"ab=,()[]{}'\"\\\nér", "==", "'''", '"""'])).map("".join)


@given(SOURCE, st.sampled_from(["=", "==", ")", "(", "'", ",", "ab", "\n", "é", ""]))
def test_the_search_finds_what_the_model_finds(source, to_find):
    wanted = ModelHits(source.encode(), to_find.encode())
    assert Hits(source, to_find.encode()) == Hits(source.encode(), to_find.encode()) == wanted


def test_what_the_model_leaves_out():
    assert Hits("f(a=1), b=2", b"=") == [9]
    assert Hits("a)b)", b")") == [1, 3]  # a closer that is found leaves the nesting alone
    assert Hits("a = '=' = r'\\'=' = b", b"=") == [2, 8, 17]
    assert Hits("f'{a['=']}' = f'{b' = c", b"=") == [12, 20]  # fields may hold the string's own quotes
    assert Hits("leaf'=' = 1", b"=") == [8]
    assert Hits("\ud800=1", b"=") == [3]


def test_only_the_stretch_is_searched():
    assert Hits(b"=a=a=", b"=", 1, 4) == [2]
    assert Hits(b"a==", b"==", 0, 2) == []
    assert Hits(b"'a'=", b"=", 0, 2) == []


def test_a_search_is_idle_without_a_text_and_after_the_last_hit():
    search = CNonNestedSearch()
    assert search.FindNext() == -1
    for no_text in (None, 3, ["a"], bytearray(b"=")):
        assert search.InitWith(no_text, b"=", 5, 7) == 0
        assert search.FindNext() == -1
    search.InitWith(b"a=b=", b"=", 0, 4)
    assert search.FindNext() == 1
    search.Clear()
    assert search.FindNext() == -1


def test_a_search_keeps_what_it_searches_and_sets_nothing_up_on_failure():
    search = CNonNestedSearch()
    text = b"a" * 1000 + b"="
    references = sys.getrefcount(text)
    search.InitWith(text, b"=", 0, len(text))
    assert sys.getrefcount(text) == references + 1
    for arguments, error in [
        ((b"abc", None, 0, 3), TypeError),
        ((b"abc", "a", 0, 3), TypeError),
        ((type("Text", (str,), {})("abc"), b"a", 0, 3), TypeError),
        ((type("Bytes", (bytes,), {})(b"abc"), b"a", 0, 3), TypeError),
        ((b"abc", b"a", -1, 3), AssertionError),
        ((b"abc", b"a", 0, 4), AssertionError),
        ((b"a\0c", b"c", 0, 3), AssertionError),  # the text is zero-terminated
    ]:
        with pytest.raises(error):
            search.InitWith(*arguments)
        assert search.FindNext() == -1
    assert sys.getrefcount(text) == references
    with pytest.raises(TypeError, match=r"^expected bytes, NoneType found$"):
        search.InitWith(None, None, 0, 0)


def test_without_assertions_a_stretch_outside_the_text_is_still_refused():
    code = """
from codeloom._fastaccess import CNonNestedSearch
for start, end in (-1, 2), (0, 4):
    try:
        CNonNestedSearch().InitWith(b"abc", b"z", start, end)
    except ValueError as error:
        print(error)
"""
    assert RunPython(code, "-O") == "start and end must lie within the text searched\n" * 2


def test_the_end_of_a_string():
    for marked in [
        "''|x", "'a'|x", "'a\\'b'|x", "r'a\\'b'|x", '"""a"b""x"""|y', "'''a'''|", "rb'a|\nb'", "'a\\\nb'|x",
        "'a\\|", "f'{a!r:>{'w'}}'|x", "f'{'''a\nb'''}'|x", "f'{{'|x", "tR'{'a'}'|x",
    ]:  # fmt: skip
        literal = marked.replace("|", "")
        search = CNonNestedSearch()
        search.InitWith(literal, b"z", 0, len(literal))
        quote_i = min(literal.find(quote) % 99 for quote in "'\"")
        assert _FindStringEndNonNested(search, quote_i) == marked.index("|")
        for outside in (-1, len(literal)):
            with pytest.raises(IndexError):
                _FindStringEndNonNested(search, outside)


@pytest.mark.parametrize("piece", ["f'{", "'", "f'''{", "(", "f'{'", '"""\\'])
def test_hostile_text_comes_to_its_end(piece):
    assert Hits(piece * (100_000 // len(piece)) + "=", b"=") in ([], [100_000])


# The tokenizer of the hint code


def Tokens(text) -> list[tuple[str, int, int]]:
    tokenizer = CStringTokenizer(text)
    tokens = []
    while not tokenizer.fAtEnd:
        tokens.append((tokenizer.GetToken(), tokenizer.fPos, tokenizer.fNestCount))
        tokenizer.Next()
    tokenizer.Next()
    assert tokenizer.fAtEnd and tokenizer.GetToken() == "" and tokenizer.fNestCount >= 0
    return tokens


def test_tokens_tell_the_brackets_around_them():
    def Depths(text):
        return " ".join(f"{token}{depth}" for token, _, depth in Tokens(text))

    assert Depths("def f(é: [int], *b) -> x: # c") == ("def0 f0 (0 é1 :1 [1 int2 ]1 ,1 *1 b1 )0 ->0 x0 :0")
    assert Depths(b") ( a\n\\\n b )") == ")0 (0 a1 b1 )0"
    assert Tokens("") == Tokens("  # a") == []
    with pytest.raises(TypeError):
        CStringTokenizer(None)


@given(st.text(st.sampled_from("ab1.'\"()[]{}#\\\n\t é€-=>*\0\ufeff")))
def test_tokens_lose_nothing_but_blanks_and_comments(text):
    utf8 = text.encode()
    end = 0
    for token, pos, _ in Tokens(text):
        between = utf8[end:pos].decode()
        assert not between.strip(" \t\f\r\n\\") or "#" in between
        assert utf8.startswith(token.encode(), pos) and token
        end = pos + len(token.encode())


def test_token_types_are_numbers():
    assert [GetTokenType(token) for token in ("x", b"1", "'a'", "->", "# c")] == [1, 2, 3, 51, 202]
    assert _fastaccess.kTokenId_COMMENT == 202


# Bytes, bits, clock


def test_bytes_are_classified_without_unicode(module):
    for byte in range(256):
        char = chr(byte)
        assert module.IsDigit(byte) == (char.isascii() and char.isdigit())
        assert module.IsAlnum(bytes([byte])) == (char.isascii() and char.isalnum())
    assert module.IsDigit("7") and not module.IsAlnum("_")


@given(st.integers(0, 2**64 - 1), st.integers())
def test_bits_of_a_double(bits, integer):
    for module in (_fastaccess, treesift):
        f = module.DoubleValueForULongLongBits(bits)
        assert struct.pack("<d", f) == struct.pack("<Q", bits)
        assert module.ULongLongValueForDoubleBits(f) == bits
        masked = module.DoubleValueForPyIntBits(integer)
        assert module.ULongLongValueForDoubleBits(masked) == integer % 2**64


def test_bits_out_of_range(module):
    for too_far in (-1, 2**64):
        with pytest.raises(OverflowError):
            module.DoubleValueForULongLongBits(too_far)
    for no_integer in (None, "1", 1.5):
        with pytest.raises(TypeError):
            module.DoubleValueForPyIntBits(no_integer)
    # The bits of the value that natively reports a failure.
    assert module.DoubleValueForPyIntBits(module.ULongLongValueForDoubleBits(-1.0)) == -1.0
    assert math.isnan(module.DoubleValueForPyIntBits(-1))


def test_a_text_in_another_ends_at_a_zero_byte(module):
    assert module.StrInStr(b"b", b"abc") and module.StrInStr(b"", b"") and not module.StrInStr(b"d", b"abc")
    assert not module.StrInStr(b"c", b"ab\0c") and module.StrInStr(b"a\0z", b"abc")
    for sub, whole in [
        ("a", b"a"),
        (b"a", "a"),
        (None, b"a"),
        (type("B", (bytes,), {})(b"a"), b"a"),
    ]:
        with pytest.raises(TypeError, match=r"^Both sub and whole must be strings$"):
            module.StrInStr(sub, whole)


def test_locations_are_equal_when_they_are_the_same(module):
    location = ("a", 1)
    assert module.LocationsEqual(location, location)
    assert not module.LocationsEqual(location, tuple(["a", 1]))
    assert module.LocationsEqual(None, None)


def test_the_clock_can_be_replaced(module, monkeypatch):
    assert abs(module.GetNowTime() - time.time()) < 60
    monkeypatch.setattr(_fastaccess, "__TimeFunc", lambda: 12.5)
    assert module.GetNowTime() == 12.5
    assert [module.OutOfTime(end_time) for end_time in (12.4, 12.5, 12.6)] == [True, True, False]
    monkeypatch.setattr(_fastaccess, "__TimeFunc", lambda: -1)  # no failure, though it looks like one
    assert module.GetNowTime() == -1 and module.OutOfTime(-2)
    monkeypatch.setattr(_fastaccess, "__TimeFunc", lambda: 1 / 0)
    for operation in (module.GetNowTime, lambda: module.OutOfTime(0)):
        with pytest.raises(ZeroDivisionError):
            operation()


def test_the_logger_has_three_levels(caplog):
    caplog.set_level(logging.DEBUG, logger="codeloom")
    logger = CLogger()
    logger.Log1("%s of %d", ("one", 3))
    logger.Log2("100%")
    logger.Log3("three", None)
    logger.Log1(None)
    assert [(record.levelno, record.getMessage()) for record in caplog.records] == [
        (logging.WARNING, "one of 3"),
        (logging.INFO, "100%"),
        (logging.DEBUG, "three"),
    ]
