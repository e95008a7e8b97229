"""Records in their readable form, and back."""

import pytest
from hypothesis import given
from hypothesis import strategies as st
from tools_of_project import tool_named

from codeloom import symbolinfo
from codeloom.records import (
    CRecord,
    FormatRecord,
    FormatRecords,
    ParseRecord,
    RecordOfPair,
    kRecordKinds,
)

KINDS = {kind.name: kind for kind in kRecordKinds}


@pytest.mark.parametrize("kind", kRecordKinds, ids=lambda kind: kind.name)
def test_each_kind_has_a_line_that_reads_back(kind):
    record = ParseRecord(kind.example)
    assert record.kind is kind and FormatRecords([record] * 2) == f"{kind.example}\n" * 2
    name, ibytes = record.ToPair()
    assert symbolinfo.GetInfoBytesKind(ibytes) == kind.kind
    assert RecordOfPair(name, ibytes, record.of_arg) == record
    assert bool(record.payload) == (kind.payload != "none")


PIECES = st.lists(st.sampled_from(b"a|b'| |  |:|s|'|\"|\\|\n|\xc3\xa9|\xff|\0".split(b"|"))).map(b"".join)
RECORDS = PIECES | st.builds(bytes.__add__, st.sampled_from([k.prefix for k in kRecordKinds]), PIECES)


@given(PIECES | st.binary(), RECORDS | st.binary(), st.booleans())
def test_no_pair_is_lost_on_the_way(name, ibytes, of_arg):
    record = RecordOfPair(name, ibytes, of_arg)
    line = FormatRecord(record)
    assert len(line.splitlines()) == 1
    assert ParseRecord(line) == record
    assert record.ToPair() == (name, ibytes) and record.of_arg == of_arg


def test_what_could_be_mistaken_is_quoted():
    lines = [
        str(RecordOfPair(name, ibytes))
        for name, ibytes in [
            (b"a  b", b":s:"),
            (b"", b""),
            (b"b'x'.y", b" a"),
            (b"x", b":h:a\nb"),
            (b"x\xff", b":Z:a"),
            (b"x", symbolinfo.kPlainEquivSpec),
        ]
    ]
    assert lines == [
        "set  b'a  b'",
        "is   b''",
        """is   b"b'x'.y"  b' a'""",
        r"hint x  b'a\nb'",
        r"raw  b'x\xff'  :Z:a",
        "raw  x  :P:",
    ]


@pytest.mark.parametrize(
    ("name", "payload", "value"),
    [
        ("Set", "", None),
        ("Set", "odd", "odd"),
        ("WithinExpr", "12", 12),
        ("WithinExpr", "odd", "odd"),
        ("FromImport", ". x", (".", "x")),
        ("FromImport", "m *", ("m", "*")),
        ("TypedLiteral", "list:", ("list", None)),
        ("TypedLiteral", "str: ': a'", ("str", "': a'")),
        ("PlainEquiv", "a.b", "a.b"),
    ],
)
def test_a_payload_has_a_value_by_its_form(name, payload, value):
    assert CRecord("x", KINDS[name], payload).value == value


def test_what_is_no_record_line_is_refused():
    for line in ("", "get", "get ", "arg get", "get x  ", "get x   y", "b''"):
        with pytest.raises(ValueError):
            ParseRecord(line)
    with pytest.raises(ValueError, match="unknown kind of record in 'got  x'; expected one of set, "):
        ParseRecord("got  x")


def test_the_page_about_records_is_up_to_date():
    tool = tool_named("make_records_page")
    assert tool.with_tables(tool.PAGE.read_text()) == tool.PAGE.read_text(), (
        "run: python tools/make_records_page.py"
    )
