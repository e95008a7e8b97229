"""What may mend a problem, by its code and its hint: edits to try, the likelier first.

They needn't be right: each is tried before it is offered.
"""

import re
from collections.abc import Callable, Iterator, Sequence
from typing import NamedTuple

from codeloom._analysis import Line, LineKind, Range
from codeloom.cli.items import Finding
from codeloom.server.blocks import line_at, line_index
from codeloom.server.document import OpenDocument
from codeloom.server.pieces import CLOSER_OF, Piece, bracket_pairs, pieces_of

Place = tuple[int, int]

_INDENT = "    "

_CURLY_QUOTES = {"\u201c": '"', "\u201d": '"', "\u2018": "'", "\u2019": "'"}


class Remedy(NamedTuple):
    """Edits in the order of the text, each with the range that it replaces."""

    title: str
    edits: Sequence[tuple[Range, str]]
    is_sure: bool = True


class Patient:
    """A problem with the line that it is on."""

    def __init__(self, document: OpenDocument, finding: Finding, line: Line) -> None:
        self.document = document
        self.finding = finding
        self.line = line
        self.hint = finding.hint or ""
        self.range = finding.range
        self.start: Place = (self.range.row, self.range.column)
        self.end: Place = (self.range.end_row, self.range.end_column)
        self.pieces = pieces_of(line)

    @property
    def code_pieces(self) -> list[Piece]:
        """The tokens without comments and the backslashes between rows."""
        return [piece for piece in self.pieces if not piece.is_comment and piece.text != "\\"]

    @property
    def row_text(self) -> str:
        """The row in which the problem begins."""
        return self.document.row(self.range.row)

    @property
    def text(self) -> str:
        """What the problem marks."""
        return self.between(self.start, self.end)

    def between(self, start: Place, end: Place) -> str:
        """The text between two places."""
        return self.document.between(start, end)

    def after(self, place: Place) -> list[Piece]:
        """The tokens from a place on."""
        return [piece for piece in self.code_pieces if piece.start >= place]

    def before(self, place: Place) -> list[Piece]:
        """The tokens that end at a place or before it."""
        return [piece for piece in self.code_pieces if piece.end <= place]


def remedies_for(document: OpenDocument, finding: Finding) -> Iterator[Remedy]:
    """The remedies to try for a problem."""
    line = line_at(document.analysis, (finding.range.row, finding.range.column))
    if line is None:
        return
    patient = Patient(document, finding, line)
    for remedies in _BY_CODE.get(finding.code, ()):
        yield from remedies(patient)


def _insert(place: Place, text: str) -> tuple[Range, str]:
    return Range(*place, *place), text


def _replace(start: Place, end: Place, text: str) -> tuple[Range, str]:
    return Range(*start, *end), text


# What is missing or too much


def _colon_for(patient: Patient) -> Iterator[Remedy]:
    """A colon in the place of a word, or of the brace around a block, whose end has a row of its own."""
    written = re.match(r"write ':' instead of '(.+?)'", patient.hint)
    if written is None:
        return
    title = f"Write ':' instead of '{written[1]}'"
    following = patient.after(patient.end)
    has_colon = bool(following) and following[0].text == ":"
    edit = _replace(_blanks_before(patient, patient.start), patient.end, "" if has_colon else ":")
    yield Remedy(title, [edit])
    if written[1] != "{":
        return
    document = patient.document
    for row in range(patient.range.row + 1, document.row_count + 1):
        text = document.row(row)
        if text.strip() == "}":
            yield Remedy(title, [edit, _replace((row, 1), (row, len(text) + 1), "")])


def _left_out(patient: Patient) -> Iterator[Remedy]:
    following = [piece for piece in patient.after(patient.end) if piece.start[0] == patient.end[0]]
    if "leave it out" in patient.hint and following:
        title = f"Remove '{patient.text}'"
        yield Remedy(title, [_replace(patient.start, following[0].start, "")])


