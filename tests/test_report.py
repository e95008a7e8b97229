"""`codeloom report`: the command, and its page in a real browser."""

import json
import os
import re
import shutil
from contextlib import chdir
from pathlib import Path

import pytest

from codeloom.cli import main

CHROMIUM = shutil.which("chromium")
LAYOUT_FAULTS = Path(__file__).with_name("layout_faults.js").read_text("utf-8")
IN_BROWSER = pytest.mark.skipif(CHROMIUM is None, reason="there is no chromium")

MARKUP = '</script><img src=x onerror="window.hacked=1">{{7*7}}'
FILLER = "".join(f"filler_{i} = {i}\n" for i in range(300))
BOX = f"""\
import os

class Box:
    def area(self, width, height=1):
        total = width * height
        return undefined + total

def broken(a, b:
    pass

x = [1, 2}}
{FILLER}"""
BOOK = {
    "cells": [
        {"cell_type": "markdown", "source": "text"},
        {"cell_type": "code", "source": "%magic\nfirst = 1\nitems = ("},
        {"cell_type": "code", "source": "ok = 1\nsecond = first +\n"},
    ]
}
SOURCES = {
    "src/pkg/box.py": BOX,
    "src/pkg/sound.py": "def fine():\n    return 1\n",
    "src/old.py": "print 1\nprint 2\nprint 3\n",
    f"src/{MARKUP.replace('/', '')}.py": f"a = '{MARKUP}' b\n# \"><svg onload='window.hacked=1'>\n",
    b"src/odd\xff\x01\xe2\x80\xae.py": b"a = 'x\0y' +\nb = '\xff'\n",
    "src/wide.py": f"\U0001d431 = '\U0001f600' + (1, # {'x' * 3000}\n\ty = 1\n",
    "src/book.ipynb": json.dumps(BOOK),
}


def write(root, sources):
    for name, text in sources.items():
        path = os.path.join(os.fsencode(root), os.fsencode(name))
        os.makedirs(os.path.dirname(path), exist_ok=True)
        with open(path, "wb") as file:
            file.write(text if isinstance(text, bytes) else text.encode())


def report_on(folder, *arguments, status=1):
    """The page on what is in a folder."""
    with chdir(folder):
        assert main(["report", *arguments, "-q", "-o", "page.html"]) == status
    return Path(folder) / "page.html"


@pytest.fixture(scope="module")
def page_file(tmp_path_factory):
    """The page on sources of all sorts."""
    folder = tmp_path_factory.mktemp("report")
    write(folder, SOURCES)
    return report_on(folder, "src", "absent.py", status=2)


def data(page, number=None):
    """What a page holds for its scripts: all files, or the rows of one."""
    name = "data-files" if number is None else f"data-rows-{number}"
    found = re.search(f'<script type="application/json" id="{name}">(.*?)</script>', page.read_text("utf-8"))
    return found and json.loads(found[1])


def test_what_the_page_holds(page_file):
    files = data(page_file)
    by_path = {file["path"]: (number, file) for number, file in enumerate(files)}
    assert set(by_path) == {
        *(name for name in SOURCES if isinstance(name, str)),
        "src/odd\\xff\N{REPLACEMENT CHARACTER}\N{REPLACEMENT CHARACTER}.py",
    }
    number, box = by_path["src/pkg/box.py"]
    assert [(each["code"], each["at"][:2]) for each in box["problems"]] == [
        ("CL202", [8, 11]),
        ("CL204", [11, 10]),
    ]
    assert {"Box", "total", "undefined"} <= set(box["names"].split("\n"))
    held = data(page_file, number)
    assert held["whole"] and held["rows"] == BOX.splitlines()
    assert held["shown"] == [[6, 13]]
    column, length, fact, records = held["names"][4][:4]
    assert (column, length) == (8, 5)
    assert held["facts"][fact] == ["bind", "function area"]
    assert held["records"][records] == ["binds total = width * height"]

    number, _ = by_path["src/wide.py"]
    start, text, cut_after = data(page_file, number)["rows"][0]
    assert (
        start == 0
        and len(text) == 1000
        and len(text) + cut_after == len(SOURCES["src/wide.py"].splitlines()[0])
    )
    number, book = by_path["src/book.ipynb"]
    assert [problem["cell"] for problem in book["problems"]] == [[2, 3], [3, 2]]
    assert data(page_file, number)["rows"] == [
        "%magic",
        "first = 1",
        "items = (",
        "",
        "ok = 1",
        "second = first +",
    ]


