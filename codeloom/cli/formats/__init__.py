"""The forms in which a run is written, one a file; `FORMATS` lists them."""

from importlib import import_module

TYPE_CHECKING = False  # `typing` takes long to import
if TYPE_CHECKING:
    from codeloom.cli.formats.base import Format

# The module of each format below this package, and its class; a run loads only its own.
FORMATS = {
    "text": ("text", "TextFormat"),
    "concise": ("concise", "ConciseFormat"),
    "json": ("json", "JsonFormat"),
    "jsonl": ("json", "JsonLinesFormat"),
    "github": ("github", "GithubFormat"),
    "gitlab": ("gitlab", "GitlabFormat"),
    "junit": ("junit", "JunitFormat"),
    "sarif": ("sarif", "SarifFormat"),
    "dot": ("dot", "DotFormat"),
}
# Those that hold whatever a command shows, with those for problems alone, and with those for trees alone.
FOR_ALL_ITEMS = ("text", "concise", "json", "jsonl")
FOR_PROBLEMS = (*FOR_ALL_ITEMS, "github", "gitlab", "junit", "sarif")
FOR_TREES = (*FOR_ALL_ITEMS, "dot")


def format_named(name: str) -> "type[Format]":
    """The class of a format."""
    module, class_name = FORMATS[name]
    found: type[Format] = getattr(import_module(f"{__name__}.{module}"), class_name)
    return found
