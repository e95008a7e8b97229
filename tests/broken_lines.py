"""Breaks lines of sound files at random and sees whether exactly those lines are reported.

What is broken is judged by the interpreter, line by line: what it still accepts, or refuses only after its
grammar, doesn't count. Run it for a measurement; tests/test_broken_lines.py holds the goal.

    python tests/broken_lines.py [single|six|typed] [--analyzer older|newer] [--cases N] [--seed N] [--show N]
"""

import argparse
import ast
import io
import random
import re
import tokenize
import warnings
from collections import Counter
from collections.abc import Iterator
from contextlib import redirect_stdout
from dataclasses import dataclass
from functools import cached_property
from pathlib import Path

from faults import KINDS, QUOTES, Edit, Line, Lines, OpensTriple, TypedAbove
from host_tokens import host_tokens
from library import plain_texts

from codeloom.logicalline import CLogicalLine
from codeloom.treesift import CExtendedAnalyzer, CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

ANALYZERS = {"older": CPGenAnalyzerImpl((3, 8, 0)), "newer": CExtendedAnalyzer((3, 11, 0))}

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
    """A text with broken lines, and what was found there."""

    path: Path
    kinds: list[str]
    damaged: list[range]
    """The rows of the broken lines, counted in the broken text."""
    errors: list[tuple[int, str]]
    keeps_others: bool
    """All other lines are read as in the sound text."""
    text: str

    @cached_property
    def found_count(self) -> int:
        return sum(any(row in rows for row, _ in self.errors) for rows in self.damaged)

    @cached_property
    def is_dirty(self) -> bool:
        """A row is blamed that isn't broken."""
        return not all(any(row in rows for rows in self.damaged) for row, _ in self.errors)

    @property
    def joined_count(self) -> int:
        """Faults that a reader can't tell from that of the line before."""
        return len(self.kinds) - len(self.damaged)

    @property
    def is_exact(self) -> bool:
        return self.found_count == len(self.damaged) and not self.is_dirty and self.keeps_others

    def __str__(self) -> str:
        source_rows = self.text.split("\n")
        shown = [f"-- {', '.join(self.kinds)}: {self.path}"]
        shown += [f"   errors: {self.errors}", f"   others kept: {self.keeps_others}"]
        for rows in self.damaged:
            for row in range(max(rows.start - 2, 0), min(rows.stop + 8, len(source_rows))):
                shown.append(f"{'>' if row in rows else ' '}{row:5} {source_rows[row]}")
        return "\n".join(shown)


class SoundText:
    """One sound file and its lines."""

    def __init__(self, path: Path, text: str, analyzer: CPGenAnalyzerImpl) -> None:
        self.path = path
        self.text = text
        self.analyzer = analyzer
        self.logicals = GetLogicalsFromText(text)
        self.lines = Lines(text, self.logicals)

    def Broken(self, edits: list[tuple[str, Line, Edit]]) -> Case:
        """What is found when lines are edited, each by one of `edits`, which are in the order of the text."""
        text = self.text
        for _, _, edit in reversed(edits):
            text = text[: edit.start] + edit.new + text[edit.end :]
        damaged = []
        kept = []
        shift = 0
        logical_i = 0
        for _, line, edit in edits:
            more = edit.new.count("\n") - self.text.count("\n", edit.start, edit.end)
            is_insertion = edit.new.endswith(f"\n{line.indent}") and edit.end == line.start
            end_row = line.first_row if is_insertion else line.end_row
            while logical_i < len(self.logicals) and self.logicals[logical_i].fFirstLine < end_row:
                if self.logicals[logical_i].fFirstLine < line.first_row:
                    kept.append((self.logicals[logical_i], shift))
                logical_i += 1
            damaged.append(range(line.first_row + shift, end_row + shift + more))
            shift += more
        kept += [(logical, shift) for logical in self.logicals[logical_i:]]
        return self._Judge(text, [kind for kind, _, _ in edits], _Told(text, damaged), kept)

    def _Judge(
        self, text: str, kinds: list[str], damaged: list[range], kept: list[tuple[CLogicalLine, int]]
    ) -> Case:
        sound = {_Facts(logical, shift) for logical, shift in kept}
        changed = [logical for logical in GetLogicalsFromText(text) if not _Discarded(sound, _Facts(logical))]
        errors = Errors(changed, self.analyzer)
        return Case(self.path, kinds, damaged, errors, not sound, text)