def test_rows_around_problems(tmp_path):
    write(tmp_path, {"a.py": "".join(f"x = {i}\n" for i in range(50)) + "y = )\n", "b.py": "z = 1\n"})
    page = report_on(tmp_path, "--source", "around", ".")
    assert data(page, 0)["shown"] == [[49, 51]]
    assert data(page, 0)["rows"] == ["x = 48", "x = 49", "y = )"]
    assert data(page, 1) is None


def test_more_problems_than_are_shown(tmp_path):
    write(tmp_path, {"a.py": "x = )\n" * 1000 + "y = (\n"})
    page = report_on(tmp_path, ".")
    (file,) = data(page)
    assert file["errors"] == 1001 and len(file["problems"]) == 200
    assert file["more_codes"] == "CL202 CL203"


def test_the_same_input_gives_the_same_page(tmp_path, monkeypatch):
    write(tmp_path, {f"a{i}.py": "x = (\ny = a.b(1)\n" for i in range(40)})
    monkeypatch.delenv("SOURCE_DATE_EPOCH", raising=False)
    page = report_on(tmp_path, ".", "--jobs", "1").read_bytes()
    assert report_on(tmp_path, ".", "--jobs", "2").read_bytes() == page
    assert b"<time" not in page
    monkeypatch.setenv("SOURCE_DATE_EPOCH", "1700000000")
    assert b"2023-11-14 22:13 UTC" in report_on(tmp_path, ".").read_bytes()


def test_statuses_and_output(write_files, run_cli):
    folder = write_files({"a.py": "x = 1\n", "b.py": "x = )\n", "page.html": "old"})
    done = run_cli("report", "a.py", "-o", "page.html")
    assert (done.returncode, done.stdout) == (0, "0 problems in 1 file, 1 logical line\n")
    assert "every logical line is sound" in (folder / "page.html").read_text()
    done = run_cli("report", "--title", "<b>", "b.py", "-o", "-")
    assert (done.returncode, done.stderr) == (1, "")
    assert done.stdout.startswith("<!DOCTYPE html>") and "<h1>&lt;b&gt;</h1>" in done.stdout
    assert run_cli("report", "--exit-zero", "b.py", "-o", "page.html").returncode == 0
    done = run_cli("report", "absent.py", "-q", "-o", "page.html")
    assert (done.returncode, done.stdout) == (2, "")
    assert (
        "<code>absent.py</code> <span>No such file or directory</span>" in (folder / "page.html").read_text()
    )
    assert sorted(os.listdir(folder)) == ["a.py", "b.py", "page.html"]


def test_wrong_use(write_files, run_cli, cli_environment):
    folder = write_files({"a.py": "x = 1\n"})
    for output, reason in (
        ("void/page.html", f"there is no folder {folder.resolve()}/void"),
        (".", "it is a folder"),
    ):
        done = run_cli("report", "a.py", "-o", output)
        assert (done.returncode, done.stderr) == (2, f"codeloom: can't write {output}: {reason}\n")
    cli_environment["SOURCE_DATE_EPOCH"] = "today"
    assert "must be a number of seconds" in run_cli("report", "a.py", "-o", "page.html").stderr


def test_a_page_that_cannot_be_finished_leaves_the_old_one(tmp_path, monkeypatch):
    write(tmp_path, {"a.py": "x = 1\n", "page.html": "old"})
    monkeypatch.setattr("codeloom.report.page.Page.html", lambda *_: iter(["half", 1]))
    with pytest.raises(TypeError), chdir(tmp_path):
        main(["report", "a.py", "-o", "page.html"])
    assert {path.name: path.read_text() for path in tmp_path.iterdir()} == {
        "a.py": "x = 1\n",
        "page.html": "old",
    }


def test_without_the_extra(write_files, run_cli):
    folder = write_files({"a.py": "x = 1\n", "jinja2.py": "raise ModuleNotFoundError(name='jinja2')\n"})
    done = run_cli("report", "a.py", "-o", "page.html")
    assert (done.returncode, done.stderr) == (
        2,
        "codeloom: report needs the extra report: pip install 'codeloom[report]'\n",
    )
    assert not (folder / "page.html").exists()


@pytest.fixture(scope="module")
def browser():
    from playwright.sync_api import sync_playwright

    with pytest.MonkeyPatch.context() as patch:
        patch.delenv("LD_PRELOAD", raising=False)  # sanitizers aren't for the browser
        playwright = sync_playwright().start()
    browser = playwright.chromium.launch(executable_path=CHROMIUM)
    yield browser
    browser.close()
    playwright.stop()


