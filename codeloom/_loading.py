"""What the engine needs of the interpreter while it loads."""

import importlib
import sys
from collections.abc import Mapping

TYPE_CHECKING = False
if TYPE_CHECKING:
    from types import ModuleType

# The modules that a host product supplies under top-level names, with the names that must be in them.
_HOST_MODULES: dict[str, dict[str, tuple[str, ...]]] = {
    "config": {"config": ("GetTarnFilename",)},
    "bytebuffer": {"bytebuffer": ("CWritableByteBuffer", "CEncodedByteBufferReader")},
    "tarnutils": {
        "tarnutils": (),
        "tarnutils.reflect": ("ReportCurrentException", "RaiseWithTraceback"),
    },
    "tarnbase": {
        "tarnbase": (),
        "tarnbase.destroyable": ("_CHandlerRecord", "_CEmissionStackItem", "CDestroyable"),
    },
}


def _IsSuppliedByHost(modules: dict[str, tuple[str, ...]]) -> bool:
    return all(
        name in sys.modules and all(hasattr(sys.modules[name], wanted) for wanted in names)
        for name, names in modules.items()
    )


class StandinsOffered:
    """Offers our own modules under the host's names, where the host hasn't supplied them.

    A user's module that merely has such a name is neither run nor used, and `sys.modules` is
    afterwards as it was.
    """

    def __enter__(self) -> None:
        self._offered = [
            name for modules in _HOST_MODULES.values() if not _IsSuppliedByHost(modules) for name in modules
        ]
        standins = {name: importlib.import_module(f"codeloom._standins.{name}") for name in self._offered}
        self._hidden = {name: sys.modules[name] for name in self._offered if name in sys.modules}
        sys.modules.update(standins)

    def __exit__(self, *_: object) -> None:
        for name in self._offered:
            sys.modules.pop(name, None)
        sys.modules.update(self._hidden)


def ImportPgen() -> "ModuleType":
    """The interpreter's pgen module, without the warning of its own age.

    The interpreter has none from 3.13 on; ours holds the same table.
    """
    import warnings

    if sys.version_info >= (3, 13):
        return importlib.import_module("codeloom._standins.pgen")
    with warnings.catch_warnings():
        warnings.simplefilter("ignore", DeprecationWarning)
        return importlib.import_module("lib2to3.pgen2.pgen")


def OperatorTypes(engine: "ModuleType") -> Mapping[str, int]:
    """The operators of the engine's pgen module with their token types.

    Where nobody has looked at that module or imported it, it isn't imported for this, which would take
    longer than all of the engine: ours holds the same table.
    """
    looked_at = "pgen" in vars(engine) or "lib2to3.pgen2.grammar" in sys.modules
    pgen = engine.pgen if looked_at else importlib.import_module("codeloom._standins.pgen")
    table: Mapping[str, int] = pgen.grammar.opmap
    return table
