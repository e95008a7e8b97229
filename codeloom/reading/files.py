"""Finding source files and reading their bytes."""

import errno
import os
import stat
from collections.abc import Callable, Iterator, Sequence

from codeloom.reading.exclusion import ENVIRONMENT, Cause, Exclusion, FolderExclusion

NOTEBOOK_SUFFIX = ".ipynb"
MODULE_SUFFIXES = (".py", ".pyi", ".pyw")
SOURCE_SUFFIXES = (*MODULE_SUFFIXES, NOTEBOOK_SUFFIX)
_ENVIRONMENT_MARK = "pyvenv.cfg"

# Where the open files of a process are: pipes there come from the shell.
_OPEN_FILES = ("/dev/fd/", "/dev/stdin", "/proc/self/fd/")


class StandardInput(str):
    """The standard input among paths."""

    NAME = "-"
    __slots__ = ()

    def __new__(cls) -> "StandardInput":
        return super().__new__(cls, cls.NAME)


def read_file(path: str) -> bytes:
    """The bytes of a file; OSError when it can't be read, also for devices and pipes."""
    mode = os.stat(path).st_mode
    is_handed_over = stat.S_ISFIFO(mode) and path.startswith(_OPEN_FILES)
    if stat.S_ISDIR(mode):
        raise IsADirectoryError(errno.EISDIR, os.strerror(errno.EISDIR), path)
    if not stat.S_ISREG(mode) and not is_handed_over:
        raise OSError(errno.EINVAL, "it isn't a regular file", path)
    with open(path, "rb") as file:
        return file.read()


def find_files(
    paths: Sequence[str],
    exclusion: Exclusion | None = None,
    on_nothing: Callable[[str, str], None] | None = None,
) -> Iterator[str | OSError]:
    """The paths of the files that `paths` name, and an error for each folder that can't be listed.

    Of a folder these are the Python files and notebooks below it, in the order of their names. What
    `exclusion` names is left out, hidden folders and caches unless told otherwise, and virtual
    environments; unless they are named themselves. Links to folders aren't followed. No file is found
    twice, whatever its names. `on_nothing` is called with each of the paths that gives no file, and with
    the reason.
    """
    return _FileFinder(paths, exclusion or Exclusion(), on_nothing).files()


def left_out_by_force(cause: Cause) -> str:
    """The reason why something isn't read that is named itself."""
    return f"--force-exclude leaves it out by {cause.reason}"


# What is the same for all names of a file or a folder: device and number, or else the path.
_Identity = tuple[int, int] | str
# What may be the same for others too, and costs nothing to know in a folder: the number, or else the path.
_Number = int | str


def _identity_of(path: str) -> _Identity:
    if isinstance(path, StandardInput):
        return path
    try:
        status = os.stat(path)
    except OSError:
        return path
    return status.st_dev, status.st_ino


def _number_of(path: str) -> _Number:
    identity = _identity_of(path)
    return identity if isinstance(identity, str) else identity[1]


class _Seen:
    """Files and folders, whatever their names; the system is asked only about those that share a number."""

    def __init__(self) -> None:
        self._first_paths: dict[_Number, str] = {}
        self._identities: set[_Identity] = set()  # of all whose number isn't theirs alone

    def add(self, path: str, number: _Number) -> bool:
        """False for what was added before, by this name or another."""
        first = self._first_paths.get(number)
        if first is None:
            self._first_paths[number] = path
            return True
        self._identities.add(_identity_of(first))
        identity = _identity_of(path)
        if identity in self._identities:
            return False
        self._identities.add(identity)
        return True


