"""What `codeloom names` shows of single appearances of names."""

from collections.abc import Iterator
from typing import Any

from codeloom._analysis import Occurrence, Scope
from codeloom.cli.console import Colour, Console
from codeloom.cli.excerpt import printable
from codeloom.cli.items import Item
from codeloom.cli.source import Source


class OccurrenceItem(Item):
    """One appearance of a name, with what it does there or what is found about it."""

    def __init__(self, source: Source, occurrence: Occurrence, finding: str | None = None) -> None:
        self._source = source
        self._occurrence = occurrence
        self._finding = finding  # "unused" or "undefined"

    def show(self, console: Console) -> None:
        """The same as for simple tools, the place in bold."""
        place = console.coloured(Colour.BOLD, self._source.label(self._occurrence.range))
        console.print_row(f"{place} {printable(self._text())}")

    def rows(self) -> Iterator[str]:
        """Place, finding or role, name, and where the name is bound."""
        yield f"{self._source.label(self._occurrence.range)} {printable(self._text())}"

    def fields(self) -> Iterator[dict[str, Any]]:
        """An object with all that is known of it."""
        occurrence = self._occurrence
        resolution = occurrence.resolution
        yield {
            "type": "occurrence",
            **self._source.fields(occurrence.range),
            "name": occurrence.name,
            "role": occurrence.role.value,
            "finding": self._finding,
            "scope": title(occurrence.scope),
            "resolution": resolution and resolution.value,
            "home": title(occurrence.home) if occurrence.home else None,
        }

    def _text(self) -> str:
        occurrence = self._occurrence
        role = f"{occurrence.role.value} {occurrence.name}"
        if self._finding is not None:
            return f"{self._finding} {role} in {title(occurrence.scope)}"
        home = occurrence.home
        if home is None:
            where = f" ({occurrence.resolution.value})" if occurrence.resolution else ""
        else:
            where = "" if home == occurrence.scope else f" of {title(home)}"
        return f"{role}{where} in {title(occurrence.scope)}"


def title(scope: Scope) -> str:
    """The kind of a scope, and its name where it has one."""
    return f"{scope.kind.value} {scope.name}".rstrip()
