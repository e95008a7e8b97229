"""What the language server answers: names, outlines, folds, completion, fixes."""

import random
import sysconfig
from pathlib import Path

import pytest
from language_client import Client, Refused, apply, range_of, shown
from tools_of_project import tool_named

import codeloom

SOURCE = '''\
import os.path
from m import a as b, c

TOTAL = 3

class Store(Base):
    """Keeps things."""
    size: int = 0

    def __init__(self, size=TOTAL):
        self.size = size
        self.items = [b for b in c if b]

    @property
    def first(self) -> str:
        """The first one.

        Or nothing.
        """
        def inner(x): return x + TOTAL
        return inner(self.items[0])

def broken(a, b
    total = a
    return to

# one
# two
if TOTAL:
    print(
        Store().first,
        f"{TOTAL + c}")
'''


@pytest.fixture(scope="module")
def client(tmp_path_factory):
    with Client(tmp_path_factory.mktemp("server")) as client:
        client.open(SOURCE)
        yield client


def Place(text, marked, source=SOURCE):
    """Row and column in the text that is marked by a bar."""
    before, _, after = marked.partition("|")
    i = source.index(before + after, source.find(text)) + len(before)
    return source.count("\n", 0, i), i - source.rfind("\n", 0, i) - 1


def Ask(client, method, marked, near="", **more):
    return client.request(f"textDocument/{method}", {**client.at(*Place(near, marked)), **more})


def Words(locations):
    """Where places are: the row from 1 and what is there."""
    rows = SOURCE.splitlines()
    return [
        f"{one.range.start.line + 1}:"
        + rows[one.range.start.line][one.range.start.character : one.range.end.character]
        for one in locations
    ]


def test_definition_references_and_highlight(client):
    assert Words(Ask(client, "definition", "return |inner")) == ["20:inner"]
    assert Words(Ask(client, "definition", "|b for")) == ["12:b"]
    assert Words(Ask(client, "definition", "Store|()")) == ["6:Store"]
    everywhere = ["4:TOTAL", "10:TOTAL", "20:TOTAL", "29:TOTAL", "32:TOTAL"]
    found = Ask(client, "references", "size=|TOTAL", context={"includeDeclaration": True})
    assert Words(found) == everywhere
    found = Ask(client, "references", "size=|TOTAL", context={"includeDeclaration": False})
    assert Words(found) == everywhere[1:]
    found = Ask(client, "documentHighlight", 'f"{|TOTAL')
    assert Words(found) == everywhere
    assert [one.kind.name for one in found] == ["Write", "Read", "Read", "Read", "Read"]
    for nothing in ("self.|items[", "|return inner", "Base|"):
        assert Ask(client, "definition", nothing) is None


@pytest.mark.parametrize(
    ("marked", "near", "words"),
    [
        ("Store|()", "", ["class Store(Base):", "a name of the module, bound in row 6", "Keeps things."]),
        ("|inner(self", "", ["def inner(x): return x + TOTAL", "function `first`"]),
        ("self.|first", "", None),
        ("Store().|first", "", ["an attribute"]),
        ("size=|TOTAL", "", ["TOTAL = 3", "a name of the module"]),
        ("in |c if", "", ["from m import a as b, c", "an import of the module, bound in row 2"]),
        ("= |size", "", ["size = TOTAL", "a parameter of the function `__init__`"]),
        ("size: |int", "", ["a builtin"]),
        ("|Base", "", ["bound nowhere in this file"]),
    ],
)
def test_hover(client, marked, near, words):
    if words is None:
        return
    found = Ask(client, "hover", marked, near)
    for word in words:
        assert word in found.contents.value, found.contents.value


