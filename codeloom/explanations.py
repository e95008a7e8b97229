"""What the codes of problems mean, each with a wrong and a right example.

The text is in explanations.txt:

    == CL301 what it is
    What it means.
    --- wrong
    source that has the problem, and no other
    --- right
    source that says what was meant, and is sound

Where a title ends in `@ 3.7`, the examples are written in that version of Python. An example that is
`made by` is an expression, since the source would be too long to read.
"""

import re
from functools import cache
from pathlib import Path
from typing import NamedTuple

from codeloom.reading.languages import NEWEST


class Example(NamedTuple):
    """Some source."""

    text: str
    """The source, or an expression that makes it."""
    is_made: bool
    """Whether `text` is an expression."""


class Explanation(NamedTuple):
    """What one code means."""

    code: str
    """Such as "CL301"."""
    title: str
    """What is wrong, in a few words."""
    meaning: str
    """One sentence or a few."""
    python: str
    """The version of Python of the examples."""
    wrong: Example
    """It has this problem and no other."""
    right: Example
    """It is sound."""


@cache
def explanations() -> dict[str, Explanation]:
    """All explanations, by their codes and in their order."""
    text = Path(__file__).with_suffix(".txt").read_text("utf-8")
    return {found.code: found for found in map(_parsed, text.removeprefix("== ").split("\n== "))}


def _parsed(entry: str) -> Explanation:
    head, *examples = entry.rstrip("\n").split("\n--- ")
    title, _, meaning = head.partition("\n")
    code, _, title = title.partition(" ")
    title, _, python = title.partition(" @ ")
    wrong, right = map(_example, examples)
    return Explanation(code, title, re.sub(r"\s+", " ", meaning), python or NEWEST, wrong, right)


def _example(section: str) -> Example:
    heading, _, text = section.partition("\n")
    return Example(f"{text}\n", heading.endswith("made by"))
