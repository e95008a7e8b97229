"""The files that everything is measured on: the interpreter's own, which every machine has."""

import sysconfig
from pathlib import Path

# What is counted is what the files after these cost: so start-up is left out.
WARM_UP = 20

# The same for the short form.
SHORT = 14
SHORT_WARM_UP = 4


def files() -> list[str]:
    """Every third file, by path, of the library's top level, `asyncio` and `email`."""
    library = Path(sysconfig.get_path("stdlib"))
    found = sorted(path for folder in (".", "asyncio", "email") for path in (library / folder).glob("*.py"))
    return [str(path) for path in found[::3]]


def count_rows(paths: list[str]) -> int:
    """The physical lines of files."""
    return sum(Path(path).read_bytes().count(b"\n") for path in paths)


def text_of(row_count: int) -> bytes:
    """A sound text of about so many rows: one of the files over and over, the last time up to some class."""
    text = Path(files()[0]).parent.joinpath("argparse.py").read_bytes()
    rows = text.count(b"\n")
    last = b"".join(text.splitlines(keepends=True)[: row_count % rows])
    return text * (row_count // rows) + last[: last.rfind(b"\n\n\nclass ") + 1]