def _without_parentheses(patient: Patient) -> Iterator[Remedy]:
    if "remove the parentheses" not in patient.hint:
        return
    for opening, closing in bracket_pairs(patient.code_pieces):
        if opening.end == patient.start:
            edits = [_replace(piece.start, piece.end, "") for piece in (opening, closing)]
            yield Remedy("Remove the parentheses", edits)


def _comment_sign(patient: Patient) -> Iterator[Remedy]:
    if "comment with '#'" in patient.hint:
        yield Remedy("Write '#'", [_replace(patient.start, patient.end, "#")])


def _colon(patient: Patient) -> Iterator[Remedy]:
    title = "Insert ':'"
    yield Remedy(title, [_insert(patient.end, ":")])
    if patient.code_pieces:
        yield Remedy(title, [_insert(patient.code_pieces[-1].end, ":")])
    written = re.match(r"write ':' before '(.*)'$", patient.hint)
    if written is not None:
        for piece in patient.after(patient.start):
            if piece.text == written[1]:
                before = patient.before(piece.start)[-1]
                yield Remedy(title, [_insert(before.end, ":")])


def _closer(patient: Patient) -> Iterator[Remedy]:
    """The closing parenthesis: at the end of a row, before the colon of a header, after the last item."""
    opener = patient.text[:1]
    closer = CLOSER_OF.get(opener)
    if closer is None:
        return
    title = f"Insert '{closer}'"
    inner = [piece for piece in patient.code_pieces if piece.start >= patient.end]
    last_of_rows = [
        piece
        for i, piece in enumerate(inner)
        if i + 1 == len(inner) or inner[i + 1].range.row > piece.range.end_row
    ]
    is_header = patient.line.kind in (LineKind.DEF, LineKind.CLASS)
    for last in reversed(last_of_rows):
        before_colon = last.start if last.text == ":" else last.end
        yield Remedy(title, [_insert(before_colon, closer)])
        yield Remedy(title, [_insert(last.end, closer)])
        if is_header or last.text != ":":
            yield Remedy(f"Insert '{closer}:'", [_insert(last.end, f"{closer}:")])
    if not inner:
        yield Remedy(title, [_insert(patient.end, closer)])
        yield Remedy(f"Insert '{closer}:'", [_insert(patient.end, f"{closer}:")])


def _comma(patient: Patient) -> Iterator[Remedy]:
    written = re.search(r" before '(.*)'$", patient.hint, re.DOTALL)
    for piece in patient.after(patient.start):
        before = patient.before(piece.start)
        if before and (written is None or piece.text == written[1]):
            yield Remedy("Insert ','", [_insert(before[-1].end, ",")], is_sure=False)


def _quote(patient: Patient) -> Iterator[Remedy]:
    """The quote at the end of the row: in place of another kind, before the closing parentheses, or last."""
    closed = re.match(r"close it with (\"+|'+)$", patient.hint)
    row, text = patient.range.row, patient.row_text
    if closed is not None:
        quote = closed[1]
        other = "'" if quote == '"' else '"'
        title = f"Insert {quote}"
        end = len(text.rstrip())
        rest = re.search(r"[)\]}:,\s]*$", text)
        inner = rest.start() if rest is not None else end
        if text[inner - 1 : inner] == other and len(quote) == 1:
            yield Remedy(f"Replace {other} with {quote}", [_replace((row, inner), (row, inner + 1), quote)])
        for column in dict.fromkeys((inner, end)):
            if column >= patient.start[1]:
                yield Remedy(title, [_insert((row, column + 1), quote)], is_sure=len(quote) == 1)
        for end_row, end_column in (patient.end, _end_of_text(patient)):
            yield Remedy(title, [_insert((end_row, end_column), quote)], is_sure=False)
    if "for a quote that is text" in patient.hint:
        quote = patient.text.lstrip("rRbBuUfFtT")[:1]
        for match in re.finditer(re.escape(quote), text[patient.start[1] :]):
            place = row, patient.start[1] + match.start() + 1
            yield Remedy("Escape the quote within the string", [_insert(place, "\\")])


