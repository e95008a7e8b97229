"""Feeds odd text to the tokenizer and the analyzer. Run with `make fuzz`.

A text is a row of odd pieces, a part of a real file with pieces strewn in, or statements made from a
grammar with words swapped. Whatever it says, analysis ends, swallows no exception, loses no
character, and leaves the next line sound. A failure prints the seed and the text.
"""

import argparse
import io
import random
import re
import sys
import sysconfig
import time
from collections.abc import Callable
from contextlib import redirect_stdout
from pathlib import Path

from sentences import COMMENTS, WORDS, Sentences

from codeloom import treesift
from codeloom.engine import LineAnalyzer
from codeloom.languages import LanguageNamed
from codeloom.logicalline import CLogicalLine
from codeloom.treesift import CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

WORDS_AND_MARKS = r"""
    def f ( ) : class x = 1 , * ** -> lambda [ ] { } if else elif for in while try except finally with as
    async await yield from import . ... @ ; ` <> != ~ := //= match case type print _ T: \ # type: int !
    0777 10L 1_0 0x 1e5j 1. .5 "a" 'b' ''' rb'' ur"" f"{x!r:>{y}}" f'{ f"{" }} é
"""
BLANKS_AND_THE_LIKE = ["", "\n", "\n\t", "\\\n", "\r", "\r\n", "\x0c", "\0", "\ufeff", "\u0301", "\ufffd"]
PIECES = [*WORDS_AND_MARKS.split(), *BLANKS_AND_THE_LIKE, '"""', "# x\n", "# type: int\n"]


# The roads of a line: as the upper layers send it, and as the engine alone takes it.
LANGUAGES = ["2.7", "3.5", "3.8", "3.11", "3.14"]
ENGINE = "the engine alone"

# What the engine alone swallows: in its trees three dots are no expression, and what wants one refuses
# them; and a hint has arguments although the `def` has none.
_SWALLOWED_BY_ENGINE = re.compile(
    r"CExpression.*logical tokens: .*\.\.\.|the def has no records of its arguments", re.DOTALL
)


class Fuzzer:
    """Makes texts, and checks what becomes of them."""

    def __init__(self, seed: int) -> None:
        self.random = random.Random(seed)
        library = Path(sysconfig.get_path("stdlib"))
        self.files = [path for path in sorted(library.rglob("*.py")) if "site-packages" not in path.parts]
        words = {**WORDS, "NEWLINE": ["\n", *COMMENTS]}
        self.sentences = [Sentences(version, self.random, words) for version in ("2.7", "3.8", "3.14")]
        self.engine = CPGenAnalyzerImpl((3, 11, 0))

    def Text(self) -> str:
        kind = self.random.random()
        if kind < 0.3:
            return self._Sentences()
        pieces = self.random.choices(PIECES, k=self.random.randrange(1, 60))
        if kind < 0.6:
            return self.random.choice(["", " "]).join(pieces)
        text = self.random.choice(self.files).read_text("utf-8", "replace")
        start = self.random.randrange(len(text) + 1)
        text = text[start : start + self.random.randrange(2000)]
        for piece in pieces[:5]:
            at = self.random.randrange(len(text) + 1)
            text = text[:at] + piece + text[at + self.random.randrange(3) :]
        return text

    def _Sentences(self) -> str:
        """Up to three of one grammar; in half of the texts a word is doubled, or one taken for another."""
        sentences = self.random.choice(self.sentences)
        words = "".join(sentences.Text() for _ in range(self.random.randrange(1, 4))).split(" ")
        if self.random.random() < 0.5:
            at = self.random.randrange(len(words))
            words[at : at + self.random.randrange(2)] = [self.random.choice(words)]
        return " ".join(words)

    def Check(self, text: str) -> None:
        """Raise AssertionError when something is wrong."""
        logicals = GetLogicalsFromText(text)
        kept = "".join(token for logical in logicals for token in logical.fToks)
        assert _Solid(kept) == _Solid(text), "characters were lost"
        self.road = self.random.choice([*LANGUAGES, ENGINE])
        analyze = self._Engine if self.road == ENGINE else self._UpperLayers(text)
        for logical in logicals:
            error = analyze(logical)
            assert error is None or 1 <= error.lineno <= text.count("\n") + text.count("\r") + 1
        (sound,) = GetLogicalsFromText("x = f(1)")
        assert analyze(sound) is None

    def _Engine(self, logical: CLogicalLine) -> SyntaxError | None:
        return self.engine.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)

    def _UpperLayers(self, text: str) -> Callable[[CLogicalLine], SyntaxError | None]:
        analyzer = LineAnalyzer(text, LanguageNamed(self.road), false_hints=False)
        return lambda logical: analyzer.Analyze(logical)[1]

    def OnSwallowed(self, suppress_gui: bool = False) -> None:
        """Raise what an analysis wants to log, but for what is known of the engine alone."""
        error = sys.exc_info()[1]
        if self.road != ENGINE or not _SWALLOWED_BY_ENGINE.search(str(error)):
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
