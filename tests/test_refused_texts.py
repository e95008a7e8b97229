"""Texts that the interpreter's own test suite expects to be refused: found, on its row, with its cause."""

import sys

import judge_refused
import pytest

# Of all texts; more would be hard to keep for an interpreter that adds tests.
LEAST = {"found": 0.99, "row": 0.97, "cause": 0.90}
FEWEST_TEXTS = 500


def test_shares():
    pytest.importorskip("test.test_syntax", reason="some distributions leave the test suite out")
    version = f"{sys.version_info.major}.{sys.version_info.minor}"
    judged = [judge_refused.judge(text, version) for text in judge_refused.refused_texts(sys.executable)]
    assert len(judged) >= FEWEST_TEXTS
    shares = {measure: sum(getattr(text, measure) for text in judged) / len(judged) for measure in LEAST}
    shown = {
        measure: list(judge_refused.rows_of_shortfalls(judged, measure))
        for measure, least in LEAST.items()
        if shares[measure] < least
    }
    assert not shown, "\n".join([str(shares), *(row for rows in shown.values() for row in rows)])
