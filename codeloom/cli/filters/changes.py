"""Problems on lines that differ from a git revision."""

import os
import re
import subprocess
from collections.abc import Iterator, Sequence

from codeloom.cli.items import Finding
from codeloom.cli.source import Source

_FILE = re.compile(rb'\+\+\+ (?:"(?P<quoted>(?:\\.|[^"\\])*)"|(?P<plain>[^\t\n]*))')
_HUNK = re.compile(rb"@@ -\S+ \+(?P<row>\d+)(?:,(?P<count>\d+))? @@")
_ESCAPE = re.compile(rb"\\([0-7]{3}|.)")
_ESCAPED = {b"a": b"\a", b"b": b"\b", b"t": b"\t", b"n": b"\n", b"v": b"\v", b"f": b"\f", b"r": b"\r"}

# Of a file: the rows that differ, or None for all of them.
_Rows = list[range] | None


class Changes:
    """What differs between the files as they are and a revision; new files differ whole."""

    def __init__(self, revision: str, folder: str = ".") -> None:
        """Ask git; ValueError with its answer when it can't tell."""
        self._rows: dict[str, _Rows] = {}
        top = os.fsdecode(_git(folder, "rev-parse", "--show-toplevel").rstrip(b"\n"))
        options = ("--no-color", "--no-ext-diff", "--no-renames", "--src-prefix=a/", "--dst-prefix=b/")
        diff = _git(top, "diff", "--unified=0", *options, "--end-of-options", revision, "--")
        for path, rows in _hunks(diff):
            found = self._rows.setdefault(_key(os.path.join(top, os.fsdecode(path))), [])
            if found is not None:
                found.append(rows)
        others = _git(top, "ls-files", "--others", "--exclude-standard", "-z")
        for path in others.split(b"\0"):
            if path:
                self._rows[_key(os.path.join(top, os.fsdecode(path)))] = None

    def concern(self, path: str) -> bool:
        """True for a file that differs."""
        return _key(path) in self._rows

    def __call__(self, source: Source, findings: Sequence[Finding]) -> Sequence[Finding]:
        """The findings on logical lines that differ, or that have to do with such a line.

        In a notebook that differs all of them, since git knows nothing of cells.
        """
        rows = self._rows.get(_key(source.path), [])
        if rows is None or source.is_notebook:
            return findings if self.concern(source.path) else []
        return [finding for finding in findings if _concern(rows, source, finding)]


def _concern(changed: list[range], source: Source, finding: Finding) -> bool:
    for place in (finding.range, *(place for place, _ in finding.related)):
        first, last = source.line_rows(place.row)[0], max(source.line_rows(place.row)[1], place.end_row)
        if any(rows.start <= last and first < rows.stop for rows in changed):
            return True
    return False


def _hunks(diff: bytes) -> Iterator[tuple[bytes, range]]:
    """The path of each file, and the rows of the newer text that a hunk touches."""
    path = b""
    for row in diff.split(b"\n"):
        if match := _FILE.match(row):
            plain = match["plain"]
            path = (_unescaped(match["quoted"]) if plain is None else plain).removeprefix(b"b/")
        elif match := _HUNK.match(row):
            start = int(match["row"])
            count = int(match["count"] or b"1")
            # Where rows were taken out, those on either side are what is left to look at.
            yield path, range(start, start + count) if count else range(max(start, 1), start + 2)


def _unescaped(quoted: bytes) -> bytes:
    def char(match: re.Match[bytes]) -> bytes:
        code = match[1]
        return bytes([int(code, 8)]) if len(code) == 3 else _ESCAPED.get(code, code)

    return _ESCAPE.sub(char, quoted)


def _key(path: str) -> str:
    return os.path.realpath(path)


def _git(folder: str, *arguments: str) -> bytes:
    try:
        done = subprocess.run(["git", "-C", folder, *arguments], capture_output=True)
    except OSError as error:
        raise ValueError(f"git can't be run: {error.strerror}") from None
    if done.returncode != 0:
        said = done.stderr.decode(errors="replace").strip().partition("\n")[0]
        raise ValueError(f"git: {said.removeprefix('fatal: ')}")
    return done.stdout
