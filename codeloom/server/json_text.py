"""Long answers as JSON that is made in slices: other messages have their turn between them."""

import json
from collections.abc import Sequence


class JsonText:
    """A part of a message that is JSON already."""

    def __init__(self, parts: Sequence[str]) -> None:
        self._parts = parts

    def encoded(self) -> bytes:
        """As it is sent."""
        return "".join(self._parts).encode()

    @classmethod
    def of_list(cls, parts: Sequence[str]) -> "JsonText":
        """A list of items, in texts that have some of them."""
        return cls(["[", ",".join(part for part in parts if part), "]"])


def items_as_json(items: Sequence[object]) -> str:
    """Items of a list, without the signs around it."""
    return json.dumps(items, separators=(",", ":"))[1:-1]
