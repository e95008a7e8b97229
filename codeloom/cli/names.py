"""`codeloom names`: what each logical line reads and binds, and what it says of these names."""

from codeloom.cli import names_formats
from codeloom.cli.item_command import ItemCommand


class NamesCommand(ItemCommand):
    """Prints the names of each logical line."""

    NAME = "names"
    HELP = "show what each logical line reads and binds, and what it says of these names"
    DESCRIPTION = (
        "Show what each logical line reads and binds, and what it says of these names. Lines that "
        "say nothing of names are left out; a line that isn't sound stands in its place with its "
        "fault. The exit status is 0 when all are sound, 1 when some aren't, 2 on wrong use or when "
        "a file can't be read."
    )
    FORMATS = names_formats.FORMATS
    FORMAT_HELP = "text; or jsonl, with an object for each record on a row"
