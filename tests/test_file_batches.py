"""Files that are read natively, some at a time, say what they say when they are read one by one."""

import itertools
import json
import os

import pytest
from run_python import RunPython

from codeloom import NEWEST, analyze_file, analyze_paths
from codeloom._analysis import FileReader

ODD_FILES = {
    "empty.py": b"",
    "plain.py": "é = 'ü'\nx = )\n".encode(),
    "rows.py": b"x = 1\r\ny = (\rz\r\n",
    "mark.py": b"\xef\xbb\xbfx = 1\n",
    "latin.py": b"# coding: latin-1\n\xe9 = 1\n",
    "second_row.py": b"#!/bin/sh\n# -*- coding: cp1252 -*-\n\x80 = 1\n",
    "says_utf8.py": "# -*- coding: utf-8 -*-\né = )\n".encode(),
    "says_both.py": b"# coding: utf-8 coding: latin-1\n# coding=cp1252\n\xc3\xa9 = )\n",
    "says_nothing.py": b"# decoding: \n# coding:\tLATIN_1 x\n\xe9 = 1\n",
    "cookie_too_late.py": b"a\nb\n# coding: latin-1\nx = 1\n",
    "no_text.py": b"x = '\xff'\ny = \xe9\n",
    "nul.py": b"x = 1\0\ny = 2\n",
    "utf16.py": "x = 1\n".encode("utf-16"),
    "cells.ipynb": json.dumps({"cells": [{"cell_type": "code", "source": ["x = )\n"]}]}).encode(),
    "stub.pyi": b"def f(x: int) -> str: ...\n",
}


def read_natively(paths, jobs=1):
    reader = FileReader(jobs, NEWEST, 315, False, False, False)
    reader.submit(paths)
    return reader.take()


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
    assert read_natively(list(map(str, named))).count(None) == 5
    with pytest.raises(TypeError):
        read_natively([b"plain.py"])


@pytest.mark.parametrize(
    ("head", "is_plain"),
    [
        ("# -*- coding: utf-8 -*-\n", True),
        ("#!/bin/sh\n# vim: set fileencoding=UTF_8 :\r\n", True),
        ("# encoding: utf8\n", True),
        ("'decoding'; x = coding; coding =1\n", True),
        ("# coding: utf-8-sig\n", False),
        ("# coding: utf-16\n", False),
        ("# coding: utf-8\n# coding: ascii\n", False),
        ("# coding:utf-8\xe9\n", True),
        ("# coding: coding: cp1252\n", False),
        ("\n\n# coding: latin-1\n", True),
        ("# coding:", True),
        ("# coding: \tl", False),
    ],
)
def test_coding_comments_that_need_no_decoding(tmp_path, head, is_plain):
    path = tmp_path / "a.py"
    path.write_text(head, newline="")
    assert (read_natively([str(path)])[0] is not None) == is_plain


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
    found = read_natively(paths)
    assert [analysis is not None for analysis in found] == expected


def test_order_however_many_threads(tmp_path):
    """Files of very different lengths, so that threads overtake each other."""
    paths = [tmp_path / f"{i:03}.py" for i in range(200)]
    for i, path in enumerate(paths):
        path.write_text("x = [a for a in b]\n" * (i * 37 % 101) ** 2 + f"y{i} = )\n")
    for jobs in (1, 2, 16):
        found = list(analyze_paths([tmp_path], jobs=jobs))
        assert [analysis.path for analysis in found] == list(map(str, paths))
        assert [analysis.problems[0].source_row for analysis in found] == [f"y{i} = )" for i in range(200)]


def test_a_reader_that_is_closed_still_reads(tmp_path):
    (tmp_path / "a.py").write_text("x = )\n")
    reader = FileReader(4, NEWEST, 315, False, False, False)
    for _ in range(20):
        reader.submit([str(tmp_path / "a.py"), ""])
    reader.close()
    reader.close()
    for _ in range(20):
        analysis, nothing = reader.take()
        assert (len(analysis.problems), nothing) == (1, None)
    with pytest.raises(IndexError, match="nothing to take"):
        reader.take()


# The ways to leave files that were read ahead; none may wait forever, or crash.
LEAVING = {
    "dropped": "next(found); del found",
    "closed": "next(found); found.close()",
    "kept by a cycle": "next(found); cycle = [found]; cycle.append(cycle); del found, cycle",
    "left to the end": "next(found); keep = found",
    "left to the end of the process": "import builtins; next(found); builtins.kept = [found]; del found",
    "raised out of": "next(found)\ntry:\n    found.throw(KeyboardInterrupt)\nexcept KeyboardInterrupt: pass",
    "in a thread left alone": """
import threading
def Go():
    for analysis in found: begun.set()
begun = threading.Event()
threading.Thread(target=Go, daemon=True).start()
begun.wait()""",
    "forked": """
import warnings; warnings.simplefilter("ignore")
next(found)
child = os.fork()
if child == 0:
    try:
        list(found)
    except RuntimeError as error:
        assert "forked" in str(error)
        sys.exit(7)
assert os.waitstatus_to_exitcode(os.waitpid(child, 0)[1]) == 7
assert len(list(found)) == 199""",
}


@pytest.mark.parametrize("how", LEAVING)
def test_leaving_files_that_are_read_ahead(tmp_path, how):
    for i in range(200):
        (tmp_path / f"{i:03}.py").write_text("x = [a for a in b]\n" * 500)
    before = f"import os, sys, codeloom\nfound = codeloom.analyze_paths([{str(tmp_path)!r}], jobs=3)\n"
    assert RunPython(f"{before}{LEAVING[how]}\nprint('left')") == "left\n"
