"""What codeloom and its peers find in the same broken texts.

    python tests/compare_peers.py [--cases 500] [--seed 1]

Two sets of texts: files of the interpreter's library, each broken by one edit, and the texts that the
interpreter's own test suite expects to be refused. Every tool reads them as the version of Python that runs
this. It prints the table of docs/comparison.md. Peers that aren't installed are left out:
`pip install --group benchmark` installs them.
"""

import argparse
import contextlib
import importlib.util
import json
import shutil
import subprocess
import sys
import tempfile
import warnings
from collections.abc import Callable
from pathlib import Path

from edits import PYTHON, outcomes
from refused_texts import Collect

from codeloom import analyze

# The rows, from one, that a tool reports for each text.
Tool = Callable[[list[str]], list[list[int]]]


def for_each(rows_of: Callable[[str], list[int]]) -> Tool:
    """A tool that takes one text after the other; where it fails, it has found nothing."""

    def rows_of_all(texts: list[str]) -> list[list[int]]:
        found: list[list[int]] = []
        for text in texts:
            try:
                found.append(sorted(set(rows_of(text))))
            except Exception as error:
                print(f"{rows_of.__qualname__}: {error!r}", file=sys.stderr)
                found.append([])
        return found

    return rows_of_all


def of_codeloom(text: str) -> list[int]:
    return [problem.range.row for problem in analyze(text, python=PYTHON).problems]


def of_interpreter(text: str) -> list[int]:
    try:
        with warnings.catch_warnings():
            warnings.simplefilter("ignore")
            compile(text, "<text>", "exec", dont_inherit=True)
    except SyntaxError as error:
        return [error.lineno or 1]
    except (ValueError, MemoryError, RecursionError):
        return [1]
    return []


def of_ruff(texts: list[str]) -> list[list[int]]:
    """All texts in one run, each as a file of its own."""
    with tempfile.TemporaryDirectory() as folder:
        for i, text in enumerate(texts):
            (Path(folder) / f"{i}.py").write_bytes(text.encode("utf-8", "surrogatepass"))
        options = ["--isolated", "--no-cache", "--select", "E9", "--output-format", "json", "--exit-zero"]
        target = f"--target-version=py{PYTHON.replace('.', '')}"
        done = subprocess.run(
            [ruff(), "check", *options, target, folder], capture_output=True, text=True, check=True
        )
    rows: list[set[int]] = [set() for _ in texts]
    for found in json.loads(done.stdout):
        rows[int(Path(found["filename"]).stem)].add(found["location"]["row"])
    return [sorted(each) for each in rows]


def ruff() -> str | None:
    beside = Path(sys.executable).with_name("ruff")
    return str(beside) if beside.exists() else shutil.which("ruff")


def parso() -> Callable[[str], list[int]]:
    import parso

    grammar = parso.load_grammar(version=PYTHON)

    def rows_of(text: str) -> list[int]:
        return [issue.start_pos[0] for issue in grammar.iter_errors(grammar.parse(text))]

    return rows_of


def tree_sitter() -> Callable[[str], list[int]]:
    import tree_sitter
    import tree_sitter_python

    parser = tree_sitter.Parser(tree_sitter.Language(tree_sitter_python.language()))

    def rows_of(text: str) -> list[int]:
        """Of the outermost nodes that are errors or missing."""
        rows, pending = [], [parser.parse(text.encode("utf-8", "replace")).root_node]
        while pending:
            node = pending.pop()
            if node.is_error or node.is_missing:
                rows.append(node.start_point.row + 1)
            elif node.has_error:
                pending += node.children
        return rows

    return rows_of


def libcst() -> Callable[[str], list[int]]:
    import libcst

    def rows_of(text: str) -> list[int]:
        try:
            libcst.parse_module(text)
        except libcst.ParserSyntaxError as error:
            return [error.raw_line]
        except libcst.CSTValidationError:  # it names no row
            return [1]
        return []

    return rows_of


def tools() -> dict[str, Tool]:
    found = {"codeloom": for_each(of_codeloom), "the interpreter": for_each(of_interpreter)}
    if ruff():
        found["ruff check --select E9"] = of_ruff
    for name, module, make in (
        ("parso", "parso", parso),
        ("tree-sitter", "tree_sitter_python", tree_sitter),
        ("libcst", "libcst", libcst),
    ):
        if importlib.util.find_spec(module):
            found[name] = for_each(make())
    return found


def main() -> None:
    parser = argparse.ArgumentParser(description=(__doc__ or "").partition("\n")[0])
    parser.add_argument("--cases", type=int, default=500)
    parser.add_argument("--seed", type=int, default=1)
    options = parser.parse_args()
    broken = list(outcomes(options.cases, options.seed))
    with tempfile.TemporaryDirectory() as folder, contextlib.chdir(folder):  # the suite writes files
        refused = [one.text for one in Collect()]
    print(f"Python {PYTHON}, {len(broken)} files broken by one edit (seed {options.seed}),")
    print(f"{len(refused)} texts that the interpreter's test suite expects to be refused\n")
    print("| | broken files found | one row, the right one | rows reported for each | refused texts found |")
    print("| --- | --- | --- | --- | --- |")
    for name, tool in tools().items():
        rows = tool([one.edit.text for one in broken])
        found = sum(map(bool, rows)) / len(broken)
        right = [
            len(each) == 1 and each[0] in one.edit.right_rows for each, one in zip(rows, broken, strict=True)
        ]
        mean = sum(map(len, rows)) / max(1, sum(map(bool, rows)))
        of_refused = sum(map(bool, tool(refused))) / len(refused)
        print(f"| {name} | {found:.1%} | {sum(right) / len(broken):.1%} | {mean:.1f} | {of_refused:.1%} |")


if __name__ == "__main__":
    main()
