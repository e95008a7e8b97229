"""What the engine says of the names of logical lines, against golden files in records/.

Each logical line of a case is there with its records beneath it in their order, those of arguments
last, then its error, if it has one: row and column from 1, counted from the line's own first row and in
UTF-8 bytes, and the message, for an expression within the line with its text. Where the language
versions differ, each has its own records.
"""

import re
from contextlib import redirect_stdout
from io import StringIO
from pathlib import Path

import pytest
from golden import Cases, Check

from codeloom.logicalinspect import TextFromTokens
from codeloom.reading.languages import language_named
from codeloom.records import FormatRecord, ParseRecord, RecordsOfLogical, kRecordKinds
from codeloom.treesift import CPGenAnalyzerImpl
from codeloom.utils import GetLogicalsFromText

CASES = Cases(Path(__file__).parent / "records", ".records")


def Analyzer(version):
    language = language_named(version)
    return CPGenAnalyzerImpl(
        language.version_triple, language.grammar_file, language.keywords, language.is_py3
    )


ANALYZERS = {version: Analyzer(version) for version in ("3.8", "2.7")}


def ReadableError(error, text):
    within = "" if error.text == text else f" in {error.text}"
    return f"error {error.lineno}:{error.offset} {error.msg}{within}"


def Analyze(logical, analyzer):
    """What the analysis leaves on the line, gives back and prints, each as rows."""
    printed = StringIO()
    with redirect_stdout(printed):
        error = analyzer.AnalyzeSingleLogical(logical, logical.fInAsyncDef, logical.fFirstInDef)
    records = RecordsOfLogical(logical)
    rows = [FormatRecord(record) for record in records]
    assert [ParseRecord(row) for row in rows] == records
    rows += [ReadableError(error, TextFromTokens(logical))] if error is not None else []
    return rows + [f"prints {row}" for row in printed.getvalue().splitlines()]


def Output(source):
    rows = ["---"]
    for logicals in zip(*(GetLogicalsFromText(source) for _ in ANALYZERS), strict=True):
        outcomes = [
            (version, Analyze(logical, analyzer))
            for logical, (version, analyzer) in zip(logicals, ANALYZERS.items(), strict=True)
        ]
        rows += TextFromTokens(logicals[0]).strip().splitlines()
        rows += Sections(outcomes)
    return "\n".join(rows)


def Sections(outcomes):
    """The rows of the outcomes, once where they are equal, otherwise each after its version."""
    if all(outcome == outcomes[0][1] for _, outcome in outcomes):
        return [f"    {row}" for row in outcomes[0][1]]
    rows = []
    for version, outcome in outcomes:
        if len(outcome) == 1:
            rows.append(f"  {version} {outcome[0]}")
        else:
            rows += [f"  {version}", *(f"      {row}" for row in outcome)]
    return rows


@pytest.mark.parametrize("case", CASES)
def test_records(case, rewrite):
    Check(case, Output(case.source), rewrite)


@pytest.mark.parametrize("kind", [kind for kind in kRecordKinds if kind.source], ids=lambda kind: kind.name)
def test_a_kind_of_records_comes_from_its_line(kind):
    (logical,) = GetLogicalsFromText(kind.source)
    assert kind.example in Analyze(logical, ANALYZERS["3.8"])


def test_every_kind_of_records_is_shown():
    outputs = "\n".join(case.values[0].output for case in CASES)
    shown = set(re.findall(r"^ {4,6}(?:arg )?([a-z-]+) ", outputs, re.MULTILINE))
    assert {kind.word for kind in kRecordKinds if kind.source} <= shown
