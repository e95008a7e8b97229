"""What installed interpreters of other versions say of a text, beside what `analyze` says.

    python tests/interpreters.py                           snippets, golden texts and made-up statements
    python tests/interpreters.py --files                   every file of each interpreter's library
    python tests/interpreters.py --files FOLDER ...        every file below the folders
    python tests/interpreters.py --files --every 5         every fifth file
    python tests/interpreters.py --python 3.8 --python 2.7 with these alone

Interpreters are looked for on the path and among those of pyenv. Every text that one refuses and `analyze`
takes, or the other way round, is printed.
"""

import argparse
import json
import os
import random
import shutil
import subprocess
import sys
from collections.abc import Iterable, Iterator
from contextlib import suppress
from itertools import islice
from pathlib import Path

from problem_rows import cases_of
from sentences import Sentences

from codeloom import VERSIONS, analyze

TESTS = Path(__file__).parent
# A list of texts as JSON, their bytes as characters; verdicts in rows as JSON: null for a text that is taken.
_JUDGE = r"""
import json, sys, warnings
warnings.simplefilter("ignore")
for text in json.load(sys.stdin):
    try:
        compile(text.encode("latin-1"), "<text>", "exec", 0, True)
        verdict = None
    except SyntaxError as error:
        verdict = "%s (row %s)" % (error.msg, error.lineno)
    except ValueError as error:
        verdict = "ValueError: %s" % error
    except Exception:
        verdict = ""
    sys.stdout.write(json.dumps(verdict) + "\n")
    sys.stdout.flush()
"""


def installed() -> dict[str, Path]:
    """The interpreters found, by their versions."""
    pyenv = Path(os.environ.get("PYENV_ROOT", "~/.pyenv")).expanduser() / "versions"
    found = {}
    for version in VERSIONS:
        paths = sorted(pyenv.glob(f"{version}.*/bin/python"))
        on_path = shutil.which(f"python{version}")
        if on_path and "shims" not in Path(on_path).parts:
            paths.append(Path(on_path))
        if paths:
            found[version] = paths[0]
    return found


def verdicts(interpreter: Path, texts: list[bytes], timeout: float = 120.0) -> list[str | None]:
    """Why the interpreter refuses each text; None where it takes it, empty where it gives up or crashes."""
    found: list[str | None] = []
    while len(found) < len(texts):
        batch = json.dumps([text.decode("latin-1") for text in texts[len(found) : len(found) + 500]])
        command = [interpreter, "-S", "-c", _JUDGE]
        run = subprocess.run(command, input=batch.encode(), capture_output=True, timeout=timeout, check=False)
        found += map(json.loads, run.stdout.splitlines())
        if run.returncode != 0:
            found.append("")
    return found


def disagreement(text: bytes, version: str, verdict: str | None) -> str | None:
    """In words how `analyze` and a verdict differ; None where they don't."""
    if verdict == "":
        return None
    problems = [problem for problem in analyze(text, python=version).problems if problem.severity == "error"]
    if verdict is not None and not problems:
        return f"missed: {verdict}"
    if verdict is None and problems:
        return f"falsely reported: {problems[0]}"
    return None


def texts(count: int, seed: int) -> list[str]:
    """Snippets, cases of golden files, and `count` made-up statements of each grammar, each text once."""
    found: dict[str, None] = {}
    for path in sorted((TESTS / "snippets").glob("*.snippets")):
        for row in path.read_text("utf-8").splitlines():
            found[row.replace("\\n", "\n") + "\n"] = None
    for path in sorted((TESTS / "problems").glob("*.problems")):
        for case in cases_of(path):
            found[case.source] = None
    source = random.Random(seed)
    for grammar in ("2.7", "3.8", "3.14"):
        sentences = Sentences(grammar, source)
        for _ in range(count):
            found[sentences.Text()] = None
    return list(found)


def sources(folders: list[Path]) -> Iterator[tuple[str, bytes]]:
    for folder in folders:
        for path in sorted(folder.rglob("*.py")):
            with suppress(OSError):
                yield str(path), path.read_bytes()


def library_of(path: Path, version: str) -> Path:
    return path.resolve().parent.parent / "lib" / f"python{version}"


def disagreements(version: str, path: Path, judged: Iterable[tuple[str, bytes]]) -> Iterator[str | None]:
    """For each text, by its name, what `disagreement` says."""
    rest = iter(judged)
    while some := list(islice(rest, 500)):
        verdicts_of_some = verdicts(path, [text for _, text in some])
        for (name, text), verdict in zip(some, verdicts_of_some, strict=True):
            words = disagreement(text, version, verdict)
            yield f"{version} {name!r}: {words}" if words else None


def main() -> int:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("folders", type=Path, nargs="*")
    parser.add_argument("--files", action="store_true", help="of the folders, or else of the libraries")
    parser.add_argument("--every", type=int, default=1, help="of the files, take one in so many")
    parser.add_argument("--python", action="append", help="a version; all by default")
    parser.add_argument("--count", type=int, default=1000, help="of made-up statements of each grammar")
    parser.add_argument("--seed", type=int, default=random.randrange(1 << 30))
    options = parser.parse_args()
    total = 0
    for version, path in installed().items():
        if options.python and version not in options.python:
            continue
        judged: Iterable[tuple[str, bytes]]
        if options.files:
            judged = islice(sources(options.folders or [library_of(path, version)]), 0, None, options.every)
        else:
            judged = ((text, text.encode()) for text in texts(options.count, options.seed))
        found = list(disagreements(version, path, judged))
        differing = list(filter(None, found))
        print(*differing, sep="\n", end="\n" if differing else "")
        print(f"{version}: {len(found)} texts, {len(differing)} disagreements (seed {options.seed})")
        total += len(differing)
    return 1 if total else 0


if __name__ == "__main__":
    sys.exit(main())
