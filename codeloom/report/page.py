"""The page: what is collected of each file, and at the end its HTML."""

import json
import re
from base64 import b64encode
from collections.abc import Iterator, Sequence
from datetime import datetime
from hashlib import sha256
from importlib.resources import files
from typing import Any

from jinja2 import Environment, PackageLoader, StrictUndefined
from jinja2.utils import htmlsafe_json_dumps
from markupsafe import Markup, escape

from codeloom import __version__
from codeloom.cli.items import Finding
from codeloom.cli.source import Source
from codeloom.cli.tally import Tally
from codeloom.report.counts import Counts
from codeloom.report.excerpts import readable
from codeloom.report.file_data import row_fields, shown_path, summary_fields

# Problems that are shown; others are counted.
_MOST_OF_FILE = 200
_MOST_IN_ALL = 20_000
_ASSETS = "assets"
_SCRIPTS = ("base.js", "names.js", "rows.js", "files.js", "folders.js", "main.js")


class Page:
    """Collects files and writes the page.

    With `is_whole` it holds all rows of the files, otherwise those around problems. `python` is the version
    that they are read as, `date` the time that the page bears.
    """

    def __init__(self, title: str, python: str, *, is_whole: bool, date: datetime | None = None) -> None:
        self._title = title
        self._python = python
        self._is_whole = is_whole
        self._date = date
        self._files: list[dict[str, Any]] = []
        self._rows: dict[int, Markup] = {}
        self._failures: list[tuple[str, str]] = []
        self._counts = Counts()
        self._room = _MOST_IN_ALL

    def add(self, source: Source, findings: Sequence[Finding]) -> None:
        """Take in a file with its problems."""
        shown = findings[: min(_MOST_OF_FILE, self._room)]
        self._room -= len(shown)
        fields = summary_fields(source, findings, shown)
        self._counts.add(fields["path"], findings)
        if shown or self._is_whole:
            # As text, which takes less memory than the objects.
            self._rows[len(self._files)] = _json(row_fields(source, shown, is_whole=self._is_whole))
        self._files.append(fields)

    def add_failure(self, path: str, reason: str) -> None:
        """Take in a file that can't be read."""
        self._failures.append((shown_path(path), readable(reason)))

    def html(self, tally: Tally) -> Iterator[str]:
        """The page, piece by piece."""
        template = _environment().get_template("page.html")
        style, script = _asset("style.css"), "\n".join(map(_asset, _SCRIPTS))
        yield from template.generate(
            title=readable(self._title),
            version=__version__,
            python=self._python,
            date=self._date,
            tally=tally,
            counts=self._counts,
            failures=self._failures,
            files=self._files,
            files_json=_json(self._files),
            rows=self._rows,
            style=Markup(style),
            script=Markup(script),
            style_hash=_hash(style),
            script_hash=_hash(script),
        )


def _environment() -> Environment:
    environment = Environment(
        loader=PackageLoader(__package__, _ASSETS),
        autoescape=True,
        undefined=StrictUndefined,
        trim_blocks=True,
        lstrip_blocks=True,
    )
    environment.filters["code_marked"] = _code_marked
    return environment


def _code_marked(text: str) -> Markup:
    """A text with what is between backticks as code."""
    return Markup(re.sub("`([^`]+)`", r"<code>\1</code>", str(escape(text))))


def _asset(name: str) -> str:
    return files(__package__).joinpath(_ASSETS, name).read_text("utf-8")


def _json(value: object) -> Markup:
    """JSON that nothing within a script element can end."""
    return htmlsafe_json_dumps(value, json.dumps, ensure_ascii=False, separators=(",", ":"))


def _hash(text: str) -> str:
    """What a content security policy knows a script or a style by."""
    return f"sha256-{b64encode(sha256(text.encode()).digest()).decode()}"
