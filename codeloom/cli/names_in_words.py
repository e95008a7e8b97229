"""Records in words: what a line does with names, as a person would say it."""

import re
from collections.abc import Iterable, Iterator
from itertools import groupby

from codeloom._analysis import Record, RecordKind

# In the order of a line's statements.
_LABELS = (
    "binds", "global", "nonlocal", "types", "takes", "inside", "knows", "calls", "reads", "returns", "yields"
)  # fmt: skip
_LABEL_OF_KIND = {
    RecordKind.GLOBAL: "global",
    RecordKind.NONLOCAL: "nonlocal",
    RecordKind.TYPEPARAM: "types",
    RecordKind.WITHIN: "inside",
    RecordKind.CALLED: "calls",
    RecordKind.GET: "reads",
}
_LABEL_OF_NAME = {"return": "returns", "yield": "yields", "*": "binds"}
# How records write what iterating gives, the prefix of a record in a record, and that of a known type.
_ITEM_MARK = "[*]"
_PREFIX = re.compile(":.:")
_LITERAL_PREFIX = ":l:"


def statements(records: list[Record]) -> Iterator[tuple[str, list[list[str]]]]:
    """What records say: a label, and rows of items after it.

    Names of which no more is said share a row; each of the others has its own.
    """
    bound = {record.name for record in records if record.kind is RecordKind.SET and not record.of_argument}
    said: dict[str, dict[str, _Said]] = {label: {} for label in _LABELS}
    for record in records:
        of_label = said[_label(record, bound)]
        of_label.setdefault(record.name, _Said(record.name)).add(record)
    for label, by_name in said.items():
        if by_name:
            yield label, _rows(by_name.values())


def _label(record: Record, bound: set[str]) -> str:
    label = _LABEL_OF_KIND.get(record.kind) or _LABEL_OF_NAME.get(record.name)
    if label is not None:
        return label
    if record.of_argument:
        return "takes"
    return "binds" if record.name in bound else "knows"


class _Said:
    """What a line says of one name in one role."""

    def __init__(self, name: str) -> None:
        is_numbered = name.startswith(":a:") and name[3:].isdecimal()
        self._name = f"argument {int(name[3:]) + 1}" if is_numbered else name
        self._is_outcome = name in _LABEL_OF_NAME
        self._hints: list[str] = []
        self._values: list[str] = []
        self._calls: list[str] = []

    def add(self, record: Record) -> None:
        """Take in one record of the name."""
        match record.kind:
            case (
                RecordKind.SET
                | RecordKind.GET
                | RecordKind.GLOBAL
                | RecordKind.NONLOCAL
                | RecordKind.WITHIN
                | RecordKind.AS
            ):
                pass
            case RecordKind.HINT:
                self._hints.append(record.payload)
            case RecordKind.TYPEPARAM:
                stars = record.payload[: len(record.payload) - len(record.payload.lstrip("*"))]
                self._name = stars + self._name
                self._hints += [spec] if (spec := record.payload.lstrip("* ")) else []
            case RecordKind.IMPORT if record.payload == record.name:
                self._name = f"module {record.name}"
            case RecordKind.FROM if record.payload.endswith(f" {record.name}"):
                self._name = _value(record)
            case RecordKind.CALLED:
                self._calls.append(self._name + record.payload)
            case _:
                self._values.append(_value(record))

    @property
    def is_bare(self) -> bool:
        """True when no more is said than the name."""
        return not (self._hints or self._values or self._calls)

    def __str__(self) -> str:
        if self._calls:
            return ", ".join(self._calls)
        values = " or ".join(self._values)
        hints = " or ".join(self._hints)
        if self._is_outcome:
            return values or hints or self._name
        return self._name + (f": {hints}" if hints else "") + (f" = {values}" if values else "")


def _rows(said: Iterable[_Said]) -> list[list[str]]:
    rows: list[list[str]] = []
    for is_bare, group in groupby(said, key=lambda one: one.is_bare):
        items = [str(one) for one in group]
        rows += [items] if is_bare else [[item] for item in items]
    return rows


def _value(record: Record) -> str:
    """What a name's value is, in words."""
    match record.kind, record.value:
        case RecordKind.LITERAL, (str(type_name), value):
            return value or _some_instance(type_name)
        case RecordKind.IMPORT, module:
            return f"module {module}"
        case RecordKind.FROM, (module, "*"):
            return f"everything in {module}"
        case RecordKind.FROM, (module, name):
            return f"{name} from {module}"
        case RecordKind.IS, _ if record.name == "yield":
            return _yielded(record.payload)
        case _:
            return _item_in_words(record.payload)


def _yielded(text: str) -> str:
    if text == "from" or text.startswith("from "):
        return f"from {_yielded_from(text.removeprefix('from').lstrip())}"
    return _item_in_words(text) if text else "something"


def _yielded_from(text: str) -> str:
    """The value of a `yield from`, which keeps the prefix that tells its kind."""
    if text.startswith(_LITERAL_PREFIX):
        type_name, _, value = text.removeprefix(_LITERAL_PREFIX).partition(":")
        return value.lstrip() or _some_instance(type_name)
    return _item_in_words(_PREFIX.sub("", text, count=1)) if text else "something"


def _item_in_words(text: str) -> str:
    if text.endswith(":"):
        return _some_instance(text[:-1])
    whole, mark, part = text.rpartition(_ITEM_MARK)
    if not mark:
        return text
    return f"{part} of an item of {whole}" if part else f"an item of {whole}"


def _some_instance(class_name: str) -> str:
    return f"{'an' if class_name[:1] in 'aeiouAEIOU' else 'a'} {class_name}"
