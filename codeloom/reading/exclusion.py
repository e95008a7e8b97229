"""What a search through folders leaves out, by patterns and by .gitignore files.

All patterns are those of .gitignore files. One that holds a slash before its end is relative to the folder
that it was written for, any other matches names at any depth.
"""

import os
from collections.abc import Container, Iterable, Sequence

TYPE_CHECKING = False  # `typing` takes longer to import than this module
if TYPE_CHECKING:  # most searches don't need it, and it takes longer to import than they take
    from pathspec import GitIgnoreSpec

_GITIGNORE = ".gitignore"
_REPOSITORY = ".git"

# What is left out unless patterns are given; virtual environments always are.
DEFAULT_PATTERNS = (".*/", "__pycache__/")


class Cause:
    """Why something is left out, and what brings it back."""

    __slots__ = ("reason", "remedy")

    def __init__(self, reason: str, remedy: str) -> None:
        self.reason = reason
        self.remedy = remedy

    def __str__(self) -> str:
        return f"{self.reason}; {self.remedy}"


_HIDDEN, _CACHE = (
    Cause(f"the default pattern {pattern!r}", "--exclude replaces the defaults")
    for pattern in DEFAULT_PATTERNS
)
ENVIRONMENT = Cause("its pyvenv.cfg, as a virtual environment", "name it to read it")


class Exclusion:
    """What is left out: `patterns` relative to `root`, and what .gitignore files name."""

    def __init__(
        self,
        root: str = ".",
        patterns: Sequence[str] = DEFAULT_PATTERNS,
        *,
        gitignore: bool = False,
        force: bool = False,
        is_top: bool = False,
    ) -> None:
        """With `force` files that are named themselves are left out too; with `is_top` no .gitignore
        file above `root` counts."""
        self._root = os.path.abspath(root)
        self._patterns = patterns
        self._gitignore = gitignore
        self._force = force
        self._is_default = tuple(patterns) == DEFAULT_PATTERNS
        self._rules = None if self._is_default else _Rules(enumerate(patterns, 1))
        self._ignore_files: dict[str, _Rules | None] = {}
        self._known_ignores: dict[str, tuple[tuple[_Rules, str], ...]] = {}
        self._tops = {self._root: True} if is_top else {}

    def in_folder(self, folder: str, names: Container[str] | None = None) -> "FolderExclusion":
        """The same for what lies in one folder; `names` are those of all that does, where they are known."""
        folder = os.path.abspath(folder)
        if names is not None:
            self._tops.setdefault(folder, _REPOSITORY in names)
            if _GITIGNORE not in names:
                self._ignore_files[folder] = None
        rules = [] if self._rules is None else [(self._rules, _relative(folder, self._root))]
        return FolderExclusion(rules, self._ignores(folder), self._is_default)

    def cause_for_named(self, path: str) -> Cause | None:
        """Why a file or a folder is left out although it is named itself; None when it isn't."""
        return self._cause_for_path(path) if self._force else None

    def below_named(self, folder: str) -> "Exclusion":
        """What holds below a folder that is named itself: within one that would be left out its own rules."""
        if self._cause_for_path(folder) is None:
            return self
        return Exclusion(folder, self._patterns, gitignore=self._gitignore, force=self._force, is_top=True)

    def _cause_for_path(self, path: str) -> Cause | None:
        """Why a path is left out, or a folder that it lies in.

        Patterns count for what is below the root, .gitignore files for all of their repository.
        """
        path = os.path.abspath(path)
        is_folder = os.path.isdir(path)
        inside = os.path.join(self._root, "")
        while (above := os.path.dirname(path)) != path:
            if path.startswith(inside):
                here = self.in_folder(above)
            elif not self._is_top(path):
                here = FolderExclusion([], self._ignores(above), False)
            else:
                return None
            cause = here.cause(os.path.basename(path), is_folder)
            if cause is not None:
                return cause
            path, is_folder = above, True
        return None

    def _ignores(self, folder: str) -> "list[tuple[_Rules, str]]":
        """The .gitignore files that hold for a folder, the nearest first, and its path from each."""
        if not self._gitignore:
            return []
        return [(rules, _relative(folder, home)) for rules, home in self._ignores_at(folder)]

    def _ignores_at(self, folder: str) -> "tuple[tuple[_Rules, str], ...]":
        """The .gitignore files that hold for a folder, the nearest first, and the folder of each."""
        unknown = []
        here = folder
        while here not in self._known_ignores:
            unknown.append(here)
            above = os.path.dirname(here)
            if self._is_top(here) or above == here:
                break
            here = above
        found = self._known_ignores.get(here, ())
        for here in reversed(unknown):
            rules = self._ignore_file_in(here)
            if rules is not None:
                found = ((rules, here), *found)
            self._known_ignores[here] = found
        return found

    def _ignore_file_in(self, folder: str) -> "_Rules | None":
        if folder not in self._ignore_files:
            self._ignore_files[folder] = _read_ignore_file(os.path.join(folder, _GITIGNORE))
        return self._ignore_files[folder]

    def _is_top(self, folder: str) -> bool:
        """True for the folder of a repository, above which no .gitignore file counts."""
        if folder not in self._tops:
            self._tops[folder] = os.path.exists(os.path.join(folder, _REPOSITORY))
        return self._tops[folder]


