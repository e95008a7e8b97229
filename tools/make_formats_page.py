"""Write the tables of docs/formats.md from the schema of reports.

python tools/make_formats_page.py
"""

import json
import pathlib
import re
from typing import Any

ROOT = pathlib.Path(__file__).parent.parent
PAGE = ROOT / "docs/formats.md"
SCHEMA = ROOT / "codeloom/cli/formats/report-1.schema.json"
_OBJECTS = re.compile(r"<!-- fields of (?P<name>\w+) -->\n.*?<!-- end -->", re.DOTALL)


def with_tables(page: str) -> str:
    """The page with the text between `<!-- fields of NAME -->` and `<!-- end -->` replaced."""
    definitions: dict[str, Any] = json.loads(SCHEMA.read_text("utf-8"))["$defs"]

    def table(match: re.Match[str]) -> str:
        name = match["name"]
        rows = ["| Field | Type | |", "| --- | --- | --- |", *fields_of(definitions[name])]
        return "\n".join([f"<!-- fields of {name} -->", "", *rows, "", "<!-- end -->"])

    return _OBJECTS.sub(table, page)


def fields_of(definition: dict[str, Any]) -> list[str]:
    """A row for each field of an object, those of lists of objects after a dot."""
    rows = []
    if definition.get("$ref") == "#/$defs/place_in_file":
        rows.append("| path and place | | [as below](#paths-and-places) |")
    for name, field in definition["properties"].items():
        rows.append(f"| `{name}` | {type_of(field)} | {field.get('description', '')} |")
        items = field.get("items", {})
        if "properties" in items:
            rows += [row.replace("| `", f"| `{name}.", 1) for row in fields_of(items)]
    return rows


def type_of(field: dict[str, Any]) -> str:
    """The type of a field in words."""
    if "const" in field:
        return f"`{json.dumps(field['const'])}`"
    if "enum" in field:
        return " or ".join(f"`{json.dumps(value)}`" for value in field["enum"])
    if "anyOf" in field:
        return " or ".join(map(type_of, reversed(field["anyOf"])))
    if "$ref" in field:
        name = field["$ref"].rpartition("/")[2]
        return {"number": "number from 1", "count": "number from 0"}.get(name, f"[{name}](#{name})")
    kind = field["type"]
    if kind == "array" or (isinstance(kind, list) and "array" in kind):
        item = field.get("items", {})
        of = "objects" if "properties" in item else f"{type_of(item)}s" if item else "numbers"
        return f"array of {of}" + (" or null" if isinstance(kind, list) else "")
    if kind == "object":
        return "object of counts by code"
    return " or ".join(kind) if isinstance(kind, list) else str(kind)


if __name__ == "__main__":
    PAGE.write_text(with_tables(PAGE.read_text("utf-8")), "utf-8")
