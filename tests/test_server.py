"""The language server over the wire: how a session goes, texts that change, diagnostics, odd messages."""

import random
import subprocess
import sys
from pathlib import Path

import pytest
from language_client import PULL, Client, Refused, range_of, shown
from lsprotocol import types
from run_python import RunPython

import codeloom
from codeloom.rows import ROW_END, RowTexts


@pytest.fixture
def client(tmp_path):
    with Client(tmp_path) as client:
        yield client


def Brief(diagnostics):
    return [(shown(one.range), one.code) for one in diagnostics]


def test_session(tmp_path):
    with Client(tmp_path, starts=False) as client:
        with pytest.raises(Refused, match="before initialize") as refused:
            client.request("textDocument/hover", client.at(0, 0))
        assert refused.value.code == -32002
        client.initialize()
        with pytest.raises(Refused, match="already"):
            client.initialize()
        client.open("x = 1 1\n")
        assert Brief(client.diagnostics()) == [("0:6-0:7", "CL219")]
        assert client.request("shutdown", None) is None
        with pytest.raises(Refused, match="after shutdown"):
            client.request("textDocument/hover", client.at(0, 0))
        client.notify("exit", None)
        assert client.process.wait(10) == 0
    with Client(tmp_path) as client:  # without shutdown
        client.notify("exit", None)
        assert client.process.wait(10) == 1
    with Client(tmp_path) as client:  # an editor that dies
        client.process.stdin.close()
        assert client.process.wait(10) == 1


def test_a_problem_as_diagnostic(client):
    client.open("def f(a, a):\n    pass\nif x = 1:\n    pass\n")
    twice, equal = client.diagnostics()
    assert twice.severity is types.DiagnosticSeverity.Error and twice.source == "codeloom"
    page = twice.code_description.href.removeprefix("file://")
    path, _, row = page.partition("#L")
    assert Path(path).read_text().splitlines()[int(row) - 1].startswith(f"== {twice.code} ")
    assert equal.message.endswith("(hint: write '==' to compare)")
    client.change("class A:\n    x = (1\n    y = ]\n")
    assert [one.code for one in client.diagnostics()] == ["CL202", "CL203"]


@pytest.mark.parametrize(("encoding", "end"), [("utf-8", 16), ("utf-16", 11), ("utf-32", 9), (None, 11)])
def test_position_encodings(tmp_path, encoding, end):
    with Client(tmp_path, encodings=encoding and [encoding]) as client:
        assert client.capabilities.position_encoding == (encoding or "utf-16")
        client.open("x = '😀é😀'\ny\n")
        assert client.diagnostics() == []
        client.change(((0, end), (0, end), " )"))
        (found,) = client.diagnostics()
        assert shown(found.range) == f"0:{end + 1}-0:{end + 2}"
        client.change(((0, end), (0, 99), ""))
        assert client.diagnostics() == []


def test_pull(tmp_path):
    with Client(tmp_path, capabilities=PULL) as client:
        document = client.open("x = )\n")
        first = client.request("textDocument/diagnostic", document)
        assert (first.kind, Brief(first.items)) == ("full", [("0:4-0:5", "CL203")])
        again = {**document, "previousResultId": first.result_id}
        assert client.request("textDocument/diagnostic", again).kind == "unchanged"
        client.change(((0, 4), (0, 5), "1"))
        assert client.request("textDocument/diagnostic", again).items == ()
        client.change(((0, 4), (0, 5), ")"))
        assert client.request("textDocument/diagnostic", again).kind == "unchanged"


def test_settings(tmp_path):
    project = tmp_path / "pyproject.toml"
    project.write_text('[tool.codeloom]\npython = "3.7"\nignore = ["CL203"]\n')
    with Client(tmp_path) as client:
        client.open("x = )\n(y := 1)\nz = 1 1  # codeloom: ignore\n")
        assert Brief(client.diagnostics()) == [("1:3-1:5", "CL701")]
        project.write_text('[tool.codeloom]\npython = "3.8"\n')
        changes = [{"uri": project.as_uri(), "type": 2}]
        client.notify("workspace/didChangeWatchedFiles", {"changes": changes})
        assert Brief(client.diagnostics()) == [("0:4-0:5", "CL203")]
        project.write_text("[tool.codeloom]\nignored = 1\n")
        client.notify("workspace/didChangeWatchedFiles", {"changes": changes})
        assert "ignored isn't a setting" in client.note("window/showMessage").message
        client.change(((1, 0), (1, 1), "["))
        assert Brief(client.diagnostics())[0] == ("0:4-0:5", "CL203")


