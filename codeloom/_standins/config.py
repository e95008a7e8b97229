"""Where the engine's own files are."""

from pathlib import Path

import codeloom


def GetTarnFilename(relative_path: str) -> str:
    """The absolute path of a file of the installation, such as "resources/pgen-grammars/NAME".

    A package in editable mode lies in two folders. A file that is in neither is named as it would
    be in the first, so that the failure to open it tells where it should be.
    """
    places = [Path(folder, relative_path) for folder in codeloom.__path__]
    return str(next((place for place in places if place.exists()), places[0]).absolute())
