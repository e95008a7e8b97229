"""How wide the terminal is."""

import os
import sys


def terminal_width(otherwise: int) -> int:
    """In columns, as `shutil.get_terminal_size` has it, which takes long to import; or `otherwise`."""
    told = os.environ.get("COLUMNS", "")
    if told.isascii() and told.isdigit() and int(told) > 0:
        return int(told)
    try:
        return os.get_terminal_size(sys.__stdout__.fileno()).columns or otherwise  # type: ignore[union-attr]
    except (AttributeError, ValueError, OSError):  # there is no output, or it is no terminal
        return otherwise
