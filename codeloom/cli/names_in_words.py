"""Records in words: what a line does with names, as a person would say it."""

from collections.abc import Iterable, Iterator
from itertools import groupby

from codeloom.records import CRecord, RecordOfPair
from codeloom.symbolinfo import kIterationSubscript

# In the order in which a line's statements stand.
_LABELS = (
    "binds", "global", "nonlocal", "types", "takes", "inside", "knows", "calls", "reads", "returns", "yields"
)  # fmt: skip
_LABEL_OF_KIND = {
    "Global": "global",
    "Nonlocal": "nonlocal",
    "TypeParameter": "types",
    "WithinExpr": "inside",
    "Called": "calls",
    "Get": "reads",
}
_LABEL_OF_NAME = {"return": "returns", "yield": "yields", "*": "binds"}
_ITEM_MARK = kIterationSubscript.decode()


def Statements(records: list[CRecord]) -> Iterator[tuple[str, list[list[str]]]]:
    """What records say: a label, and rows of items behind it.

    Names of which no more is said share a row; each of the others has its own.
    """
    bound = {record.name for record in records if record.kind.name == "Set" and not record.of_arg}
    said: dict[str, dict[str, _Said]] = {label: {} for label in _LABELS}
    for record in records:
        of_label = said[_Label(record, bound)]
        of_label.setdefault(record.name, _Said(record.name)).Add(record)
    for label, by_name in said.items():
        if by_name:
            yield label, _Rows(by_name.values())


def _Label(record: CRecord, bound: set[str]) -> str:
    label = _LABEL_OF_KIND.get(record.kind.name) or _LABEL_OF_NAME.get(record.name)
    if label is not None:
        return label
    if record.of_arg:
        return "takes"
    return "binds" if record.name in bound else "knows"


class _Said:
    """What a line says of one name in one role."""

    def __init__(self, name: str) -> None:
        is_numbered = name.startswith(":a:") and name[3:].isdecimal()
        self._fName = f"argument {int(name[3:]) + 1}" if is_numbered else name
        self._fIsOutcome = name in _LABEL_OF_NAME
        self._fHints: list[str] = []
        self._fValues: list[str] = []
        self._fCalls: list[str] = []

    def Add(self, record: CRecord) -> None:
        """Take in one record of the name."""
        match record.kind.name:
            case "Set" | "Get" | "Global" | "Nonlocal" | "WithinExpr" | "ImportAsName":
                pass
            case "TypeHint":
                self._fHints.append(record.payload)
            case "TypeParameter":
                stars = record.payload[: len(record.payload) - len(record.payload.lstrip("*"))]
                self._fName = stars + self._fName
                self._fHints += [spec] if (spec := record.payload.lstrip("* ")) else []
            case "Import" if record.payload == record.name:
                self._fName = f"module {record.name}"
            case "FromImport" if record.payload.endswith(f" {record.name}"):
                self._fName = _Value(record)
            case "Called":
                self._fCalls.append(self._fName + record.payload)
            case _:
                self._fValues.append(_Value(record))

    @property
    def is_bare(self) -> bool:
        """True when no more is said than the name."""
        return not (self._fHints or self._fValues or self._fCalls)

    def __str__(self) -> str:
        if self._fCalls:
            return ", ".join(self._fCalls)
        values = " or ".join(self._fValues)
        hints = " or ".join(self._fHints)
        if self._fIsOutcome:
            return values or hints or self._fName
        return self._fName + (f": {hints}" if hints else "") + (f" = {values}" if values else "")


def _Rows(said: Iterable[_Said]) -> list[list[str]]:
    rows: list[list[str]] = []
    for is_bare, group in groupby(said, key=lambda one: one.is_bare):
        items = [str(one) for one in group]
        rows += [items] if is_bare else [[item] for item in items]
    return rows


def _Value(record: CRecord) -> str:
    """What a name stands for, in words."""
    match record.kind.name, record.value:
        case "TypedLiteral", (str(type_name), value):
            return value or _SomeInstance(type_name)
        case "Import", module:
            return f"module {module}"
        case "FromImport", (module, "*"):
            return f"everything in {module}"
        case "FromImport", (module, name):
            return f"{name} from {module}"
        case "PlainEquiv", _ if record.name == "yield":
            return _Yielded(record.payload)
        case _:
            return _ItemInWords(record.payload)


def _Yielded(text: str) -> str:
    if text == "from" or text.startswith("from "):
        rest = text[len("from ") :].encode("utf-8", "surrogateescape")
        return f"from {_Value(RecordOfPair(b'yield', rest))}"
    return _ItemInWords(text) if text else "something"


def _ItemInWords(text: str) -> str:
    if text.endswith(":"):
        return _SomeInstance(text[:-1])
    whole, mark, part = text.rpartition(_ITEM_MARK)
    if not mark:
        return text
    return f"{part} of an item of {whole}" if part else f"an item of {whole}"


def _SomeInstance(class_name: str) -> str:
    return f"{'an' if class_name[:1] in 'aeiouAEIOU' else 'a'} {class_name}"
