"""Where the names of a line's records stand among its tokens.

Records carry no place. `PlaceFinder` is a walker like the engine's own that keeps, in place of the
records, the tokens that each of them comes from.
"""

from bisect import bisect_left
from collections import defaultdict, deque
from collections.abc import Iterable, Iterator
from typing import Any, NamedTuple

from codeloom.logicalline import CLogicalLine
from codeloom.strutils import AsStr, AsUtf8
from codeloom.symbolinfo import (
    kCalledPrefix,
    kGetPrefix,
    kPrefixLen,
    kWithinExprPrefix,
)
from codeloom.treesift import (
    CAtom,
    CClassArgumentPatternNode,
    CDottedName,
    CNameLiteral,
    CNode,
    CNodeWalker,
    CPatternNode,
    CStarExpression,
    CTestListStarExpr,
    DropSimpleParens,
)


class Tokens(NamedTuple):
    """The first and the last token of a name, both by their index in a line."""

    logical: CLogicalLine
    first: int
    last: int

    @property
    def text(self) -> str:
        """The tokens without anything between them."""
        return "".join(self.logical.fToks[self.first : self.last + 1])


_PUNCTUATION = ("(", ")", "\\")


class NamePlaces:
    """The tokens of the names in a line's records, as far as they can be told."""

    def __init__(self) -> None:
        # By name and info bytes, in the order in which the records came.
        self.of_records: dict[tuple[bytes, bytes], deque[Tokens | None]] = defaultdict(deque)
        self.of_arguments: dict[str, Tokens] = {}
        self.of_names: dict[str, Tokens] = {}
        self.in_comments: dict[str, Tokens] = {}
        self.arrow: Tokens | None = None

    def Take(self, name: bytes, ibytes: bytes, of_arg: bool) -> Tokens | None:
        """The tokens of the next record of a name; equal records are told apart by their order."""
        text = AsStr(name)
        if of_arg:
            return self.arrow if text == "return" else self.of_arguments.get(text)
        known = self.of_records.get((name, ibytes))
        if known:
            return known.popleft()
        if ibytes == kGetPrefix and text in self.in_comments:
            return self.in_comments[text]
        return self.of_names.get(text)

    def AddComment(self, hint: CLogicalLine) -> None:
        """Add the names that a hint in a comment reads, which is rewritten before it is parsed."""
        first = 0
        for i, token in enumerate(hint.fToks):
            if token.isidentifier():
                first = first if i and hint.fToks[i - 1] == "." else i
                tokens = Tokens(hint, first, i)
                self.in_comments.setdefault(tokens.text, tokens)