def _end_of_text(patient: Patient) -> Place:
    document = patient.document
    row = document.row_count
    while row > 1 and not document.row(row).strip():
        row -= 1
    return row, len(document.row(row)) + 1


def _else(patient: Patient) -> Iterator[Remedy]:
    yield Remedy("Insert 'else None'", [_insert(patient.end, " else None")], is_sure=False)


def _in(patient: Patient) -> Iterator[Remedy]:
    for piece in patient.after(patient.start)[1:]:
        yield Remedy("Insert 'in'", [_insert(piece.start, "in ")])


def _body(patient: Patient) -> Iterator[Remedy]:
    """An indented block: the row that should be in it, or `pass`."""
    lines = patient.document.analysis.lines
    i = line_index(patient.document.analysis, patient.start)
    width = (lines[i].indent or 0) if i >= 0 else 0
    yield Remedy("Indent the row", [_insert((patient.range.row, 1), _INDENT)])
    header = lines[i - 1] if i > 0 and lines[i].range.row == patient.range.row else lines[i]
    place = header.range.end_row, len(patient.document.row(header.range.end_row)) + 1
    indent = " " * ((header.indent if header.indent is not None else width) + len(_INDENT))
    yield Remedy("Insert 'pass'", [_insert(place, f"\n{indent}pass")], is_sure=False)


def _braces_or_field(patient: Patient) -> Iterator[Remedy]:
    row = patient.row_text
    column = patient.start[1]
    for i in range(len(row), column - 1, -1):
        yield Remedy("Insert '}'", [_insert((patient.range.row, i + 1), "}")], is_sure=False)
    i = row.find("{", max(column - 2, 0))
    if row[i : i + 2] == "{}" and "{{}}" in patient.hint:
        start, end = (patient.range.row, i + 1), (patient.range.row, i + 3)
        yield Remedy("Write '{{}}'", [_replace(start, end, "{{}}")])


# What is too much, or another


def _unmatched(patient: Patient) -> Iterator[Remedy]:
    yield Remedy(f"Remove '{patient.text}'", [_replace(patient.start, patient.end, "")])


def _other_closer(patient: Patient) -> Iterator[Remedy]:
    opener = re.search(r"opening parenthesis '(.)'", patient.finding.message)
    if opener is not None:
        closer = CLOSER_OF[opener[1]]
        yield Remedy(
            f"Replace '{patient.text}' with '{closer}'", [_replace(patient.start, patient.end, closer)]
        )


def _equal(patient: Patient) -> Iterator[Remedy]:
    signs = [piece for piece in patient.after(patient.start) if piece.text == "="]
    if "'=='" in patient.hint:
        for sign in signs:
            yield Remedy("Replace '=' with '=='", [_replace(sign.start, sign.end, "==")])
    if "'=' to give an argument" in patient.hint:
        for sign in patient.after(patient.start):
            if sign.text == ":":
                blank = patient.between(sign.end, _next_start(patient.code_pieces, sign))
                edits = [_replace(sign.start, (sign.end[0], sign.end[1] + len(blank)), "=")]
                yield Remedy("Write '='", edits)
    if "':' between a key and its value" in patient.hint:
        for i in range(len(signs), 0, -1):
            edits = [_replace(_blanks_before(patient, sign.start), sign.end, ":") for sign in signs[:i]]
            yield Remedy("Replace '=' with ':'", edits)


def _blanks_before(patient: Patient, place: Place) -> Place:
    """Where the blanks in front of a place begin."""
    before = patient.before(place)
    return before[-1].end if before and before[-1].range.end_row == place[0] else place


_QUOTED = r"('+)(?P<text>.+?)\1"