@pytest.fixture
def visit(browser):
    """Opens a page; it must ask for nothing else and say nothing on the console."""
    seen = []
    contexts = []

    def open_page(path, fragment="", *, width=1600, scheme="light"):
        context = browser.new_context(viewport={"width": width, "height": 900}, color_scheme=scheme)
        contexts.append(context)
        page = context.new_page()
        page.on("console", lambda message: seen.append(message.text))
        page.on("pageerror", lambda error: seen.append(str(error)))
        page.on("request", lambda request: requested.append(request.url))
        requested = []
        page.goto(f"{path.as_uri()}{fragment}")
        page.locator("#found", has_text="file").wait_for()
        assert len(requested) == 1
        page.requested = requested
        return page

    yield open_page
    for context in contexts:
        for page in context.pages:
            assert len(page.requested) == 1
        context.close()
    assert not seen


def summary_of(page, name):
    return page.locator("#list summary", has_text=name)


@IN_BROWSER
@pytest.mark.parametrize("width", [360, 1600])
@pytest.mark.parametrize("scheme", ["light", "dark"])
def test_layout(page_file, visit, width, scheme):
    page = visit(page_file, width=width, scheme=scheme)
    assert page.evaluate(LAYOUT_FAULTS) == []
    for summary in page.locator("#list summary").all():
        summary.click()
    page.locator(".name").first.hover()
    assert page.evaluate(LAYOUT_FAULTS) == []
    tip = page.locator("#tip").bounding_box()
    assert tip["x"] >= 0 and tip["x"] + tip["width"] <= width
    ground = page.evaluate("getComputedStyle(document.documentElement).backgroundColor")
    assert (ground == "rgb(17, 20, 26)") is (scheme == "dark")


@IN_BROWSER
def test_markup_stays_text(page_file, visit):
    page = visit(page_file)
    for summary in page.locator("#list summary").all():
        summary.click()
    assert page.locator("#list :is(img, script, svg)").count() == 0
    assert page.evaluate("window.hacked") is None
    assert summary_of(page, MARKUP.replace("/", "")).count() == 1
    rows = page.locator(".row code").all_text_contents()
    assert f"a = '{MARKUP}' b" in rows
    assert "# \"><svg onload='window.hacked=1'>" in rows
    assert "a = 'x\N{REPLACEMENT CHARACTER}y' +" in rows
    # Columns are characters, which a browser counts differently beyond the first plane.
    row = page.locator(".row code", has_text="x" * 100)
    assert row.evaluate("row => [...row.childNodes].map(node => node.textContent).slice(0, 2)") == [
        "\U0001d431 = '\U0001f600' + ",
        "(",
    ]


@IN_BROWSER
def test_keyboard(page_file, visit):
    page = visit(page_file)

    def focused(expression):
        return page.evaluate(f"(() => {{ const at = document.activeElement; return {expression}; }})()")

    def press(*keys):
        for key in keys:
            page.keyboard.press(key)

    def tab_until(expression):
        for _ in range(60):
            press("Tab")
            if focused(expression):
                return
        pytest.fail(f"the tabulator never reaches {expression}")

    press("Tab")
    assert focused("at.className") == "skip"
    press("Enter", "Tab")
    tab_until("at.matches('#search')")
    page.keyboard.type("box.py")
    page.locator("#found", has_text="found: 1 file").wait_for()
    tab_until("at.matches('#list summary')")
    press("Enter")
    assert page.locator("#list details").first.get_attribute("open") is not None
    tab_until("at.matches('.name')")
    press("ArrowRight", "ArrowRight")
    assert focused("at.textContent") == "total" and page.locator("#tip").is_visible()
    press("Escape")
    assert page.locator("#tip").is_hidden()
    tab_until("at.matches('.problem .code')")
    press("Enter")
    page.locator("#code-CL202[open]").wait_for()
    assert focused("at.closest('details').id") == "code-CL202"
    press("/")
    assert focused("at.id") == "search"
    page.locator("#search").fill("")
    page.locator("#found", has_text=re.compile("^7 files")).wait_for()
    page.locator("#list summary").first.focus()
    press("ArrowDown", "ArrowDown", "ArrowUp")
    assert focused("at.closest('li') === at.closest('ol').children[1]")
    page.locator("[role=treeitem]").first.focus()
    press("ArrowDown", "ArrowRight", "ArrowDown", "Enter")
    assert page.locator("#found").inner_text().startswith("found: 2 files in src/pkg,")


@IN_BROWSER
def test_names_on_hover_and_focus(page_file, visit):
    page = visit(page_file, "#file-src/pkg/box.py")
    page.get_by_text("Show row 1 to row 5").click()
    tip = page.locator("#tip")
    assert tip.is_hidden()
    page.locator(".name", has_text="total").first.hover()
    assert tip.inner_text().split("\n\n") == ["total bind in function area", "binds total = width * height"]
    page.locator(".name", has_text="undefined").focus()
    assert tip.inner_text().startswith("undefined read in function area, undefined")
    assert page.locator(".name", has_text="undefined").get_attribute("aria-describedby") == "tip"