class PlaceFinder(CNodeWalker):
    """Finds the places of names, one line at a time."""

    def __init__(self, version_triple: tuple[int, int, int]) -> None:
        super().__init__(version_triple)
        self._fPlaces = NamePlaces()

    def Find(self, tree: CNode, logical: CLogicalLine, places: NamePlaces) -> None:
        """Add the places in a sound line, which may get more records meanwhile."""
        self._fPlaces = places
        self._fLine = logical
        # What the tokens of a part that is parsed by itself count from.
        self._fFirst = 0
        # The tokens of what is visited now, and of what is known by name or token.
        self._fHere: Tokens | None = None
        self._fDefined: dict[str, Tokens] = {}
        self._fLoads: dict[str, Tokens | None] = {}
        self._fByContext: dict[object, Tokens | None] = {}
        # In their order, since a line may bind the same name twice.
        self._fImported: deque[Tokens] = deque()
        # Innermost last.
        self._fCalls: list[Tokens | None] = []
        self._fYields: list[Tokens | None] = []
        self.Walk(tree, logical)

    # Tokens

    def _TokensOf(self, first: CNode, last: CNode | None = None) -> Tokens | None:
        """The tokens from the first leaf of a node to the last one of a node; None when unknown."""
        first_i = self._LeafIndex(_Leaf(first, 0))
        last_i = self._LeafIndex(_Leaf(last or first, -1))
        return None if first_i is None or last_i is None else Tokens(self._fLine, first_i, last_i)

    def _LeafIndex(self, leaf: CNode) -> int | None:
        """The index of a leaf's token; None when it can't be told."""
        toks, context = self._fLine.fToks, leaf.fContext
        if isinstance(context, tuple):  # a position; they ascend
            context = bisect_left(self._fLine.fPositions, context)
        elif isinstance(context, int):
            context += self._fFirst
        is_index = isinstance(context, int) and 0 <= context < len(toks)
        return context if is_index and toks[context] == leaf.fText else None

    def _Visible(self, first: int = 0) -> Iterator[tuple[int, str]]:
        """The tokens from an index on, without comments."""
        toks = self._fLine.fToks
        return ((i, toks[i]) for i in range(first, len(toks)) if toks[i] and toks[i][0] != "#")

    def _Define(self, name: str | None, tokens: Tokens | None) -> None:
        if name is not None and tokens is not None:
            self._fDefined[name] = tokens
            self._fPlaces.of_names.setdefault(name, tokens)

    def _DefineByText(self, node: CNode) -> None:
        text = self._fToText.TextForNode(node)
        if text is not None:
            self._Define(AsStr(text), self._TokensOf(DropSimpleParens(node)))

    def _Enter(self, tokens: Tokens | None) -> None:
        """Remember where the walk is, and what name stands there."""
        self._fHere = tokens
        if tokens is not None:
            self._fPlaces.of_names.setdefault(tokens.text, tokens)

    # Records

    def _AddTypeEquiv(self, name: str | bytes, equiv: str | bytes) -> None:
        pair = AsUtf8(name), AsUtf8(equiv)
        self._fPlaces.of_records[pair].append(self._TokensOfRecord(AsStr(name), pair[1]))

    def _TokensOfRecord(self, name: str, ibytes: bytes) -> Tokens | None:
        prefix = ibytes[:kPrefixLen]
        if prefix == kGetPrefix:
            return self._fLoads.get(name)
        if prefix == kWithinExprPrefix:
            return self._fByContext.get(int(ibytes[kPrefixLen:]))
        if prefix == kCalledPrefix:
            return self._fCalls[-1]
        if name == "yield":
            return self._fYields[-1]
        return self._fDefined.get(name, self._fHere)

    def _AddArgInfoBytes(self, name: str | bytes, ibytes: str | bytes) -> None:
        pass

    # Loads and calls

    def _VisitNameLiteral(
        self,
        node: CNameLiteral,
        atom_node: CNode | None = None,
        all_trailers: list[CNode] | None = None,
        trailer_i: int = -1,
    ) -> None:
        self._Enter(self._TokensOf(atom_node or node, node))
        self._fByContext[node.fContext] = self._fHere
        super()._VisitNameLiteral(node, atom_node, all_trailers, trailer_i)

    def _VisitDottedName(self, node: CDottedName) -> None:
        children = node.fChildren
        name = ""
        for i, child in enumerate(children):
            name += child.fText
            if i % 2 == 0:
                self._fLoads.setdefault(name, self._TokensOf(node, child))
        super()._VisitDottedName(node)

    def _ProcessLoadName(self, name: str | None) -> None:
        if name is not None:
            self._fLoads.setdefault(name, self._fHere)
        super()._ProcessLoadName(name)

    def _VisitCall(self, atom: CNode, prev_trailers: list[CNode], arglist: CNode) -> None:
        self._fCalls.append(self._TokensOf(atom, prev_trailers[-1] if prev_trailers else atom))
        super()._VisitCall(atom, prev_trailers, arglist)
        self._fCalls.pop()

    def _VisitSingleDecorator(self, node: Any) -> None:
        self._fCalls.append(self._TokensOf(node.GetDottedName()))
        super()._VisitSingleDecorator(node)
        self._fCalls.pop()

    def _ProcessIsInstanceCall(self, arg_list: list[Any]) -> None:
        # These records go to the line directly.
        count = len(self._fLine.fTypeEquivs or ())
        super()._ProcessIsInstanceCall(arg_list)
        for pair in (self._fLine.fTypeEquivs or [])[count:]:
            self._fPlaces.of_records[pair].append(self._TokensOf(arg_list[0].value))

    # What binds names

    def _AppendEquivNode(
        self, name_node: CNode, equiv_node: CNode | None, extra_trailer: bytes | None = None
    ) -> None:
        self._Enter(self._TokensOf(name_node))
        super()._AppendEquivNode(name_node, equiv_node, extra_trailer)

    def _AddNodeInfoStr(self, name_node: CNode, istr: str | bytes | None) -> None:
        self._Enter(self._TokensOf(name_node))
        super()._AddNodeInfoStr(name_node, istr)

    def _ProcessTargets(self, lhs: Any, rhs: CNode | None, extra_trailer: bytes | None = None) -> None:
        if isinstance(lhs, CTestListStarExpr | CAtom):
            for i in range(lhs.GetSubExprCount()):
                target = lhs.GetSubExpr(i)
                if isinstance(target, CStarExpression):
                    self._DefineByText(target.fChildren[1])
        super()._ProcessTargets(lhs, rhs, extra_trailer)

    def _VisitFuncdef(self, node: Any) -> None:
        self._Define(node.GetFunctionName(), self._TokensOf(node.GetChild(1)))
        for child in node.fChildren:
            if child.fText == "->":
                self._fPlaces.arrow = self._TokensOf(child)
        super()._VisitFuncdef(node)

    def _ProcessDefiningArgList(self, arg_list: list[Any]) -> None:
        for arg in arg_list:
            if not isinstance(arg, list) and arg.name is not None:
                self._DefineArgument(arg.name.fText, arg.name)
        super()._ProcessDefiningArgList(arg_list)

    def _VisitTypeParameter(self, type_param: Any) -> None:
        name = type_param.GetName()
        for child in type_param.fChildren:
            if child.fText == name:
                self._DefineArgument(name, child)
                break
        super()._VisitTypeParameter(type_param)

    def _DefineArgument(self, name: str, node: CNode) -> None:
        tokens = self._TokensOf(node)
        if tokens is not None:
            self._fPlaces.of_arguments.setdefault(name, tokens)

    def _VisitClassdef(self, classdef_node: Any) -> None:
        self._Define(classdef_node.GetClassName(), self._TokensOf(classdef_node.GetChild(1)))
        super()._VisitClassdef(classdef_node)

    def _VisitImportNames(self, node: Any) -> None:
        self._fImported.extend(self._Imported())
        super()._VisitImportNames(node)

    def _VisitFromImport(self, node: Any) -> None:
        self._fImported.extend(self._Imported())
        if node.GetImportStar():
            self._Define("*", self._fImported.popleft())
        super()._VisitFromImport(node)

    def _AddNameDefined(self, name: str | bytes) -> None:
        if self._fImported:
            self._Define(AsStr(name), self._fImported.popleft())
        super()._AddNameDefined(name)

    def _Imported(self) -> Iterator[Tokens]:
        """A name is bound by the first token behind `import` or a comma, or by the one behind `as`."""
        before, first = "", None
        for i, token in self._Visible(self._fLine.fToks.index("import")):
            if token in _PUNCTUATION:
                continue
            if before in ("import", ",", "as"):
                if first is not None and before != "as":
                    yield Tokens(self._fLine, first, first)
                first = i
            before = token
        if first is not None:
            yield Tokens(self._fLine, first, first)

    def _VisitGlobalStmt(self, node: Any) -> None:
        self._DefineEach(node.fChildren[1:])
        super()._VisitGlobalStmt(node)

    def _VisitNonlocalStmt(self, node: Any) -> None:
        self._DefineEach(node.fChildren[1:])
        super()._VisitNonlocalStmt(node)

    def _VisitCaseStmt(self, case_stmt: Any) -> None:
        # A guard and a body may be parsed by themselves, and then count their tokens from their own first.
        pattern, *rest = case_stmt.fChildren[1:]
        if isinstance(pattern, CPatternNode):
            self._VisitPatternNode(pattern)
        at_colon = [child.fText for child in rest].index(":")
        colon_i = self._LeafIndex(rest[at_colon]) or 0
        for i, child in enumerate(rest):
            if i == at_colon:
                continue
            if _Leaf(child, 0).fContext == 0:
                self._fFirst = colon_i + 1 if i > at_colon else colon_i - child.fChildren[2].fContext
            self._VisitNode(child)
            self._fFirst = 0

    def _VisitPatternNode(self, pattern_node: Any) -> None:
        # The name in front of a "=" belongs to the class.
        first_i = 2 if isinstance(pattern_node, CClassArgumentPatternNode) else 0
        children = pattern_node.fChildren[first_i:]
        self._DefineEach(child for child in children if isinstance(child, CNameLiteral))
        super()._VisitPatternNode(pattern_node)

    def _DefineEach(self, nodes: Iterable[CNode]) -> None:
        for node in nodes:
            self._Define(node.fText, self._TokensOf(node))

    # What leaves the definition

    def _VisitReturn(self, return_stmt: Any) -> None:
        self._Define("return", self._TokensOf(return_stmt.GetChild(0)))
        super()._VisitReturn(return_stmt)

    def _VisitYield(self, yield_expr: Any) -> None:
        self._fYields.append(self._TokensOf(_Leaf(yield_expr, 0)))
        super()._VisitYield(yield_expr)
        self._fYields.pop()


def _Leaf(node: CNode, child_i: int) -> CNode:
    """The first (0) or the last (-1) leaf of a tree."""
    while node.fChildren:
        node = node.fChildren[child_i]
    return node
