"""What a search through folders leaves out, by patterns and by .gitignore files.

All patterns are those of .gitignore files. One that holds a slash before its end is relative to the folder
that it was written for, any other stands for names at any depth.
"""

import os
from collections.abc import Iterable, Iterator, Sequence

TYPE_CHECKING = False  # `typing` takes longer to import than this module
if TYPE_CHECKING:  # most searches don't need it, and it takes longer to import than they take
    from pathspec import GitIgnoreSpec

_GITIGNORE = ".gitignore"
_REPOSITORY = ".git"

# What is left out unless patterns are given; virtual environments always are.
DEFAULT_PATTERNS = (".*/", "__pycache__/")


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
        self._spec = None if self._is_default else _spec_of(patterns)
        self._specs: dict[str, GitIgnoreSpec | None] = {}
        self._is_top = {self._root: True} if is_top else {}

    def in_folder(self, folder: str) -> "FolderExclusion":
        """The same for what lies in one folder."""
        folder = os.path.abspath(folder)
        rules = [(self._spec, _relative(folder, self._root))] if self._spec is not None else []
        ignores = list(self._ignores(folder)) if self._gitignore else []
        return FolderExclusion(rules, ignores, self._is_default)

    def leaves_out_named(self, path: str) -> bool:
        """True when a file or a folder is left out although it is named itself."""
        return self._force and self._leaves_out_path(path)

    def below_named(self, folder: str) -> "Exclusion":
        """What holds below a folder that is named itself: within one that would be left out its own rules."""
        if not self._leaves_out_path(folder):
            return self
        return Exclusion(folder, self._patterns, gitignore=self._gitignore, force=self._force, is_top=True)

    def _leaves_out_path(self, path: str) -> bool:
        """True for what is left out, or lies in a folder that is."""
        path = os.path.abspath(path)
        is_folder = os.path.isdir(path)
        while len(path) > len(self._root) and path.startswith(self._root):
            folder, name = os.path.split(path)
            if self.in_folder(folder).leaves_out(name, is_folder):
                return True
            path, is_folder = folder, True
        return False

    def _ignores(self, folder: str) -> Iterator[tuple["GitIgnoreSpec", str]]:
        """The .gitignore files that hold for a folder, the nearest first, and its path from each."""
        here = folder
        while True:
            spec = self._spec_in(here)
            if spec is not None:
                yield spec, _relative(folder, here)
            above = os.path.dirname(here)
            if self._is_top[here] or above == here:
                return
            here = above

    def _spec_in(self, folder: str) -> "GitIgnoreSpec | None":
        if folder not in self._specs:
            if folder not in self._is_top:
                self._is_top[folder] = os.path.exists(os.path.join(folder, _REPOSITORY))
            self._specs[folder] = _read_spec(os.path.join(folder, _GITIGNORE))
        return self._specs[folder]


class FolderExclusion:
    """What is left out of the files and folders that lie in one folder."""

    def __init__(
        self,
        rules: "Sequence[tuple[GitIgnoreSpec, str]]",
        ignores: "Sequence[tuple[GitIgnoreSpec, str]]",
        leaves_out_hidden: bool,
    ) -> None:
        """Each spec comes with the path from its folder to this one, empty or with a slash at the end."""
        self._rules = rules
        self._ignores = ignores
        self._leaves_out_hidden = leaves_out_hidden

    def leaves_out(self, name: str, is_folder: bool) -> bool:
        """True for a file or a folder of this name that isn't looked at."""
        if self._leaves_out_hidden and is_folder and (name.startswith(".") or name == "__pycache__"):
            return True
        name = f"{name}/" if is_folder else name
        if any(spec.check_file(prefix + name).include for spec, prefix in self._rules):
            return True
        for spec, prefix in self._ignores:  # the nearest file that says anything decides
            include = spec.check_file(prefix + name).include
            if include is not None:
                return include
        return False


def _spec_of(patterns: Iterable[str]) -> "GitIgnoreSpec":
    from pathspec import GitIgnoreSpec

    return GitIgnoreSpec.from_lines(patterns)


def _read_spec(path: str) -> "GitIgnoreSpec | None":
    try:
        with open(path, encoding="utf-8", errors="surrogateescape") as file:
            patterns = file.read().splitlines()
    except OSError:  # none, or none that can be read
        return None
    try:
        return _spec_of(patterns) if patterns else None
    except ValueError:  # a pattern that isn't one: the others hold
        return _spec_of(filter(is_pattern, patterns))


def is_pattern(pattern: str) -> bool:
    """True for what a .gitignore file may hold on a row."""
    try:
        _spec_of([pattern])
    except ValueError:
        return False
    return True


def _relative(folder: str, root: str) -> str:
    path = os.path.relpath(folder, root).replace(os.sep, "/")
    return "" if path == "." else f"{path}/"
