"""codeloom analyses Python source one logical line at a time.

For each line it says whether the line is sound, with the exact place of a fault, and what it says
about names. A broken line never spoils its neighbours.

    for problem in codeloom.analyze(source).problems:
        print(problem)

The engine beneath is the native module `codeloom.treesift`.
"""

import sys

TYPE_CHECKING = False  # true for those who check types; `typing` takes longer to import than this package
if TYPE_CHECKING:
    from codeloom._analysis import (
        Analysis,
        Hint,
        HintKind,
        Limit,
        LimitKind,
        Line,
        LineKind,
        Occurrence,
        Parameter,
        ParameterKind,
        Problem,
        Range,
        Record,
        RecordKind,
        Resolution,
        Role,
        Scope,
        ScopeKind,
        Signature,
        Symbol,
        Table,
    )
    from codeloom._document import Change, Document
    from codeloom._face import analyze, analyze_file, analyze_paths, read_notebook
    from codeloom.reading.languages import NEWEST, VERSIONS
    from codeloom.reading.notebooks import Notebook

if "t" in getattr(sys, "abiflags", ""):
    raise ImportError(
        "codeloom doesn't run on a free-threaded Python: use a usual build of CPython 3.11, 3.12 or 3.13"
    )

__version__ = "0.1.0"

__all__ = [
    "NEWEST",
    "VERSIONS",
    "Analysis",
    "Change",
    "Document",
    "Hint",
    "HintKind",
    "Limit",
    "LimitKind",
    "Line",
    "LineKind",
    "Notebook",
    "Occurrence",
    "Parameter",
    "ParameterKind",
    "Problem",
    "Range",
    "Record",
    "RecordKind",
    "Resolution",
    "Role",
    "Scope",
    "ScopeKind",
    "Signature",
    "Symbol",
    "Table",
    "analyze",
    "analyze_file",
    "analyze_paths",
    "read_notebook",
]

# Where the names are, which are imported when they are first asked for, so that `import codeloom` is cheap.
_MODULES = {
    **dict.fromkeys(("analyze", "analyze_file", "analyze_paths", "read_notebook"), "codeloom._face"),
    **dict.fromkeys(("Change", "Document"), "codeloom._document"),
    **dict.fromkeys(("NEWEST", "VERSIONS"), "codeloom.reading.languages"),
    "Notebook": "codeloom.reading.notebooks",
}


def __getattr__(name: str) -> object:
    if name not in __all__:
        raise AttributeError(f"module {__name__!r} has no attribute {name!r}")
    from importlib import import_module

    value = getattr(import_module(_MODULES.get(name, "codeloom._analysis")), name)
    globals()[name] = value
    return value


def __dir__() -> list[str]:
    return sorted({*globals(), *__all__})
