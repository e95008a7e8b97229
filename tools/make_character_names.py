"""Write src/text/character_name_bits.h: the names that `\\N{...}` may hold, as a Bloom filter.

    python tools/make_character_names.py NAME_ALIASES

`NAME_ALIASES` is the file NameAliases.txt of the Unicode data. Names come from the package unicodedata2 where
it is installed, which is newer than any interpreter's own data, or else from the interpreter. Names never
change, so that a newer table takes all that an older one took.
"""

import pathlib
import sys
from collections.abc import Iterator
from importlib import import_module
from importlib.util import find_spec

unicodedata = import_module("unicodedata2" if find_spec("unicodedata2") else "unicodedata")

TARGET = pathlib.Path(__file__).parent.parent / "src/text/character_name_bits.h"
BIT_COUNT = 1 << 19
PROBE_COUNT = 10
_MASK = (1 << 64) - 1

HEADER = """\
// Made by tools/make_character_names.py from Unicode {version}; don't edit.
// The names of characters as a Bloom filter: {count} names, {probes} bits for each of them.
#pragma once

#include <cstdint>

namespace codeloom {{

inline constexpr uint32_t kNameProbeCount = {probes};

// clang-format off
inline constexpr uint64_t kNameBits[] = {{
{rows}
}};
// clang-format on

}}  // namespace codeloom
"""


def names() -> Iterator[str]:
    """All names but those made of a code point or of the letters of a syllable."""
    for code in range(sys.maxunicode + 1):
        name = unicodedata.name(chr(code), "")
        is_made = name.endswith(f"-{code:04X}") or name.startswith("HANGUL SYLLABLE ")
        if name and not is_made:
            yield name


def aliases(path: pathlib.Path) -> Iterator[str]:
    """The second field of each row of the file."""
    for row in path.read_text("utf-8").splitlines():
        if row and not row.startswith("#"):
            yield row.split(";")[1]


def bits_of(name: str) -> Iterator[int]:
    """The bits that stand for a name, as src/text/character_names.cpp finds them."""
    text_hash = 0xCBF29CE484222325
    for byte in name.encode("ascii"):
        text_hash = ((text_hash ^ byte) * 0x100000001B3) & _MASK
    first, step = text_hash & 0xFFFFFFFF, text_hash >> 32 | 1
    for probe_i in range(PROBE_COUNT):
        yield (first + probe_i * step) % BIT_COUNT


def main() -> None:
    """Write the table."""
    known = {*names(), *aliases(pathlib.Path(sys.argv[1]))}
    words = [0] * (BIT_COUNT // 64)
    for name in known:
        for bit in bits_of(name):
            words[bit // 64] |= 1 << bit % 64
    texts = [f"0x{word:X}u," for word in words]
    rows = "\n".join("    " + " ".join(texts[i : i + 5]) for i in range(0, len(texts), 5))
    TARGET.write_text(
        HEADER.format(version=unicodedata.unidata_version, count=len(known), probes=PROBE_COUNT, rows=rows),
        encoding="utf-8",
    )


if __name__ == "__main__":
    main()
