"""The package's face: its names, its items, its arguments, threads, forks and memory."""

import collections.abc
import copy
import os
import pickle
import resource
import sys
import threading
import time

import pytest
from run_python import RunPython

import codeloom
from codeloom import (
    Document,
    LineKind,
    Range,
    RecordKind,
    analyze,
    analyze_file,
    analyze_paths,
    read_notebook,
)

TEXT = "import a\n\nclass B:\n\tdef f(self, é=1):  # why\n\t\treturn é.c; x = )\n"


def test_all_names_are_there_and_cheap_to_import():
    for name in codeloom.__all__:
        assert getattr(codeloom, name) is not None
    assert set(codeloom.__all__) <= set(dir(codeloom))
    with pytest.raises(AttributeError, match="no attribute 'analyse'"):
        _ = codeloom.analyse
    loaded = RunPython(
        "import sys, codeloom; before = set(sys.modules); codeloom.analyze('x').problems;"
        "print(*sorted({'re', 'typing', 'codeloom._analysis', 'codeloom.treesift'} & before), '|',"
        "*sorted({'typing', 'codeloom.treesift', 'codeloom._neighbours'} & set(sys.modules)))",
    )
    assert loaded == "|\n" or loaded == " |\n" or loaded.strip() == "|"


class TestItems:
    def test_lines(self):
        analysis = analyze(TEXT, path="p.py", python="3.12")
        assert (analysis.path, analysis.python, analysis.text) == ("p.py", "3.12", TEXT)
        assert [(line.kind, line.indent, line.range, line.text) for line in analysis.lines] == [
            (LineKind.IMPORT, 0, Range(1, 1, 1, 9), "import a"),
            (LineKind.CLASS, 0, Range(3, 1, 3, 9), "class B:"),
            (LineKind.DEF, 8, Range(4, 2, 4, 26), "def f(self, é=1):  # why"),
            (LineKind.RETURN, 16, Range(5, 3, 5, 13), "return é.c"),
            (LineKind.ASSIGNMENT, None, Range(5, 15, 5, 20), "x = )"),
        ]

    def test_records(self):
        *_, of_def, of_return, _ = analyze(TEXT).lines
        shown = [(record.kind, record.name, record.value, record.of_argument) for record in of_def.records]
        assert shown == [
            (RecordKind.SET, "f", None, False),
            (RecordKind.SET, "self", None, True),
            (RecordKind.SET, "é", None, True),
            (RecordKind.LITERAL, "é", ("int", "1"), True),
        ]
        assert [(record.name, record.range) for record in of_return.records] == [
            ("return", Range(5, 3, 5, 9)),
            ("é", Range(5, 10, 5, 11)),
            ("é.c", Range(5, 10, 5, 13)),
        ]
        assert all(record.line == of_return for record in of_return.records)

    def test_problems(self):
        analysis = analyze(TEXT)
        (problem,) = analysis.problems
        assert str(problem) == "<string>:5:19: CL203 unmatched ')'"
        assert (problem.range, problem.related, problem.hint) == (Range(5, 19, 5, 20), (), None)
        assert analysis.lines[-1].problems == analysis.problems and not analysis.lines[-1].records

    def test_limits(self):
        analysis = analyze("x = 1\ny = " + "[" * 50 + "]" * 50)
        (limit,) = analysis.limits
        assert limit.line == analysis.lines[1] and "nested too deep" in limit.message

    @pytest.mark.parametrize("name", ["problems", "lines", "records", "limits"])
    def test_sequences(self, name):
        items = getattr(analyze(TEXT * 3 + "[" * 50 + "]" * 50), name)
        same = list(items)
        assert isinstance(items, collections.abc.Sequence) and len(items) == len(same) > 0
        assert (items[0], items[-1]) == (same[0], same[-1])
        assert list(reversed(items)) == same[::-1]
        assert list(items[::-1][1:][::2]) == same[::-1][1:][::2]
        assert (items[:0], list(items[1:2])) == (items[5000:], same[1:2])
        assert same[-1] in items and items.index(same[-1]) == same.index(same[-1])
        assert items.count(same[0]) == same.count(same[0])
        assert items == items[:] and hash(items) == hash(items[:]) and items != same
        with pytest.raises(IndexError):
            items[len(items)]
        with pytest.raises(TypeError, match="integers or slices, not str"):
            items["a"]
        with pytest.raises(ValueError):
            items.index(None)

    def test_items_are_values(self):
        one, other = analyze(TEXT), analyze(TEXT)
        for name in ("problems", "lines", "records"):
            assert getattr(one, name) == getattr(other, name)
            assert set(getattr(one, name)) == set(getattr(other, name))
        assert analyze("x = 1").records[0] != analyze(" x = 1").records[0]
        with pytest.raises(AttributeError):
            one.records[0].name = "y"
        for made_inside in (one.records[0], one.records, one.problems):
            with pytest.raises(TypeError, match="cannot create"):
                type(made_inside).__new__(type(made_inside))

    def test_copies(self):
        analysis = analyze(TEXT.encode() + b"'\xff'", path="é", python="3.8", false_hints=True)
        items = (analysis.problems, analysis.records[::-2], analysis.lines[1], analysis.records[0])
        for value in (*items, analysis.problems[0], analysis.lines[0].range):
            assert pickle.loads(pickle.dumps(value)) == value
            assert copy.copy(value) is copy.deepcopy(value) is value
        again = pickle.loads(pickle.dumps(analysis))
        assert (again.path, again.python, again.text) == (analysis.path, "3.8", analysis.text)
        assert list(map(str, again.problems)) == list(map(str, analysis.problems))


