"""Where the engine's own files are."""

import os.path

import codeloom


def GetTarnFilename(relative_path: str) -> str:
    """The absolute path of a file of the installation, such as "resources/pgen-grammars/NAME".

    A package may lie in several folders, as in editable mode. A file that is in none of them is named
    as it would be in the first, so that the failure to open it tells where it should be.
    """
    places = [os.path.abspath(os.path.join(folder, relative_path)) for folder in codeloom.__path__]
    return next((place for place in places if os.path.exists(place)), places[0])
