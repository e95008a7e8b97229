"""Write docs/mistakes.md: typical mistakes, and what is said of them here and elsewhere.

python tools/make_mistakes_page.py PYTHON RUFF

`PYTHON` is the interpreter to ask, such as python3.13, and `RUFF` the linter. The mistakes are in
tests/problems/mistakes.problems.
"""

import json
import pathlib
import subprocess
import sys
from collections.abc import Iterator

from codeloom import analyze

ROOT = pathlib.Path(__file__).parent.parent
PAGE = ROOT / "docs/mistakes.md"
MISTAKES = ROOT / "tests/problems/mistakes.problems"

_HEAD = """# Typical mistakes

What is said of each mistake by {interpreter}, by {linter} (`check --select E9`) and by codeloom, all of its
problems with their hints. Rows and columns count from 1. The page is made by `tools/make_mistakes_page.py`.
"""
_OURS = "codeloom"

# Prints the row, the column and the message.
_ASK_INTERPRETER = """
import sys
try:
    compile(sys.stdin.buffer.read(), "<mistake>", "exec")
except SyntaxError as error:
    print(f"{error.lineno}:{error.offset} {error.msg}")
"""


def mistakes() -> Iterator[tuple[str, str, str]]:
    """The title, the source and the version of each mistake; none for the newest."""
    for case in MISTAKES.read_text("utf-8").removeprefix("== ").split("\n== "):
        title, *rows = case.rstrip("\n").split("\n")
        title, _, version = title.partition(" @ ")
        yield title, "".join(f"{row[2:]}\n" for row in rows if not row.startswith("!")), version


def of_codeloom(source: str, version: str) -> str:
    """Our problems, one after the other, each with its hint."""
    problems = analyze(source, python=version).problems if version else analyze(source).problems
    said = (
        f"{problem.range.row}:{problem.range.column} {problem.code} {problem.message}"
        + (f" (hint: {problem.hint})" if problem.hint else "")
        for problem in problems
    )
    return "; ".join(said) or "nothing"


def of_interpreter(python: str, source: str) -> str:
    """The interpreter's error."""
    asked = [python, "-W", "ignore", "-c", _ASK_INTERPRETER]
    return _output(asked, source).strip() or "nothing"


def of_ruff(ruff: str, source: str) -> str:
    """The linter's problems, one after the other."""
    version = ["--target-version", "py313"]
    asked = [ruff, "check", "--isolated", "--select", "E9", "--output-format", "json", *version, "-"]
    found = json.loads(_output(asked, source))
    said = (f"{one['location']['row']}:{one['location']['column']} {one['message']}" for one in found)
    return "; ".join(said).replace("\n", " ") or "nothing"


def page(python: str, ruff: str) -> str:
    """The whole page."""
    interpreter = _output([python, "--version"], "").strip()
    linter = _output([ruff, "--version"], "").strip()
    rows = [_HEAD.format(interpreter=interpreter, linter=linter)]
    for number, (title, source, version) in enumerate(mistakes(), 1):
        rows.append(f"## {number}. {title}\n\n```py\n{source}```\n")
        said = {
            interpreter: of_interpreter(python, source),
            linter: of_ruff(ruff, source),
            _OURS: of_codeloom(source, version),
        }
        rows += [f"- {who}: {as_code(what)}" for who, what in said.items()]
        rows.append("")
    return "\n".join(rows)


def of_codeloom_in(text: str) -> list[str]:
    """What the page says that we say."""
    rows = text.splitlines()
    return [row.removeprefix(f"- {_OURS}: ") for row in rows if row.startswith(f"- {_OURS}: ")]


def as_code(text: str) -> str:
    """The text as code within a row."""
    return f"`` {text} ``" if "`" in text else f"`{text}`"


def _output(arguments: list[str], source: str) -> str:
    done = subprocess.run(arguments, input=source.encode(), capture_output=True, check=False)
    return done.stdout.decode()


if __name__ == "__main__":
    PAGE.write_text(page(*sys.argv[1:]), encoding="utf-8")
