"""What accessors tell of the interpreter's own library, against its own parser.

Each side makes facts: the row, the kind of statement, and what its accessors or fields tell. Calls within
f-strings are parsed as lines of their own and left out here.
"""

import ast
from collections import Counter

import pytest
from hand_made import DRIVERS
from test_library import LibraryTexts

from codeloom.logicalinspect import TextFromTokens
from codeloom.optpgen import ParseError
from codeloom.treesift import CSingleUsedArgumentNode, GetDefiningArgInfoList, GetUsedArgInfoList
from codeloom.utils import GetLogicalsFromText

# Ours


def Parameters(node):
    """Prefix and name of each parameter, whether it has an annotation, whether it has a default."""
    return tuple(
        (info.prefix or "", info.name and info.name.fText, bool(info.type_expr), bool(info.value))
        for info in (GetDefiningArgInfoList(node) if node else ())
    )


def Arguments(arguments):
    """The name or the prefix of each argument of a call."""
    return tuple(
        (info.name and info.name.fText)
        or (isinstance(info.value, CSingleUsedArgumentNode) and info.value.GetPrefix())
        or None
        for info in arguments
    )


def Calls(node):
    for trailer in node.GetTrailers():
        if trailer.GetInitialToken() == "(":
            nested = trailer.GetNestedNode()
            yield "call", Arguments(GetUsedArgInfoList(nested) if nested else ())


def Expression(node):
    if node.GetAnnotatedAssignNode() is not None:
        yield "annotation", node.GetAnnotatedAssignNode().GetPostEqualsTestExpr() is not None
    elif node.GetEqualCount():
        yield "assignment", node.GetEqualCount()
    else:
        yield "augmented", node.GetAugAssignOp()


def Decorator(node):
    if node.GetChildText(2) == "(":
        yield "call", Arguments(node.GetUsedArgList())


def Names(node):
    return tuple((name.module_name, name.as_name) for name in node.GetAsNameList())


OURS = {
    "CFuncdefStmt": lambda node: [
        ("def", node.GetFunctionName(), Parameters(node.GetParameters()), node.GetChildText(3) == "->")
    ],
    "CLambdaExpr": lambda node: [("lambda", Parameters(node.GetArgumentsNode()))],
    "CClassdefStmt": lambda node: [("class", node.GetClassName(), Arguments(node.GetBaseClassList()))],
    "CSingleDecorator": Decorator,
    "CImportNamesStmt": lambda node: [("import", Names(node))],
    "CFromImportStmt": lambda node: [("from", node.GetFromString(), Names(node), node.GetImportStar())],
    "CExprStmt": Expression,
    "CForStmt": lambda node: [("for", node.GetElseBody() is not None)],
    "CWithStmt": lambda node: [("with", len(node.GetWithItems()))],
    "CExceptClause": lambda node: [("except", node.GetTarget() and node.GetTarget().fText)],
    "CGlobalStmt": lambda node: [("global", tuple(node.GetUtf8NameList()))],
    "CNonlocalStmt": lambda node: [("nonlocal", tuple(node.GetUtf8NameList()))],
    "CDelStmt": lambda node: [("del", len(node.GetExpressions()))],
    "CReturnStmt": lambda node: [("return", node.GetValue() is not None)],
    "CAtomExpr": Calls,
}


def OurFacts(text, left_out):
    """The facts of a text; `left_out` gets the rows of lines that are refused or parsed by hand."""
    for logical in GetLogicalsFromText(text):
        try:
            if logical.fToks[0] in ("match", "case"):
                raise ParseError("left to its own tests", None, None, 0)
            tree = DRIVERS["3.8"].ParseToNode(logical, logical.fInAsyncDef)
        except ParseError:
            left_out.update(RowsOf(logical))
            continue
        yield from FactsBelow(tree, logical)
        DRIVERS["3.8"].DiscardNode(tree)


def FactsBelow(tree, logical):
    pending = [tree]
    while pending:
        node = pending.pop()
        pending += node.fChildren or ()
        for fact in OURS.get(type(node).__name__, lambda node: ())(node):
            row, _ = logical.fPositions[node.fContext]
            yield logical.fFirstLine + row + 1, *fact


