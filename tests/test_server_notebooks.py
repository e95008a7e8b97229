"""Notebooks in the language server: cells that are edited, and problems and names across them."""

import json
import random

import pytest
from language_client import PULL, Client, Refused, range_of, shown

from codeloom import Notebook, analyze
from codeloom.rows import ROW_END

NOTEBOOK = "n.ipynb"
TELLING = {"notebookDocument": {"synchronization": {}}}
ASKING = {**PULL, **TELLING}


def item(client, name, text, language="python"):
    client.versions[name] = 1
    return {"uri": client.uri(name), "languageId": language, "version": 1, "text": text}


def cells_of(client, names):
    return [{"kind": 2, "document": client.uri(name)} for name in names]


def open_notebook(client, **texts):
    """A notebook whose cells have these names."""
    notebook = {"uri": client.uri(NOTEBOOK), "notebookType": "jupyter-notebook", "version": 1}
    items = [item(client, name, text) for name, text in texts.items()]
    client.notify(
        "notebookDocument/didOpen",
        {"notebookDocument": {**notebook, "cells": cells_of(client, texts)}, "cellTextDocuments": items},
    )


def change_notebook(client, cells):
    notebook = {"uri": client.uri(NOTEBOOK), "version": 2}
    client.notify("notebookDocument/didChange", {"notebookDocument": notebook, "change": {"cells": cells}})


def type_in(client, name, start, end, text):
    client.versions[name] += 1
    document = {"uri": client.uri(name), "version": client.versions[name]}
    change = {"range": range_of(start, end), "text": text}
    change_notebook(client, {"textContent": [{"document": document, "changes": [change]}]})


def brief(client, name):
    return [(one.code, shown(one.range)) for one in client.diagnostics(name)]


def test_cells(tmp_path):
    """Magic is no fault, names of other cells are known, and a cell that is left open spoils no other."""
    with Client(tmp_path, capabilities=TELLING) as client:
        open_notebook(
            client,
            a="%matplotlib inline\nimport os\n!ls\nfiles = !ls\nawait f()\n",
            b="def total(x):\n    return x\n",
            c="total(os.path)\ny = (1\n",
            d="z = total(2) 3\n%%time",
        )
        found = {name: brief(client, name) for name in "abcd"}
        assert found == {"a": [], "b": [], "c": [("CL202", "1:4-1:5")], "d": [("CL219", "0:13-0:14")]}
        (place,) = client.request("textDocument/definition", client.at(0, 5, "c"))
        assert (place.uri, shown(place.range)) == (client.uri("b"), "0:4-0:9")
        uses = client.request(
            "textDocument/references", {**client.at(0, 4, "b"), "context": {"includeDeclaration": True}}
        )
        assert [one.uri[-1] for one in uses] == ["b", "c"]  # the line of the third one has a fault
        assert "row 1 of cell 2" in client.request("textDocument/hover", client.at(0, 1, "c")).contents.value
        type_in(client, "d", (0, 12), (0, 14), "")
        assert brief(client, "d") == []
        edit = client.request("textDocument/rename", {**client.at(0, 1, "c"), "newName": "s"})
        assert [(uri[-1], len(edits)) for uri, edits in edit.changes.items()] == [
            ("b", 1),
            ("c", 1),
            ("d", 1),
        ]
        (mark,) = client.request("textDocument/documentHighlight", client.at(0, 1, "c"))
        assert shown(mark.range) == "0:0-0:5"
        labels = {one.label for one in client.request("textDocument/completion", client.at(2, 0, "c")).items}
        assert {"os", "total", "files", "z"} <= labels
        document = {"textDocument": {"uri": client.uri("b")}}
        (symbol,) = client.request("textDocument/documentSymbol", document)
        assert (symbol.name, shown(symbol.range)) == ("total", "0:0-1:12")
        (fold,) = client.request("textDocument/foldingRange", document)
        assert (fold.start_line, fold.end_line) == (0, 1)
        data = client.request("textDocument/semanticTokens/full", document).data
        assert list(data[:5]) == [0, 4, 5, 2, 1] and len(data) == 15
        selected = {**document, "positions": [{"line": 1, "character": 11}]}
        (around,) = client.request("textDocument/selectionRange", selected)
        while around.parent is not None:
            around = around.parent
        assert shown(around.range) == "0:0-2:0"
        context = {"range": range_of((0, 0), (9, 0)), "context": {"diagnostics": []}}
        actions = client.request(
            "textDocument/codeAction", {"textDocument": {"uri": client.uri("c")}, **context}
        )
        assert [(one.title, *one.edit.changes) for one in actions] == [("Insert ')'", client.uri("c"))]