@pytest.mark.parametrize(
    ("call", "error", "words"),
    [
        (lambda: analyze(None), TypeError, "source must be str or bytes, not NoneType"),
        (lambda: analyze("", path=1), TypeError, "path must be a str or a path, not int"),
        (lambda: analyze("", python=(3, 12)), TypeError, "python must be a str such as .*, not tuple"),
        (lambda: analyze("", python="4"), ValueError, "python: unknown version '4'"),
        (lambda: analyze("", false_hints=1), TypeError, "false_hints must be a bool, not int"),
        (lambda: analyze_file(3), TypeError, "path must be"),
        (lambda: analyze_paths("a.py"), TypeError, "paths must be an iterable"),
        (lambda: analyze_paths([], jobs=0), ValueError, "jobs must be at least 1"),
        (lambda: analyze_paths([], jobs="2"), TypeError, "jobs must be an int"),
        (lambda: analyze_paths(3), TypeError, "paths must be an iterable of paths, not int"),
        (lambda: analyze_paths([], records=1), TypeError, "records must be a bool, not int"),
        (lambda: analyze_paths([], on_error=1), TypeError, "on_error must be callable, not int"),
        (lambda: analyze("").occurrence_at("1", 1), TypeError, "row must be an int, not str"),
        (lambda: analyze("").occurrence_at(1, 1.0), TypeError, "column must be an int, not float"),
        (lambda: analyze("").occurrence_at(-(10**30), 1), ValueError, "row must be at least 1"),
        (lambda: analyze("").definitions(b"x"), TypeError, "name must be a str, not bytes"),
        (lambda: analyze("").references(1), TypeError, "occurrence must be an Occurrence, not int"),
        (lambda: analyze("").unused(parameters=1), TypeError, "parameters must be a bool, not int"),
        (lambda: read_notebook(3), TypeError, "path must be"),
        (lambda: analyze_file("a\0b"), ValueError, r"path holds a NUL: 'a\\x00b'"),
        (lambda: analyze("").table("\udc80"), ValueError, "."),
        (lambda: analyze("").table(3), TypeError, "name must be a str, not int"),
        (lambda: Range("1", 1, 1, 1), TypeError, "row must be an int, not str"),
        (lambda: Range(1, 1, -1, 1), ValueError, "end_row must be at least 0"),
        (lambda: Document("").position("1", 1), TypeError, "place must be a row and a column, both of type"),
    ],
)
def test_wrong_arguments(call, error, words):
    with pytest.raises(error, match=words):
        call()


class TestPaths:
    def test_order_and_errors(self, write_files):
        folder = write_files({f"a/{i:03}.py": f"x{i} = )\n" * (i % 7) for i in range(60)})
        paths = [folder / "absent.py", folder]
        for jobs in (1, 2, 5, 10**20, None):
            errors = []
            found = list(analyze_paths(paths, jobs=jobs, on_error=errors.append))
            assert [os.path.basename(analysis.path) for analysis in found] == [
                f"{i:03}.py" for i in range(60)
            ]
            assert [len(analysis.problems) for analysis in found] == [i % 7 for i in range(60)]
            assert [error.filename for error in errors] == [str(folder / "absent.py")]
        with pytest.raises(FileNotFoundError):
            list(analyze_paths(paths))

    def test_it_is_lazy(self, write_files):
        folder = write_files({f"{i:03}.py": "x = 1\n" for i in range(200)})
        gone = []
        found = analyze_paths([folder], jobs=2, records=True, on_error=gone.append)
        assert len(next(found).records) == 2
        for path in sorted(folder.iterdir())[100:]:
            path.unlink()
        assert (len(list(found)), len(gone)) == (99, 100)


