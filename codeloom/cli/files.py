"""The files that a command line names: found, and read one after the other."""

import os
import sys
from collections.abc import Callable, Iterator, Sequence

STANDARD_INPUT = "-"

_SUFFIXES = (".py", ".pyi", ".pyw")
_CACHE_FOLDER = "__pycache__"
_ENVIRONMENT_MARK = "pyvenv.cfg"

# Takes the path of what can't be read, and why.
FailureHandler = Callable[[str, OSError], None]


def ReadFiles(paths: Sequence[str], on_failure: FailureHandler) -> Iterator[tuple[str, bytes]]:
    """Path and bytes of each file that `paths` name, one at a time.

    A folder stands for the Python files below it, in the order of their names. Hidden folders,
    caches and virtual environments are left out, unless they are named themselves. "-" is the
    standard input. Nothing is read twice.
    """
    for path in _FileFinder(paths, on_failure).Files():
        try:
            data = _Read(path)
        except OSError as error:
            on_failure(path, error)
        else:
            yield "<stdin>" if path == STANDARD_INPUT else path, data


def _Read(path: str) -> bytes:
    if path != STANDARD_INPUT:
        with open(path, "rb") as file:
            return file.read()
    if sys.stdin is None:
        raise OSError(0, "there is no standard input")
    return sys.stdin.buffer.read()


# What is the same for all names of a file or a folder: device and number, or else the path.
_Identity = tuple[int, int] | str


def _IdentityOf(path: str) -> _Identity:
    try:
        status = os.stat(path)
    except OSError:
        return path
    return status.st_dev, status.st_ino


class _FileFinder:
    """Goes through files and folders.

    It remembers folders and the files that were named, not each file that it found.
    """

    def __init__(self, paths: Sequence[str], on_failure: FailureHandler) -> None:
        self._fPaths = paths
        self._fOnFailure = on_failure
        self._fSeenFolders: set[_Identity] = set()
        # Whether a named file was found already, by its name or within a folder.
        self._fNamedFiles = {_IdentityOf(path): False for path in paths if not os.path.isdir(path)}

    def Files(self) -> Iterator[str]:
        """The paths of the files, and "-" for the standard input."""
        for path in dict.fromkeys(self._fPaths):
            if path == STANDARD_INPUT:
                yield path
            elif os.path.isdir(path):
                yield from self._FilesBelow(path)
            elif self._IsNew(path):
                yield path

    def _FilesBelow(self, folder: str) -> Iterator[str]:
        # What is still to be looked at, the next one last; folders end in a separator.
        pending = self._Children(folder, is_named=True)
        while pending:
            path = pending.pop()
            if path.endswith(os.sep):
                pending += self._Children(path, is_named=False)
            elif self._IsNew(path):
                yield path

    def _Children(self, folder: str, is_named: bool) -> list[str]:
        """What is of interest in a folder, in reverse order; nothing if it was looked at before."""
        identity = _IdentityOf(folder)
        if identity in self._fSeenFolders:
            return []
        self._fSeenFolders.add(identity)
        try:
            with os.scandir(folder) as scan:
                entries = sorted(scan, key=lambda entry: entry.name, reverse=True)
        except OSError as error:
            self._fOnFailure(folder, error)
            return []
        if not is_named and any(entry.name == _ENVIRONMENT_MARK for entry in entries):
            return []
        return [path for entry in entries if (path := self._PathOfInterest(entry)) is not None]

    def _PathOfInterest(self, entry: os.DirEntry[str]) -> str | None:
        """The path of a folder, with a separator, or of a Python file; None for anything else."""
        is_hidden = entry.name.startswith(".")
        if _IsFolder(entry):
            is_left_out = is_hidden or entry.name == _CACHE_FOLDER
            return None if is_left_out else entry.path + os.sep
        if not entry.name.lower().endswith(_SUFFIXES):
            return None
        # A broken link is a failure when it is read; hidden ones are the locks of editors.
        if _IsFile(entry) or (entry.is_symlink() and not is_hidden):
            return entry.path
        return None

    def _IsNew(self, path: str) -> bool:
        """False for a file that is named on the command line and was found before."""
        identity = _IdentityOf(path) if self._fNamedFiles else path
        if identity not in self._fNamedFiles:
            return True
        was_found = self._fNamedFiles[identity]
        self._fNamedFiles[identity] = True
        return not was_found


def _IsFolder(entry: os.DirEntry[str]) -> bool:
    try:
        return entry.is_dir()
    except OSError:
        return False


def _IsFile(entry: os.DirEntry[str]) -> bool:
    try:
        return entry.is_file()
    except OSError:
        return False
