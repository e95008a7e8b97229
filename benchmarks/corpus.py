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
    """A text of so many rows, of whole functions of one of the files."""
    text = Path(files()[0]).parent.joinpath("argparse.py").read_bytes()
    rows = text.count(b"\n")
    return text * (row_count // rows) + b"".join(text.splitlines(keepends=True)[: row_count % rows])
