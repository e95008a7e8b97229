"""Logical lines: the record of one line, and the kinds of lines."""

from codeloom import _neighbours
from codeloom._neighbours import CLogicalLine, FindMatchOrCaseType

__all__ = ["CLogicalLine", "FindMatchOrCaseType", "IsScopeStartLogical"]

# The logical types are text constants under their own names.
_TYPES = {
    name: value
    for name, value in vars(_neighbours).items()
    if name.startswith("k") and isinstance(value, str)
}
globals().update(_TYPES)
__all__ += _TYPES


def IsScopeStartLogical(logical: CLogicalLine) -> bool:
    """True when a logical opens a scope: the header of a class or a def."""
    return logical.fType in (_TYPES["kClassDef"], _TYPES["kFunctionDef"])
