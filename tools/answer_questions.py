"""Ask the questions of docs/questions.md again, write the answers beneath them, and draw docs/annotated.svg.

python tools/answer_questions.py [FOLDER]

It runs the commands of the page in a folder, where downloads and indexes are kept for the next time.
"""

import json
import os
import pathlib
import re
import subprocess
import sys
import sysconfig
import tempfile
from collections.abc import Iterator, Sequence
from typing import Any

PAGE = pathlib.Path(__file__).parent.parent / "docs/questions.md"
PICTURE = PAGE.parent / "annotated.svg"
LIBRARY = "python3.11"
QUESTION = re.compile(r"```sql\n(?P<sql>.*?)```\n```text\n(?P<answer>.*?)```", re.DOTALL)
_COMMANDS = re.compile(r"(?:^    .*\n)+", re.MULTILINE)
_RUN = 'pip() { "$PYTHON" -m pip "$@"; }; codeloom() { "$PYTHON" -P -m codeloom "$@"; }\n'

_WIDTH, _HEIGHT, _LEFT, _TOP, _BOTTOM = 760, 300, 46, 54, 30
_STYLE = """
text { font: 13px system-ui, sans-serif; fill: #333 }
.value { font-size: 11px }
.grid { stroke: #ccc }
.series-0 { fill: #0072b2 }
.series-1 { fill: #d55e00 }
@media (prefers-color-scheme: dark) {
  text { fill: #ddd }
  .grid { stroke: #555 }
  .series-0 { fill: #56b4e9 }
  .series-1 { fill: #e69f00 }
}
"""


def questions() -> list[tuple[str, list[str]]]:
    """The SQL of each question, with the columns of its answer, in their order."""
    page = PAGE.read_text(encoding="utf-8")
    return [(match["sql"], match["answer"].split("\n", 1)[0].split()) for match in QUESTION.finditer(page)]


def commands() -> str:
    """How the page says that the indexes are made."""
    match = _COMMANDS.search(PAGE.read_text(encoding="utf-8"))
    assert match is not None
    return match[0]


def make_indexes(folder: pathlib.Path) -> None:
    """Run the commands of the page."""
    folder.mkdir(parents=True, exist_ok=True)
    library = folder / LIBRARY
    if not library.exists():
        library.symlink_to(sysconfig.get_path("stdlib"))
    environment = {**os.environ, "PYTHON": sys.executable}
    subprocess.run(["bash", "-euc", _RUN + commands()], cwd=folder, env=environment, check=True)


def with_answers(folder: pathlib.Path) -> str:
    """The page with the answers."""
    return QUESTION.sub(
        lambda match: f"```sql\n{match['sql']}```\n```text\n{_answer(match['sql'], folder)}```",
        PAGE.read_text(encoding="utf-8"),
    )


def _answer(sql: str, folder: pathlib.Path, *options: str) -> str:
    command = [sys.executable, "-P", "-m", "codeloom", "query", *options, sql, "index"]
    return subprocess.run(command, cwd=folder, capture_output=True, check=True, encoding="utf-8").stdout


def picture(folder: pathlib.Path) -> str:
    """The chart of annotated parameters by year."""
    sql = next(sql for sql, columns in questions() if columns[0] == "year")
    rows = [json.loads(row) for row in _answer(sql, folder, "--format", "jsonl").splitlines()]
    series = (("library", "the library"), ("packages", "the five packages"))
    step = (_WIDTH - _LEFT) / len(rows)
    return "\n".join(
        [
            f'<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 {_WIDTH} {_HEIGHT}" role="img">',
            "<title>Parameters with a hint, in percent, by the year of their file's syntax</title>",
            f"<style>{_STYLE}</style>",
            *_grid(),
            *_legend([title for _, title in series]),
            *(
                part
                for i, row in enumerate(rows)
                for part in _year(row, [name for name, _ in series], i, step)
            ),
            "</svg>\n",
        ]
    )


def _y(share: float) -> float:
    return _TOP + (1 - share) * (_HEIGHT - _TOP - _BOTTOM)


def _grid() -> Iterator[str]:
    for share in (0, 0.25, 0.5, 0.75, 1):
        y = f"{_y(share):.0f}"
        yield f'<line class="grid" x1="{_LEFT}" x2="{_WIDTH}" y1="{y}" y2="{y}"/>'
        yield f'<text x="{_LEFT - 6}" y="{y}" dy="4" text-anchor="end">{share:.0%}</text>'


def _legend(titles: Sequence[str]) -> Iterator[str]:
    for i, title in enumerate(titles):
        x = _LEFT + 130 * i
        yield f'<rect class="series-{i}" x="{x}" y="10" width="12" height="12"/>'
        yield f'<text x="{x + 18}" y="21">{title}</text>'


def _year(row: dict[str, Any], names: Sequence[str], column: int, step: float) -> Iterator[str]:
    """Its bars beside each other, without one where there are no files."""
    middle = _LEFT + (column + 0.5) * step
    yield f'<text x="{middle:.0f}" y="{_HEIGHT - 10}" text-anchor="middle">{row["year"]}</text>'
    there = [(i, row[name]) for i, name in enumerate(names) if row[name] is not None]
    width = step * 0.36
    for place, (i, share) in enumerate(there):
        x = middle + (place - len(there) / 2) * width
        y = _y(share)
        yield (
            f'<rect class="series-{i}" x="{x:.1f}" y="{y - 1:.1f}" width="{width - 2:.1f}" '
            f'height="{_y(0) - y + 1:.1f}"/>'
        )
        yield (
            f'<text class="value" x="{x + width / 2 - 1:.1f}" y="{y - 5:.1f}" '
            f'text-anchor="middle">{100 * share:.3g}</text>'
        )


def main() -> None:
    with tempfile.TemporaryDirectory() as temporary:
        folder = pathlib.Path(sys.argv[1] if len(sys.argv) > 1 else temporary)
        make_indexes(folder)
        PAGE.write_text(with_answers(folder), encoding="utf-8")
        PICTURE.write_text(picture(folder), encoding="utf-8")


if __name__ == "__main__":
    main()