# What begins no line, so that it continues the row before if that is open.
CONTINUES = re.compile(r"[)\]}.,:=/%|&^<>]|(and|or|in|is|as)\b")


def _Told(text: str, damaged: list[range]) -> list[range]:
    """The broken lines that a reader can tell from each other.

    Two that touch may make up one sound line, `f(` and `x=0)`, or one broken line, when the first leaves a
    bracket or a quote open and the second begins with what must continue it, `f(x` and `.y)`.
    """
    source_rows = text.split("\n")
    told: list[range] = []
    for rows in damaged:
        line = "\n".join(source_rows[rows.start : rows.stop])
        last = told[-1] if told else range(0)
        between = source_rows[last.stop : rows.start]
        if last and all(row.strip()[:1] in ("", "#") for row in between):
            before = "\n".join(source_rows[last.start : last.stop])
            if not IsBroken(f"{before}\n{line}", ()):
                told.pop()
                continue
            if CONTINUES.match(line.strip()) and _LeavesOpen(before.strip()):
                told[-1] = range(last.start, rows.stop)
                continue
        told.append(rows)
    return told


def _LeavesOpen(line: str) -> bool:
    try:
        tokens = list(host_tokens(f"{line}\n"))
    except (tokenize.TokenError, SyntaxError):
        return True
    return any(token.string in QUOTES for token in tokens if token.type == tokenize.ERRORTOKEN)


def _Facts(logical: CLogicalLine, shift: int = 0) -> tuple:
    return (logical.fFirstLine + shift, logical.fType, tuple(logical.fToks), tuple(logical.fPositions))


def _Discarded(facts: set, fact: tuple) -> bool:
    is_in = fact in facts
    facts.discard(fact)
    return is_in


def Errors(logicals: list[CLogicalLine], analyzer: CPGenAnalyzerImpl) -> list[tuple[int, str]]:
    """The row in the file and the text of every broken logical line."""
    errors = []
    with redirect_stdout(io.StringIO()):
        for logical in logicals:
            error = analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)
            if error is not None:
                errors.append((logical.fFirstLine + error.lineno - 1, error.text))
    return errors


def IsBroken(line: str, after: tuple[str, ...] = AFTER_THE_GRAMMAR) -> bool:
    """True when the interpreter's grammar refuses a line, completed to a statement of its own.

    A backslash at its end joins it to the rest of the row, where nothing is left.
    """
    line = line.strip().removesuffix("\\").rstrip()
    word = line.split(None, 1)[0] if line else ""
    before, after_line = "", ""
    if re.match(r"elif\b", word):
        line = line[2:]
    elif re.match(r"else\b", word):
        before = "if 0: pass\n"
    elif re.match(r"(except|finally)\b", word):
        before = "try: pass\n"
    elif re.match(r"try\b", word):
        after_line = "\nfinally: pass"
    elif word == "case":
        before = "match x:\n "
    elif word.startswith("@"):
        after_line = "\ndef function(): pass"
    if line.endswith(":"):
        line += "\n case _: pass" if word == "match" else " pass"
    return IsRefused(before + line + after_line + "\n", after)


def IsRefused(text: str, after: tuple[str, ...] = AFTER_THE_GRAMMAR) -> bool:
    """True when the interpreter refuses a text, but not with a message that begins like one of `after`."""
    try:
        with warnings.catch_warnings():
            warnings.simplefilter("ignore")
            ast.parse(text)
    except SyntaxError as error:
        message = str(error.msg)
        return not message.startswith(after) and "illegal expression" not in message
    except ValueError:
        return True
    return False


def IsBreaking(line: Line, edit: Edit) -> bool:
    """The edited line, or the one that was put above it, is broken."""
    if edit.end == line.start and edit.new.endswith(f"\n{line.indent}"):
        return IsBroken(edit.new)
    return IsBroken(line.source[line.start : edit.start] + edit.new + line.source[edit.end : line.end])


def SoundTexts(source: random.Random, analyzer: CPGenAnalyzerImpl) -> Iterator[SoundText]:
    """Random files of the interpreter's library without end."""
    for path, text in plain_texts(source, 100_000):
        if not IsRefused(text):
            sound = SoundText(path, text, analyzer)
            if len(sound.lines) > 6 and not Errors(sound.logicals, analyzer):
                yield sound


