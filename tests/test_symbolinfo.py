"""The vocabulary of records: constants, questions about them, and the texts in records."""

import argparse
import ast
import inspect
import statistics
import tokenize

import pytest
from host_tokens import host_tokens
from hypothesis import example, given
from hypothesis import strategies as st

from codeloom import symbolinfo, treesift
from codeloom.symbolinfo import (
    BuildArgInfo,
    BuildLiteralInfo,
    CKindFilter,
    CLocationCache,
    EncodeStringLiteral,
    EnsureScopeNameIndicies,
    GetInstanceNameForClass,
    JoinTokens,
    ObjectForStringLiteral,
    _NonInlineNextNonNestedUtf8PtrIndex,
    gInfoBytesBuilder,
)


@pytest.fixture(params=[symbolinfo, treesift], ids=["symbolinfo", "treesift"])
def module(request):
    return request.param


# Constants and kinds


def test_a_prefix_is_a_colon_its_kind_and_a_colon(module):
    prefixes = {name: value for name, value in vars(symbolinfo).items() if name.endswith("Prefix")}
    kinds = [getattr(symbolinfo, name.replace("Prefix", "Kind")) for name in prefixes]
    assert len(prefixes) == 32
    assert list(prefixes.values()) == [b":%c:" % kind for kind in kinds]
    assert len({*kinds, symbolinfo.kPlainEquivKind}) == 33
    assert symbolinfo.kPrefixLen == 3
    for prefix, kind in zip(prefixes.values(), kinds, strict=True):
        assert module.GetInfoBytesKind(prefix + b"x") == kind


def test_a_record_without_a_prefix_is_plain(module):
    for record in (b"", b":", b":\0x", b"x", b"a:s:", "é"):
        assert module.GetInfoBytesKind(record) == symbolinfo.kPlainEquivKind
    assert module.GetInfoBytesKind(b":\xff") == 255


def test_what_a_def_makes(module):
    def_kinds = [kind for kind in range(256) if module.IsDefKind(kind)]
    wanted = [symbolinfo.kFunctionKind, symbolinfo.kMethodKind, symbolinfo.kUnboundMethodKind]
    assert def_kinds == sorted(wanted)


@given(st.sets(st.integers(0, 255)))
def test_a_filter_is_a_set_of_kinds(kinds):
    kind_filter = CKindFilter(bytes(kinds))
    assert {kind for kind in range(256) if kind_filter.KindMatches(kind)} == kinds
    assert not CKindFilter().KindMatches("s")


# Scopes


def test_scopes(module):
    assert module.IsTopLevelModuleScope("") and module.IsTopLevelModuleScope([])
    assert not module.IsTopLevelModuleScope("a")
    def_line = "A.f" + symbolinfo._kDotLineScopeName
    assert module.IsDefLineScope(def_line) and module.IsDefLineScope("é.<def>")
    assert not any(module.IsDefLineScope(scope) for scope in ("", "A.f", ".<def", "<def>.x"))
    assert module.IsParentOfDefLineScope("A.f", def_line)
    assert module.IsParentOfDefLineScope("éàü", def_line)  # the lengths alone count, in characters
    assert not module.IsParentOfDefLineScope("A.ff", def_line)
    for operation, arguments in [
        (module.IsTopLevelModuleScope, (None,)),
        (module.IsDefLineScope, (None,)),
        (module.IsDefLineScope, (b"a.<def>",)),
        (module.IsParentOfDefLineScope, (None, "")),
        (module.IsParentOfDefLineScope, ("", b"")),
    ]:
        with pytest.raises(TypeError):
            operation(*arguments)


