"""The plain names that lines of the interpreter's own library read and bind, against its own parser.

Each side gives facts, a role and a name. The interpreter's are made of the statement as it is, but for
what the records say in their own way; each such difference is a method of `Facts` or `Pattern` below with
its reason. Left out are lines that are refused, that are walked in part only, and those with a hint in
a comment.
"""

import ast
import random
import unicodedata
from bisect import bisect_right
from contextlib import suppress

import pytest
from sentences import Sentences
from test_library import LibraryTexts

from codeloom import RecordKind, analyze
from codeloom.logicalline import kCommentedTypeHint
from codeloom.utils import GetLogicalsFromText

ROLES = {
    RecordKind.GET: "reads",
    RecordKind.SET: "binds",
    RecordKind.WITHIN: "inside",
    RecordKind.GLOBAL: "global",
    RecordKind.NONLOCAL: "nonlocal",
}


def OurFacts(line, logical, limits):
    """The facts of a line; None when it is left out."""
    has_comment = any(embedded.fType == kCommentedTypeHint for embedded in logical.GetExpLogicals())
    if has_comment or line.problems or line in limits:
        return None
    facts = set()
    for record in line.records:
        role = ROLES.get(record.kind)
        if role is not None and record.name.isidentifier():
            facts.add(("takes" if record.of_argument else role, unicodedata.normalize("NFKC", record.name)))
    return facts


