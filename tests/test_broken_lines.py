"""Broken lines of sound files are found exactly, and their neighbours are untouched."""

import sys

import broken_lines
import pytest

SEED = 8


def Missed(cases):
    return [case for case in cases if not case.is_exact and not broken_lines.IsSoundAfterAll(case)]


@pytest.mark.parametrize("analyzer", broken_lines.ANALYZERS)
def test_a_broken_line_is_reported_and_no_other(analyzer):
    missed = Missed(broken_lines.Singles(800, SEED, broken_lines.ANALYZERS[analyzer]))
    assert len(missed) <= 1, "\n".join(map(str, missed))


def test_six_broken_lines_are_told_apart():
    missed = Missed(broken_lines.Sixes(200, SEED))
    most = 1 if sys.version_info < (3, 12) else 2  # another library has other lines
    assert len(missed) <= most, "\n".join(map(str, missed))


def test_a_line_being_typed_leaves_its_neighbours_alone():
    cases = broken_lines.Typed(600, SEED)
    missed = [case for case in cases if case.is_dirty or not case.keeps_others]
    assert not missed, "\n".join(map(str, missed))
