"""The rows of a text. They end at LF, CR LF and CR, and at nothing else."""

import re

ROW_END = re.compile(r"\r\n|\r|\n")


def RowTexts(text: str) -> list[str]:
    """The rows of a text, without their ends."""
    return ROW_END.split(text)