class Facts(ast.NodeVisitor):
    """The facts of a module, by the index of the logical line that they belong to."""

    def __init__(self, text, logicals):
        self.rows = text.split("\n")
        self.starts = [Start(logical) for logical in logicals]
        self.found = [set() for _ in logicals]
        self.pinned = None

    def Line(self, node):
        return bisect_right(self.starts, (node.lineno, node.col_offset)) - 1

    def Add(self, role, name, node):
        self.found[self.Line(node) if self.pinned is None else self.pinned].add((role, name))

    def VisitAll(self, *nodes):
        for node in nodes:
            for each in node if isinstance(node, list) else [node]:
                if each is not None:
                    self.visit(each)

    def visit_JoinedStr(self, node):
        # Its fields have no reliable places before 3.12.
        outer = self.pinned
        if outer is None:
            self.pinned = self.Line(node)
        self.generic_visit(node)
        self.pinned = outer

    def visit_Name(self, node):
        # What is deleted counts as read.
        self.Add("reads" if not isinstance(node.ctx, ast.Store) else "binds", node.id, node)

    def VisitTarget(self, target, role="binds"):
        """The names that a target binds; what it reads is read as anywhere."""
        if isinstance(target, ast.Name):
            # A name in brackets of its own isn't taken for a target.
            if role == "inside" or not self.IsBracketed(target):
                self.Add(role, target.id, target)
        elif isinstance(target, ast.Tuple | ast.List):
            for each in target.elts:
                self.VisitTarget(each, role)
        elif isinstance(target, ast.Starred):
            self.VisitTarget(target.value, role)
        else:
            self.VisitWithinTarget(target)

    def VisitWithinTarget(self, node, is_first=False):
        """Of what a target is made of, the first name of a chain and what is in `[...]` is read.

        A name by itself isn't, such as the argument in `f(a).b = 1`.
        """
        match node:
            case ast.Name():
                if is_first:
                    self.Add("reads", node.id, node)
            case ast.Attribute(value=value):
                self.VisitWithinTarget(value, True)
            case ast.Subscript(value=value, slice=inner):
                self.VisitWithinTarget(value, True)
                self.visit(inner)
            case ast.Call(func=function, args=args, keywords=keywords):
                self.VisitWithinTarget(function, True)
                for arg in [*args, *keywords]:
                    self.VisitWithinTarget(arg)
            case ast.JoinedStr():
                self.visit(node)
            case _:
                for child in ast.iter_child_nodes(node):
                    self.VisitWithinTarget(child)

    def IsBracketed(self, name):
        row = self.rows[name.lineno - 1].encode()
        before, after = row[: name.col_offset].rstrip(), row[name.end_col_offset :].lstrip()
        return before.endswith(b"(") and after.startswith(b")")

    def visit_Assign(self, node):
        for target in node.targets:
            self.VisitTarget(target)
        self.visit(node.value)

    def visit_AugAssign(self, node):
        # An augmented target is read only.
        if isinstance(node.target, ast.Name):
            self.Add("reads", node.target.id, node.target)
        self.VisitAll(node.target if not isinstance(node.target, ast.Name) else None, node.value)

    def visit_AnnAssign(self, node):
        # A name that is only annotated isn't bound.
        if node.value is not None or not isinstance(node.target, ast.Name):
            self.VisitTarget(node.target)
        self.VisitAnnotation(node.annotation)
        self.VisitAll(node.value)

    def visit_NamedExpr(self, node):
        self.Add("binds", node.target.id, node.target)
        self.visit(node.value)

    def visit_For(self, node):
        self.VisitTarget(node.target)
        self.VisitAll(node.iter, node.body, node.orelse)

    visit_AsyncFor = visit_For

    def visit_withitem(self, node):
        self.visit(node.context_expr)
        # What the target of an item reads isn't recorded.
        for name in ast.walk(node.optional_vars) if node.optional_vars else ():
            if isinstance(name, ast.Name) and isinstance(name.ctx, ast.Store):
                self.VisitTarget(name)

    def visit_ExceptHandler(self, node):
        if node.name is not None:
            self.Add("binds", node.name, node)
        self.VisitAll(node.type, node.body)

    def visit_comprehension(self, node):
        # A target of a comprehension belongs to the expression.
        self.VisitTarget(node.target, "inside")
        self.VisitAll(node.iter, node.ifs)

    def visit_Lambda(self, node):
        # So do a lambda's arguments.
        for arg in Arguments(node.args):
            self.Add("inside", arg.arg, arg)
        self.VisitAll(node.args.defaults, node.args.kw_defaults, node.body)

    def visit_FunctionDef(self, node):
        self.Add("binds", node.name, node)
        for arg in Arguments(node.args):
            self.Add("takes", arg.arg, arg)
            self.VisitAnnotation(arg.annotation)
        self.VisitAnnotation(node.returns)
        self.VisitAll(node.decorator_list, node.args.defaults, node.args.kw_defaults)
        self.VisitAll(getattr(node, "type_params", []))
        self.VisitSuite(node)

    visit_AsyncFunctionDef = visit_FunctionDef

    def visit_ClassDef(self, node):
        self.Add("binds", node.name, node)
        self.VisitAll(node.decorator_list, node.bases, node.keywords, getattr(node, "type_params", []))
        self.VisitSuite(node)

    def VisitSuite(self, node):
        # The suite of a definition isn't entered where it is on the line of its header, but the fields
        # of its f-strings are lines of their own.
        for statement in node.body:
            if self.Line(statement) != self.Line(node):
                self.visit(statement)
            else:
                self.VisitAll([each for each in ast.walk(statement) if isinstance(each, ast.JoinedStr)])

    def visit_Import(self, node):
        # The module's first name is bound, and none is read.
        for alias in node.names:
            if alias.name != "*":
                self.Add("binds", alias.asname or alias.name.partition(".")[0], node)

    visit_ImportFrom = visit_Import

    def visit_Global(self, node):
        for name in node.names:
            self.Add("global", name, node)

    def visit_Nonlocal(self, node):
        for name in node.names:
            self.Add("nonlocal", name, node)

    def VisitAnnotation(self, annotation):
        """What a hint reads, in quotes too, but for the values of `Literal` and the notes of `Annotated`."""
        match annotation:
            case ast.Constant(value=str(text)) if not self.HasEscape(annotation):
                outer, self.pinned = self.pinned, self.Line(annotation)
                with suppress(SyntaxError):  # the line is refused then
                    self.visit(ast.parse(f"[{text}\n]", mode="eval"))
                self.pinned = outer
            case ast.Subscript(value=name, slice=inner):
                last_name = getattr(name, "id", None) or getattr(name, "attr", None)
                self.visit(name)
                if last_name == "Literal":
                    self.visit(inner)
                elif last_name == "Annotated" and isinstance(inner, ast.Tuple):
                    self.VisitAnnotation(inner.elts[0])
                    self.VisitAll(inner.elts[1:])
                else:
                    self.VisitAnnotation(inner)
            case ast.Tuple(elts=elements) | ast.List(elts=elements):
                for element in elements:
                    self.VisitAnnotation(element)
            case ast.BinOp(left=left, right=right):
                self.VisitAnnotation(left)
                self.VisitAnnotation(right)
            case _:
                self.VisitAll(annotation)

    def HasEscape(self, text):
        # A hint with escapes in it is a text to the tokenizer.
        return "\\" in self.rows[text.lineno - 1].encode()[text.col_offset : text.end_col_offset].decode()

    def visit_match_case(self, node):
        # A pattern that is a name or a dotted name by itself leaves no record.
        if not isinstance(node.pattern, ast.MatchAs | ast.MatchValue) or self.IsOfParts(node.pattern):
            self.visit(node.pattern)
        self.VisitAll(node.guard, node.body)

    def IsOfParts(self, pattern):
        if isinstance(pattern, ast.MatchAs):
            return pattern.pattern is not None or self.IsBracketed(pattern)
        return False

    def visit_MatchAs(self, node):
        if node.name is not None:
            self.Add("binds", node.name, node)
        self.VisitAll(node.pattern)

    def visit_MatchStar(self, node):
        if node.name is not None and node.name != "_":
            self.Add("binds", node.name, node)

    def visit_MatchMapping(self, node):
        if node.rest is not None:
            self.Add("binds", node.rest, node)
        self.VisitDotted(*node.keys)
        self.VisitAll(node.patterns)

    def visit_MatchValue(self, node):
        self.VisitDotted(node.value)

    def visit_MatchClass(self, node):
        self.VisitDotted(node.cls)
        self.VisitAll(node.patterns, node.kwd_patterns)

    def VisitDotted(self, *values):
        # Each part of a dotted name in a pattern is read as a name of its own.
        for value in values:
            for part in ast.walk(value):
                if isinstance(part, ast.Name | ast.Attribute):
                    self.Add("reads", getattr(part, "id", None) or part.attr, part)