def _BreakingEdit(
    sound: SoundText, kind: str, line: Line, source: random.Random
) -> tuple[str, Line, Edit] | None:
    edit = KINDS[kind](line, source, sound.lines)
    return (kind, line, edit) if edit and IsBreaking(line, edit) else None


def _WithOneFault(sound: SoundText, kind: str, source: random.Random) -> Case | None:
    for _ in range(20):
        if edit := _BreakingEdit(sound, kind, source.choice(sound.lines), source):
            return sound.Broken([edit])
    return None


def Singles(count: int, seed: int, analyzer: CPGenAnalyzerImpl = ANALYZERS["newer"]) -> Iterator[Case]:
    """`count` texts with one broken line, all kinds alike."""
    source = random.Random(seed)
    for sound in SoundTexts(source, analyzer):
        for kind in KINDS:
            if case := _WithOneFault(sound, kind, source):
                yield case
                count -= 1
                if count == 0:
                    return


def _SixEdits(sound: SoundText, source: random.Random) -> list[tuple[str, Line, Edit]]:
    """Faults in six lines, in the order of the text, or fewer.

    One of them at most leaves triple quotes open: two may pair up to a sound string.
    """
    edits: list[tuple[str, Line, Edit]] = []
    for line in source.sample(sound.lines, k=40):
        edit = _BreakingEdit(sound, source.choice(list(KINDS)), line, source)
        opens = edit and OpensTriple(line, edit[2])
        if edit and not (opens and any(OpensTriple(*other[1:]) for other in edits)):
            edits.append(edit)
    return sorted(edits[:6], key=lambda edit: edit[1].start)


def Sixes(count: int, seed: int, analyzer: CPGenAnalyzerImpl = ANALYZERS["newer"]) -> Iterator[Case]:
    """`count` texts of 60 lines or more, with six broken ones."""
    source = random.Random(seed)
    for sound in SoundTexts(source, analyzer):
        for _ in range(3 if len(sound.lines) >= 60 else 0):
            edits = _SixEdits(sound, source)
            if len(edits) == 6:
                yield sound.Broken(edits)
                count -= 1
                if count == 0:
                    return


def Typed(count: int, seed: int, analyzer: CPGenAnalyzerImpl = ANALYZERS["newer"]) -> Iterator[Case]:
    """At least `count` texts, in which a line grows above a sound one character by character."""
    source = random.Random(seed)
    for sound in SoundTexts(source, analyzer):
        for _ in range(4):
            line = source.choice(sound.lines)
            for edit in TypedAbove(line, source.choice(sound.lines)):
                yield sound.Broken([("typed", line, edit)])
                count -= 1
        if count <= 0:
            return


def IsSoundAfterAll(case: Case) -> bool:
    """The edited text as a whole is sound, whatever its lines are by themselves."""
    return not IsRefused(case.text)


RUNS = {"single": Singles, "six": Sixes, "typed": Typed}


def main() -> None:
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("run", choices=RUNS, nargs="?", default="single")
    parser.add_argument("--cases", type=int, default=2000)
    parser.add_argument("--analyzer", choices=ANALYZERS, default="newer")
    parser.add_argument("--seed", type=int, default=random.randrange(1 << 30))
    parser.add_argument("--show", type=int, default=0, help="print so many of the cases that were missed")
    options = parser.parse_args()
    counts: Counter[str] = Counter()
    missed: Counter[str] = Counter()
    shown = 0
    for case in RUNS[options.run](options.cases, options.seed, ANALYZERS[options.analyzer]):
        is_right = case.is_exact if options.run != "typed" else not case.is_dirty and case.keeps_others
        if not is_right and IsSoundAfterAll(case):
            continue
        counts["texts"] += 1
        counts["faults"] += len(case.damaged)
        counts["found"] += case.found_count
        counts["joined"] += case.joined_count
        counts["exact"] += is_right
        counts["dirty"] += case.is_dirty
        counts["changed"] += not case.keeps_others
        if not is_right:
            missed[" + ".join(sorted(case.kinds)) if len(case.kinds) == 1 else "six"] += 1
            if shown < options.show:
                shown += 1
                print(case)
    print(f"seed {options.seed}:", dict(counts))
    for kind, count in missed.most_common():
        print(f"  {count:5} {kind}")


if __name__ == "__main__":
    main()
