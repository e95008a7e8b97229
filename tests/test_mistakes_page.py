"""The page of typical mistakes says what is said of them."""

from tools_of_project import tool_named


def test_our_words():
    tool = tool_named("make_mistakes_page")
    said = [tool.as_code(tool.of_codeloom(source, version)) for _, source, version in tool.mistakes()]
    assert len(said) >= 60 and tool.as_code("nothing") not in said
    shown = tool.of_codeloom_in(tool.PAGE.read_text("utf-8"))
    assert shown == said, "run: python tools/make_mistakes_page.py python3.13 ruff"
