"""How far two sequences are the same: what an edit of one into the other leaves alone."""

TYPE_CHECKING = False  # `typing` takes longer to import than this module
if TYPE_CHECKING:
    from collections.abc import Sequence


def common_start(one: "Sequence[object]", other: "Sequence[object]") -> int:
    """How many items both begin with: of texts characters, of lists whatever these hold."""
    same, most = 0, min(len(one), len(other))
    while same < most:
        middle = (same + most + 1) // 2
        if one[same:middle] == other[same:middle]:
            same = middle
        else:
            most = middle - 1
    return same
