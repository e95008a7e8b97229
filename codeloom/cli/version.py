"""What `codeloom --version` prints."""

import os
import sys

import codeloom

_GRAMMARS = os.path.join(os.path.dirname(codeloom.__file__), "resources", "pgen-grammars")
_PREFIX = "Python-Grammar-"


def version_text() -> str:
    """The version, those of the grammars, and the Python that runs it."""
    names = os.listdir(_GRAMMARS) if os.path.isdir(_GRAMMARS) else []
    found = [name.removeprefix(_PREFIX) for name in names if name.startswith(_PREFIX)]
    versions = sorted((name for name in found if name.replace(".", "").isdigit()), key=_numbers)
    host = f"{sys.implementation.name} {sys.version.partition(' ')[0]} on {sys.platform}"
    return f"codeloom {codeloom.__version__} (grammars {', '.join(versions)}; {host})"


def _numbers(version: str) -> list[int]:
    return [int(number) for number in version.split(".")]
