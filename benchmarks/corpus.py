"""The files that everything is measured on: the interpreter's own, which every machine has."""

import shutil
import sysconfig
from itertools import cycle, islice
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


def library() -> list[Path]:
    """The interpreter's own files, and those that are installed."""
    found = sorted(Path(sysconfig.get_path("stdlib")).rglob("*.py"))
    return [path for path in found if "lib2to3/tests/data" not in str(path)]


def copy_library(folder: Path, count: int) -> Path:
    """So many of these files in folders of twenty, again and again where there are fewer."""
    for i, path in enumerate(islice(cycle(library()), count)):
        to = folder / f"{i // 20}" / f"{i:05}.py"
        to.parent.mkdir(parents=True, exist_ok=True)
        shutil.copyfile(path, to)
    return folder


def count_rows(paths: list[str]) -> int:
    """The physical lines of files."""
    return sum(Path(path).read_bytes().count(b"\n") for path in paths)


def text_of(row_count: int) -> bytes:
    """A sound text of about so many rows: one of the files over and over, the last time up to some class."""
    text = Path(files()[0]).parent.joinpath("argparse.py").read_bytes()
    rows = text.count(b"\n")
    last = b"".join(text.splitlines(keepends=True)[: row_count % rows])
    return text * (row_count // rows) + last[: last.rfind(b"\n\n\nclass ") + 1]
