"""Where the engine's own files are."""

from pathlib import Path

_PACKAGE_FOLDER = Path(__file__).parent.parent


def GetTarnFilename(relative_path: str) -> str:
    """The absolute path of a file of the installation, such as "resources/pgen-grammars/NAME"."""
    return str(_PACKAGE_FOLDER / relative_path)
