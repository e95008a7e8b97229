r"""What `\N{...}` may hold: all names that there are, and hardly anything else."""

import random
import sys
import unicodedata

from codeloom import analyze


def refused(names):
    text = "".join(f'"\\N{{{name}}}"\n' for name in names)
    return [(problem.range.row - 1, problem.message) for problem in analyze(text).problems]


def known_names():
    return [name for code in range(sys.maxunicode + 1) if (name := unicodedata.name(chr(code), ""))]


def test_every_name_is_taken():
    aliases = [
        "LINE FEED",
        "NULL",
        "ALERT",
        "LATIN SMALL LETTER GHA",
        "NBSP",
        "byte order mark",
        "latin small letter a",
    ]
    newer = ["SHAKING FACE", "SPLATTER", "DISTORTED FACE", "FACE WITH BAGS UNDER EYES"]
    names = [*known_names(), *aliases, *newer]
    assert [names[row] for row, _ in refused(names)] == []


def test_other_names_are_refused(seed):
    source = random.Random(seed)
    known = known_names()
    wrong = set()
    for name in source.sample(known, 3000):
        place = source.randrange(len(name))
        wrong.add(f"{name[:place]}Q{name[place:]}")
    wrong = sorted(wrong - set(known) - {name for name in wrong if name.startswith("HANGUL SYLLABLE")})
    found = refused(wrong)
    assert {message for _, message in found} == {"unknown Unicode character name"}
    assert len(found) > 0.99 * len(wrong)
