"""Broken lines of sound files are found exactly, and their neighbours are untouched."""

import broken_lines
import pytest


@pytest.mark.parametrize("analyzer", broken_lines.ANALYZERS)
def test_a_broken_line_is_reported_and_no_other(analyzer, seed):
    cases = list(broken_lines.Singles(1000, seed, broken_lines.ANALYZERS[analyzer]))
    missed = [case for case in cases if not case.is_exact and not broken_lines.IsSoundAfterAll(case)]
    assert len(missed) <= len(cases) * 0.01, "\n".join(map(str, [seed, *missed]))
