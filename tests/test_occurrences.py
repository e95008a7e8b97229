"""Every appearance of a name: its role, its place, its scope, and where it is bound."""

import pickle
import random
import warnings
from collections import Counter
from pathlib import Path

import pytest
from golden import Cases, Check
from lib2to3_of_host import PYTHON2_TEXT
from names_against_interpreter import KNOWN, disagreements_of, python2_disagreements
from test_library import LibraryTexts

from codeloom import LineKind, Role, analyze
from codeloom._analysis import DumpJoinedNames

FOLDER = Path(__file__).parent / "occurrences"

# One character a role, drawn under each name.
MARKS = {
    Role.READ: "r",
    Role.BIND: "b",
    Role.AUGMENT: "u",
    Role.DELETE: "d",
    Role.IMPORT: "i",
    Role.PARAMETER: "p",
    Role.TYPE_PARAMETER: "t",
    Role.GLOBAL: "g",
    Role.NONLOCAL: "n",
    Role.ATTRIBUTE: ".",
    Role.ATTRIBUTE_BIND: "B",
    Role.ATTRIBUTE_AUGMENT: "U",
    Role.ATTRIBUTE_DELETE: "D",
    Role.KEYWORD: "k",
    Role.ORIGIN: "o",
}


def VersionOf(case):
    """The first word of a title may be a version."""
    first = case.title.split()[0]
    return first if first[0].isdecimal() else "3.12"


@pytest.mark.parametrize("case", Cases(FOLDER, ".roles"))
def test_roles(case, rewrite):
    analysis = analyze(case.source, python=VersionOf(case))
    rows = case.source.split("\n")
    marks = [[" "] * (len(row) + 1) for row in rows]
    for occurrence in analysis.occurrences:
        place = occurrence.range
        for column in range(place.column - 1, place.end_column - 1):
            assert marks[place.row - 1][column] == " "
            marks[place.row - 1][column] = MARKS[occurrence.role]
    drawn = ["---"]
    for row, mark in zip(rows, marks, strict=True):
        drawn.append(row)
        if "".join(mark).strip():
            drawn.append("".join(mark).rstrip())
    Check(case, "\n".join(drawn), rewrite)


FLAGS = (
    "local",
    "global",
    "free",
    "declared_global",
    "nonlocal",
    "referenced",
    "assigned",
    "parameter",
    "imported",
    "annotated",
    "type_parameter",
    "namespace",
)


def TitleOf(scope):
    return f"{scope.kind.value} {scope.name}".rstrip()


@pytest.mark.parametrize("case", Cases(FOLDER, ".scopes"))
def test_scopes(case, rewrite):
    analysis = analyze(case.source, python=VersionOf(case))
    rows = ["---"]
    depths = {}
    for scope in analysis.scopes:
        depths[scope] = depth = depths[scope.parent] + 1 if scope.parent else 0
        indent = "    " * depth
        rows.append(f"{indent}{TitleOf(scope)} {scope.range.row}-{scope.range.end_row}")
        for symbol in scope.symbols:
            flags = [flag.replace("_", " ") for flag in FLAGS if getattr(symbol, f"is_{flag}")]
            rows.append(f"{indent}  {symbol.name:<8} {', '.join(flags)}".rstrip())
    rows.append("")
    for occurrence in analysis.occurrences:
        if occurrence.resolution is not None:
            home = TitleOf(occurrence.home) if occurrence.home else occurrence.resolution.value
            place = f"{occurrence.range.row}:{occurrence.range.column}"
            rows.append(f"{place:<6} {occurrence.mangled:<8} {home}")
    Check(case, "\n".join(rows), rewrite)


@pytest.mark.parametrize("count", [30, pytest.param(None, marks=pytest.mark.slow)])
def test_against_the_interpreter(count, seed):
    found = []
    for path, text, _ in LibraryTexts(count, seed):
        with warnings.catch_warnings():
            warnings.simplefilter("ignore")
            found += [(path, kind, what) for kind, what in disagreements_of(text) if kind not in KNOWN]
    assert not found, found[:20]


# A broken line is a gap: all others say what they said.