@IN_BROWSER
def test_search(page_file, visit):
    page = visit(page_file)

    def found(text):
        page.locator("#search").fill(text)
        page.wait_for_timeout(150)
        return page.locator("#list .path").all_text_contents()

    assert found("pkg sound") == ["src/pkg/sound.py"]
    assert found("cl204") == ["src/pkg/box.py"]
    assert found("never CLOSED") == ["src/book.ipynb", "src/pkg/box.py", "src/wide.py"]
    assert found("filler_299") == ["src/pkg/box.py"]
    summary_of(page, "box.py").click()
    page.locator(".note a", has_text="filler_299").click()
    assert page.locator(".row.target code").inner_text() == "filler_299 = 299"
    assert found("<img") == [f"src/{MARKUP.replace('/', '')}.py"]
    assert found("nothing has this") == []
    assert page.locator("#found").inner_text() == "Nothing has “nothing has this”."
    found("")
    page.locator("#faulty").check()
    assert "src/pkg/sound.py" not in page.locator("#list .path").all_text_contents()
    page.locator("#sort").select_option("path")
    paths = page.locator("#list .path").all_text_contents()
    assert paths == sorted(paths)


@IN_BROWSER
def test_links_lead_to_rows_and_codes(page_file, visit):
    page = visit(page_file, "#file-src/pkg/box.py:250")
    row = page.locator(".row.target")
    assert row.locator("code").inner_text() == "filler_238 = 238" and row.is_visible()
    page.goto(f"{page_file.as_uri()}#file-src/book.ipynb")
    assert page.locator(".source .cell").all_text_contents() == ["cell 2", "cell 3"]
    assert page.locator(".problem .place", has_text="cell 3, 2:16").is_visible()
    page.goto(f"{page_file.as_uri()}#folder-src/pkg")
    page.locator("#found", has_text="in src/pkg").wait_for()
    assert page.locator("[role=treeitem][aria-selected=true] > .label").inner_text().split() == [
        "pkg",
        "2",
        "problems",
    ]


@IN_BROWSER
def test_theme_and_opening_all(page_file, visit):
    page = visit(page_file)
    theme = page.locator("#theme")
    theme.click()
    theme.click()
    assert theme.inner_text() == "Theme: dark"
    page.reload()
    assert page.evaluate("getComputedStyle(document.body).color") == "rgb(230, 234, 241)"
    page.requested.pop()
    page.get_by_text("Open or close all").click()
    assert page.locator("#list details[open]").count() == len(SOURCES)
    page.locator("#search").fill("box")
    page.locator("#found", has_text="found: 1 file").wait_for()
    assert page.locator(".source").count() == 1
    page.get_by_text("Open or close all").click()
    summary_of(page, "box.py").click()
    assert page.url.endswith("#file-src/pkg/box.py")


@IN_BROWSER
def test_folders_of_absolute_paths(tmp_path, visit):
    write(tmp_path, {"elsewhere/a/b.py": "x = )\n", "elsewhere/c/d/e.py": "x = 1\n", "here/page.html": ""})
    path = report_on(tmp_path / "here", str(tmp_path / "elsewhere"))
    page = visit(path, f"#folder-{tmp_path}/elsewhere/c/d")
    folders = page.locator("[role=treeitem] > .label > .name-of-folder").all_text_contents()
    assert folders == ["all files", f"{tmp_path}/elsewhere", "a", "c/d"]
    assert page.locator("#list .path").all_text_contents() == [f"{tmp_path}/elsewhere/c/d/e.py"]


@IN_BROWSER
def test_a_thousand_files(tmp_path, visit):
    write(tmp_path, {f"p{i % 30}/m{i}.py": f"name_{i} = 1\nx = )\n" + FILLER for i in range(1000)})
    path = report_on(tmp_path, ".")
    assert path.stat().st_size < 8_000_000
    page = visit(path)
    assert page.evaluate("document.querySelectorAll('*').length") < 4000
    page.locator("#search").fill("name_77")
    page.locator("#found", has_text="found: 11 files").wait_for()
    page.locator("#search").fill("")
    page.locator("#more", has_text="Show 200 more of 800").click()
    assert page.locator("#list summary").count() == 400


@IN_BROWSER
def test_without_scripts(page_file, browser):
    context = browser.new_context(java_script_enabled=False)
    page = context.new_page()
    page.goto(page_file.as_uri())
    assert "11:10 CL204 closing parenthesis" in page.inner_text("noscript")
    assert page.locator("#browser").is_hidden()
    context.close()
