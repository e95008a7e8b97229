"""Write the tables of docs/records.md from the kinds that an installed build knows.

python tools/make_records_page.py
"""

import pathlib
import re

from codeloom.records import CRecordKind, kRecordKinds

PAGE = pathlib.Path(__file__).parent.parent / "docs/records.md"


def code(text: str) -> str:
    """The text as code within a table."""
    return "`" + text.replace("|", "\\|") + "`"


def written_row(kind: CRecordKind) -> str:
    prefix = "(none)" if kind is kRecordKinds[-1] else code(kind.prefix.decode())
    return f"| {prefix} | {kind.meaning} | {code(kind.source)} | {code(kind.example)} |"


def known_row(kind: CRecordKind) -> str:
    return f"| {code(kind.prefix.decode())} | {kind.meaning} | {code(kind.example)} |"


def tables() -> dict[str, list[str]]:
    return {
        "written": [
            "| Prefix | Meaning | A line | Gives, among others |",
            "|---|---|---|---|",
            *(written_row(kind) for kind in kRecordKinds if kind.source),
        ],
        "known": [
            "| Prefix | Meaning | As a line |",
            "|---|---|---|",
            *(known_row(kind) for kind in kRecordKinds if not kind.source),
        ],
    }


def with_tables(page: str) -> str:
    """The page with the text between `<!-- name -->` and `<!-- end -->` replaced."""
    for name, rows in tables().items():
        block = "\n".join([f"<!-- {name} -->", *rows, "<!-- end -->"])
        pattern = rf"<!-- {name} -->.*?<!-- end -->"
        before, _, after = re.split(f"({pattern})", page, maxsplit=1, flags=re.DOTALL)
        page = before + block + after
    return page


if __name__ == "__main__":
    PAGE.write_text(with_tables(PAGE.read_text(encoding="utf-8")), encoding="utf-8")
