"""The scripts in tools/, as modules."""

import importlib.util
from pathlib import Path
from types import ModuleType

TOOLS = Path(__file__).parent.parent / "tools"


def tool_named(name: str) -> ModuleType:
    """The script of this name, run as a module of its own."""
    spec = importlib.util.spec_from_file_location(name, TOOLS / f"{name}.py")
    assert spec is not None and spec.loader is not None
    tool = importlib.util.module_from_spec(spec)
    spec.loader.exec_module(tool)
    return tool
