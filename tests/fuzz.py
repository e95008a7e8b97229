"""Feeds odd text to the tokenizer, the analyzer and the commands. Run with `make fuzz`.

A text is a row of odd pieces, a part of a real file with pieces strewn in, or statements made from a
grammar with words swapped; now and then it is repeated into a big file. Whatever it says, analysis
ends, swallows no exception, loses no character, and leaves the next line sound; a command ends with a
status, and the records survive host code that runs while they are asked for, or does what nobody should
while a line is analysed. A failure prints the seed and the text.
"""

import argparse
import io
import random
import re
import sys
import tempfile
import time
from contextlib import redirect_stderr, redirect_stdout
from pathlib import Path

from collecting import OnCollection
from library import library_files
from odd_hosts import OddHost
from sentences import COMMENTS, WORDS, Sentences

from codeloom import Analysis, analyze, cli, treesift
from codeloom.logicalline import CLogicalLine
from codeloom.rows import RowTexts
from codeloom.treesift import CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

WORDS_AND_MARKS = r"""
    def f ( ) : class x = 1 , * ** -> lambda [ ] { } if else elif for in while try except finally with as
    async await yield from import . ... @ ; ` <> != ~ := //= match case type print _ T: \ # type: int !
    0777 10L 1_0 0x 1e5j 1. .5 "a" 'b' ''' rb'' ur"" f"{x!r:>{y}}" f'{ f"{" }} é
"""
BLANKS_AND_THE_LIKE = ["", "\n", "\n\t", "\\\n", "\r", "\r\n", "\x0c", "\0", "\ufeff", "\u0301", "\ufffd"]
PIECES = [*WORDS_AND_MARKS.split(), *BLANKS_AND_THE_LIKE, '"""', "# x\n", "# type: int\n"]


# The versions in which a text is analysed as users call it.
LANGUAGES = ["2.7", "3.5", "3.8", "3.11", "3.14"]

COMMANDS = [
    ["check"],
    *(["names", f"--format={form}"] for form in ("text", "jsonl")),
    *(["hints", f"--format={form}"] for form in ("text", "jsonl")),
    *(["tree", f"--format={form}"] for form in ("text", "json", "dot")),
]
COMMANDED_TEXTS = 0.1  # the part of the texts that a command takes too
ODDLY_HOSTED_TEXTS = 0.1
BIG_FILES = 0.002
BIG_FILE_SIZE = 300_000

# What the engine alone swallows: in its trees three dots aren't an expression, and what wants one refuses
# them; and a hint has arguments although the `def` has none.
_SWALLOWED_BY_ENGINE = re.compile(
    r"CExpression.*logical tokens: .*\.\.\.|the def has no records of its arguments", re.DOTALL
)


class Fuzzer:
    """Makes texts, and checks what becomes of them."""

    def __init__(self, seed: int) -> None:
        self.random = random.Random(seed)
        self.files = library_files()
        words = {**WORDS, "NEWLINE": ["\n", *COMMENTS]}
        self.sentences = [Sentences(version, self.random, words) for version in ("2.7", "3.8", "3.14")]
        self.engine = CPGenAnalyzerImpl((3, 11, 0))
        self.odd_host = OddHost(random.Random(seed))
        self.folder = tempfile.TemporaryDirectory()

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
        for logical in [*logicals, *GetLogicalsFromText("x = f(1)")]:
            error = self.engine.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)
        assert error is None
        self._Analyze(f"{text}\nx = f(1)")
        self._AskWhileDropping(logicals)
        if self.random.random() < ODDLY_HOSTED_TEXTS:
            for logical in logicals:
                self.odd_host.Analyze(logical)
        if self.random.random() < COMMANDED_TEXTS:
            self._Command(text)
        if self.random.random() < BIG_FILES:
            self._Command((f"{text}\n" * BIG_FILE_SIZE)[:BIG_FILE_SIZE])

    def _AskWhileDropping(self, logicals: list[CLogicalLine]) -> None:
        """Ask for records while host code, run by a collection, drops them."""
        for logical in logicals:
            with OnCollection(logical.ClearDerivedInfo, ("start", "stop")):
                for name in ("fTypeEquivs", "fArgTypeEquivs"):
                    records = getattr(logical, name)
                    assert records is None or all(len(record) == 2 for record in records)

    def _Command(self, text: str) -> None:
        """Run a command on a file of the text: it says what it says, and ends with a status."""
        path = Path(self.folder.name) / "text.py"
        path.write_bytes(text.encode("utf-8", "surrogatepass"))
        command, *options = self.random.choice(COMMANDS)
        with redirect_stderr(io.StringIO()) as failures:
            status = cli.main([command, *options, "--python", self.random.choice(LANGUAGES), str(path)])
        holds_nothing = command == "tree" and "holds no line" in failures.getvalue()
        assert status in (0, 1) or holds_nothing, (command, options, status, failures.getvalue())

    def _Analyze(self, text: str) -> None:
        """The same as users call it."""
        analysis = analyze(text, python=self.random.choice(LANGUAGES))
        assert len(analysis.lines) == len(GetLogicalsFromText(analysis.text))
        rows = len(RowTexts(analysis.text))
        for item in (*analysis.problems, *analysis.records, *analysis.hints, *analysis.scopes):
            place = item.range
            assert place is None or 1 <= place.row <= place.end_row <= rows
        self._LookAtNames(analysis)

    @staticmethod
    def _LookAtNames(analysis: Analysis) -> None:
        """Names are in order, where they say, and each question about them has an answer."""
        text_rows = RowTexts(analysis.text)
        last = (0, 0)
        for occurrence in analysis.occurrences:
            place = occurrence.range
            assert last <= (place.row, place.column), occurrence
            last = place.end_row, place.end_column
            shown = text_rows[place.row - 1][place.column - 1 : place.end_column - 1]
            assert shown == occurrence.name, occurrence
        for occurrence in analysis.occurrences[:10]:
            assert occurrence.home is None or occurrence in analysis.references(occurrence)
        assert {*analysis.unused(parameters=True), *analysis.undefined()} <= {*analysis.occurrences}

    def OnSwallowed(self, suppress_gui: bool = False) -> None:
        """Raise what an analysis wants to log, but for what is known of the engine alone."""
        error = sys.exc_info()[1]
        if not _SWALLOWED_BY_ENGINE.search(str(error)):
            raise AssertionError("an exception was swallowed") from error


def _Solid(text: str) -> list[str]:
    """The characters that are in tokens: no white space, no separators of statements."""
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