def _as_written(patient: Patient) -> Iterator[Remedy]:
    """What a hint says in so many words: write 'x', write 'x' instead of 'y', write 0o755."""
    written = re.match(rf"write {_QUOTED}(?: instead of '(?P<of>[^']*)'| instead)?", patient.hint)
    text = written["text"] if written is not None else None
    if text is None and (plain := re.match(r"write (\w+)$", patient.hint)) is not None:
        text = plain[1]
    if text is None or "condition" in text:
        return
    title = f"Write '{text}'"
    is_sure = "or another name" not in patient.hint
    old = written["of"] if written is not None else None
    if old:
        for piece in patient.after(patient.start):
            if piece.text == old:
                yield Remedy(title, [_replace(piece.start, piece.end, text)])
    for end in _ends_of_marked(patient):
        yield Remedy(title, [_replace(patient.start, end, _apart(patient, end, text))], is_sure)


def _apart(patient: Patient, end: Place, text: str) -> str:
    """A text with blanks where it would run into what is before or after it."""
    row = patient.row_text
    before, after = row[: patient.start[1] - 1][-1:], row[end[1] - 1 :][:1]
    is_operator = "=" in text
    left = " " if _is_word(before) and (is_operator or _is_word(text[0])) else ""
    return left + text + (" " if _is_word(after) and (is_operator or _is_word(text[-1])) else "")


def _is_word(character: str) -> bool:
    return character.isalnum() or character == "_"


def _ends_of_marked(patient: Patient) -> Iterator[Place]:
    """Where what is marked ends, and where its token or the next one does."""
    yield patient.end
    yield from (piece.end for piece in patient.after(patient.start)[:2] if piece.end != patient.end)


def _character(patient: Patient) -> Iterator[Remedy]:
    """A character that looks like another one: here, or wherever it and its kind are on the row."""
    written = re.match(rf"write {_QUOTED} instead", patient.hint)
    text = written["text"] if written is not None else " " if "write a blank" in patient.hint else None
    if text is None:
        return
    title = f"Write '{text}'" if text != " " else "Write a blank"
    yield Remedy(title, [_replace(patient.start, patient.end, text)])
    row, number = patient.row_text, patient.range.row
    edits = [
        _replace((number, i + 1), (number, i + 2), _CURLY_QUOTES[sign])
        for i, sign in enumerate(row)
        if sign in _CURLY_QUOTES
    ]
    if edits:
        yield Remedy(title, edits)


# What ended with Python 2


def _call(patient: Patient) -> Iterator[Remedy]:
    """`print x` as a call."""
    word, *rest = patient.after(patient.start)
    if not rest:
        return
    last = rest[-1]
    title = f"Write {word.text}(...)"
    start = _replace(word.end, rest[0].start, "(")
    if last.text == "," and word.text == "print":
        yield Remedy(title, [start, _replace(last.start, last.end, ', end=" ")')])
    yield Remedy(title, [start, _insert(last.end, ")")])


def _next_start(pieces: Sequence[Piece], piece: Piece) -> Place:
    i = pieces.index(piece) + 1
    return pieces[i].start if i < len(pieces) else piece.end


def _raise_or_repr(patient: Patient) -> Iterator[Remedy]:
    pieces = patient.code_pieces
    if "raise" in patient.hint and "," in (texts := [piece.text for piece in pieces]):
        comma = pieces[texts.index(",")]
        edits = [_replace(comma.start, _next_start(pieces, comma), "("), _insert(pieces[-1].end, ")")]
        yield Remedy("Write raise Exception(...)", edits)
    if "repr" in patient.hint:
        marks = [piece for piece in pieces if piece.text == "`"]
        if len(marks) >= 2:
            edits = [_replace(marks[0].start, marks[0].end, "repr(")]
            yield Remedy("Write repr(...)", [*edits, _replace(marks[1].start, marks[1].end, ")")])
    if "<>" in patient.text:
        yield Remedy("Write '!='", [_replace(patient.start, patient.end, "!=")])


