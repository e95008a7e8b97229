"""A text that changes says at any time what `analyze` says of it."""

import contextlib
import os
import resource
from concurrent.futures import ThreadPoolExecutor
from pathlib import Path

import pytest
from document_edits import Editor, compare

import codeloom
from codeloom import Document, Range, analyze

TEXT = "def f(a):\n    return a + b\n\n\nclass C:\n    x = 1\n"


def test_random_edits(seed):
    for number in range(4):
        editor = Editor(seed + number, rows=40)
        for _ in range(40):
            editor.step()


class TestPositions:
    @pytest.mark.parametrize(
        "encoding, start, end, after", [("utf-32", 3, 4, 5), ("utf-16", 3, 5, 7), ("utf-8", 4, 8, 12)]
    )
    def test_what_columns_count(self, encoding, start, end, after):
        document = Document("\n'é\U0001f600\U0001f600'\r\n", encoding=encoding)
        assert document.position(2, 5) == (2, after)
        change = document.edit((2, start), (2, end), "x")
        assert document.text == "\n'éx\U0001f600'\r\n"
        assert (change.range, change.new_range) == (Range(2, 3, 2, 4), Range(2, 3, 2, 4))

    def test_end(self):
        assert Document("").end == (1, 1)
        assert Document("a\r\né\r\U0001f600", encoding="utf-16").end == (3, 3)
        document = Document(TEXT)
        document.edit((1, 1), document.end, "")
        assert document.text == "" and not document.analysis.lines

    @pytest.mark.parametrize(
        "start, end, message",
        [
            ((0, 1), (1, 1), "start (0, 1): the last row is 7"),
            ((1, 1), (8, 1), "end (8, 1): the last row is 7"),
            ((1, 0), (1, 1), "start (1, 0): row 1 ends at column 10"),
            ((1, 1), (1, 11), "end (1, 11): row 1 ends at column 10"),
            ((2, 3), (2, 2), "end (2, 2) is before start (2, 3)"),
        ],
    )
    def test_out_of_range(self, start, end, message):
        document = Document(TEXT)
        analysis = document.analysis
        with pytest.raises(ValueError) as raised:
            document.edit(start, end, "x")
        assert str(raised.value) == message
        assert document.text == TEXT and document.analysis is analysis

    def test_within_a_character(self):
        for encoding in ("utf-8", "utf-16"):
            document = Document("\U0001f600", encoding=encoding)
            with pytest.raises(ValueError, match=r"start \(1, 2\) is within a character"):
                document.edit((1, 2), document.end, "")


ODD_TEXTS = {
    "NUL": "x = 1\n\0y\nz = (\n",
    "surrogates": "x = '\ud800\udc00'\ny\n",
    "byte order mark": "\ufeffdef f():\n    pass\n",
    "encoding declaration": "# -*- coding: latin-1 -*-\nx = 'é'\n",
    "row ends": "a\rb\r\nc\n\rd\r\r\n",
    "form feeds": "def f():\n    x\n\f\nclass C:\n\f    y\n",
    "a long row": "x = [" + "'é', " * 20_000 + "]\ny\n",
    "deep brackets": "x = " + "(" * 3_000 + "\ny\n",
    "no row": "",
}


@pytest.mark.parametrize("text", ODD_TEXTS.values(), ids=ODD_TEXTS)
def test_odd_texts(text):
    """Each is edited at both ends and in the middle, by what may make it odd or mend it."""
    for new_text in ("", "\n", "\r", "\0", "\ud800", "\ufeff", "'''"):
        document = Document(text)
        for share in (0.0, 0.5, 1.0):
            row = 1 + int((document.row_count - 1) * share)
            column = 1 + int(len(document.row(row)) * share)
            document.edit((row, column), (row, column), new_text)
            assert document.analysis.problems == analyze(document.text).problems
        compare(document.analysis, analyze(document.text))


def test_threads_that_edit_the_same_document():
    """They may be refused a place that another one took away; nothing else happens."""
    document = Document(TEXT * 20)

    def edit(number):
        for i in range(200):
            with contextlib.suppress(ValueError):
                change = document.edit((3 + number, 1), (3 + number, 1 + i % 2), "x = (\n"[i % 3 :])
                assert change.lines_come is not None
                assert len(document.analysis.occurrences) > 0

    with ThreadPoolExecutor(4) as pool:
        list(pool.map(edit, range(4)))
    compare(document.analysis, analyze(document.text))


@pytest.mark.skipif("ASAN_OPTIONS" in os.environ, reason="the sanitizer keeps memory that is freed")
def test_memory_after_many_edits():
    """Nothing is kept of texts that are gone, not even the names in them."""

    def edit(count):
        for i in range(count):
            end = 2, 1 + len(document.row(2))
            document.edit((2, 5), end, f"{'name' * 100}_{i}_{count} = (a")
            assert len(document.analysis.problems) == 1
            if i % 10 == 0:
                assert document.analysis.scopes
        return int(Path("/proc/self/statm").read_text().split()[1]) * resource.getpagesize()

    document = Document(TEXT * 20)
    before = edit(2_000)
    assert edit(8_000) - before < 2_000_000


