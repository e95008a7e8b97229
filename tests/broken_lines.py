"""Breaks single lines of sound files at random and sees whether exactly those lines are reported.

One token of one logical line is deleted, doubled or replaced by another of the file. The broken line
alone is judged by the interpreter: what it still accepts, or refuses only after its grammar, doesn't
count. Run it for a measurement; tests/test_broken_lines.py holds the goal.

    python tests/broken_lines.py [--analyzer older|newer] [--cases N] [--seed N] [--show]
"""

import argparse
import ast
import io
import random
import sysconfig
import warnings
from contextlib import redirect_stdout
from dataclasses import dataclass
from pathlib import Path

from codeloom.logicalline import kComment
from codeloom.treesift import CNewerAnalyzer, CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

ANALYZERS = {"older": CPGenAnalyzerImpl((3, 8, 0)), "newer": CNewerAnalyzer((3, 11, 0))}

# What the interpreter says of code that its grammar holds and that it refuses afterwards.
AFTER_THE_GRAMMAR = (
    "cannot assign",
    "cannot delete",
    "cannot use",
    "cannot mix",
    "illegal",
    "only single target",
    "positional ",
    "keyword argument",
    "non-default",
    "duplicate",
    "named arguments",
    "Generator expression",
    "f-string",
    "bytes can only",
    "assignment",
    "did you forget",
    "unicode error",
    "(unicode error)",
    "'return'",
    "expression cannot",
    "expression must",
    "starred",
    "* argument",
    "var-",
    "/ ",
    "* ",
    "bare *",
    "parameter",
    "Did you mean print",
    "Missing parentheses in call to",
)


@dataclass(frozen=True)
class Case:
    """One broken line: where it stands, what was done, and the errors that were found."""

    path: Path
    first_row: int
    end_row: int
    deed: str
    source: str
    errors: list[tuple[int, str]]

    def IsExact(self) -> bool:
        """True when every error lies in the broken line, and there is one."""
        return bool(self.errors) and all(self.first_row <= row < self.end_row for row, _ in self.errors)


def SoundFiles() -> list[Path]:
    """The files of the interpreter's library."""
    library = Path(sysconfig.get_path("stdlib"))
    return [path for path in sorted(library.rglob("*.py")) if "site-packages" not in path.parts]


def Errors(text: str, analyzer: CPGenAnalyzerImpl) -> list[tuple[int, str]]:
    """The row in the file and the text of every broken logical line."""
    errors = []
    with redirect_stdout(io.StringIO()):
        for logical in GetLogicalsFromText(text):
            error = analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)
            if error is not None:
                errors.append((logical.fFirstLine + error.lineno - 1, error.text))
    return errors


def IsBroken(line: str) -> bool:
    """True when the interpreter's grammar refuses a line, completed to a statement of its own."""
    line = line.strip()
    word = line.split(None, 1)[0] if line else ""
    before, behind = "", ""
    if word.startswith("elif"):
        line = line[2:]
    elif word.startswith("else"):
        before = "if 0: pass\n"
    elif word.startswith(("except", "finally")):
        before = "try: pass\n"
    elif word.startswith("try"):
        behind = "\nfinally: pass"
    elif word == "case":
        before = "match x:\n "
    elif word.startswith("@"):
        behind = "\ndef function(): pass"
    if line.endswith(":"):
        line += " pass"
    try:
        with warnings.catch_warnings():
            warnings.simplefilter("ignore")
            ast.parse(before + line + behind + "\n")
    except SyntaxError as error:
        return not str(error.msg).startswith(AFTER_THE_GRAMMAR)
    except ValueError:
        return True
    return False


class Breaker:
    """Breaks lines of one sound file."""

    def __init__(
        self, path: Path, text: str, random_source: random.Random, analyzer: CPGenAnalyzerImpl
    ) -> None:
        self.analyzer = analyzer
        self.path = path
        self.random = random_source
        self.data = text.encode()
        self.row_starts = [0]
        for row in self.data.splitlines(keepends=True):
            self.row_starts.append(self.row_starts[-1] + len(row))
        self.logicals = [logical for logical in GetLogicalsFromText(text) if logical.fType != kComment]
        self.words = [token for logical in self.logicals for token in logical.fToks if token[0] not in "#\\"]

    def Break(self) -> Case | None:
        """A case, or None when what was done broke nothing."""
        logical = self.random.choice(self.logicals)
        token_i = self.random.choice([i for i, token in enumerate(logical.fToks) if token[0] not in "#\\"])
        token = logical.fToks[token_i]
        deed = self.random.choice(["delete", "double", "replace"])
        new = {"delete": "", "double": f"{token} {token}", "replace": self.random.choice(self.words)}[deed]
        if new == token:
            return None
        start, end = self._Bytes(logical, token_i)
        line_start, line_end = self._Bytes(logical, 0)[0], self._Bytes(logical, -1)[1]
        new_bytes = f" {new} ".encode()
        line = self.data[line_start:start] + new_bytes + self.data[end:line_end]
        if not IsBroken(line.decode()):
            return None
        text = (self.data[:start] + new_bytes + self.data[end:]).decode()
        end_row = logical.fFirstLine + line.count(b"\n") + 1
        return Case(self.path, logical.fFirstLine, end_row, deed, line.decode(), Errors(text, self.analyzer))

    def _Bytes(self, logical, token_i: int) -> tuple[int, int]:
        row, col = logical.fPositions[token_i]
        start = self.row_starts[logical.fFirstLine + row] + col
        return start, start + len(logical.fToks[token_i].encode())


def Cases(count: int, seed: int, analyzer: CPGenAnalyzerImpl = ANALYZERS["newer"]) -> list[Case]:
    """`count` broken lines of random sound files."""
    random_source = random.Random(seed)
    files = SoundFiles()
    cases: list[Case] = []
    while len(cases) < count:
        path = random_source.choice(files)
        try:
            text = path.read_text("utf-8")
            ast.parse(text)
        except (SyntaxError, ValueError):
            continue
        if not text.strip() or "\f" in text or len(text) > 200_000 or Errors(text, analyzer):
            continue
        breaker = Breaker(path, text, random_source, analyzer)
        if breaker.logicals:
            cases += [case for _ in range(10) if (case := breaker.Break()) is not None]
    return cases[:count]


def main() -> None:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--cases", type=int, default=500)
    parser.add_argument("--analyzer", choices=ANALYZERS, default="newer")
    parser.add_argument("--seed", type=int, default=random.randrange(1 << 30))
    parser.add_argument("--show", action="store_true", help="print the lines that were missed")
    options = parser.parse_args()
    cases = Cases(options.cases, options.seed, ANALYZERS[options.analyzer])
    missed = [case for case in cases if not case.IsExact()]
    if options.show:
        for case in missed:
            print(f"-- {case.deed}, rows {case.first_row} to {case.end_row} of {case.path}")
            print(case.source)
            print("   errors:", case.errors)
    print(f"seed {options.seed}: {len(cases) - len(missed)} of {len(cases)} exact")


if __name__ == "__main__":
    main()
