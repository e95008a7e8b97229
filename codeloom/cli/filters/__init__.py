"""Which problems of a file count: by code, by comments, by what was there before, by what has changed."""

from collections.abc import Callable, Sequence

from codeloom.cli.items import Finding
from codeloom.cli.source import Source

# Those of a file's problems that pass.
Filter = Callable[[Source, Sequence[Finding]], Sequence[Finding]]