def test_rename(client):
    def Renamed(marked, name):
        edit = Ask(client, "rename", marked, newName=name)
        (edits,) = edit.changes.values()
        return apply(SOURCE, edits)

    assert Renamed("size=|TOTAL", "most") == SOURCE.replace("TOTAL", "most")
    text = Renamed('f"{TOTAL + |c', "d")
    assert "import a as b, c as d\n" in text and "for b in d if b" in text and "{TOTAL + d}" in text
    prepared = Ask(client, "prepareRename", "|Store()")
    assert prepared.placeholder == "Store"
    refused = [
        ("self.|items[", "x", "'items' is an attribute: what it belongs to isn't known"),
        ("size: |int", "x", "'int' is a builtin"),
        ("|Base", "x", "'Base' is bound nowhere in this file"),
        ("|return inner", "x", "there is no name here"),
        ("size=|TOTAL", "class", "'class' is a keyword"),
        ("size=|TOTAL", "2nd", "'2nd' isn't a name"),
        ("size=|TOTAL", "", "'' isn't a name"),
        ("size=|TOTAL", "c", "'c' has another meaning here already"),
        ("size=|TOTAL", "x", "'x' has another meaning here already"),
        ("import |os", "x", "the import in row 1 can bind 'os' by this name only"),
        ("a as |b", "x", "row 23 names 'b' and has a fault: mend it first"),
    ]
    for marked, name, message in refused:
        with pytest.raises(Refused, match=message) as error:
            Ask(client, "rename", marked, newName=name)
        assert error.value.code == -32803
    client.open("x = 1\nf(\n  x x)\nreturn x\n", "broken.py")
    with pytest.raises(Refused, match="row 2 names 'x' and has a fault"):
        client.request("textDocument/rename", {**client.at(3, 7, "broken.py"), "newName": "z"})
    source = "from m import a as b\n\ndef f(b):\n    return b\nprint(b)\n"
    client.open(source, "as.py")
    edit = client.request("textDocument/rename", {**client.at(4, 6, "as.py"), "newName": "e"})
    (edits,) = edit.changes.values()
    assert apply(source, edits) == source.replace("as b", "as e").replace("print(b)", "print(e)")


def Meanings(analysis):
    """A number for each name that has a scope: the same for those that mean the same."""
    known = {}
    return [
        known.setdefault((one.home, one.mangled), len(known))
        for one in analysis.occurrences
        if one.resolution is not None
    ]


def test_random_renames(tmp_path, seed):
    """After each that isn't refused every name of the text means what it meant."""
    chance = random.Random(seed)
    folder = Path(sysconfig.get_path("stdlib"))
    done = refused = 0
    with Client(tmp_path, encodings=["utf-32"]) as client:
        for name in ("textwrap.py", "contextlib.py", "bisect.py"):
            source = (folder / name).read_text("utf-8")
            client.open(source, name)
            before = codeloom.analyze(source)
            names = [one for one in before.occurrences if one.resolution is not None]
            for _ in range(25):
                one, other = chance.sample(names, 2)
                new = chance.choice(("fresh_name", other.name))
                place = client.at(one.range.row - 1, one.range.column - 1, name)
                try:
                    edit = client.request("textDocument/rename", {**place, "newName": new})
                except Refused:
                    refused += 1
                    continue
                (edits,) = edit.changes.values()
                after = codeloom.analyze(apply(source, edits))
                assert Meanings(after) == Meanings(before), (seed, name, one, new)
                assert not after.problems, (seed, name, one, new)
                done += 1
    assert done > 10 and refused > 10


def test_outline(client):
    def Show(symbols, depth=0):
        for one in symbols:
            named = one.selection_range.start
            place = f"{shown(one.range)} {named.line}:{named.character}"
            yield f"{'  ' * depth}{one.kind.name} {one.name} {place}"
            yield from Show(one.children, depth + 1)

    found = client.request("textDocument/documentSymbol", {"textDocument": {"uri": client.uri("a.py")}})
    assert list(Show(found)) == [
        "Constant TOTAL 3:0-3:9 3:0",
        "Class Store 5:0-20:35 5:6",
        "  Field size 7:4-7:17 7:4",
        "  Constructor __init__ 9:4-11:40 9:8",
        "  Method first 14:4-20:35 14:8",
        "    Function inner 19:8-19:38 19:12",
        "Function broken 22:0-24:13 22:0",
    ]


def test_folding(client):
    found = client.request("textDocument/foldingRange", {"textDocument": {"uri": client.uri("a.py")}})
    assert [(one.start_line + 1, one.end_line + 1, one.kind) for one in found] == [
        (1, 2, "imports"),
        (6, 21, None),
        (10, 12, None),
        (15, 21, None),
        (16, 19, None),
        (23, 25, None),
        (27, 28, "comment"),
        (29, 32, None),
        (30, 32, None),
    ]