def _except(patient: Patient) -> Iterator[Remedy]:
    pieces = patient.code_pieces
    texts = [piece.text for piece in pieces]
    if texts[:1] != ["except"] or "," not in texts or (texts[-1:] != [":"] and ":" not in texts):
        return
    comma, colon = pieces[texts.index(",")], pieces[len(texts) - 1 - texts[::-1].index(":")]
    before_colon = patient.before(colon.start)[-1]
    yield Remedy(
        "Write 'except (A, B)'",
        [_insert(pieces[1].start, "("), _insert(before_colon.end, ")")],
        is_sure=False,
    )
    yield Remedy(
        "Write 'except A as name'", [_replace(comma.start, _next_start(pieces, comma), " as ")], is_sure=False
    )


# What is in a wrong order or place


def _else_if(patient: Patient) -> Iterator[Remedy]:
    first, *others = patient.code_pieces
    if first.text == "else" and "elif" in patient.hint and others:
        last = others[0] if others[0].text == "if" else first
        yield Remedy("Write 'elif'", [_replace(first.start, last.end, "elif")])


def _wrapped(patient: Patient) -> Iterator[Remedy]:
    for last in patient.after(patient.start):
        edits = [_insert(patient.start, "("), _insert(last.end, ")")]
        yield Remedy("Insert parentheses", edits)


def _import_from(patient: Patient) -> Iterator[Remedy]:
    text = patient.between(patient.start, patient.code_pieces[-1].end)
    parts = re.fullmatch(r"import\s+(.+?)\s+from\s+([\w.]+)", text)
    if parts is not None:
        title = f"Write 'from {parts[2]} import {parts[1]}'"
        yield Remedy(
            title,
            [_replace(patient.start, patient.code_pieces[-1].end, f"from {parts[2]} import {parts[1]}")],
        )


def _own_row(patient: Patient) -> Iterator[Remedy]:
    row = patient.row_text
    indent = row[: len(row) - len(row.lstrip())]
    before = patient.before(patient.start)
    start = before[-1].end if before else patient.start
    yield Remedy("Begin a new row", [_replace(start, patient.start, f"\n{indent}")], is_sure=False)


def _unindent(patient: Patient) -> Iterator[Remedy]:
    lines = patient.document.analysis.lines
    i = line_index(patient.document.analysis, patient.start)
    indents = [line.indent for line in lines[max(i - 50, 0) : i] if line.indent is not None]
    for indent in dict.fromkeys(reversed(indents)):
        edit = _replace((patient.range.row, 1), (patient.range.row, patient.start[1]), " " * indent)
        yield Remedy("Indent as the rows before", [edit], is_sure=False)


_BY_CODE: dict[str, Sequence[Callable[[Patient], Iterator[Remedy]]]] = {
    "CL102": (_character,),
    "CL104": (_quote,),
    "CL105": (_quote,),
    "CL141": (_braces_or_field,),
    "CL142": (_braces_or_field,),
    "CL202": (_closer,),
    "CL203": (_unmatched,),
    "CL204": (_other_closer,),
    "CL211": (_comma,),
    "CL212": (_else_if, _colon_for, _colon),
    "CL213": (_else,),
    "CL214": (_in,),
    "CL219": (_own_row,),
    "CL221": (_equal,),
    "CL223": (_as_written,),
    "CL231": (_as_written, _left_out),
    "CL232": (_as_written,),
    "CL233": (_without_parentheses,),
    "CL236": (_comment_sign,),
    "CL241": (_call,),
    "CL242": (_raise_or_repr,),
    "CL253": (_import_from,),
    "CL263": (_colon, _equal),
    "CL264": (_wrapped,),
    "CL301": (_unindent,),
    "CL302": (_body,),
    "CL303": (_unindent,),
    "CL401": (_equal,),
    "CL701": (_except,),
    "CL702": (_as_written,),
}
