"""Language versions: what the engine is told of each."""

import keyword
import sys

import pytest

from codeloom.check import CheckText
from codeloom.languages import (
    DEFAULT_LANGUAGE_NAME,
    LANGUAGE_NAMES,
    LanguageNamed,
    UnknownLanguageError,
)


def test_the_default_is_this_interpreter():
    language = LanguageNamed()
    assert language.name == DEFAULT_LANGUAGE_NAME
    assert language.version_triple[:2] == sys.version_info[:2]
    assert list(language.keywords) == sorted(keyword.kwlist)
    assert language.is_py3


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
    language = LanguageNamed(name)
    assert present <= set(language.keywords)
    assert not absent & set(language.keywords)
    assert ("2.7" in language.grammar_file) != language.is_py3


@pytest.mark.parametrize("name", ["", "2", "3", "2.6", "3.15", "3.1.2", "three", "3.011"])
def test_unknown_versions(name):
    with pytest.raises(UnknownLanguageError, match=r"choose 2\.7, or one from 3\.0 to 3\.14"):
        CheckText("x = 1", name)


def test_all_names_make_an_analyzer():
    for name in LANGUAGE_NAMES:
        assert CheckText("x = 1\n", name) == []


@pytest.mark.parametrize(
    ("line", "sound_in"),
    [
        ("print 'a', b", {"2.7"}),
        ("exec 'a' in b", {"2.7"}),
        ("raise E, 'text'", {"2.7"}),
        ("x = `y` <> 0777", {"2.7"}),
        ("async = await", {"2.7", "3.6"}),
        ("nonlocal x", {"3.6", "3.7", "3.12"}),
        ("if (x := 1): pass", {"3.12"}),
        ("x = 1 if y else 2", {"2.7", "3.6", "3.7", "3.12"}),
    ],
)
def test_what_is_sound_depends_on_the_version(line, sound_in):
    sound = {name for name in ("2.7", "3.6", "3.7", "3.12") if not CheckText(line, name)}
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
    def Rows(line, version):
        return [problem.row for problem in CheckText(f"{head}\n{line}", version)]

    row = head.count("\n") + 2
    assert Rows("print(x, file=f)", "2.7") == ([] if is_function else [row])
    assert Rows("print x", "2.7") == ([row] if is_function else [])
    assert Rows("print(x)", "2.7") == Rows("print(x, file=f)", "3.8") == []
    assert Rows("exec 'a' in b", "2.7") == []
