"""Write docs/check.svg: what `codeloom check` prints in a terminal, in its colours.

python tools/make_picture.py
"""

import pathlib
import re
from xml.sax.saxutils import escape

from codeloom.cli import main

ROOT = pathlib.Path(__file__).parent.parent
PICTURE = ROOT / "docs/check.svg"
COMMAND = "codeloom check examples/broken/half_written.py"

_COLUMN_WIDTH, _ROW_HEIGHT, _FONT_SIZE, _MARGIN = 8.43, 19, 14, 18
_BACKGROUND, _FOREGROUND, _BUTTONS = "#1e1e2e", "#cdd6f4", ("#f38ba8", "#f9e2af", "#a6e3a1")
# What the codes of a terminal look like.
_STYLES = {
    "1": 'font-weight="bold"',
    "2": 'fill="#7f849c"',
    "31": 'fill="#f38ba8"',
    "32": 'fill="#a6e3a1"',
    "36": 'fill="#89dceb"',
}
_PIECE = re.compile(r"\033\[(?P<code>\d+)m(?P<coloured>.*?)\033\[0m|(?P<plain>[^\033]+)")


def output() -> list[str]:
    """The rows that the command prints."""
    import contextlib
    import io

    printed = io.StringIO()
    with contextlib.chdir(ROOT), contextlib.redirect_stdout(printed):
        main([*COMMAND.split()[1:], "--color", "always"])
    return printed.getvalue().splitlines()


def picture() -> str:
    """The text of the file."""
    rows = [f"$ \033[1m{COMMAND}\033[0m", *output()]
    columns = max(len(_PIECE.sub(lambda match: match["plain"] or match["coloured"], row)) for row in rows)
    width = round(columns * _COLUMN_WIDTH + 2 * _MARGIN)
    top = 2 * _MARGIN + _ROW_HEIGHT
    height = top + len(rows) * _ROW_HEIGHT
    buttons = (
        f'<circle cx="{_MARGIN + 6 + 20 * i}" cy="{_MARGIN + 4}" r="6" fill="{colour}"/>'
        for i, colour in enumerate(_BUTTONS)
    )
    texts = (_text(row, top + i * _ROW_HEIGHT) for i, row in enumerate(rows))
    return "\n".join(
        [
            f'<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 {width} {height}" width="{width}" '
            f'height="{height}" role="img">',
            f"<title>What {COMMAND} prints</title>",
            f'<rect width="{width}" height="{height}" rx="10" fill="{_BACKGROUND}"/>',
            *buttons,
            f'<g fill="{_FOREGROUND}" font-size="{_FONT_SIZE}" '
            "font-family=\"ui-monospace, SFMono-Regular, Menlo, Consolas, 'DejaVu Sans Mono', monospace\">",
            *texts,
            "</g>",
            "</svg>\n",
        ]
    )


def _text(row: str, y: int) -> str:
    """A row; each of its pieces is put at its column, so that any font keeps to them."""
    pieces, column = [], 0
    for match in _PIECE.finditer(row):
        text = match["plain"] or match["coloured"] or ""
        x = _MARGIN + column * _COLUMN_WIDTH
        column += len(text)
        if not text.strip():
            continue
        style = f" {_STYLES[match['code']]}" if match["code"] else ""
        length = f'textLength="{len(text) * _COLUMN_WIDTH:.1f}"'
        pieces.append(f'<tspan x="{x:.1f}" {length}{style}>{escape(text)}</tspan>')
    return f'<text y="{y}" xml:space="preserve">{"".join(pieces)}</text>'


if __name__ == "__main__":
    PICTURE.write_text(picture(), encoding="utf-8")
