"""The language server among messages of all kinds: whatever comes, what is open says what its text says."""

import copy
import json
import random

from language_client import PULL, Client, range_of, shown

import codeloom
from codeloom.rows import ROW_END, RowTexts

PIECES = [
    "x",
    "(",
    ")",
    "[",
    "'",
    '"""',
    "\n",
    "\r\n",
    "é",
    "😀",
    " ",
    "def f(a):\n    return a\n",
    ":",
    "#",
    "",
]
POSITIONED = (
    *("hover", "definition", "references", "documentHighlight", "prepareRename", "rename", "completion"),
    *("semanticTokens/range", "codeAction", "selectionRange"),
)
WHOLE = ("documentSymbol", "foldingRange", "semanticTokens/full", "semanticTokens/full/delta", "diagnostic")
OTHERS = (
    *("workspace/didChangeConfiguration", "workspace/didChangeWatchedFiles", "workspace/diagnostic"),
    *("workspace/didChangeWorkspaceFolders", "notebookDocument/didOpen", "notebookDocument/didChange"),
    *("$/cancelRequest", "$/setTrace", "workspace/executeCommand", "window/workDoneProgress/cancel"),
)
JUNK = (
    None,
    True,
    -1,
    7,
    1.5,
    1 << 31,
    1 << 70,
    "",
    "x",
    "\0",
    "\ud800",
    [],
    [[]],
    {},
    {"uri": 3},
    "é😀" * 50,
)


class Editor:
    """A text as the client has it, and the messages about it."""

    def __init__(self, chance):
        self.chance = chance
        self.text = "def f(a):\r\n    return a\nx = 'é'\n\nclass A:\n    y = f(x)\n"

    def edit(self):
        """Change the text: start and end in characters, and what comes there."""
        starts = [0, *(match.end() for match in ROW_END.finditer(self.text))]
        rows = RowTexts(self.text)
        first = self.chance.randrange(len(rows))
        last = min(first + self.chance.choice((0, 0, 0, 1, 2)), len(rows) - 1)
        places = sorted((row, self.chance.randint(0, len(rows[row]))) for row in (first, last))
        new = "".join(self.chance.choices(PIECES, k=self.chance.randint(0, 3)))
        start, end = (starts[row] + column for row, column in places)
        self.text = self.text[:start] + new + self.text[end:]
        return (*places, new)

    def message(self, document):
        """A request or a notification about a document, as an editor sends them."""
        position = {"line": self.chance.randrange(8), "character": self.chance.randrange(12)}
        params = {
            **document,
            "position": position,
            "positions": [position],
            "range": range_of((0, 0), (self.chance.randrange(9), 0)),
            "newName": "renamed",
            "previousResultId": str(self.chance.randrange(99)),
            "context": {"includeDeclaration": True, "diagnostics": []},
        }
        method = self.chance.choice((*POSITIONED, *WHOLE, *OTHERS))
        if method not in OTHERS:
            method = f"textDocument/{method}"
        message = {"jsonrpc": "2.0", "method": method, "params": params}
        if self.chance.random() < 0.8:
            message["id"] = self.chance.choice((f"odd{self.chance.randrange(99)}", 1 << 40))
        return message

    def broken_edit(self, document):
        """A change that no text can have."""
        place = self.chance.choice(
            (range_of((0, 3), (0, 1)), range_of((1 << 20, 0), (1 << 20, 1)), {}, None, 3)
        )
        change = {"range": place, "text": "lost"} if place is not None else {"text": None}
        changes = self.chance.choice(([change], [{}], None, "text", [None], {"text": "lost"}))
        return {
            "jsonrpc": "2.0",
            "method": "textDocument/didChange",
            "params": {"textDocument": {**document["textDocument"], "version": 3}, "contentChanges": changes},
        }

    def spoilt(self, message):
        """A message in which something is another thing, or missing."""
        message = copy.deepcopy(message)
        for _ in range(self.chance.randint(1, 3)):
            parts = list(_parts(message))
            owner, key = self.chance.choice(parts)
            if self.chance.random() < 0.3:
                del owner[key]
            else:
                owner[key] = copy.deepcopy(self.chance.choice(JUNK))
            if not message:
                break
        return message


def _parts(value):
    """Each part of a message, as what holds it and its key there."""
    for key in list(value) if isinstance(value, dict) else range(len(value)):
        yield value, key
        if isinstance(value[key], dict | list):
            yield from _parts(value[key])


def send_odd(client, editor, document):
    """Something that no editor should send; it must leave the text as it is."""
    chance = editor.chance
    kind = chance.random()
    if kind < 0.2:
        message = editor.broken_edit(document)
    elif kind < 0.4:
        message = editor.message(document)
    else:
        message = editor.spoilt(editor.message(document))
    body = json.dumps(message).encode()
    if kind > 0.9:
        i = chance.randrange(len(body))
        body = body[:i] + bytes(chance.choices(range(256), k=chance.randint(0, 2))) + body[i + 1 :]
    client.write(body)


def said(client, document):
    """What the server says of a text."""
    outline = client.request("textDocument/documentSymbol", document)
    folds = client.request("textDocument/foldingRange", document)
    tokens = client.request("textDocument/semanticTokens/full", document)
    found = client.request("textDocument/diagnostic", document).items
    return outline, folds, list(tokens.data), [(one.code, one.message, shown(one.range)) for one in found]


def test_odd_messages_among_real_ones(tmp_path, seed):
    """After any of them the server says of the text what it says of the same text that is opened anew."""
    chance = random.Random(seed)
    editor = Editor(chance)
    with Client(tmp_path, encodings=["utf-32"], capabilities=PULL) as client:
        document = client.open(editor.text)
        for number in range(40):
            for _ in range(chance.randint(0, 6)):
                send_odd(client, editor, document)
            for _ in range(chance.randint(1, 3)):
                client.change(editor.edit())
            fresh = client.open(editor.text, "fresh.py")
            now = said(client, document)
            assert now == said(client, fresh), (seed, number, editor.text)
            problems = codeloom.analyze(editor.text).problems
            assert [code for code, *_ in now[-1]] == [one.code for one in problems], (seed, number)
            client.notify("textDocument/didClose", fresh)
        assert client.process.poll() is None
        assert not client.errors, seed


def test_deltas_of_semantic_tokens(tmp_path, seed):
    """Whoever takes each delta has what the whole answer says."""
    editor = Editor(random.Random(seed))
    with Client(tmp_path, encodings=["utf-32"]) as client:
        document = client.open(editor.text)
        first = client.request("textDocument/semanticTokens/full", document)
        data, known = list(first.data), first.result_id
        for _ in range(60):
            client.change(*(editor.edit() for _ in range(editor.chance.randint(1, 3))))
            delta = client.request(
                "textDocument/semanticTokens/full/delta", {**document, "previousResultId": known}
            )
            for edit in delta.edits:
                data[edit.start : edit.start + edit.delete_count] = edit.data or ()
            known = delta.result_id
            fresh = client.open(editor.text, "fresh.py")
            assert data == list(client.request("textDocument/semanticTokens/full", fresh).data), (
                seed,
                editor.text,
            )