def Broken(text, random_source):
    """The text with one in twenty of its lines of a single row broken, and the numbers of these rows."""
    lines = analyze(text, python="3.11").lines
    count = Counter(line.range.row for line in lines)
    single = [line.range for line in lines if line.range.row == line.range.end_row]
    single = [place for place in single if count[place.row] == 1]
    rows = text.split("\n")
    broken = random_source.sample(single, len(single) // 20)
    for place in broken:
        row = rows[place.row - 1]
        indent = row[: place.column - 1]
        damages = (" = = ", " )", ":(")
        rows[place.row - 1] = (
            f"{indent}{row[place.column - 1 :].split('#')[0]}{random_source.choice(damages)}"
        )
    return "\n".join(rows), {place.row for place in broken}


def ByPlace(text, left_out):
    """For each occurrence what it is, and where it is bound."""
    found = {}
    for occurrence in analyze(text, python="3.11").occurrences:
        place, home = occurrence.range, occurrence.home
        if place.row not in left_out:
            key = (place.row, place.column, place.end_column, occurrence.name, occurrence.role)
            found[key] = (home.kind, home.name, home.range.row) if home else occurrence.resolution
    return found


def test_broken_lines_leave_the_others_alone(seed):
    count = same = 0
    for path, text, _ in LibraryTexts(20, seed):
        broken_text, broken = Broken(text, random.Random(f"{seed} {path.name}"))
        sound, spoilt = ByPlace(text, broken), ByPlace(broken_text, broken)
        assert sound.keys() == spoilt.keys(), path
        count += len(sound)
        same += sum(spoilt[key] == home for key, home in sound.items())
    assert same > 0.99 * count


# An edit leaves the names of other parts as they are.


def StartsOfParts(analysis, text, random_source):
    """Some bytes of the text at which statements of the module begin."""
    before = [0]
    for row in text.split("\n"):
        before.append(before[-1] + len(row.encode()) + 1)
    clauses = {LineKind.ELIF, LineKind.ELSE, LineKind.EXCEPT, LineKind.FINALLY, LineKind.COMMENT}
    lines = [line for line in analysis.lines if line.range.column == 1 and line.kind not in clauses]
    rows = [line.range.row for line in lines]
    return sorted({0, *(before[row - 1] for row in rows if random_source.random() < 0.3)})


def test_names_of_parts_are_those_of_the_text(seed):
    for path, text, _ in LibraryTexts(20, seed):
        random_source = random.Random(f"{seed} {path.name}")
        for each in (text, Broken(text, random_source)[0]):
            starts = StartsOfParts(analyze(each), each, random_source)
            joined, whole = DumpJoinedNames(each, 314, starts)
            assert joined == whole, path


# Questions


def At(occurrences):
    return [f"{each.range.row}:{each.range.column} {each.name}" for each in occurrences]


def test_definitions_and_references():
    analysis = analyze("x = 1\ndef f(x):\n    return x\nx += y\nä = x; x\n")
    assert At(analysis.definitions("x")) == ["1:1 x", "2:7 x", "4:1 x"]
    assert analysis.definitions("\udc80") == analysis.definitions("x\0") == ()
    assert At(analysis.references(analysis.occurrence_at(5, 5))) == ["1:1 x", "4:1 x", "5:5 x", "5:8 x"]
    assert At(analysis.references(analysis.occurrence_at(3, 12))) == ["2:7 x", "3:12 x"]
    assert At(analysis.references(analysis.occurrence_at(4, 6))) == ["4:6 y"]
    assert At([analysis.occurrence_at(5, 6)]) == ["5:5 x"]  # it ends there
    assert analysis.occurrence_at(5, 4) is None
    assert analysis.occurrence_at(99, 1) is None
    with pytest.raises(ValueError, match="row must be at least 1"):
        analysis.occurrence_at(0, 1)
    with pytest.raises(ValueError, match="another analysis"):
        analysis.references(analyze("x").occurrences[0])


def test_private_attributes_are_mangled():
    text = "class _A:\n  def f(self):\n    self.__x = a.__b__ = g(lambda: self.__y)\nself.__z\n"
    attributes = [one for one in analyze(text).occurrences if one.object]
    assert [one.mangled for one in attributes] == ["_A__x", "__b__", "_A__y", "__z"]


@pytest.mark.parametrize(
    ("text", "unused"),
    [
        ("import a, b.c, d as e\nb", ["1:8 a", "1:21 e"]),
        ("from __future__ import division\nfrom m import a as a, _b, *", []),
        ("import a, b, c\n__all__ = ['a']\n__all__ += ['b']", ["1:14 c"]),
        ("import a, b, c\n__all__ = []\n__all__.extend(['a', 'b'])\n__all__.remove('c')", ["1:14 c"]),
        ("def f(a, *b):\n    c = d = 1\n    def g(): pass\n    return d", ["2:5 c", "3:9 g"]),
        ("def f():\n    a = 1\n    return locals()", []),
        ("def f():\n    a = 1\n    def g():\n        nonlocal a\n        a = 2", ["2:5 a", "3:9 g"]),
        ("def f():\n    a = 1\n    del a\n    for b in c: pass", ["4:9 b"]),
        ("import a\nx: 'a.b' = 1\ny = z  # type: c", []),
        ("import a\nx = (a,]", []),
        ("class A:\n    a = 1\nb = 2", []),
    ],
)
def test_unused(text, unused):
    assert At(analyze(text).unused()) == unused


def test_unused_parameters():
    analysis = analyze("def f(a, b, _c): return a\nlambda d: 1")
    assert At(analysis.unused(parameters=True)) == ["1:10 b", "2:8 d"]


@pytest.mark.parametrize(
    ("text", "undefined"),
    [
        ("a.b(len, c=__name__)", ["1:1 a"]),
        ("from m import *\na", []),
        ("globals().update(m)\na", []),
        ("def f():\n    exec(m)\na", []),
        ("g = globals()\ng['a'] = 1\na", []),
        ("globals().get('b')\na", ["2:1 a"]),
        ("import enum\n@enum.global_enum\nclass A(enum.Enum): a = 1\na", []),
        ("def f():\n    global a, b\n    a = 1\nprint(a, b)", ["4:10 b"]),
        ("class A:\n    x = 1\n    y = __qualname__\n    def f(self): return x, __class__", ["4:25 x"]),
        ("x: 'a' = 1", ["1:5 a"]),
        ("(a,]\na", []),
        ("del a\nunicode", ["2:1 unicode"]),
    ],
)
def test_undefined(text, undefined):
    assert At(analyze(text).undefined()) == undefined


def test_items_are_values():
    analysis = analyze("class A:\n    __x = f(1).y\n")
    again = analyze("class A:\n    __x = f(1).y\n")
    x, f, y = analysis.occurrences[1:]
    assert x == again.occurrences[1] and hash(x) == hash(again.occurrences[1]) and x != f
    assert (x.mangled, x.symbol.name, x.home.name, x.scope.parent.parent) == ("_A__x", "_A__x", "A", None)
    assert (y.object.column, y.object.end_column, y.symbol, y.home, f.object) == (11, 15, None, None, None)
    assert x in x.line.occurrences and x.line == analysis.lines[1]
    assert pickle.loads(pickle.dumps(x)) == x
    assert pickle.loads(pickle.dumps(x.scope)) == x.scope
    with pytest.raises(TypeError):
        type(x.symbol)()


def test_python2_against_lib2to3():
    assert list(python2_disagreements(PYTHON2_TEXT.read_text())) == []


def test_what_python2_unpacks_of_an_exception():
    analysis = analyze("try: pass\nexcept a.b, (c, d): c\n", python="2.7")
    assert [(each.name, each.role.value) for each in analysis.occurrences[2:]] == [
        ("c", "bind"),
        ("d", "bind"),
        ("c", "read"),
    ]


@pytest.mark.parametrize(
    ("text", "python"),
    [("type return []", "2.7"), ("type a.b = c", "2.7"), ("@a[b] := c", "3.14"), ("(a.b := c)", "3.14")],
)
def test_what_the_grammar_alone_takes_has_names_of_some_kind(text, python):
    """No name is where one should be, and the rules of a line may refuse that only afterwards."""
    analysis = analyze(f"{text}\nglobal x\n", python=python)
    assert analysis.problems is not None
    for occurrence in analysis.occurrences:
        assert occurrence.name.isidentifier()
