"""Problems by their codes: what options select, and what comments ignore.

A selector is a code, the beginning of one such as "CL4", or "ALL".
"""

import re
from collections.abc import Sequence

from codeloom.cli.filters import Filter
from codeloom.cli.items import Finding
from codeloom.cli.project import nearest
from codeloom.cli.source import Source

_SELECTOR = re.compile(r"CL[0-9]{0,3}|ALL")
_COMMENT = re.compile(r"#\s*codeloom:\s*ignore\b(?:\s*\[(?P<codes>[^\]#]*)\])?", re.IGNORECASE)
_COMMENT_MARK = "codeloom:"


def selectors_of(text: str) -> list[str]:
    """The selectors in a text, parted by commas or blanks; ValueError for what fits no code."""
    from codeloom.explanations import explanations  # only where codes are named

    known = explanations()
    selectors = re.split(r"[,\s]+", text.strip().upper())
    for selector in selectors:
        if not _SELECTOR.fullmatch(selector):
            raise ValueError(f"{selector!r} isn't a code: give one such as CL301, its beginning, or ALL")
        if selector != "ALL" and not any(code.startswith(selector) for code in known):
            raise ValueError(f"there is no code {selector}{nearest(selector, known)}")
    return selectors


class CodeFilter:
    """What is selected and not ignored; of two selectors that fit, the longer one decides."""

    def __init__(self, select: Sequence[str], ignore: Sequence[str]) -> None:
        self._select = select or ["ALL"]
        self._ignore = ignore

    def __call__(self, source: Source, findings: Sequence[Finding]) -> Sequence[Finding]:
        """The findings that pass."""
        return [finding for finding in findings if self._passes(finding.code)]

    def _passes(self, code: str) -> bool:
        return _best_fit(code, self._select) > _best_fit(code, self._ignore)


def code_filters(select: Sequence[str], ignore: Sequence[str]) -> list[Filter]:
    """What every run passes problems through: comments, and what is selected if anything is."""
    return [not_ignored_by_comments, *([CodeFilter(select, ignore)] if select or ignore else [])]


def not_ignored_by_comments(source: Source, findings: Sequence[Finding]) -> Sequence[Finding]:
    """The findings without `# codeloom: ignore[CODE]` on their row or the last row of their line.

    The comment ignores all codes when it names none.
    """
    if not source.holds(_COMMENT_MARK):
        return findings
    return [finding for finding in findings if not _is_ignored(source, finding)]


def _is_ignored(source: Source, finding: Finding) -> bool:
    row = finding.range.row
    for number in {row, source.line_rows(row)[1]}:
        text = source.row_text(number)
        for comment in _COMMENT.finditer(text):
            codes = comment["codes"]
            if codes is None or _best_fit(finding.code, re.split(r"[,\s]+", codes.strip().upper())) >= 0:
                return True
    return False


def _best_fit(code: str, selectors: Sequence[str]) -> int:
    """The length of the longest selector that fits, 0 for ALL, -1 for none."""
    fits = [
        0 if one == "ALL" else len(one) for one in selectors if one and (one == "ALL" or code.startswith(one))
    ]
    return max(fits, default=-1)
