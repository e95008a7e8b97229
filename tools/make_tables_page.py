"""Write the tables of docs/tables.md from the columns that an installed build declares.

python tools/make_tables_page.py
"""

import pathlib
import re

from codeloom._analysis import file_columns, table_kinds

PAGE = pathlib.Path(__file__).parent.parent / "docs/tables.md"


def all_tables() -> str:
    """A heading for each table, and its columns."""
    parts = []
    files = ("files", "The sources of a batch, in their order.", file_columns())
    for name, meaning, columns in (*table_kinds(), files):
        rows = [
            f"| `{column}` | {kind}{', may be null' if is_nullable else ''} | {told} |"
            for column, kind, is_nullable, told in columns
        ]
        parts.append(
            "\n".join([f"### {name}", "", meaning, "", "| Column | Type | |", "|---|---|---|", *rows])
        )
    return "\n\n".join(parts)


def with_tables(page: str) -> str:
    """The page with the text between `<!-- tables -->` and `<!-- end -->` replaced."""
    before, after = re.split("<!-- tables -->.*?<!-- end -->", page, maxsplit=1, flags=re.DOTALL)
    return f"{before}<!-- tables -->\n\n{all_tables()}\n\n<!-- end -->{after}"


if __name__ == "__main__":
    PAGE.write_text(with_tables(PAGE.read_text(encoding="utf-8")), encoding="utf-8")
