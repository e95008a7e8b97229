"""Write docs/codes.md from the explanations of an installed build.

python tools/make_codes_page.py
"""

import pathlib
from collections.abc import Iterator

from codeloom.explanations import Example, Explanation, explanations
from codeloom.reading.languages import NEWEST

PAGE = pathlib.Path(__file__).parent.parent / "docs/codes.md"

_PARTS = {
    "1": "Tokens and encoding",
    "2": "Grammar",
    "3": "Blocks and placement",
    "4": "Targets, arguments, parameters and patterns",
    "5": "Scopes",
    "6": "Hints",
    "7": "Versions",
    "9": "Limits",
}
_HEAD = """# Codes of problems

Each problem has a code, which keeps its meaning. `codeloom explain CL301` prints what this page says of one.
The page is made by `tools/make_codes_page.py` from `codeloom/explanations.txt`.
"""


def page() -> str:
    """The whole page."""
    rows = [_HEAD]
    part = ""
    for explanation in explanations().values():
        if explanation.code[2] != part:
            part = explanation.code[2]
            rows.append(f"## {_PARTS[part]}\n")
        rows += _rows_of(explanation)
    return "\n".join(rows)


def _rows_of(explanation: Explanation) -> Iterator[str]:
    yield f"### {explanation.code}: {explanation.title}\n"
    yield f"{explanation.meaning}\n"
    version = "" if explanation.python == NEWEST else f", in Python {explanation.python}"
    yield from _rows_of_example(f"Wrong{version}", explanation.wrong)
    yield from _rows_of_example("Right", explanation.right)


def _rows_of_example(label: str, example: Example) -> Iterator[str]:
    yield f"{label}, made by this expression:\n" if example.is_made else f"{label}:\n"
    yield f"```py\n{example.text}```\n"


if __name__ == "__main__":
    PAGE.write_text(page(), encoding="utf-8")
