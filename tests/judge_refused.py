"""How many of the texts that an interpreter refuses are found, on its row, and with its cause.

    python tests/judge_refused.py                          by the interpreter that runs this
    python tests/judge_refused.py --interpreter PATH       by another one
    python tests/judge_refused.py --show cause             with the texts that fall short, by their words

Found: there is a problem. Row: one on the row that the interpreter names. Cause: one that says the same in
the same words, or in words that `SAME_CAUSE` takes for the same.
"""

import argparse
import json
import re
import subprocess
import sys
from collections import Counter, defaultdict
from collections.abc import Iterable, Iterator
from pathlib import Path
from typing import NamedTuple

from refused_texts import Refused

from codeloom import Problem, analyze

# What the interpreter says, and what says as much. Both are patterns; {} is a group of the first one.
SAME_CAUSE: list[tuple[str, str]] = [
    # It names no cause: whatever is found says more.
    (r"(?:f-string: )?invalid syntax", r".+"),
    (r"(expected an indented block after .+) on line \d+", r"{}"),
    (r"(closing parenthesis '.' does not match opening parenthesis '.') on line \d+", r"{}"),
    (r"asynchronous comprehension outside of an asynchronous function", r"'await' outside async function"),
    (r"'yield from' outside function", r"'yield' outside function"),
    (r"multiple exception types must be parenthesized", r"an `except` of several types .+ needs Python 3.14"),
    (r"leading zeros in decimal .+", r"an octal number without `0o` ended with Python 2"),
    (r"\(unicode error\) .+ position \d+-\d+: (.+)", r"{}"),
    (r"\(value error\) (invalid \\x escape) at position \d+", r"{}"),
    (r".+ unpacking cannot be used in .*comprehension", r"unpacking in a comprehension needs Python 3.15"),
    # As fields were read before 3.12.
    (r"f-string: expecting '}'", r"f-string: (expecting .+|unmatched .+|invalid conversion .+)"),
    (r"f-string: expression required before '(.)'", r"f-string: valid expression required before '{}'"),
    (r"f-string: empty expression not allowed", r"f-string: valid expression required before '}}'"),
    (r"f-string: invalid conversion character: .+", r"f-string: .*conversion.*"),
    (r"f-string: (closing parenthesis .+|invalid syntax\. .+|cannot .+)", r"{}"),
    (r"f-string: unterminated string", r"unterminated string literal"),
    (r"f-string expression part cannot include '#'", r"'{{' was never closed"),
    (r"f-string expression part cannot include a backslash", r".+ after line continuation character"),
    (r"'(.+ expression)' can not be used within an annotation", r"{} cannot be used within an annotation"),
    (r"unexpected EOF while parsing", r"unexpected end of file after a backslash"),
    (r"assignment to yield expression not possible", r"'yield' is a keyword and can't be used as a name"),
    (r"f-string: expecting '=', .+", r"'.' has no meaning in Python"),
    (
        r"f-string: conversion type must come right after the exclamanation mark",
        r".+ after the exclamation mark",
    ),
]

MEASURES = ("found", "row", "cause")


class Judged(NamedTuple):
    """A refused text with our problems, and how we do by each measure."""

    refused: Refused
    problems: list[Problem]
    found: bool
    row: bool
    cause: bool


def refused_texts(interpreter: str) -> list[Refused]:
    """The texts that an interpreter refuses."""
    script = Path(__file__).parent / "refused_texts.py"
    done = subprocess.run([interpreter, script], capture_output=True, check=True, text=True)
    return [Refused(**json.loads(row)) for row in done.stdout.splitlines() if row.startswith("{")]


def judge(refused: Refused, version: str) -> Judged:
    """Our problems of a text, held against the interpreter's words."""
    problems = list(analyze(refused.text, python=version).problems)
    last_row = refused.text.rstrip("\n").count("\n") + 1
    rows = {min(problem.range.row, last_row) for problem in problems}
    return Judged(
        refused,
        problems,
        bool(problems),
        bool(problems) and (refused.row is None or min(refused.row, last_row) in rows),
        any(is_same_cause(refused.message, problem.message) for problem in problems),
    )


def is_same_cause(theirs: str, ours: str) -> bool:
    """Whether both messages name the same cause."""
    theirs = re.sub(r" \(detected at line \d+\)", "", theirs)
    return ours == theirs or any(
        (said := re.fullmatch(pattern, theirs))
        and re.fullmatch(same.format(*map(re.escape, said.groups())), ours)
        for pattern, same in SAME_CAUSE
    )


def rows_of_shortfalls(judged: Iterable[Judged], measure: str) -> Iterator[str]:
    """The texts that fall short by a measure, by the interpreter's words."""
    by_words = defaultdict(list)
    for text in judged:
        if not getattr(text, measure):
            by_words[text.refused.message].append(text)
    for message, texts in sorted(by_words.items(), key=lambda item: -len(item[1])):
        yield f"{len(texts):4} {message}"
        for text in texts:
            said = Counter(f"{problem.range.row} {problem.message}" for problem in text.problems)
            yield f"       {text.refused.text!r:.200} row {text.refused.row}: {', '.join(said) or '-'}"


def main() -> None:
    """Print the counts, and what falls short."""
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--interpreter", default=sys.executable)
    parser.add_argument("--texts", type=Path, help="what refused_texts.py has printed")
    parser.add_argument("--show", choices=MEASURES)
    options = parser.parse_args()
    if options.texts:
        texts = [Refused(**json.loads(row)) for row in options.texts.read_text("utf-8").splitlines()]
    else:
        texts = refused_texts(options.interpreter)
    asked = [options.interpreter, "-c", "import sys; print('%d.%d' % sys.version_info[:2])"]
    version = subprocess.run(asked, capture_output=True, check=True, text=True).stdout.strip()
    judged = [judge(refused, version) for refused in texts]
    if options.show:
        print("\n".join(rows_of_shortfalls(judged, options.show)))
    print(f"{len(judged)} texts that {version} refuses")
    for measure in MEASURES:
        count = sum(getattr(text, measure) for text in judged)
        print(f"{measure:6} {count:5} {count / len(judged):7.1%}")


if __name__ == "__main__":
    main()
