"""Write src/text/unicode_ranges.h: which characters make names, and which are letters or numbers.

Run it with the newest Python at hand, since the table is as new as the interpreter's Unicode data:

    python3 tools/make_unicode_ranges.py
"""

import pathlib
import sys
import unicodedata
from collections.abc import Callable

TARGET = pathlib.Path(__file__).parent.parent / "src/text/unicode_ranges.h"
HEADER = """\
// Made by tools/make_unicode_ranges.py from Unicode {version}; don't edit.
// Where the role of characters in names changes: the first code point of a range, shifted left by two, plus
// 0 for no part of a name, 1 for a character that continues names, 2 for one that begins them too.
#pragma once

#include <cstdint>

namespace codeloom {{

// clang-format off
inline constexpr uint32_t kNameRanges[] = {{
{name_rows}
}};

// Where ranges of letters and numbers begin and end, by turns.
inline constexpr uint32_t kAlnumRanges[] = {{
{alnum_rows}
}};
// clang-format on

}}  // namespace codeloom
"""


def name_role(code: int) -> int:
    char = chr(code)
    if char.isidentifier():
        return 2
    return 1 if ("a" + char).isidentifier() else 0


def is_alnum(code: int) -> int:
    return int(chr(code).isalnum())


def make_ranges(role_of: Callable[[int], int]) -> list[tuple[int, int]]:
    """The first code point of each range above ASCII, with the role of its characters."""
    ranges = []
    last_role = 0
    for code in range(0x80, sys.maxunicode + 1):
        role = role_of(code)
        if role != last_role or code == 0x80:
            ranges.append((code, role))
            last_role = role
    return ranges


def rows_of(numbers: list[int]) -> str:
    rows = [numbers[i : i + 12] for i in range(0, len(numbers), 12)]
    return "\n".join("    " + " ".join(f"{number:#x}," for number in row) for row in rows)


def main() -> None:
    names = [code << 2 | role for code, role in make_ranges(name_role)]
    alnums = [code for code, _ in make_ranges(is_alnum)[1:]]
    TARGET.write_text(
        HEADER.format(
            version=unicodedata.unidata_version, name_rows=rows_of(names), alnum_rows=rows_of(alnums)
        )
    )
    print(f"{TARGET}: {len(names)} and {len(alnums)} ranges of Unicode {unicodedata.unidata_version}")


if __name__ == "__main__":
    main()
