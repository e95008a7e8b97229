"""Files that are read natively, some at a time, say what they say when they are read one by one."""

import itertools
import json
import os

import pytest

from codeloom import NEWEST, analyze_file, analyze_paths
from codeloom._analysis import analyze_files

ODD_FILES = {
    "empty.py": b"",
    "plain.py": "é = 'ü'\nx = )\n".encode(),
    "rows.py": b"x = 1\r\ny = (\rz\r\n",
    "mark.py": b"\xef\xbb\xbfx = 1\n",
    "latin.py": b"# coding: latin-1\n\xe9 = 1\n",
    "second_row.py": b"#!/bin/sh\n# -*- coding: cp1252 -*-\n\x80 = 1\n",
    "cookie_too_late.py": b"a\nb\n# coding: latin-1\nx = 1\n",
    "no_text.py": b"x = '\xff'\ny = \xe9\n",
    "nul.py": b"x = 1\0\ny = 2\n",
    "utf16.py": "x = 1\n".encode("utf-16"),
    "cells.ipynb": json.dumps({"cells": [{"cell_type": "code", "source": ["x = )\n"]}]}).encode(),
    "stub.pyi": b"def f(x: int) -> str: ...\n",
}


@pytest.fixture
def folder(tmp_path):
    for name, data in ODD_FILES.items():
        (tmp_path / name).write_bytes(data)
    (tmp_path / os.fsdecode(b"name-\xff.py")).write_bytes(b"x = (\n")
    return tmp_path


@pytest.mark.parametrize("records", [False, True])
def test_they_say_the_same(folder, records):
    found = list(analyze_paths([folder], records=records, jobs=2))
    assert sorted(analysis.path for analysis in found) == sorted(map(str, folder.iterdir()))
    for analysis in found:
        alone = analyze_file(analysis.path)
        assert (analysis.text, list(map(str, analysis.problems)), list(map(str, analysis.records))) == (
            alone.text,
            list(map(str, alone.problems)),
            list(map(str, alone.records)),
        )


def test_what_cannot_be_read(folder):
    os.mkfifo(folder / "pipe.py")
    (folder / "folder.py").mkdir()
    (folder / "link.py").symlink_to("absent")
    named = [
        folder / name for name in ("absent.py", "pipe.py", "plain.py", "folder.py", "link.py", "nul\0.py")
    ]
    errors = []
    found = analyze_paths(named[:-1], on_error=errors.append)
    assert [os.path.basename(analysis.path) for analysis in found] == ["plain.py"]
    assert [os.path.basename(error.filename) for error in errors] == ["absent.py", "pipe.py", "link.py"]
    assert analyze_files(list(map(str, named)), NEWEST, 315, False, False, False).count(None) == 5
    with pytest.raises(TypeError):
        analyze_files([b"plain.py"], NEWEST, 315, False, False, False)


def test_what_counts_as_utf8(tmp_path):
    leads = (0x7F, 0x80, 0xC1, 0xC2, 0xDF, 0xE0, 0xE1, 0xED, 0xEF, 0xF0, 0xF1, 0xF4, 0xF5, 0xFF)
    seconds = (0x41, 0x7F, 0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xBF, 0xC0)
    tails = (b"", b"\x80", b"\x80\x80", b"\x80A", b"\xc0\x80", b"\x80\x80" + b"12345678" * 2)
    paths, expected = [], []
    for i, (lead, second, tail) in enumerate(itertools.product(leads, seconds, tails)):
        data = b"x = '12345" + bytes((lead, second)) + tail
        path = tmp_path / f"{i}.py"
        path.write_bytes(data)
        paths.append(str(path))
        try:
            data.decode()
        except UnicodeDecodeError:
            expected.append(False)
        else:
            expected.append(True)
    found = analyze_files(paths, NEWEST, 315, False, False, False)
    assert [analysis is not None for analysis in found] == expected