class FolderExclusion:
    """What is left out of the files and folders that lie in one folder."""

    def __init__(
        self,
        rules: "Sequence[tuple[_Rules, str]]",
        ignores: "Sequence[tuple[_Rules, str]]",
        leaves_out_hidden: bool,
    ) -> None:
        """Rules come with the path from their folder to this one, empty or with a slash at the end."""
        self._rules = rules
        self._ignores = ignores
        self._leaves_out_hidden = leaves_out_hidden

    def cause(self, name: str, is_folder: bool) -> Cause | None:
        """Why a file or a folder of this name isn't looked at; None when it is."""
        if self._leaves_out_hidden and is_folder:
            if name.startswith("."):
                return _HIDDEN
            if name == "__pycache__":
                return _CACHE
        name = f"{name}/" if is_folder else name
        for rules, prefix in self._rules:
            if rules.decide(prefix + name):
                return rules.cause(prefix + name)
        for rules, prefix in self._ignores:  # the nearest file that says anything decides
            is_left_out = rules.decide(prefix + name)
            if is_left_out is not None:
                return rules.cause(prefix + name) if is_left_out else None
        return None


class _Rules:
    """The patterns of a .gitignore file, or those of an option."""

    def __init__(self, rows: Iterable[tuple[int, str]], path: str = "") -> None:
        """From numbered rows; ValueError when one of them isn't a pattern."""
        self._rows = [(number, row) for number, row in rows if row]
        self._path = path
        self._spec = _spec_of([row for _, row in self._rows])

    def decide(self, path: str) -> bool | None:
        """True for what is left out, False for what is taken back, None for anything else."""
        return self._spec.check_file(path).include

    def cause(self, path: str) -> Cause:
        """Why a path is left out that these rules leave out."""
        row_i = self._spec.check_file(path).index
        number, pattern = self._rows[row_i or 0]
        if not self._path:
            return Cause(f"the pattern {pattern!r} to exclude", "name it to read it")
        where = _shown_path(self._path)
        return Cause(f"{pattern!r} in row {number} of {where}", "--no-gitignore reads it")


def is_pattern(pattern: str) -> bool:
    """True for what a .gitignore file may hold on a row."""
    try:
        _spec_of([pattern])
    except ValueError:
        return False
    return True


def _spec_of(patterns: Sequence[str]) -> "GitIgnoreSpec":
    from pathspec import GitIgnoreSpec

    return GitIgnoreSpec.from_lines(patterns)


def _read_ignore_file(path: str) -> _Rules | None:
    try:
        with open(path, encoding="utf-8", errors="surrogateescape") as file:
            rows = list(enumerate(file.read().splitlines(), 1))
    except OSError:  # none, or none that can be read
        return None
    try:
        return _Rules(rows, path) if rows else None
    except ValueError:  # a row that isn't a pattern: the others count
        return _Rules([row for row in rows if is_pattern(row[1])], path)


def _shown_path(path: str) -> str:
    below = os.path.relpath(path)
    return path if below.startswith(os.pardir) else below


def _relative(folder: str, root: str) -> str:
    path = os.path.relpath(folder, root).replace(os.sep, "/")
    return "" if path == "." else f"{path}/"
