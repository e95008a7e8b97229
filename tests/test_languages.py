"""Language versions: what the engine gets for each."""

import keyword

import pytest

from codeloom import NEWEST, VERSIONS, analyze
from codeloom.reading.languages import language_named


def Rows(text, python):
    """The rows with a problem."""
    return [problem.range.row for problem in analyze(text, python=python).problems]


def test_the_default_is_the_newest():
    assert NEWEST == VERSIONS[-1] == analyze("").python
    assert list(language_named(NEWEST).keywords) == sorted(keyword.kwlist)


@pytest.mark.parametrize(
    ("name", "present", "absent"),
    [
        ("2.7", {"print", "exec"}, {"nonlocal", "None", "True", "async"}),
        ("3.0", {"nonlocal", "None", "True"}, {"print", "exec", "async", "await"}),
        ("3.6", {"nonlocal"}, {"async", "await"}),
        ("3.7", {"async", "await"}, {"print", "match", "type"}),
        ("3.14", {"async", "await"}, {"print", "match", "type"}),
    ],
)
def test_keywords(name, present, absent):
    language = language_named(name)
    assert present <= set(language.keywords)
    assert not absent & set(language.keywords)
    assert ("2.7" in language.grammar_file) != language.is_py3


@pytest.mark.parametrize("name", ["", "2", "3", "2.6", "3.99", "3.1.2", "three", "3.011"])
def test_unknown_versions(name):
    with pytest.raises(ValueError, match=r"python: .*choose 2\.7, or one from 3\.0 to 3\."):
        analyze("x = 1", python=name)


def test_all_versions_are_known():
    for name in VERSIONS:
        assert Rows("x = 1\ny = )\n", name) == [2]


@pytest.mark.parametrize(
    ("line", "sound_in"),
    [
        ("print 'a', b", {"2.7"}),
        ("exec 'a' in b", {"2.7"}),
        ("raise E, 'text'", {"2.7"}),
        ("try: pass\nexcept E, (a, b.c): pass", {"2.7"}),
        ("try: pass\nexcept E, a[0]: pass", {"2.7"}),
        ("x = `y` <> 0777", {"2.7"}),
        ("async = await", {"2.7", "3.6"}),
        ("def f():\n  x = 1\n  def g(): nonlocal x", {"3.6", "3.7", "3.12"}),
        ("if (x := 1): pass", {"3.12"}),
        ("try: pass\nexcept E, (a, b): pass\nexcept E, a.b: pass\nexcept E, a[0]: pass", {"2.7"}),
        ("x = 1 if y else 2", {"2.7", "3.6", "3.7", "3.12"}),
    ],
)
def test_what_is_sound_depends_on_the_version(line, sound_in):
    sound = {name for name in ("2.7", "3.6", "3.7", "3.12") if not Rows(line, name)}
    assert sound == sound_in


@pytest.mark.parametrize(
    ("head", "is_function"),
    [
        ("from __future__ import print_function", True),
        ("'doc'\nfrom __future__ import (division,  # one\n  print_function as p)", True),
        ("from __future__ import division", False),
        ("from __future__ import division  # no print_function", False),
        ("x = 'from __future__ import print_function'", False),
    ],
)
def test_print_is_a_function_in_texts_that_import_it(head, is_function):
    row = head.count("\n") + 2
    assert Rows(f"{head}\nprint(x, file=f)", "2.7") == ([] if is_function else [row])
    assert Rows(f"{head}\nprint x", "2.7") == ([row] if is_function else [])
    assert Rows(f"{head}\nprint(x)", "2.7") == Rows(f"{head}\nprint(x, file=f)", "3.8") == []
    assert Rows(f"{head}\nexec 'a' in b", "2.7") == []
