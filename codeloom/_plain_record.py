"""The base of plain records: public fields, compared and shown by their values.

The engine loads these classes, so they do without `dataclasses`, which takes longer to import than
all of the engine.
"""


class CPlainRecord:
    """A record with the fields that its constructor sets."""

    def __eq__(self, other: object) -> bool:
        return vars(self) == vars(other) if type(self) is type(other) else NotImplemented

    __hash__ = None  # type: ignore[assignment]

    def __repr__(self) -> str:
        fields = ", ".join(f"{name}={value!r}" for name, value in vars(self).items())
        return f"{type(self).__name__}({fields})"
