"""Write docs/report.png: the page that `codeloom report` makes of the examples, in the system's chromium.

python tools/make_report_picture.py
"""

import contextlib
import pathlib
import shutil
import tempfile

from playwright.sync_api import Page, sync_playwright

from codeloom.cli import main

ROOT = pathlib.Path(__file__).parent.parent
PICTURE = ROOT / "docs/report.png"
_OPEN_FILE = "fstring_field.py"


def write_picture(page_file: pathlib.Path) -> None:
    """Open the page, a file in it, and what is said of a name."""
    with sync_playwright() as playwright:
        browser = playwright.chromium.launch(executable_path=shutil.which("chromium"))
        page = browser.new_page(viewport={"width": 1200, "height": 1420}, color_scheme="light")
        page.goto(page_file.as_uri())
        _arrange(page)
        page.screenshot(path=PICTURE)
        browser.close()


def _arrange(page: Page) -> None:
    page.locator("#list summary", has_text=_OPEN_FILE).click()
    page.locator(".row[data-row='11'] .name", has_text="item").hover()
    page.wait_for_timeout(1000)  # it may scroll
    page.evaluate("scrollTo({top: 0, behavior: 'instant'})")


if __name__ == "__main__":
    with tempfile.TemporaryDirectory() as folder, contextlib.chdir(ROOT):
        made = pathlib.Path(folder) / "report.html"
        main(["report", "examples", "--python", "3.14", "-q", "-o", str(made)])
        write_picture(made)
