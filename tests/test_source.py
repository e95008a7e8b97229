"""Bytes of files into text: encodings, faults and their places, rows."""

import codecs

import pytest

from codeloom import analyze
from codeloom.reading.source import MOST_FAULTY_ROWS, source_from_bytes


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
        # Not a cookie: after code, in the third row, in a string.
        ("x = 1\n# coding: latin-1\n'é'".encode(), "x = 1\n# coding: latin-1\n'é'"),
        ("\n\n# coding: latin-1\n'é'".encode(), "\n\n# coding: latin-1\n'é'"),
        ("x = '# coding: latin-1 é'".encode(), "x = '# coding: latin-1 é'"),
    ],
)
def test_sound_files(data, text):
    analysis = analyze(data)
    assert not [problem for problem in analysis.problems if problem.code == "CL101"]
    assert analysis.text == (text if text is not None else data.decode("cp1252"))


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
        # What follows from a wrong name isn't a fault of its own.
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
    analysis = analyze(data)
    assert analysis.text == text
    found = [problem for problem in analysis.problems if problem.code == "CL101"]
    assert [(problem.range.row, problem.range.column) for problem in found] == [fault[:2] for fault in faults]
    for problem, (_, _, words) in zip(found, faults, strict=True):
        assert words in problem.message
        assert any(remedy in problem.message for remedy in ("save", "name", "remove"))


def test_a_line_with_unreadable_bytes_is_not_blamed_even_where_no_fault_is():
    assert [problem.range.row for problem in analyze(b"# coding: klingon\n\nx = ) '\xff'").problems] == [1]


def test_a_binary_file_gives_a_short_list():
    problems = analyze(b"\xff\0\n" * 1000).problems
    assert len(problems) == MOST_FAULTY_ROWS
    assert "980 more rows" in problems[-1].message


def test_sound_bytes_are_not_copied():
    data = "é\n".encode() * 10
    assert source_from_bytes(data).utf8 is data


def test_text_of_a_host():
    assert not analyze("x = '\ufffd'").problems
    analysis = analyze("é\n'\ud800'\0")
    assert analysis.text == "é\n'\ufffd'\ufffd"
    assert [(problem.range.row, problem.range.column) for problem in analysis.problems] == [(2, 2)]


@pytest.mark.parametrize("text", ["\ufeff=", "x = 1\n\ufeff =\n", "x\ufeff = 1\n"])
def test_a_mark_that_is_no_first_character(text):
    problems = analyze(text).problems
    assert len(problems) == 1 and "\ufeff" in problems[0].source_row
    assert not analyze(codecs.BOM_UTF8 + b"x = 1\n").problems


def test_rows_end_at_line_feed_and_carriage_return_only():
    text = "a\nb\r\nc\rd + '\x0b\x0c\x1c\x85\u2028\u2029' e\n"
    (problem,) = analyze(text).problems
    assert (problem.range.row, problem.source_row) == (4, text[7:-1])


@pytest.mark.parametrize("end", ["\n", "\r\n", "\r"])
@pytest.mark.parametrize("filler", ["a", "é", "日", "𝄞"])
def test_columns_count_characters(end, filler):
    """In short rows, and in long ones, which are counted in another way."""
    for length in (0, 1, 100, 300, 1000):
        string = f"'{filler * length}'"
        text = f"x{end}{string} + a){end}y = ]"
        places = [problem.range for problem in analyze(text).problems]
        assert [(place.row, place.column, place.end_column) for place in places] == [
            (2, length + 7, length + 8),
            (3, 5, 6),
        ]
