"""What a user's type checker sees of the package: nothing is `Any`."""

import ast
import json
import subprocess
import sys
from pathlib import Path

import pytest

import codeloom

PACKAGE = Path(codeloom.__file__).parent
STUBS = sorted(PACKAGE.glob("*.pyi"))


@pytest.mark.parametrize("stub", STUBS, ids=lambda stub: stub.name)
def test_the_stubs_leave_nothing_unchecked(stub):
    tree = ast.parse(stub.read_text(encoding="utf-8"))
    named = {getattr(node, "id", getattr(node, "attr", "")) for node in ast.walk(tree)}
    assert "Any" not in named
    for node in ast.walk(tree):
        if isinstance(node, ast.FunctionDef) and node.name != "__init__":
            is_setter = any(ast.unparse(each).endswith(".setter") for each in node.decorator_list)
            assert node.returns is not None or is_setter, node.name


def test_pyright_finds_nothing_in_a_strict_script(tmp_path):
    pytest.importorskip("pyright")
    (tmp_path / "script.py").write_text((Path(__file__).parent / "typed_script.py").read_text())
    (tmp_path / "engine.py").write_text(
        "from codeloom.treesift import CNode, CPGenAnalyzerImpl\n"
        "from codeloom.utils import GetLogicalsFromText\n"
        "analyzer = CPGenAnalyzerImpl((3, 8, 0))\n"
        "for logical in GetLogicalsFromText('x = 1'):\n"
        "    error = analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)\n"
        "    print(error and error.lineno, logical.fToks[0].upper(), logical.fPositions[0][0])\n"
        "def texts(node: CNode) -> list[str | None]:\n"
        "    return [node.fText, *(text for child in node.fChildren or () for text in texts(child))]\n"
    )
    settings = {"typeCheckingMode": "strict", "extraPaths": [str(PACKAGE.parent)], "pythonVersion": "3.11"}
    (tmp_path / "pyrightconfig.json").write_text(json.dumps(settings))
    done = subprocess.run(
        [sys.executable, "-m", "pyright", "--project", str(tmp_path)],
        capture_output=True,
        text=True,
        timeout=110,
    )
    assert "0 errors, 0 warnings" in done.stdout, done.stdout + done.stderr