def Arguments(args):
    every = [*args.posonlyargs, *args.args, args.vararg, *args.kwonlyargs, args.kwarg]
    return [arg for arg in every if arg is not None]


def Start(logical):
    row, col = logical.fPositions[0]
    return logical.fFirstLine + row + 1, col


# The first digit of the codes of what parses and is refused after that.
REFUSED_BY_COMPILERS = {"CL1", "CL3", "CL4", "CL5"}


def FactsOfLines(text, module):
    """For each line its row, our facts or None, and those of the interpreter's tree of the text."""
    logicals = GetLogicalsFromText(text)
    facts = Facts(text, logicals)
    facts.visit(module)
    analysis = analyze(text)
    limits = {limit.line for limit in analysis.limits}
    for logical, line, theirs in zip(logicals, analysis.lines, facts.found, strict=True):
        if any(problem.code[:3] in REFUSED_BY_COMPILERS for problem in line.problems):
            continue
        yield line.range.row, OurFacts(line, logical, limits), theirs


@pytest.mark.parametrize(
    ("count", "seed"), [(100, 1), pytest.param(None, None, marks=pytest.mark.slow)], ids=["some", "all"]
)
def test_the_library(count, seed):
    differences, compared, left_out = [], 0, 0
    for path, text, module in LibraryTexts(count, seed):
        for row, ours, theirs in FactsOfLines(text, module):
            compared += ours is not None
            left_out += ours is None
            if ours is not None and ours != theirs:
                differences.append((f"{path}:{row}", sorted(ours - theirs), sorted(theirs - ours)))
    assert not differences[:20]
    assert compared > 100 * (count or 1000) and left_out < compared / 1000


@pytest.mark.parametrize("seed", range(4))
def test_sentences_of_the_grammar(seed):
    sentences = Sentences("3.14", random.Random(seed))
    differences, compared = [], 0
    for text in (sentences.Text() for _ in range(1000)):
        try:
            module = ast.parse(text)
        except SyntaxError:
            continue  # the grammar holds more than the interpreter's parser
        for _, ours, theirs in FactsOfLines(text, module):
            compared += 1
            if ours != theirs:
                differences.append((text, ours and sorted(ours - theirs), ours and sorted(theirs - ours)))
    assert not differences[:20]
    assert compared > 500
