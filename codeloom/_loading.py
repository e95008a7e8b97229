"""What the engine needs of the interpreter while it loads."""

import importlib
import sys
import warnings
from collections.abc import Iterator
from contextlib import contextmanager
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


@contextmanager
def StandinsOffered() -> Iterator[None]:
    """Offer our own modules under the host's names, where the host hasn't supplied them.

    A user's module that merely has such a name is neither run nor used, and `sys.modules` is
    afterwards as it was.
    """
    offered = [
        name for modules in _HOST_MODULES.values() if not _IsSuppliedByHost(modules) for name in modules
    ]
    standins = {name: importlib.import_module(f"codeloom._standins.{name}") for name in offered}
    hidden = {name: sys.modules[name] for name in offered if name in sys.modules}
    sys.modules.update(standins)
    try:
        yield
    finally:
        for name in offered:
            sys.modules.pop(name, None)
        sys.modules.update(hidden)


def ImportPgen() -> ModuleType:
    """The interpreter's pgen module, for its operator table, without the warning of its own age.

    The interpreter has none from 3.13 on; ours holds the same table.
    """
    if sys.version_info >= (3, 13):
        return importlib.import_module("codeloom._standins.pgen")
    with warnings.catch_warnings():
        warnings.simplefilter("ignore", DeprecationWarning)
        return importlib.import_module("lib2to3.pgen2.pgen")