@pytest.mark.parametrize(
    ("cls_name", "with_indices", "instance"),
    [
        ("list", "list#0", "list:"),
        ("A#1.f", "A#1.f#0", "A#1.f:"),
        ("A.<def>", "A#0.<def>", "A.<def>:"),
        ("A.*", "A#0.*", "A.*:"),
        ("a[x.y].'b.c'", "a[x.y]#0.'b.c'#0", "a[x.y].'b.c':"),
        ("é#10", "é#10", "é#10:"),
        ("x#", "x##0", "x#:"),
        ("", "", ":"),
    ],
)
def test_an_instance_is_named_by_its_class(cls_name, with_indices, instance):
    assert EnsureScopeNameIndicies(cls_name) == with_indices
    assert EnsureScopeNameIndicies(with_indices.encode()) == with_indices
    assert GetInstanceNameForClass(with_indices) == instance


def Walked(walk, text: str) -> list[int]:
    utf8 = text.encode()
    indices, i = [], 0
    while (i := walk(utf8, i, len(utf8))) != -1:
        indices.append(i)
    return indices


def test_walking_skips_what_is_nested(module):
    walk = module.NextNonNestedUtf8PtrIndex
    assert Walked(walk, "a.b") == [1, 2, 3]
    assert Walked(walk, "a(b[c)d]e") == [1, 8, 9]
    assert Walked(walk, "fr'(\\')'x") == [1, 2, 8, 9]  # the prefix byte by byte
    assert Walked(walk, "(')'") == Walked(walk, "'''a") == [4]  # what doesn't end, ends with the text
    assert Walked(walk, ")é)") == [1, 2, 3, 4]
    assert [walk("abc", pos, 3) for pos in (2, 3, 4, -1)] == [3, -1, -1, -1]
    with pytest.raises(ValueError, match="outside the buffer"):
        walk("abc", 0, 4)


@given(st.text(st.sampled_from("ab.()[]'\"\\é")), st.integers(0, 30), st.integers(0, 30))
def test_walking_gets_on_and_stays_inside(text, pos, end_pos):
    utf8 = text.encode()
    end_pos = min(end_pos, len(utf8))
    following = symbolinfo.NextNonNestedUtf8PtrIndex(utf8, pos, end_pos)
    if pos < end_pos:
        assert pos < following <= end_pos
        assert following == _NonInlineNextNonNestedUtf8PtrIndex(utf8, pos, end_pos)
    else:
        assert following == -1


# Records


def test_records_are_composed():
    assert BuildLiteralInfo("list", None) == b":l:list:"
    assert BuildLiteralInfo(b"tuple", "( )") == b":l:tuple: ( )"
    assert BuildArgInfo(2, None) == b":a:2"
    assert BuildArgInfo(0, "é") == ":a:0 é".encode()
    assert gInfoBytesBuilder.Build(symbolinfo.kSetPrefix, None, "a", b"b") == b":s:ab"
    for no_text in (3, ["a"]):
        with pytest.raises(TypeError):
            BuildLiteralInfo("list", no_text)


def test_a_host_says_where_the_builtins_are():
    class CHostCache(CLocationCache):
        calls = 0

        def _InitBuiltinLoc(self):
            self.calls += 1
            self._fBuiltinLoc = "here"

    cache = CHostCache()
    assert [cache.GetBuiltinLoc(), cache.GetBuiltinLoc(), cache.calls] == ["here", "here", 1]
    plain = CLocationCache()
    assert plain.GetBuiltinLoc() is plain.GetBuiltinLoc() is not None


# String literals

LITERALS = st.builds(
    "{0}{1}{2}{1}".format,
    st.sampled_from(["", "r", "R", "b", "B", "u", "U", "br", "Rb", "f", "x"]),
    st.sampled_from(["'", '"', "'''", '"""']),
    st.lists(
        st.sampled_from([*"a\\'\"\n\ré{#\0", "\\x41", "\\u0041", "\\N{EM DASH}", "\\N{DASH}", "\\d", "\r\n"])
    ).map("".join),
)