def test_threads():
    texts = [f"x{i} = [f(a) for a in b]\ny = )\n" * 200 for i in range(8)]
    results = {}

    def Work(i):
        analysis = analyze(texts[i])
        results[i] = (len(analysis.problems), [record.name for record in analysis.records[:1]])

    threads = [threading.Thread(target=Work, args=(i,)) for i in range(8)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert results == {i: (200, [f"x{i}"]) for i in range(8)}


def test_one_analysis_in_many_threads():
    analysis = analyze("x = f(y)\nz = )\n" * 5_000)
    counts = []
    threads = [
        threading.Thread(target=lambda: counts.append((len(analysis.problems), len(analysis.records))))
        for _ in range(6)
    ]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert set(counts) == {(5_000, len(analysis.records))}


def test_other_threads_run_meanwhile(capfd):
    """The interpreter's lock is given up, and the standard output is nobody's."""
    text = "x = [a.b(c) for a in d]\n" * 100_000
    done = threading.Event()
    rows = []

    def Print():
        while not done.is_set():
            rows.append(len(rows))
            print(rows[-1])
            time.sleep(0)

    thread = threading.Thread(target=Print)
    thread.start()
    before = len(rows)
    assert not analyze(text + "[" * 50 + "]" * 50).problems
    ran = len(rows) - before
    done.set()
    thread.join()
    assert ran > 20
    assert capfd.readouterr().out.splitlines() == list(map(str, rows))


@pytest.mark.filterwarnings("ignore:This process .* is multi-threaded")
def test_a_fork_while_another_thread_analyses():
    text = "x = [a.b(c) for a in d]\n" * 20_000
    done = threading.Event()

    def Work():
        while not done.is_set():
            _ = analyze(text).records

    thread = threading.Thread(target=Work)
    thread.start()
    try:
        for _ in range(8):
            child = os.fork()
            if child == 0:
                os._exit(len(analyze("x = )\n").problems))
            deadline = time.monotonic() + 30
            while True:
                ended, status = os.waitpid(child, os.WNOHANG)
                if ended:
                    break
                assert time.monotonic() < deadline, "the child hangs"
                time.sleep(0.001)
            assert os.waitstatus_to_exitcode(status) == 1
    finally:
        done.set()
        thread.join()


@pytest.mark.skipif(sys.platform != "linux", reason="measures in the units of Linux")
@pytest.mark.parametrize(("wanted", "most"), [("problems", 60), ("records", 300)])
def test_memory(wanted, most):
    """Bytes beyond the text itself for each line of code as people write it."""
    used = RunPython(
        f"""
import resource, codeloom, inspect, argparse
text = (inspect.getsource(argparse) * 40).encode()
codeloom.analyze(text[:10000]).{wanted}
before = resource.getrusage(resource.RUSAGE_SELF).ru_maxrss
codeloom.analyze(text).{wanted}
print((resource.getrusage(resource.RUSAGE_SELF).ru_maxrss - before) * 1024 / text.count(b"\\n"))
"""
    )
    assert float(used) < most


def test_a_line_as_long_as_a_file_takes_no_longer():
    """Many problems in one row, each shown with its place and the row."""
    text = "é = );" * 20_000
    start = time.process_time()
    problems = analyze(text).problems
    assert problems[-1].range.column == 6 * 20_000 - 1
    assert sum(len(problem.source_row) for problem in problems[:2_000]) == 2_000 * len(text)
    assert time.process_time() - start < 10


@pytest.mark.skipif(
    "ASAN_OPTIONS" in os.environ, reason="the sanitizer ends a process that runs out of memory"
)
def test_out_of_memory_is_a_memory_error():
    limit = resource.getrlimit(resource.RLIMIT_AS)
    assert limit[0] == resource.RLIM_INFINITY or limit[0] > 1 << 30
    told = RunPython(
        """
import resource, codeloom
text = b"x = 1\\n" * 10_000_000
codeloom.analyze("x").problems
resource.setrlimit(resource.RLIMIT_AS, (400_000_000, -1))
try:
    codeloom.analyze(text).records
except MemoryError:
    print("told")
"""
    )
    assert told == "told\n"
