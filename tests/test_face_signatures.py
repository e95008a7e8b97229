"""Signatures with the places of their parts, and every type hint of a text."""

import ast
import inspect
import pickle

from test_library import LibraryTexts

from codeloom import HintKind, ParameterKind, analyze

TEXT = """\
class A:
    x: int = 1
    async def f(self, a, /, b: "B", *c, d=1 + 2, **e: E) -> None: pass
    self.y: str
    def g(self, a, b):
        # type: (int, str) -> bool
        z = []  # type: list[int]
    def h(self, a,  # type: int
          b):
        pass
def k(*, a): pass
def broken(a:
    # type: (int) -> str
    pass
"""


def Text(place):
    if place is None:
        return None
    row = TEXT.split("\n")[place.row - 1]
    return row[place.column - 1 : place.end_column - 1]


def test_signatures():
    shown = [
        (
            signature.name,
            signature.is_async,
            signature.is_method,
            [
                (Text(each.range), each.kind.name, Text(each.default), each.hint and each.hint.text)
                for each in signature.parameters
            ],
            signature.return_hint and signature.return_hint.text,
        )
        for signature in analyze(TEXT).signatures
    ]
    plain = "POSITIONAL_OR_KEYWORD"
    assert shown == [
        (
            "f",
            True,
            True,
            [
                ("self", "POSITIONAL_ONLY", None, None),
                ("a", "POSITIONAL_ONLY", None, None),
                ("b", plain, None, '"B"'),
                ("c", "VAR_POSITIONAL", None, None),
                ("d", "KEYWORD_ONLY", "1 + 2", None),
                ("e", "VAR_KEYWORD", None, "E"),
            ],
            "None",
        ),
        (
            "g",
            False,
            True,
            [("self", plain, None, None), ("a", plain, None, "int"), ("b", plain, None, "str")],
            "bool",
        ),
        (
            "h",
            False,
            True,
            [("self", plain, None, None), ("a", plain, None, "int"), ("b", plain, None, None)],
            None,
        ),
        ("k", False, False, [("a", "KEYWORD_ONLY", None, None)], None),
    ]


def test_hints():
    shown = [
        (hint.name, hint.kind.name, hint.text, hint.in_comment, Text(hint.target) == hint.name)
        for hint in analyze(TEXT).hints
    ]
    assert all(Text(hint.range) == hint.text for hint in analyze(TEXT).hints)
    assert shown == [
        ("x", "VARIABLE", "int", False, True),
        ("b", "PARAMETER", '"B"', False, True),
        ("e", "PARAMETER", "E", False, True),
        ("f", "RETURN", "None", False, True),
        ("self.y", "ATTRIBUTE", "str", False, True),
        ("a", "PARAMETER", "int", True, True),
        ("b", "PARAMETER", "str", True, True),
        ("g", "RETURN", "bool", True, True),
        ("z", "VARIABLE", "list[int]", True, True),
        ("a", "PARAMETER", "int", True, True),
    ]


def test_items_are_values():
    one, other = analyze(TEXT), analyze(TEXT)
    assert one.signatures == other.signatures and one.hints == other.hints
    assert one.signatures[0].parameters == other.signatures[0].parameters
    assert pickle.loads(pickle.dumps(one.hints[2])) == one.hints[2]
    assert one.signatures[1].line == one.lines[4]


KINDS = {
    ParameterKind.POSITIONAL_ONLY: inspect.Parameter.POSITIONAL_ONLY,
    ParameterKind.POSITIONAL_OR_KEYWORD: inspect.Parameter.POSITIONAL_OR_KEYWORD,
    ParameterKind.VAR_POSITIONAL: inspect.Parameter.VAR_POSITIONAL,
    ParameterKind.KEYWORD_ONLY: inspect.Parameter.KEYWORD_ONLY,
    ParameterKind.VAR_KEYWORD: inspect.Parameter.VAR_KEYWORD,
}


def Expected(node, source):
    """(name, kind, annotation, default) of each parameter, as the interpreter has them."""
    arguments = node.args
    before = [None] * (len(arguments.posonlyargs) + len(arguments.args) - len(arguments.defaults))
    defaults = [*before, *arguments.defaults]
    positional = [
        *((each, inspect.Parameter.POSITIONAL_ONLY) for each in arguments.posonlyargs),
        *((each, inspect.Parameter.POSITIONAL_OR_KEYWORD) for each in arguments.args),
    ]
    found = [(*each, default) for each, default in zip(positional, defaults, strict=True)]
    if arguments.vararg:
        found.append((arguments.vararg, inspect.Parameter.VAR_POSITIONAL, None))
    for each, default in zip(arguments.kwonlyargs, arguments.kw_defaults, strict=True):
        found.append((each, inspect.Parameter.KEYWORD_ONLY, default))
    if arguments.kwarg:
        found.append((arguments.kwarg, inspect.Parameter.VAR_KEYWORD, None))
    return [(each.arg, kind, Dumped(each.annotation), Dumped(default)) for each, kind, default in found]


def Dumped(node):
    return None if node is None else ast.dump(node)


def Parsed(text):
    return None if text is None else ast.dump(ast.parse(f"({text}\n)", mode="eval").body)


def test_against_the_interpreter(seed):
    for path, text, tree in LibraryTexts(40, seed):
        rows = text.split("\n")

        def source(place, rows=rows):
            if place is None:
                return None
            if place.row == place.end_row:
                return rows[place.row - 1][place.column - 1 : place.end_column - 1]
            first, *between, last = rows[place.row - 1 : place.end_row]
            return "\n".join([first[place.column - 1 :], *between, last[: place.end_column - 1]])

        analysis = analyze(text, python="3.11")
        functions = [
            node for node in ast.walk(tree) if isinstance(node, ast.FunctionDef | ast.AsyncFunctionDef)
        ]
        theirs = {(node.lineno, node.name): node for node in functions}
        ours = {(each.line.range.row, each.name): each for each in analysis.signatures}
        assert ours.keys() == theirs.keys(), path
        for key, signature in ours.items():
            node = theirs[key]
            assert signature.is_async == isinstance(node, ast.AsyncFunctionDef)
            shown = [
                (
                    each.name,
                    KINDS[each.kind],
                    Parsed(each.hint.text) if each.hint and not each.hint.in_comment else None,
                    Parsed(source(each.default)),
                )
                for each in signature.parameters
            ]
            assert shown == Expected(node, source), (path, key)
            hint = signature.return_hint
            assert Parsed((hint and not hint.in_comment and hint.text) or None) == Dumped(node.returns)
        annotated = [node for node in ast.walk(tree) if isinstance(node, ast.AnnAssign)]
        plain = [each for each in annotated if isinstance(each.target, ast.Name | ast.Attribute)]
        variables = [
            each
            for each in analysis.hints
            if each.kind in (HintKind.VARIABLE, HintKind.ATTRIBUTE) and not each.in_comment
        ]
        assert len(variables) == len(plain), path
