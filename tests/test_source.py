"""Bytes of files into text: encodings, faults and their places, rows."""

import codecs

import pytest

from codeloom.source import MOST_FAULTY_ROWS, RowMap, SourceFromBytes, SourceFromText


@pytest.mark.parametrize(
    ("data", "text"),
    [
        (b"", ""),
        ("é = '日本'\n".encode(), "é = '日本'\n"),
        (codecs.BOM_UTF8 + b"x = 1\r\ny = 2\r", "x = 1\r\ny = 2\r"),
        (codecs.BOM_UTF8 + b"# coding: utf-8\n", "# coding: utf-8\n"),
        (b"# -*- coding: latin-1 -*-\n'\xe9'", "# -*- coding: latin-1 -*-\n'é'"),
        (b"#!/bin/python\n# vim: set fileencoding=cp1252 :\n'\x80'", None),
        (b"\x0c\r# coding=ISO_8859-1-unix\r'\xe9'", "\x0c\r# coding=ISO_8859-1-unix\r'é'"),
        (b"# coding: utf-8-dos\r\n'\xc3\xa9'", "# coding: utf-8-dos\r\n'é'"),
        (b"# coding: shift_jis\n'\x93\xfa'", "# coding: shift_jis\n'日'"),
        # Not a cookie: behind code, in the third row, in a string.
        ("x = 1\n# coding: latin-1\n'é'".encode(), "x = 1\n# coding: latin-1\n'é'"),
        ("\n\n# coding: latin-1\n'é'".encode(), "\n\n# coding: latin-1\n'é'"),
        ("x = '# coding: latin-1 é'".encode(), "x = '# coding: latin-1 é'"),
    ],
)
def test_sound_files(data, text):
    source = SourceFromBytes(data)
    assert (source.faults, source.spoiled_rows) == ((), frozenset())
    assert source.text == (text if text is not None else data.decode("cp1252"))


@pytest.mark.parametrize(
    ("data", "text", "faults"),
    [
        (b"x = '\xe9'", "x = '\ufffd'", [(1, 6, "byte 0xE9 can't be read as utf-8")]),
        ("é\n\t日".encode() + b"\xff\xfe = 1", "é\n\t日\ufffd\ufffd = 1", [(2, 3, "0xFF")]),
        (b"\xe6\x97", "\ufffd\ufffd", [(1, 1, "0xE6")]),
        (b"a\r\xff\r\nb\n\xff", "a\r\ufffd\r\nb\n\ufffd", [(2, 1, "0xFF"), (4, 1, "0xFF")]),
        (b"a\x0c\xff", "a\x0c\ufffd", [(1, 3, "0xFF")]),
        (b"x = 1\0", "x = 1\ufffd", [(1, 6, "NUL")]),
        (
            b"# coding: ascii\n'\x80'",
            "# coding: ascii\n'\ufffd'",
            [(2, 2, "'ascii' in row 1")],
        ),
        (b"# coding: cp1252\n'\x81'", "# coding: cp1252\n'\ufffd'", [(2, 2, "0x81")]),
        # What follows from a wrong name is no fault of its own.
        (b"# coding: klingon\n'\xff'", "# coding: klingon\n'\ufffd'", [(1, 11, "'klingon'")]),
        ("#é coding: rot13\n".encode(), "#é coding: rot13\n", [(1, 12, "'rot13'")]),
        (b"# coding: utf-16\n", "# coding: utf-16\n", [(1, 11, "'utf-16'")]),
        (b"# coding: undefined\n", "# coding: undefined\n", [(1, 11, "'undefined'")]),
        (b"# coding: idna\n", "# coding: idna\n", [(1, 11, "'idna'")]),
        (codecs.BOM_UTF8 + b"#\n# coding: cp1252", "#\n# coding: cp1252", [(2, 11, "mark")]),
        ("x = 'é'\n".encode("utf-16"), "x = 'é'\n", [(1, 1, "UTF-16")]),
        (codecs.BOM_UTF32_LE + "x".encode("utf-32-le"), "x", [(1, 1, "UTF-32")]),
    ],
)
def test_faulty_files(data, text, faults):
    source = SourceFromBytes(data)
    assert source.text == text
    assert [(fault.row, fault.column) for fault in source.faults] == [fault[:2] for fault in faults]
    for fault, (_, _, words) in zip(source.faults, faults, strict=True):
        assert words in fault.message
        assert any(remedy in fault.message for remedy in ("save", "name", "remove"))


def test_spoiled_rows_are_told_even_where_no_fault_is():
    assert SourceFromBytes(b"# coding: klingon\n\n'\xff'").spoiled_rows == {2}


def test_a_binary_file_gives_a_short_list():
    source = SourceFromBytes(b"\xff\0\n" * 1000)
    assert len(source.faults) == MOST_FAULTY_ROWS
    assert "980 more rows" in source.faults[-1].message
    assert len(source.spoiled_rows) == 1000


def test_text_of_a_host():
    assert SourceFromText("x = '\ufffd'").faults == ()
    source = SourceFromText("é\n'\ud800'\0")
    assert source.text == "é\n'\ufffd'\ufffd"
    assert [(fault.row, fault.column) for fault in source.faults] == [(2, 2)]


def test_rows_end_at_line_feed_and_carriage_return_only():
    text = "a\nb\r\nc\rd\x0b\x0c\x1c\x85\u2028\u2029e\n"
    rows = RowMap(text)
    assert [rows.Text(row) for row in range(5)] == ["a", "b", "c", text[7:-1], ""]


@pytest.mark.parametrize(
    ("row", "utf8_col", "place"),
    [
        (0, 0, (0, 0)),
        (0, 3, (0, 2)),  # "é" has two bytes
        (1, 4, (1, 1)),  # and "𝄞" four
        (1, 5, (1, 2)),  # just behind the row
        (0, 3 + 2 + 4, (1, 1)),  # on into the row below: "=", CR LF and "𝄞"
        (2, 0, (2, 0)),
        (2, 99, (2, 1)),  # behind the text
    ],
)
def test_places(row, utf8_col, place):
    assert RowMap("é=\r\n𝄞=\rz").Place(row, utf8_col) == place
