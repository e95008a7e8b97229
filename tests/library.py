"""The interpreter's own library, which every machine has, as texts to try things on."""

import random
import sysconfig
from collections.abc import Iterator
from pathlib import Path


def library_files() -> list[Path]:
    """Its Python files, in one order, without the packages that are installed beside it."""
    library = Path(sysconfig.get_path("stdlib"))
    return [path for path in sorted(library.rglob("*.py")) if "site-packages" not in path.parts]


def plain_texts(chance: random.Random, most: int) -> Iterator[tuple[Path, str]]:
    """Random files without end: ASCII, without odd characters, at most so many bytes long."""
    paths = library_files()
    while True:
        path = chance.choice(paths)
        try:
            text = path.read_text("utf-8")
        except ValueError:
            continue
        if text.isascii() and not set("\f\r\0") & set(text) and 200 < len(text) < most:
            yield path, text