@pytest.mark.filterwarnings("ignore:invalid escape sequence")
@given(LITERALS)
@example("'a' 'b'")
@example("'''a''' '''b'''")
@example("'a\\\nb'")
@example("'\\N{EM DASH}'")
def test_the_value_of_a_literal_is_the_interpreters(text):
    try:
        (statement,) = ast.parse(text).body
        tokens = [token.string for token in host_tokens(text)]
        is_one_literal = tokens[0] == text or tokens[0] == text.replace("\r\n", "\n")
        value = ast.literal_eval(statement.value) if is_one_literal else None
    except (SyntaxError, ValueError, tokenize.TokenError):
        value = None
    for given_text in (text, text.encode()):
        found = ObjectForStringLiteral(given_text)
        assert (type(found), found) == (type(value), value)


@pytest.mark.parametrize(
    ("text", "value"),
    [
        (r"ur'a\d'", r"a\d"),
        (r"uR'\u0041\U0001F600'", "A\U0001f600"),
        (r"ur'\\u0041'", r"\\u0041"),
        (r"""UR"\'\é" """.strip(), r"\'\é"),
        (r"ur'\u12'", None),
    ],
)
def test_the_value_of_a_raw_text_of_python_2(text, value):
    assert ObjectForStringLiteral(text) == value


def test_what_is_no_literal_has_no_value():
    for text in ("", "x", "1", "'a", "a'", " 'a'", "'a' ", "('a')", "f'a'", "F'{x}'", "b'é'", "'a'.x"):
        assert ObjectForStringLiteral(text) is None
    with pytest.raises(TypeError):
        ObjectForStringLiteral(None)


@given(LITERALS)
def test_an_encoded_literal_is_one_row_of_the_same_value(text):
    encoded = EncodeStringLiteral(text).decode()
    assert len(encoded.splitlines()) == 1
    value = ObjectForStringLiteral(text)
    if value is not None and "r" not in text[:2].lower():
        assert ObjectForStringLiteral(encoded) == value


def test_encoding_a_literal():
    assert EncodeStringLiteral("'a\\n\té \"'") == "'a\\n\té \"'".encode()
    assert EncodeStringLiteral("'''a\v\x1c\x85\u2028b'''") == rb"'''a\v\x1c\x85\u2028b'''"
    assert EncodeStringLiteral("r'''a\\\nb'''") == rb"r'''a\\nb'''"
    assert EncodeStringLiteral("'a\\\v'") == rb"'a\\\v'"
    assert EncodeStringLiteral("'a\\") == b"'a\\"


# Tokens


JOINED = """
a + b; -x; a**-b; not x; a is not -b; f(x, *a, **b); f(a=1)(2)[3].c; a[1:]; [::2, :3]; {a: b, c: d}
lambda *a, **k: a; lambda: 0; x if not y else z; not (a); a in [b]; (x := 3); a @ b == c // d; ..., .5
[a async for a in b if c]; await x; ~a ^ b; (yield)
"""


@pytest.mark.parametrize("text", JOINED.strip().replace("\n", "; ").split("; "))
def test_tokens_are_joined_as_a_formatter_would(text):
    tokens = [token.string for token in host_tokens(text)]
    assert JoinTokens(tokens).decode() == text


def test_texts_of_expressions_are_joined_too():
    assert JoinTokens([b"a", "not in", b"(b)"]) == b"a not in (b)"
    assert JoinTokens(["a", "is not", "-", "x"]) == b"a is not -x"
    assert JoinTokens(iter(["f", "(x)", ".b", "", "[1]"])) == b"f(x).b[1]"
    assert JoinTokens([]) == b""
    with pytest.raises(TypeError):
        JoinTokens(["a", None])


@pytest.mark.parametrize("source", [argparse, statistics, tokenize], ids=lambda source: source.__name__)
def test_joining_keeps_the_meaning_of_every_expression(source):
    for node in ast.walk(ast.parse(inspect.getsource(source))):
        if not isinstance(node, ast.expr) or isinstance(
            node, ast.Slice | ast.JoinedStr | ast.FormattedValue | ast.Starred
        ):
            continue
        tokens = [token.string for token in host_tokens(ast.unparse(node))]
        joined = JoinTokens(tokens).decode()
        again = ast.parse(joined, mode="eval").body
        assert ast.unparse(again) == ast.unparse(node)
