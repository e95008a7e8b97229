"""What holds for a file: the settings of its project, as the command line reads them."""

import os
from collections.abc import Sequence

from codeloom.cli.filters.codes import code_filters
from codeloom.cli.items import Finding
from codeloom.cli.options import Options, WrongUseError
from codeloom.cli.source import Source
from codeloom.reading.exclusion import Exclusion
from codeloom.reading.languages import NEWEST

SETTINGS_FILES = ("pyproject.toml", "codeloom.toml")


class Settings:
    """The settings for the files of a folder. `fault` says why they are the defaults."""

    def __init__(self, folder: str | None) -> None:
        self.fault: str | None = None
        self._options: Options | None = None
        if folder is not None:
            try:
                self._options = Options({"paths": [folder]})
            except (WrongUseError, OSError) as error:
                self.fault = str(error)

    @property
    def python(self) -> str:
        """The version of Python that texts are written in."""
        return self._options.version if self._options is not None else NEWEST

    @property
    def false_hints(self) -> bool:
        """Whether all that looks like a type hint is taken for one."""
        return self._options is not None and self._options.false_hints

    @property
    def exclusion(self) -> Exclusion:
        """What a search through folders leaves out."""
        return self._options.exclusion if self._options is not None else Exclusion(gitignore=True)

    def passed(self, source: Source) -> Sequence[Finding]:
        """The problems of a source that settings and comments let through."""
        findings: Sequence[Finding] = [Finding.of(source, problem) for problem in source.problems]
        options = self._options
        selected = (options.select, options.ignore) if options is not None else ((), ())
        for passes in code_filters(*selected) if findings else ():
            findings = passes(source, findings)
        return findings


class SettingsByFolder:
    """The settings of each folder, read once until they are forgotten."""

    def __init__(self) -> None:
        self._known: dict[str, Settings] = {}

    def of_file(self, path: str | None) -> Settings:
        """The settings for a file; the defaults for a text that is not a file."""
        if path is None:
            return Settings(None)
        return self.of_folder(os.path.dirname(os.path.abspath(path)))

    def of_folder(self, folder: str) -> Settings:
        """The settings for the files of a folder."""
        if folder not in self._known:
            self._known[folder] = Settings(folder)
        return self._known[folder]

    def forget(self) -> None:
        """Read all settings anew when they are next asked for."""
        self._known.clear()