def test_cells_come_and_go(tmp_path):
    with Client(tmp_path, capabilities=TELLING) as client:
        open_notebook(client, a="from __future__ import annotations\n", b="if x:\n")
        assert (brief(client, "a"), brief(client, "b")) == ([], [("CL302", "0:4-0:5")])
        opened = [item(client, "c", "x = 1\n"), item(client, "d", "# text", "markdown")]
        array = {"start": 0, "deleteCount": 0, "cells": cells_of(client, "cd")}
        change_notebook(client, {"structure": {"array": array, "didOpen": opened}})
        assert brief(client, "c") == [] and [code for code, _ in brief(client, "a")] == ["CL329"]
        array = {"start": 0, "deleteCount": 1}
        gone = [{"uri": client.uri("c")}]
        change_notebook(client, {"structure": {"array": array, "didClose": gone}})
        del client.versions["c"]
        assert brief(client, "a") == brief(client, "c") == []
        for start, count in ((0, 9), (4, 0)):
            change_notebook(client, {"structure": {"array": {"start": start, "deleteCount": count}}})
            assert "has 3 cells" in client.note("window/logMessage").message
        change_notebook(
            client,
            {"structure": {"array": {"start": 0, "deleteCount": 0, "cells": gone and cells_of(client, "e")}}},
        )
        assert "the text of the cell" in client.note("window/logMessage").message
        client.notify(
            "textDocument/didClose", {"textDocument": {"uri": client.uri("a")}}
        )  # no editor does so
        client.notify(
            "notebookDocument/didClose",
            {"notebookDocument": {"uri": client.uri(NOTEBOOK)}, "cellTextDocuments": []},
        )
        del client.versions["b"]
        assert brief(client, "b") == []
        with pytest.raises(Refused, match="isn't open"):
            client.request("textDocument/hover", client.at(0, 0, "a"))
        assert not client.errors


def test_a_client_that_asks_is_made_to_ask_again(tmp_path):
    """What is typed in one cell may be a fault in another one."""
    capabilities = {**ASKING, "workspace": {"diagnostics": {"refreshSupport": True}}}
    with Client(tmp_path, capabilities=capabilities) as client:
        open_notebook(client, a="# 1\n", b="from __future__ import annotations\n")
        type_in(client, "a", (0, 0), (1, 0), "if x:\n    y = [1,\n         2]\nz\n")
        client.note("workspace/diagnostic/refresh")
        (found,) = client.request("textDocument/diagnostic", client.at(0, 0, "b")).items
        assert found.code == "CL329"


PIECES = [
    "x",
    "(",
    ")",
    "'",
    '"""',
    "\n",
    "%m\n",
    "!ls \\\n",
    "é",
    "😀",
    "    ",
    "if x:\n    y = 1\n",
    "%%time\n",
    "?",
]


def test_random_edits_of_cells(tmp_path, seed):
    """After any edits each cell has the problems that the notebook's file would have."""
    chance = random.Random(seed)
    texts = {"a": "x = 1\n%magic\n", "b": "def f(a):\n    return a\n", "c": "", "d": "f(x)"}
    with Client(tmp_path, encodings=["utf-32"], capabilities=ASKING) as client:
        open_notebook(client, **texts)
        for _ in range(150):
            name = chance.choice(list(texts))
            text = texts[name]
            starts = [0, *(match.end() for match in ROW_END.finditer(text))]
            offsets = sorted((chance.randint(0, len(text)), chance.randint(0, len(text))))
            if chance.random() < 0.6:
                offsets[1] = offsets[0]
            places = []
            for offset in offsets:
                row = max(i for i, start in enumerate(starts) if start <= offset)
                places.append((row, offset - starts[row]))
            new = "".join(chance.choices(PIECES, k=chance.randint(0, 3)))
            texts[name] = text[: offsets[0]] + new + text[offsets[1] :]
            type_in(client, name, *places, new)
            found = [
                (number, one.code, one.range.start.line + 1, one.range.start.character + 1)
                for number, cell in enumerate(texts, 1)
                for one in client.request(
                    "textDocument/diagnostic", {"textDocument": {"uri": client.uri(cell)}}
                ).items
            ]
            assert found == problems_of_file(texts), (seed, texts)
        assert not client.errors


def problems_of_file(texts):
    cells = [{"cell_type": "code", "source": f"{text}\n"} for text in texts.values()]
    notebook = Notebook(json.dumps({"cells": cells, "metadata": {}}).encode())
    found = []
    for one in analyze(notebook.text).problems:
        number, row = notebook.place(one.range.row)
        if "outside function" not in one.message:
            found.append((number, one.code, row, one.range.column))
    return found