def RowsOf(logical):
    first = logical.fFirstLine + 1
    return range(first, first + TextFromTokens(logical).count("\n") + 1)


# The interpreter's


def AstParameters(arguments):
    positional = [*arguments.posonlyargs, *arguments.args]
    defaults = [None] * (len(positional) - len(arguments.defaults)) + arguments.defaults
    told = [
        ("", arg.arg, bool(arg.annotation), bool(default))
        for arg, default in zip(positional, defaults, strict=True)
    ]
    if arguments.vararg:
        told.append(("*", arguments.vararg.arg, bool(arguments.vararg.annotation), False))
    elif arguments.kwonlyargs:
        told.append(("*", None, False, False))
    for arg, default in zip(arguments.kwonlyargs, arguments.kw_defaults, strict=True):
        told.append(("", arg.arg, bool(arg.annotation), bool(default)))
    if arguments.kwarg:
        told.append(("**", arguments.kwarg.arg, bool(arguments.kwarg.annotation), False))
    return tuple(told)


def AstArguments(values, keywords):
    def Told(argument):
        if isinstance(argument, ast.keyword):
            return argument.arg or "**"
        return "*" if isinstance(argument, ast.Starred) else None

    return tuple(map(Told, sorted([*values, *keywords], key=lambda node: (node.lineno, node.col_offset))))


def AstNames(node):
    return tuple((name.name, name.asname) for name in node.names)


# Operators aren't distinguished.
OPERATORS = {
    ast.Add: "+=",
    ast.Sub: "-=",
    ast.Mult: "*=",
    ast.Div: "/=",
    ast.Mod: "%=",
    ast.BitAnd: "&=",
    ast.BitXor: "^=",
    ast.LShift: "<<=",
    ast.RShift: ">>=",
    ast.Pow: "**=",
    ast.FloorDiv: "//=",
}


def AstFunction(node):
    return "def", node.name, AstParameters(node.args), node.returns is not None


def AstFrom(node):
    names = AstNames(node)
    return "from", "." * node.level + (node.module or ""), names, names == (("*", None),)


THEIRS = {
    ast.FunctionDef: AstFunction,
    ast.AsyncFunctionDef: AstFunction,
    ast.Lambda: lambda node: ("lambda", AstParameters(node.args)),
    ast.ClassDef: lambda node: ("class", node.name, AstArguments(node.bases, node.keywords)),
    ast.Import: lambda node: ("import", AstNames(node)),
    ast.ImportFrom: AstFrom,
    ast.Assign: lambda node: ("assignment", len(node.targets)),
    ast.AnnAssign: lambda node: ("annotation", node.value is not None),
    ast.AugAssign: lambda node: ("augmented", OPERATORS.get(type(node.op))),
    ast.For: lambda node: ("for", False),
    ast.AsyncFor: lambda node: ("for", False),
    ast.With: lambda node: ("with", sum(item.optional_vars is not None for item in node.items)),
    ast.AsyncWith: lambda node: ("with", sum(item.optional_vars is not None for item in node.items)),
    ast.ExceptHandler: lambda node: node.type and ("except", node.name),
    ast.Global: lambda node: ("global", tuple(node.names)),
    ast.Nonlocal: lambda node: ("nonlocal", tuple(node.names)),
    ast.Delete: lambda node: ("del", len(node.targets)),
    ast.Return: lambda node: node.value and ("return", True),
    ast.Call: lambda node: ("call", AstArguments(node.args, node.keywords)),
}


def AstFacts(module):
    pending = [module]
    while pending:
        node = pending.pop()
        if isinstance(node, ast.JoinedStr):
            continue
        fact = THEIRS[type(node)](node) if type(node) in THEIRS else None
        if fact:
            yield node.lineno, *fact
        pending += ast.iter_child_nodes(node)


@pytest.mark.parametrize(
    ("count", "seed"), [(30, 1), pytest.param(300, 2, marks=pytest.mark.slow)], ids=["some", "many"]
)
def test_the_library(count, seed):
    for path, text, module in LibraryTexts(count, seed):
        left_out = set()
        ours = Counter(OurFacts(text, left_out))
        theirs = Counter(fact for fact in AstFacts(module) if fact[0] not in left_out)
        assert (ours - theirs, theirs - ours) == (Counter(), Counter()), path
