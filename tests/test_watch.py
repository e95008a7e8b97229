"""Runs again and again print what a run of its own prints, and read only what has changed."""

import json
import random
import signal
import subprocess
import sys
import threading

from codeloom import Document, analyze, analyze_file
from codeloom.cli.arguments import options_from
from codeloom.cli.run import files_of
from codeloom.cli.source import Source
from codeloom.cli.watch import Watch, change_text

ROWS = [f"def f{i}(a, b=({i}, 2)):\n    return a.b[{i}]\n" for i in range(50)]


def notebook(code):
    return json.dumps({"cells": [{"cell_type": "code", "source": code}]})


# Files that are written before a run; None takes one away.
CHANGES = [
    {"a.py": "".join(ROWS), "b.py": ")\n", "c.ipynb": notebook("x = )\n"), "d/e.py": "é = 'ü'\n"},
    {"a.py": "".join([*ROWS[:20], "x = (\n", *ROWS[20:]])},
    {"a.py": "".join([*ROWS[:20], "x = (1,\n", *ROWS[21:]])},
    {"a.py": "".join(ROWS), "d/e.py": "é = 'ü\n"},
    {"a.py": b"x = '\xff'\ny = )\n"},
    {"a.py": b"# coding: latin-1\nx = '\xe9'\ny = ]\n"},
    {"a.py": "\ufeffx = 1\ry = )\r\nz = 1\n"},
    {"a.py": b"x = 1\0\n", "c.ipynb": notebook("x = 1\n  y = 2\n")},
    {"a.py": "x = )", "c.ipynb": "no notebook"},
    {"a.py": None, "b.py": None},
    {"a.py": "x = ]\n", "new.py": "x = 1\n"},
    {f"{i}.py": f"x{i} = )\n" for i in range(30)},
    {f"{i}.py": f"x{i} = ]\n" for i in range(30)},
    {f"{i}.py": None for i in range(30)},
]


def make(folder, change):
    for name, content in change.items():
        if content is None:
            (folder / name).unlink()
            continue
        (folder / name).parent.mkdir(exist_ok=True)
        made = folder / "made"
        made.write_bytes(content if isinstance(content, bytes) else content.encode())
        made.replace(folder / name)  # at once, so that no half of it is seen


def test_what_it_prints(tmp_path, cli_environment, run_cli):
    """The same as a command without --watch."""
    arguments = ["check", "--format", "jsonl", ".", "b.py"]

    def HeedInterrupts():  # which a shell lets its background jobs ignore
        signal.signal(signal.SIGINT, signal.SIG_DFL)

    make(tmp_path, CHANGES[0])
    process = subprocess.Popen(
        [sys.executable, "-P", "-m", "codeloom", *arguments, "--watch"],
        cwd=tmp_path,
        env=cli_environment,
        stdout=subprocess.PIPE,
        stderr=subprocess.DEVNULL,
        text=True,
        preexec_fn=HeedInterrupts,
    )
    patience = threading.Timer(120, process.kill)
    patience.start()

    def Printed():
        rows = [process.stdout.readline()]
        while json.loads(rows[-1])["type"] != "summary":
            rows.append(process.stdout.readline())
        return "".join(rows)

    try:
        for i, change in enumerate(CHANGES):
            if i > 0:
                make(tmp_path, change)
            expected = run_cli(*arguments).stdout
            while Printed() != expected:  # the first of many changes may be seen alone
                pass
    finally:
        patience.cancel()
        process.send_signal(signal.SIGINT)
        process.communicate(timeout=30)


def test_what_it_reads(write_files, monkeypatch):
    """Only what has changed, and that as a document where few files have."""
    folder = write_files({f"{i:02}.py": f"x = {i}\n" for i in range(30)})
    monkeypatch.chdir(folder)
    options = options_from(["check", "--watch", "."])
    watch = Watch(options)

    def ReadAnew():
        watch.wait()
        found = list(watch.recall(files_of(options)))
        paths = [one for one in found if isinstance(one, str)]
        for path in paths:
            watch.keep(Source(path, analyze_file(path)))
        assert len(found) == 30
        for one in found:
            if isinstance(one, Source):
                assert one.analysis.text == (folder / one.path).read_bytes().decode()
        return len(paths)

    assert ReadAnew() == 30
    for text in ("x = 1\ny = )\n", "x = 1\ny = ()\n", "", "z"):
        make(folder, {"00.py": text, "01.py": f"{text}\r{text}"})
        assert ReadAnew() == 0
    make(folder, {"01.py": b"\xff = 1\n"})
    assert ReadAnew() == 1
    make(folder, {f"{i:02}.py": "y = 1\n" for i in range(30)})
    assert ReadAnew() == 30
    make(folder, {"00.py": "y = 2\n"})
    assert ReadAnew() == 0


def test_texts_by_edits(tmp_path):
    """Texts made of pieces of others, so that they begin and end alike, with all ends of rows."""
    seed = random.randrange(2**32)
    print("seed", seed)
    chance = random.Random(seed)
    pieces = [
        "x = (",
        "\n",
        "\r",
        "\r\n",
        ")",
        "if a:\n",
        "    b\n",
        "'''",
        "é = 1\n",
        "\n\n",
        "def f():\r\n",
        "# c\n",
    ]
    text = ""
    document = Document(text)
    for _ in range(1_000):
        start = chance.randint(0, len(text))
        end = min(len(text), start + chance.choice([0, 0, 1, 5, 30]))
        text = text[:start] + "".join(chance.choices(pieces, k=chance.randint(0, 4))) + text[end:]
        change_text(document, text)
        assert document.text == text
        alone = analyze(text)
        assert list(map(str, document.analysis.problems)) == list(map(str, alone.problems))
        assert [line.range for line in document.analysis.lines] == [line.range for line in alone.lines]
