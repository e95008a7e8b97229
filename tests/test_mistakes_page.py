"""The page of typical mistakes says what is said of them."""

import importlib.util
from pathlib import Path

ROOT = Path(__file__).parent.parent


def test_our_words():
    path = ROOT / "tools/make_mistakes_page.py"
    spec = importlib.util.spec_from_file_location("make_mistakes_page", path)
    tool = importlib.util.module_from_spec(spec)
    spec.loader.exec_module(tool)
    said = [tool.as_code(tool.of_codeloom(source, version)) for _, source, version in tool.mistakes()]
    assert len(said) >= 60 and tool.as_code("nothing") not in said
    shown = tool.of_codeloom_in(tool.PAGE.read_text("utf-8"))
    assert shown == said, "run: python tools/make_mistakes_page.py python3.13 ruff"