def test_comments_that_ignore(client):
    """One may come while the text is typed."""
    client.open("x = 1 1\ny = )\n")
    assert len(client.diagnostics()) == 2
    for i, character in enumerate("  # codeloom: ignore"):
        client.change(((0, 7 + i), (0, 7 + i), character))
        found = Brief(client.diagnostics())
    assert found == [("1:4-1:5", "CL203")]
    client.change(((1, 5), (1, 5), "\n  # codeloom: ignore"), ((1, 5), (2, 0), ""))
    assert Brief(client.diagnostics()) == []


def test_files_that_are_not_open(tmp_path):
    (tmp_path / "sub").mkdir()
    files = {"a.py": "x = )\n", "sub/b.py": "x = 1\n", "sub/c.py": "x = (\n", "d.ipynb": "{", ".h/e.py": ")"}
    for name, text in files.items():
        (tmp_path / name).parent.mkdir(exist_ok=True)
        (tmp_path / name).write_text(text)
    options = {"workspaceDiagnostics": True}
    with Client(tmp_path, options=options) as client:
        assert [one.code for one in client.diagnostics("a.py")] == ["CL203"]
        assert [one.code for one in client.diagnostics("sub/c.py")] == ["CL202"]
        document = client.open("x = 2\n", "a.py")  # what is open counts as it is there
        assert client.diagnostics("a.py") == []
        client.notify("textDocument/didClose", document)
        del client.versions["a.py"]
        assert client.diagnostics("a.py") == []
        assert [one.code for one in client.diagnostics("a.py")] == ["CL203"]
        (tmp_path / "a.py").unlink()
        (tmp_path / "sub/b.py").write_text("return\n")
        changes = [{"uri": client.uri(name), "type": 2} for name in ("a.py", "sub/b.py")]
        client.notify("workspace/didChangeWatchedFiles", {"changes": changes})
        assert client.diagnostics("a.py") == []
        assert [one.code for one in client.diagnostics("sub/b.py")] == ["CL321"]
        (tmp_path / "pyproject.toml").write_text('[tool.codeloom]\nextend-exclude = ["sub/"]\n')
        assert not client.errors
    with Client(tmp_path, options=options, capabilities=PULL) as client:  # asked for, and waited for
        first = client.request("workspace/diagnostic", {"previousResultIds": []})
        assert first.items == ()
        (tmp_path / "f.py").write_text("x = (\n")
        known = [{"uri": client.uri("f.py"), "value": "none"}]
        waiting = client.begin("workspace/diagnostic", {"previousResultIds": known})
        changes = [{"uri": client.uri("f.py"), "type": 1}]
        client.notify("workspace/didChangeWatchedFiles", {"changes": changes})
        (report,) = client.answer(waiting, "workspace/diagnostic").items
        assert (report.uri, report.kind, report.items[0].code) == (client.uri("f.py"), "full", "CL202")
        known = [{"uri": report.uri, "value": report.result_id}]
        waiting = client.begin("workspace/diagnostic", {"previousResultIds": known})
        client.notify("$/cancelRequest", {"id": waiting})
        with pytest.raises(Refused) as cancelled:
            client.answer(waiting)
        assert cancelled.value.code == -32800