def test_selection(client):
    positions = [dict(zip(("line", "character"), Place("", "Store().f|irst"), strict=True))]
    (found,) = client.request(
        "textDocument/selectionRange", {"textDocument": {"uri": client.uri("a.py")}, "positions": positions}
    )
    steps = []
    while found is not None:
        steps.append(shown(found.range))
        found = found.parent
    assert steps == [
        "30:17-30:17",
        "30:16-30:21",
        "30:8-30:21",
        "29:10-31:22",
        "29:9-31:23",
        "29:4-31:23",
        "28:0-31:23",
        "0:0-32:0",
    ]


def Tokens(client, data):
    """Each token as its text, its type and its modifiers."""
    legend = client.capabilities.semantic_tokens_provider.legend
    rows, row, column, found = SOURCE.splitlines(), 0, 0, []
    for i in range(0, len(data), 5):
        rows_on, columns_on, length, kind, bits = data[i : i + 5]
        row, column = row + rows_on, columns_on + (0 if rows_on else column)
        modifiers = [name for j, name in enumerate(legend.token_modifiers) if bits >> j & 1]
        found.append(" ".join([rows[row][column : column + length], legend.token_types[kind], *modifiers]))
    return found


def test_semantic_tokens(client):
    document = {"textDocument": {"uri": client.uri("a.py")}}
    whole = client.request("textDocument/semanticTokens/full", document)
    found = Tokens(client, whole.data)
    for one in (
        "os namespace declaration",
        "TOTAL variable declaration readonly",
        "Store class declaration",
        "size property declaration",
        "int class defaultLibrary",
        "__init__ method declaration",
        "self parameter",
        "size property modification",
        "inner function",
        "x parameter declaration",
        "print function defaultLibrary",
        "first property",
    ):
        assert one in found, one
    part = client.request(
        "textDocument/semanticTokens/range", {**document, "range": range_of((9, 0), (11, 0))}
    )
    assert Tokens(client, part.data)[0] == "__init__ method declaration"
    assert 5 <= len(part.data) // 5 < len(found)
    client.change(((3, 0), (3, 5), "LIMIT"), ((0, 0), (0, 0), "\n"))
    delta = client.request(
        "textDocument/semanticTokens/full/delta", {**document, "previousResultId": whole.result_id}
    )
    data = list(whole.data)
    for edit in delta.edits:
        data[edit.start : edit.start + edit.delete_count] = edit.data or ()
    now = client.request("textDocument/semanticTokens/full", document)
    assert data == list(now.data) != list(whole.data)
    client.change(SOURCE)


def Labels(client, text, near="", name="c.py"):
    """What is offered at the bar, by label."""
    before, _, after = text.partition("|")
    client.open(before + after, name)
    line = before.count("\n")
    answer = client.request(
        "textDocument/completion", client.at(line, len(before) - before.rfind("\n") - 1, name)
    )
    return {one.label: one for one in answer.items}


def test_completion(client):
    head = "import os\nlimit = 1\nclass A:\n    field = 1\n    def f(self, given):\n        self.made = 1\n"
    inside = head + "        x = 2\n        for y in |\n"
    found = Labels(client, inside)
    assert {"os", "limit", "A", "self", "given", "x", "len", "return"} <= found.keys()
    assert "field" not in found and "f" not in found and "made" not in found
    assert found["x"].sort_text < found["limit"].sort_text < found["len"].sort_text
    broken = Labels(
        client, head + "        x = 2\n        print((given[|\n\n    def g(self):\n        pass\n"
    )
    assert {"self", "given", "x", "limit"} <= broken.keys() and "g" not in broken
    assert "given" in Labels(client, head + "\n        |\nz = 1\n")
    assert "given" not in Labels(client, head + "\n|\nz = 1\n")
    assert "field" in Labels(client, head + "    |\n")
    assert {"field", "f", "made"} == Labels(client, head + "        self.|\n").keys()
    assert {"field", "f"} <= Labels(client, head + "A.|\n").keys()
    assert Labels(client, head + "os.path\nos.|\n").keys() == {"path"}
    assert "q" in Labels(client, "z = [q + | for q in w]\n")
    for nothing in ("'a |'", "# |", "def |", "import |", "from |", "x = 3|", "f().|"):
        assert not Labels(client, head + nothing), nothing
    assert "limit" in Labels(client, head + "print(f'{|}')\n")


