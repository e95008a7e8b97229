"""Write src/neighbours/tokenizer/unicode_ranges.h: which characters make names.

Run it with the newest Python at hand, since the table is as new as the interpreter's Unicode data:

    python3 tools/make_unicode_ranges.py
"""

import pathlib
import sys
import unicodedata

TARGET = pathlib.Path(__file__).parent.parent / "src/neighbours/tokenizer/unicode_ranges.h"
HEADER = """\
// Made by tools/make_unicode_ranges.py from Unicode {version}; don't edit.
// Where the role of characters in names changes: the first code point of a range, shifted left by two, plus
// 0 for no part of a name, 1 for a character that continues names, 2 for one that begins them too.
#pragma once

#include <cstdint>

namespace codeloom {{

// clang-format off
inline constexpr uint32_t kNameRanges[] = {{
{rows}
}};
// clang-format on

}}  // namespace codeloom
"""


def name_role(code: int) -> int:
    char = chr(code)
    if char.isidentifier():
        return 2
    return 1 if ("a" + char).isidentifier() else 0


def make_ranges() -> list[int]:
    """The ranges above ASCII, one number each."""
    ranges = []
    last_role = None
    for code in range(0x80, sys.maxunicode + 1):
        role = name_role(code)
        if role != last_role:
            ranges.append(code << 2 | role)
            last_role = role
    return ranges


def main() -> None:
    ranges = make_ranges()
    rows = [
        "    " + " ".join(f"{number:#x}," for number in ranges[i : i + 12]) for i in range(0, len(ranges), 12)
    ]
    TARGET.write_text(HEADER.format(version=unicodedata.unidata_version, rows="\n".join(rows)))
    print(f"{TARGET}: {len(ranges)} ranges of Unicode {unicodedata.unidata_version}")


if __name__ == "__main__":
    main()