def test_random_edits(tmp_path, seed):
    """After any edits the server has the client's text: it says of it what `analyze` does."""
    chance = random.Random(seed)
    pieces = ["x", "(", ")", "'", '"""', "\n", "\r", "\r\n", "é", "😀", " ", "if x:\n    y = 1\n", "#", ""]
    with Client(tmp_path, encodings=["utf-32"], capabilities=PULL) as client:
        text = "def f(a):\r\n    return a\rx = 'é'\n\n"
        document = client.open(text)
        for _ in range(300):
            starts = [0, *(match.end() for match in ROW_END.finditer(text))]
            rows = RowTexts(text)
            places = sorted(
                (row_i, chance.randint(0, len(rows[row_i])))
                for row_i in (chance.randrange(len(rows)) for _ in range(2))
            )
            offsets = [starts[row] + column for row, column in places]
            new = "".join(chance.choices(pieces, k=chance.randint(0, 3)))
            text = text[: offsets[0]] + new + text[offsets[1] :]
            client.change((*places, new))
            expected = codeloom.analyze(text).problems
            found = client.request("textDocument/diagnostic", document).items
            assert [(one.code, shown(one.range)) for one in found] == [
                (one.code, shown(Counted(one.range))) for one in expected
            ], (seed, text)


def Counted(place):
    """A range of the analysis as the protocol counts it."""
    start = types.Position(place.row - 1, place.column - 1)
    return types.Range(start, types.Position(place.end_row - 1, place.end_column - 1))


def test_what_is_typed_is_not_told_of_elsewhere(client):
    """A header without its body marks the row after it: only when nobody types."""

    def Type(text, row, column=0):
        for character in text:
            client.change(((row, column), (row, column), character))
            row, column = (row + 1, 0) if character == "\n" else (row, column + 1)
            yield [one.range.start.line - row for one in client.diagnostics()]

    document = client.open("x = )\n\n\nprint(1)\n")
    client.diagnostics()
    seen = list(Type("def f(a,\n      b):\n    ", 1))
    assert {row for rows in seen for row in rows} == {-1, -2, -3, 0}
    assert all(len(rows) <= 2 for rows in seen) and seen[-1] == [-3]  # what was there before, and its own
    assert Brief(client.diagnostics())[1:] == [("5:0-5:5", "CL302")]  # a moment later
    assert list(Type("y = (", 3, 4))[-1] == [-3, 0]
    assert list(Type("\n", 3, 9))[-1] == [-4]
    client.notify("textDocument/didSave", document)
    assert [one.code for one in client.diagnostics()] == ["CL203", "CL202"]
    client.change(((4, 0), (4, 0), "1)"))
    assert [one.code for one in client.diagnostics()] == ["CL203"]


def test_odd_messages(client):
    """Each gets an error, and the text is as it was."""
    document = client.open("x = 1\n")
    client.diagnostics()
    for body in (b"{", b"\xff", b"[]", b"3", b"{}", b'{"jsonrpc": "2.0"}', b"[" * 100_000, b""):
        client.write(body)
    for _ in range(8):
        assert client.next(lambda one: "error" in one and one["id"] is None)
    client.process.stdin.write(b"hello\r\n\r\nContent-Length: x\r\n\r\n")
    refused = [
        ("textDocument/hover", client.at(0, 0, "other.py"), -32602, "isn't open"),
        ("textDocument/hover", client.at(7, 0), -32602, "no position 7:0"),
        ("textDocument/hover", client.at(0, -1), -32602, "parameters of textDocument/hover"),
        ("textDocument/hover", {"textDocument": 3}, -32602, "parameters of textDocument/hover"),
        ("textDocument/hover", None, -32602, "parameters of textDocument/hover"),
        ("no/such", {}, -32601, "no/such"),
    ]
    for method, params, code, message in refused:
        with pytest.raises(Refused, match=message) as error:
            client.request(method, params)
        assert error.value.code == code, method
    bad = [
        {"textDocument": {"uri": client.uri("other.py"), "version": 2}, "contentChanges": [{"text": ""}]},
        {
            "textDocument": {"uri": client.uri("a.py"), "version": 2},
            "contentChanges": [{"range": range_of((9, 0), (9, 1)), "text": "y"}],
        },
        {
            "textDocument": {"uri": client.uri("a.py"), "version": 2},
            "contentChanges": [{"range": range_of((0, 4), (0, 1)), "text": "y"}],
        },
        {"textDocument": {"uri": client.uri("a.py")}, "contentChanges": 7},
    ]
    for params in bad:
        client.notify("textDocument/didChange", params)
        assert client.note("window/logMessage").type is types.MessageType.Error
    client.notify("textDocument/didClose", {"textDocument": {"uri": client.uri("other.py")}})
    assert "isn't open" in client.note("window/logMessage").message
    client.send({"id": 77, "result": None})  # an answer that nobody waits for
    client.notify("$/cancelRequest", {"id": "never"})
    client.notify("$/unknown", {})
    client.versions["a.py"] = 9
    client.change(((0, 5), (0, 5), " )"))
    assert Brief(client.diagnostics()) == [("0:6-0:7", "CL203")]
    client.notify("textDocument/didClose", document)
    client.versions["a.py"] = None
    assert client.diagnostics() == []