class _FileFinder:
    """Goes through files and folders, and remembers what it has seen."""

    def __init__(
        self,
        paths: Sequence[str],
        exclusion: Exclusion,
        on_nothing: Callable[[str, str], None] | None = None,
    ) -> None:
        self._paths = paths
        self._exclusion = exclusion
        self._on_nothing = on_nothing
        self._seen = _Seen()
        # What was left out, when somebody asks: where nothing was found.
        self._left_out: list[tuple[str, Cause]] | None = None

    def files(self) -> Iterator[str | OSError]:
        for path in self._paths:
            has_found = False
            for found in self._files_of(path):
                has_found = True
                yield found
            if not has_found and self._on_nothing is not None:
                reason = self._why_nothing(path)
                if reason:
                    self._on_nothing(path, reason)

    def _files_of(self, path: str) -> Iterator[str | OSError]:
        if isinstance(path, StandardInput):
            if self._seen.add(path, _number_of(path)):
                yield path
        elif self._exclusion.cause_for_named(path) is not None:
            return
        elif os.path.isdir(path):
            yield from self._files_below(path)
        elif self._seen.add(path, _number_of(path)):
            yield path

    def _why_nothing(self, path: str) -> str | None:
        """Why a path gives no file; None when all of its files were found before."""
        cause = None if isinstance(path, StandardInput) else self._exclusion.cause_for_named(path)
        if cause is not None:
            return left_out_by_force(cause)
        if not os.path.isdir(path):
            return None
        again = _FileFinder([path], self._exclusion)
        again._left_out = []
        if next(again.files(), None) is not None:
            return None
        for left_out, cause in again._left_out:
            if not left_out.endswith(os.sep) or next(find_files([left_out]), None) is not None:
                return f"{left_out} is left out by {cause}"
        return "it holds no Python file and no notebook"

    def _files_below(self, folder: str) -> Iterator[str | OSError]:
        # What is still to be looked at, the next one last; folders end in a separator.
        pending = [(os.path.join(folder, ""), _number_of(folder))]
        exclusion = self._exclusion.below_named(folder)
        is_named = True
        while pending:
            path, number = pending.pop()
            if not self._seen.add(path, number):
                continue
            if not path.endswith(os.sep):
                yield path
                continue
            try:
                pending += self._children(folder if is_named else path, is_named, exclusion)
            except OSError as error:
                yield error
            is_named = False

    def _children(self, folder: str, is_named: bool, exclusion: Exclusion) -> list[tuple[str, _Number]]:
        """What is of interest in a folder, in reverse order."""
        with os.scandir(folder) as scan:
            entries = {entry.name: entry for entry in scan}
        if not is_named and _ENVIRONMENT_MARK in entries:
            self._note(folder, ENVIRONMENT)
            return []
        here = exclusion.in_folder(folder, entries)
        found = []
        for name in sorted(entries, reverse=True):
            entry = entries[name]
            path = self._path_of_interest(entry, here)
            if path is not None:
                found.append((path, _number_of(path) if entry.is_symlink() else entry.inode()))
        return found

    def _path_of_interest(self, entry: os.DirEntry[str], exclusion: FolderExclusion) -> str | None:
        """The path of a folder, with a separator, or of a Python file; None for anything else."""
        is_folder = entry.is_dir(follow_symlinks=False)
        if not is_folder and not entry.name.lower().endswith(SOURCE_SUFFIXES):
            return None
        cause = exclusion.cause(entry.name, is_folder)
        if cause is not None:
            self._note(entry.path + os.sep if is_folder else entry.path, cause)
            return None
        return entry.path + os.sep if is_folder else _path_of_file(entry)

    def _note(self, path: str, cause: Cause) -> None:
        if self._left_out is not None:
            self._left_out.append((path, cause))


def _path_of_file(entry: os.DirEntry[str]) -> str | None:
    """The path of a file that is to be read, or that can't be; None for anything else."""
    try:
        if entry.is_file():
            return entry.path
        is_failure = entry.is_symlink() and not os.path.exists(entry.path)
    except OSError:  # a link that leads to itself
        is_failure = True
    # A broken link is a failure when it is read; hidden ones are the locks of editors.
    return entry.path if is_failure and not entry.name.startswith(".") else None
