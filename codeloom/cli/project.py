"""The project around the files of a run: its folder, its settings, the Python that it is for.

Settings are the table `tool.codeloom` of a pyproject.toml, or all of a codeloom.toml. Those of the nearest
folder hold, from the one that the files lie in upwards, as far as the repository goes.
"""

from __future__ import annotations

import os
from collections.abc import Callable, Iterator, Mapping, Sequence

TYPE_CHECKING = False  # `typing` takes long to import
if TYPE_CHECKING:
    from typing import Any

_OWN_FILE = "codeloom.toml"
_PROJECT_FILE = "pyproject.toml"


class WrongUseError(Exception):
    """Wrong use of the command line or of its settings; the message is for the user."""


class Project:
    """What is known of the project around some paths.

    `root` is the folder of the settings, or else the current one. `settings` are as they were written,
    and `requires_python` is what the nearest project names.
    """

    def __init__(self, paths: Sequence[str], settings_file: str | None = None) -> None:
        self.root = os.getcwd()
        self.settings: Mapping[str, Any] = {}
        self.settings_file = settings_file
        self.requires_python: str | None = None
        if settings_file is not None:
            self._take(settings_file)
        for folder in _folders_upward(_common_folder(paths)):
            self._look_into(folder)

    def _look_into(self, folder: str) -> None:
        own = os.path.join(folder, _OWN_FILE)
        project = os.path.join(folder, _PROJECT_FILE)
        if self.settings_file is None and os.path.isfile(own):
            self._take(own)
        if not os.path.isfile(project):
            return
        text = _bytes_of(project)
        # Most have nothing for us, and a parser of TOML takes a while to load.
        if b"codeloom" not in text and b"requires-python" not in text:
            return
        try:
            table = _parsed(text, project)
        except WrongUseError:
            if b"tool.codeloom" in text:
                raise
            return  # others have something to say about it
        if self.settings_file is None and "codeloom" in _table(table, "tool"):
            self._take(project)
        if self.requires_python is None:
            requirement = _table(table, "project").get("requires-python")
            self.requires_python = requirement if isinstance(requirement, str) else None

    def _take(self, path: str) -> None:
        settings: Any = _parsed(_bytes_of(path), path)
        if os.path.basename(path) == _PROJECT_FILE:
            settings = _table(settings, "tool").get("codeloom", {})
        if not isinstance(settings, dict):
            raise WrongUseError(f"{path}: tool.codeloom must be a table")
        self.settings, self.settings_file = settings, path
        self.root = os.path.dirname(os.path.abspath(path))


def checked_settings(
    project: Project, readers: Mapping[str, Callable[[Any], Any]]
) -> Iterator[tuple[str, Any]]:
    """The settings by name, each as its reader makes it; WrongUseError for unknown and wrong ones.

    A reader raises ValueError, or TypeError for a value of a wrong type.
    """
    for name, value in project.settings.items():
        where = f"{project.settings_file}: {name}"
        if name not in readers:
            raise WrongUseError(f"{where} isn't a setting{nearest(name, readers)}")
        try:
            yield name, readers[name](value)
        except (TypeError, ValueError) as error:
            raise WrongUseError(f"{where}: {error}") from None


def nearest(name: str, known: Mapping[str, object] | Sequence[str]) -> str:
    """A question that ends a message: whether the known word nearest to `name` was meant."""
    from difflib import get_close_matches

    found = get_close_matches(name, list(known), 1)
    return f": did you mean {found[0]!r}?" if found else ""


def _bytes_of(path: str) -> bytes:
    try:
        with open(path, "rb") as file:
            return file.read()
    except OSError as error:
        raise WrongUseError(f"can't read {path}: {error.strerror}") from None


def _parsed(text: bytes, path: str) -> dict[str, Any]:
    import tomllib

    try:
        return tomllib.loads(text.decode())
    except (tomllib.TOMLDecodeError, UnicodeDecodeError, RecursionError) as error:
        raise WrongUseError(f"{path}: {error}") from None


def _table(table: Mapping[str, Any], name: str) -> Mapping[str, Any]:
    found = table.get(name)
    return found if isinstance(found, dict) else {}


def _common_folder(paths: Sequence[str]) -> str:
    """The folder that all paths lie in; the current one when they have none in common."""
    try:
        common = os.path.commonpath([os.path.abspath(path) for path in paths])
    except ValueError:
        return os.getcwd()
    return common if os.path.isdir(common) else os.path.dirname(common)


def _folders_upward(folder: str) -> Iterator[str]:
    while True:
        yield folder
        above = os.path.dirname(folder)
        if above == folder or os.path.exists(os.path.join(folder, ".git")):
            return
        folder = above
