"""Files broken by one edit: all found, hardly ever marked twice, and at the edit or the next statement."""

import edits


def test_one_edit(seed):
    outcomes = list(edits.outcomes(400, seed))
    wrong = [outcome for outcome in outcomes if len(outcome.rows) != 1 or not outcome.is_right]
    told = "\n".join(map(str, wrong))
    assert all(outcome.rows for outcome in outcomes), told
    assert sum(len(outcome.rows) for outcome in outcomes) <= 1.06 * len(outcomes), told
    assert sum(outcome.is_right for outcome in outcomes) >= 0.96 * len(outcomes), told
