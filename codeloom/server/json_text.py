"""Answers with very many parts: JSON without an object for each, made in slices where they are long."""

import json
from collections.abc import Sequence
from typing import Any

# What the protocol calls an object, by the names of its fields.
Fields = dict[str, Any]


class JsonText:
    """A part of a message that is JSON already."""

    def __init__(self, parts: Sequence[str]) -> None:
        self._parts = parts

    def encoded(self) -> bytes:
        """As it is sent."""
        return "".join(self._parts).encode()

    @classmethod
    def of(cls, value: object) -> "JsonText":
        """A value with the fields that the protocol names."""
        return cls([json.dumps(value)])

    @classmethod
    def of_list(cls, parts: Sequence[str]) -> "JsonText":
        """A list of items, in texts that have some of them."""
        return cls(["[", ",".join(part for part in parts if part), "]"])


def items_as_json(items: Sequence[object]) -> str:
    """Items of a list, without the signs around it."""
    return json.dumps(items, separators=(",", ":"))[1:-1]
