"""`codeloom check`: which logical lines of the files aren't sound."""

from collections.abc import Iterable

from codeloom.cli.formats import FOR_PROBLEMS
from codeloom.cli.items import Finding, Item
from codeloom.cli.source import Source
from codeloom.cli.source_command import SourceCommand


class CheckCommand(SourceCommand):
    """Shows the problems of each file, and a summary at the end."""

    NAME = "check"
    DESCRIPTION = (
        "Report every logical line that is broken, with the place of each fault. The exit status is "
        "0 if there is no problem, 1 if there are some, 2 for wrong use or a file that can't be read."
    )
    EXAMPLES = (
        "codeloom check src tests",
        "codeloom check --python 2.7 old.py",
        "codeloom check --diff main .                  # only what this branch changed",
        "codeloom check --format json -o known.json .  # what is there today ...",
        "codeloom check --baseline known.json .        # ... and then only what is new",
        "git show HEAD:a.py | codeloom check --stdin-filename a.py -",
    )
    FORMATS = FOR_PROBLEMS
    HAS_SUMMARY = True

    def items(self, source: Source, findings: list[Finding]) -> Iterable[Item]:
        """The problems."""
        return findings