def test_annotations_deferred_by_an_edit():
    document = Document("import a\n" + "x: b = 1\n" * 60, python="3.13")
    assert document.analysis.scopes
    document.edit((1, 1), (1, 9), "from __future__ import annotations")
    compare(document.analysis, analyze(document.text, python="3.13"))


def test_names_after_many_others():
    document = Document(TEXT)
    many = "".join(f"x = name_{i}\n" for i in range(70_000))
    assert len(document.edit((1, 1), (1, 1), many).occurrences_come) == 140_000
    document.edit((1, 1), (70_001, 1), "")
    document.edit((1, 7), (1, 8), "b")
    compare(document.analysis, analyze(document.text))


class TestArguments:
    @pytest.mark.parametrize(
        "arguments, name",
        [
            ((None, (1, 1), ""), "start"),
            (((1, 1, 1), (1, 1), ""), "start"),
            (((1, 1.0), (1, 1), ""), "start"),
            (((1, 1), (1, True), ""), "end"),
            (((1, 1), (1, 1), b""), "new_text"),
        ],
    )
    def test_of_an_edit(self, arguments, name):
        with pytest.raises(TypeError, match=f"^{name} must be"):
            Document(TEXT).edit(*arguments)

    def test_of_a_document(self):
        with pytest.raises(TypeError, match="source must be a str, not bytes"):
            Document(b"")
        with pytest.raises(TypeError, match="encoding must be a str"):
            Document("", encoding=8)
        with pytest.raises(ValueError, match="encoding must be one of utf-8, utf-16, utf-32, not 'latin-1'"):
            Document("", encoding="latin-1")
        with pytest.raises(ValueError, match="python: unknown version"):
            Document("", python="4.0")


class TestChange:
    def test_of_a_broken_line(self):
        document = Document(TEXT, path="d.py", python="3.12")
        change = document.edit((2, 14), (2, 15), "(")
        assert [line.text for line in change.lines_gone] == ["return a + b"]
        assert [line.text for line in change.lines_come] == ["return a ( b"]
        assert [str(problem) for problem in change.problems_come] == [str(document.analysis.problems[0])]
        assert [scope.name for scope in change.scopes_gone] == ["f"]
        assert [name.name for name in change.occurrences_gone] == ["a", "b"]
        undone = document.edit((2, 14), (2, 15), "+")
        assert undone.problems_gone == change.problems_come and not undone.problems_come
        assert undone.before is change.after
        compare(document.analysis, change.before)

    def test_of_a_text_with_nul(self):
        change = Document("\0\nx = )\ntry\n").edit((3, 4), (3, 4), "s")
        assert [problem.range for problem in change.problems_gone] == [Range(3, 1, 3, 4)]

    def test_what_only_moves(self):
        change = Document(TEXT + "x = )\n").edit((4, 1), (4, 1), "\n\n")
        for name in ("lines", "problems", "occurrences", "scopes"):
            assert getattr(change, f"{name}_gone") == getattr(change, f"{name}_come") == ()
        assert change.moved(Range(5, 1, 5, 9)) == Range(7, 1, 7, 9)
        assert change.moved(Range(2, 5, 2, 11)) == Range(2, 5, 2, 11)

    def test_edits_of_a_name(self):
        document = Document(TEXT)
        change = document.edit((1, 7), (1, 8), "b")
        assert [(name.name, name.range.row) for name in change.occurrences_gone] == [
            ("a", 1),
            ("a", 2),
            ("b", 2),
        ]
        assert document.text.startswith("def f(b):")
        assert repr(document) == "<Document '<string>'>"
        assert repr(change).startswith("<Change of '<string>': Range(1, 7, 1, 8) to Range(1, 7, 1, 8)")


def test_it_is_lazy_to_import():
    assert codeloom.Document is Document
    assert Document(TEXT).analysis.problems == analyze(TEXT).problems


def test_a_fault_that_is_reported_once_in_a_block():
    text = "return\n" + "x = 1\n" * 60 + "return\n"
    assert len(Document(text).analysis.problems) == len(analyze(text).problems) == 1


def test_a_method_of_a_long_class():
    methods = "".join(f"    def m{i}(self):\n        return __x\n\n" for i in range(40))
    document = Document(f"class C:\n{methods}\nx = 1\n")
    for place, new_text in [
        ((60, 5), "x"),
        ((60, 5), "y = ("),
        ((60, 9), "nonlocal m1\n"),
        ((123, 1), "else:"),
    ]:
        document.edit(place, place, new_text)
        compare(document.analysis, analyze(document.text))