def Mistakes():
    tool = tool_named("make_mistakes_page")
    return list(tool.mistakes())


# What must have a fix, of the titles there.
MENDED = {
    "a colon is missing after `if`",
    "a colon is missing after `def`",
    "a colon is missing after `else`",
    "a parenthesis isn't closed",
    "a bracket isn't closed",
    "a parenthesis too many",
    "the wrong kind of bracket closes",
    "a comma is missing in a call",
    "a colon is missing in a dictionary",
    "`=` in a dictionary",
    "`=` for `==` in a condition",
    "an assignment to a call",
    "a quote is missing at the end",
    "different quotes",
    "three quotes that aren't closed",
    "curly quotes",
    "a no-break space",
    "`print` of Python 2 with several values",
    "`exec` of Python 2",
    "`raise` of Python 2",
    "backquotes of Python 2",
    "an octal number of Python 2",
    "`else if`",
    "`&&`",
    "`!`",
    "`++`",
    "`===`",
    "a misspelled `return`",
    "a keyword as a parameter",
    "an unindented block",
    "an unexpected indent",
    "`for` without `in`",
    "`import` before `from`",
    "a field that isn't closed",
    "two statements on a row",
    "braces around a block",
    "`then` instead of a colon",
    "a colon in a call",
}


def test_fixes_of_typical_mistakes(client):
    """Each fix takes its problem away and brings none."""
    mended = set()
    for title, source, version in Mistakes():
        if version:
            continue
        for context in ("", "x = 0\n\n"):
            text = context + source + "\nafter = 1\n"
            name = f"{'b' if context else 'a'}{abs(hash(title))}.py"
            document = client.open(text, name)
            diagnostics = client.diagnostics(name)
            before = sorted(one.code for one in diagnostics)
            actions = client.request(
                "textDocument/codeAction",
                {**document, "range": range_of((0, 0), (99, 0)), "context": {"diagnostics": []}},
            )
            for action in actions:
                (edits,) = action.edit.changes.values()
                after = sorted(one.code for one in codeloom.analyze(apply(text, edits)).problems)
                removed = list(before)
                removed.remove(action.diagnostics[0].code)
                assert set(after) <= set(removed) and len(after) <= len(removed), (title, action)
            if actions and not context:
                mended.add(title)
    assert mended >= MENDED, MENDED - mended


@pytest.mark.parametrize(
    ("source", "title", "fixed"),
    [
        ("if x:\n    f(a, (b\ny = 1\n", "Insert ')'", None),
        ("def f(a, b\n    return a\n", "Insert '):'", "def f(a, b):\n    return a\n"),
        ("def f(a, b:\n    return a\n", "Insert ')'", "def f(a, b):\n    return a\n"),
        ("x = [1,\n     2\ny = 3\n", "Insert ']'", "x = [1,\n     2]\ny = 3\n"),
        ("if x  # why\n    y\n", "Insert ':'", "if x:  # why\n    y\n"),
        ('print("a)\n', 'Insert "', 'print("a")\n'),
        ("print 'a',\n", "Write print(...)", "print('a', end=\" \")\n"),
        ("if !x and y:\n    pass\n", "Write 'not'", "if not x and y:\n    pass\n"),
        ("for x in y:\n", "Insert 'pass'", "for x in y:\n    pass\n"),
        ("é = '😀' if x = 1 else 2\n", "Replace '=' with '=='", "é = '😀' if x == 1 else 2\n"),
    ],
)
def test_fixes(client, source, title, fixed):
    name = f"fix{abs(hash(source))}.py"
    document = client.open(source, name)
    actions = client.request(
        "textDocument/codeAction",
        {**document, "range": range_of((0, 0), (9, 0)), "context": {"diagnostics": []}},
    )
    by_title = {one.title: one for one in actions}
    if fixed is None:
        assert title not in by_title  # one bracket alone doesn't mend it
        return
    (edits,) = by_title[title].edit.changes.values()
    if source.isascii():
        assert apply(source, edits) == fixed
    else:
        assert edits[0].range.start.character == source.index("= 1") + 1