def test_cancelled_requests(client):
    """A request that is cancelled while others are handled isn't begun."""
    document = client.open("x = [1]\n" * 20_000)
    first = client.begin("textDocument/semanticTokens/full", document)
    second = client.begin("textDocument/hover", client.at(0, 0))
    third = client.begin("textDocument/semanticTokens/full", document)
    client.notify("$/cancelRequest", {"id": second})
    client.notify("$/cancelRequest", {"id": third})
    client.change(((0, 0), (0, 0), "y = 1\n"))
    outcomes = []
    for identity in (first, second, third):
        try:
            client.answer(identity)
            outcomes.append("answered")
        except Refused as refused:
            outcomes.append(refused.code)
    assert outcomes[2] == -32800 and outcomes[0] in ("answered", -32801)


def test_only_the_protocol_is_on_the_standard_output():
    code = """
import os
from codeloom.server.transport import standard_streams
print("before")
with standard_streams() as (_, own):
    print("printed")
    os.write(1, b"written")
    os.write(own, b"protocol\\n")
print("after")
"""
    assert RunPython(code) == "before\nprotocol\nafter\n"


def test_without_the_extra():
    code = "import sys; sys.modules['pygls'] = None; from codeloom.cli import main; sys.exit(main(['serve']))"
    done = subprocess.run([sys.executable, "-P", "-c", code], capture_output=True, text=True)
    assert (done.returncode, done.stdout) == (2, "")
    assert done.stderr == "codeloom: serve needs the extra lsp: pip install 'codeloom[lsp]'\n"


POSITIONED = (
    "hover",
    "definition",
    "references",
    "documentHighlight",
    "prepareRename",
    "rename",
    "completion",
)
WHOLE = (
    "documentSymbol",
    "foldingRange",
    "semanticTokens/full",
    "diagnostic",
    "codeAction",
    "selectionRange",
)


def test_any_request_at_any_place(tmp_path, seed):
    """Whatever the text is, a request gets an answer or a reason, and none fails within."""
    chance = random.Random(seed)
    folder = Path(__file__).parent
    texts = [path.read_text("utf-8") for path in sorted(folder.glob("problems/*.problems"))]
    sources = ["".join(f"{row[2:]}\n" for row in text.split("\n") if row[:2] == "  ") for text in texts]
    with Client(tmp_path, capabilities=PULL) as client:
        for number in range(40):
            rows = chance.choice(sources).splitlines(keepends=True)
            start = chance.randrange(max(len(rows) - 30, 1))
            text = "".join(chance.sample(rows[start : start + 30], k=min(20, len(rows[start:]))))
            document = client.open(text, f"r{number}.py")
            last = len(RowTexts(text))
            for _ in range(12):
                row, column = chance.randrange(last), chance.randrange(30)
                position = {"line": row, "character": column}
                more = {
                    "position": position,
                    "positions": [position],
                    "range": {"start": position, "end": {"line": last, "character": 0}},
                    "newName": "renamed",
                }
                method = f"textDocument/{chance.choice(POSITIONED + WHOLE)}"
                if method.endswith(("references", "codeAction")):
                    more["context"] = {"includeDeclaration": True, "diagnostics": []}
                try:
                    client.request(method, {**document, **more})
                except Refused as refused:
                    assert refused.code == -32803, (seed, method, position, text, refused)
        assert not client.errors
