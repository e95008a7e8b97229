"""Feeds odd text to the tokenizer and the analyzer. Run with `make fuzz`.

Whatever the text says, analysis ends, swallows no exception, loses no character, and leaves the
next line sound. A failure prints the seed and the text.
"""

import argparse
import io
import random
import re
import sys
import sysconfig
import time
from contextlib import redirect_stdout
from pathlib import Path

from codeloom import treesift
from codeloom.treesift import CNewerAnalyzer, CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

PIECES = [
    "\n",
    "",
    "",
    "",
    "def",
    "f",
    "(",
    ")",
    ":",
    "\n",
    "\n\t",
    "class",
    "x",
    "=",
    "1",
    ",",
    "*",
    "**",
    "->",
    "lambda",
    "[",
    "]",
    "{",
    "}",
    "if",
    "else",
    "elif",
    "for",
    "in",
    "while",
    "try",
    "except",
    "finally",
    "with",
    "as\n",
    "",
    "",
    "",
    "async",
    "await",
    "yield",
    "from",
    "import",
    ".",
    "...",
    "@",
    ";",
    "\\",
    "\\\n",
    "#",
    "type:",
    "int\n",
    "#",
    "x\n",
    '"a"',
    "'b'",
    '"""',
    "'''",
    'f"{x!r:>{y}}"',
    "f'{",
    'f"{"',
    "}}",
    "!\n",
    "",
    "",
    "",
    "rb''",
    'ur""',
    "0777",
    "10L",
    "1_0",
    "0x",
    "1e5j",
    "1.",
    ".5",
    "é",
    "́",
    "�",
    "\x00",
    "\x0c",
    "\r",
    "\r\n",
    "\ufeff",
    "`",
    "<>",
    "!=",
    "~",
    "match",
    "case",
    "type",
    "print",
    "_",
    "T:",
    ":=",
    "//=\n",
]


# In the engine's own trees three dots are no expression, and what wants one refuses them.
_REFUSED_DOTS = re.compile(r"CExpression.*logical tokens: .*\.\.\.", re.DOTALL)


class Fuzzer:
    """Makes texts, and checks what becomes of them."""

    def __init__(self, seed: int) -> None:
        self.random = random.Random(seed)
        library = Path(sysconfig.get_path("stdlib"))
        self.files = [path for path in sorted(library.rglob("*.py")) if "site-packages" not in path.parts]
        self.analyzers = [
            CNewerAnalyzer((3, 11, 0)),
            CNewerAnalyzer((3, 14, 0)),
            CPGenAnalyzerImpl((3, 11, 0)),
            CPGenAnalyzerImpl((3, 5, 0)),
            CPGenAnalyzerImpl((2, 7, 18), "Python-Grammar-2.7", ["print", "exec", "if"], False),
        ]

    def Text(self) -> str:
        """Pieces in any order, or a part of a real file with pieces strewn in."""
        pieces = self.random.choices(PIECES, k=self.random.randrange(1, 60))
        if self.random.random() < 0.4:
            return self.random.choice(["", " "]).join(pieces)
        text = self.random.choice(self.files).read_text("utf-8", "replace")
        start = self.random.randrange(len(text) + 1)
        text = text[start : start + self.random.randrange(2000)]
        for piece in pieces[:5]:
            at = self.random.randrange(len(text) + 1)
            text = text[:at] + piece + text[at + self.random.randrange(3) :]
        return text

    def Check(self, text: str) -> None:
        """Raise AssertionError when something is wrong."""
        logicals = GetLogicalsFromText(text)
        kept = "".join(token for logical in logicals for token in logical.fToks)
        assert _Solid(kept) == _Solid(text), "characters were lost"
        self.analyzer = analyzer = self.random.choice(self.analyzers)
        for logical in logicals:
            error = analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)
            assert error is None or 1 <= error.lineno <= text.count("\n") + text.count("\r") + 1
        (sound,) = GetLogicalsFromText("x = f(1)")
        assert analyzer.AnalyzeSingleLogical(sound, False) is None

    def OnSwallowed(self, suppress_gui: bool = False) -> None:
        """Raise what an analysis wants to log, but for what is known of the engine's own trees."""
        error = sys.exc_info()[1]
        if isinstance(self.analyzer, CNewerAnalyzer) or not _REFUSED_DOTS.search(str(error)):
            raise AssertionError("an exception was swallowed") from error


def _Solid(text: str) -> list[str]:
    """The characters that stand in tokens: no white space, no separators of statements."""
    return sorted(char for char in text if not char.isspace() and char not in ";\ufeff")


def main() -> int:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--seconds", type=float, default=60)
    parser.add_argument("--seed", type=int, default=random.randrange(1 << 30))
    options = parser.parse_args()
    fuzzer = Fuzzer(options.seed)
    treesift.reflect.ReportCurrentException = fuzzer.OnSwallowed
    print(f"seed {options.seed}", flush=True)
    count, end = 0, time.monotonic() + options.seconds
    while time.monotonic() < end:
        text = fuzzer.Text()
        try:
            with redirect_stdout(io.StringIO()):
                fuzzer.Check(text)
        except BaseException:
            print(f"seed {options.seed}, text {count}: {text!r}")
            raise
        count += 1
    print(f"{count} texts")
    return 0


if __name__ == "__main__":
    sys.exit(main())
