"""The base of plain records: public fields, compared and shown by their values.

The engine loads these classes, so they do without `dataclasses`, which takes longer to import than
all of the engine.
"""


class CPlainRecord:
    """A record whose fields are its slots."""

    __slots__: tuple[str, ...] = ()

    def __eq__(self, other: object) -> bool:
        if type(self) is not type(other):
            return NotImplemented
        return all(getattr(self, name) == getattr(other, name) for name in self.__slots__)

    __hash__ = None  # type: ignore[assignment]

    def __repr__(self) -> str:
        fields = ", ".join(f"{name}={getattr(self, name)!r}" for name in self.__slots__)
        return f"{type(self).__name__}({fields})"
