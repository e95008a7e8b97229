"""Which logical lines are too long to be handed to the engine.

What the engine does takes time in proportion to a line's text and to its records. But records
repeat the text: the chain `a.b.c` has the names `a`, `a.b` and `a.b.c`, and each target of an
assignment gets the text of the value.
"""

from codeloom.engine import Complaint
from codeloom.logicalline import CLogicalLine

MOST_TOKENS = 1_000_000
"""The most tokens of a line: some megabytes of text."""

MOST_REPEATED_TEXT = 20_000_000
"""The most characters that chains of names or the targets of an assignment may come to in records."""

# Lines of fewer tokens can't repeat much.
_FEW_TOKENS = 200

_OPENING = frozenset("([{")
_CLOSING = frozenset(")]}")
_WORDS_BETWEEN = frozenset({"and", "as", "else", "for", "if", "import", "in", "is", "lambda", "not", "or"})


def TooLong(logical: CLogicalLine) -> Complaint | None:
    """The complaint about a line that is too long to be analysed; None for any other.

    The expressions within it count too, as those in f-strings.
    """
    exp_logicals = logical.GetExpLogicals()
    if not exp_logicals and logical.fTokenCount <= _FEW_TOKENS:
        return None
    parts = [part for part in (logical, *exp_logicals) if part.fTokenCount > _FEW_TOKENS]
    count = sum(part.fTokenCount for part in parts)
    if count > MOST_TOKENS:
        return _Complaint(logical, f"it has {count:,} tokens, more than {MOST_TOKENS:,}")
    repeated = sum(max(_TextOfChains(part.fToks), _TextForTargets(part.fToks)) for part in parts)
    if repeated > MOST_REPEATED_TEXT:
        return _Complaint(
            logical,
            "it has so many parts in a chain, or so many targets, that their texts come to "
            f"{repeated:,} characters, more than {MOST_REPEATED_TEXT:,}",
        )
    return None


def _Complaint(logical: CLogicalLine, reason: str) -> Complaint:
    row, col = logical.fPositions[0]
    message = f"this logical line is too long and isn't analysed: {reason}; split it into several"
    return Complaint(logical.fFirstLine + row, col, message)


def _TextOfChains(toks: tuple[str, ...]) -> int:
    """The length of the names that the chains consist of, all together and at the most."""
    total = length = 0
    # Where the chain under way starts, at each depth of brackets.
    starts = [0]
    for token in toks:
        if token == ".":
            total += length - starts[-1]
        elif token in _OPENING:
            starts.append(length + 1)
        elif token in _CLOSING:
            if len(starts) > 1:
                starts.pop()
        elif not token.isidentifier() or token in _WORDS_BETWEEN:
            starts[-1] = length
        length += len(token)
    return total


def _TextForTargets(toks: tuple[str, ...]) -> int:
    """The length of the value's text, once for each target that an assignment can have."""
    depth = length = target_count = length_of_targets = 0
    for i, token in enumerate(toks):
        length += len(token)
        if token in _OPENING:
            depth += 1
        elif token in _CLOSING:
            depth -= 1
        elif token == "=" and depth == 0:
            target_count, length_of_targets = (i + 1) // 2, length
    return target_count * (length - length_of_targets)
