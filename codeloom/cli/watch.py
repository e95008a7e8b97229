"""Files that are watched: what earlier runs have read, so that a run reads only what has changed since."""

from __future__ import annotations

import os
import time
from collections.abc import Iterator

from codeloom._document import Document
from codeloom.cli.options import Options
from codeloom.cli.run import files_of
from codeloom.cli.source import Source
from codeloom.common_start import common_start
from codeloom.reading.files import NOTEBOOK_SUFFIX, StandardInput, read_file
from codeloom.reading.source import source_from_bytes

_SECONDS_BETWEEN_LOOKS = 0.3
# A look at many files takes long: how many times as long nothing is done afterwards.
_REST = 4
# Who types changes few files; when more change at once, such as to another branch, they are read anew.
_MOST_DOCUMENTS = 16

# What changes with a file: times, size, number.
_Stamp = tuple[int, int, int, int]


class Watch:
    """The files of a run again and again.

    What an unchanged file says is kept. One that has changed becomes a document, so that of the next change
    only what it concerns is analysed.
    """

    def __init__(self, options: Options) -> None:
        self._options = options
        self._stamps: dict[str, _Stamp] | None = None  # of the last look
        self._kept: dict[str, Source] = {}
        self._changed: set[str] = set()  # what was kept before the last look
        self._documents: dict[str, Document] = {}  # the last changed is last

    def wait(self) -> None:
        """Return when a file has changed; at once the first time."""
        while True:
            start = time.monotonic()
            now = _stamps(self._options)
            if now != self._stamps:
                break
            time.sleep(max(_SECONDS_BETWEEN_LOOKS, _REST * (time.monotonic() - start)))
        before = self._stamps or {}
        self._changed = {path for path in self._kept if path in now and now[path] != before[path]}
        self._kept = {path: source for path, source in self._kept.items() if now.get(path) == before[path]}
        self._documents = {path: document for path, document in self._documents.items() if path in now}
        self._stamps = now

    def recall(self, found: Iterator[str | OSError]) -> Iterator[str | OSError | Source]:
        """What is found, but in place of a path what its file says, where that is known or easy to know."""
        becomes_document = self._changed if len(self._changed) <= _MOST_DOCUMENTS else ()
        for one in found:
            if isinstance(one, OSError):
                yield one
            elif one in self._kept:
                yield self._kept[one]
            else:
                source = self._edited(one) if one in becomes_document else None
                yield source or one

    def keep(self, source: Source) -> None:
        """Keep what a file says, until it changes."""
        if self._stamps is not None and source.path in self._stamps:  # else it is newer than the last look
            self._kept[source.path] = source

    def _edited(self, path: str) -> Source | None:
        """What a changed file says; None for one that isn't plain text, or can't be read."""
        document = self._documents.pop(path, None)
        text = _plain_text(path)
        if text is None:
            return None
        if document is None:
            options = self._options
            document = Document(text, path=path, python=options.version, false_hints=options.false_hints)
        else:
            change_text(document, text)
        self._documents[path] = document
        if len(self._documents) > _MOST_DOCUMENTS:
            del self._documents[next(iter(self._documents))]
        source = Source(path, document.analysis)
        self.keep(source)
        return source


def change_text(document: Document, new: str) -> None:
    """Give a document another text, as an edit of the rows that differ."""
    old = document.text
    start = old.rfind("\n", 0, common_start(old, new)) + 1
    end = len(old) - common_start(old[start:][::-1], new[start:][::-1])
    end = old.find("\n", end) + 1 or len(old)
    place = document.end if end == len(old) else (_row_at(old, end), 1)
    document.edit((_row_at(old, start), 1), place, new[start : len(new) - (len(old) - end)])


def _row_at(text: str, row_start: int) -> int:
    """The number of the row, from 1, that begins at an offset."""
    counts = (text.count(row_end, 0, row_start) for row_end in ("\n", "\r", "\r\n"))
    newlines, returns, both = counts
    return 1 + newlines + returns - both


def _plain_text(path: str) -> str | None:
    if path.lower().endswith(NOTEBOOK_SUFFIX):
        return None
    try:
        source = source_from_bytes(read_file(path))
    except OSError:  # whoever reads it next says why
        return None
    return None if source.faults else source.utf8.decode()


def _stamps(options: Options) -> dict[str, _Stamp]:
    """What changes with each file that a run would read."""
    found = {}
    for path in files_of(options):
        if isinstance(path, str) and not isinstance(path, StandardInput):
            try:
                status = os.stat(path)
            except OSError:
                continue
            found[path] = status.st_mtime_ns, status.st_ctime_ns, status.st_size, status.st_ino
    return found
