"""A host whose code runs whenever it can, and does with lines, trees and walks what nobody should.

Its subclasses override every operation of drivers, walkers and nodes. Before and after the native one they
may change what is under way; finalizers, callbacks of the collector and texts do the same. Whatever comes
of it is an exception at most.
"""

import gc
import inspect
import random
from collections.abc import Callable, Iterator
from contextlib import contextmanager, suppress

from codeloom import treesift
from codeloom.logicalline import CLogicalLine
from codeloom.optpgen import ParseError
from codeloom.treesift import CNode, CNodeWalker, CPGenParserImpl, CTypeHintWalker
from codeloom.utils import GetLogicalsFromText

# What odd use of the engine may raise.
HOST_ERRORS = (ArithmeticError, AssertionError, AttributeError, LookupError, RuntimeError, SyntaxError,
               TypeError, ValueError)  # fmt: skip

_MOST_KEPT = 40


class OddHost:
    """One host; its oddities come from `random`, so that a seed tells them all."""

    def __init__(self, random: random.Random) -> None:
        self.random = random
        self._nodes: list[CNode] = []
        self._logical, self._other = GetLogicalsFromText("a = 1\nb.c(d)[e]")
        self._is_acting = True
        self._driver = self._Subclass(CPGenParserImpl)((3, 11, 0))
        walker = self._Subclass(CNodeWalker)((3, 11, 0))
        hints = self._Subclass(CTypeHintWalker)((3, 11, 0), treesift.kPy3DefaultGrammar, walker)
        self._walks = [
            lambda node, logical: walker.Walk(node, logical),
            lambda node, logical: hints.Walk(node, logical, logical.fFirstInDef),
        ]
        self._actions = self._Actions()
        self._is_acting = False

    def Analyze(self, logical: CLogicalLine) -> None:
        """Parse a line, walk its tree, give it back; anything may happen meanwhile."""
        self._logical = logical
        with self._Collecting(), suppress(*HOST_ERRORS, ParseError):
            node = self._driver.ParseToNode(logical, logical.fInAsyncDef)
            for walk in self._walks:
                with suppress(*HOST_ERRORS):
                    walk(node, logical)
            self._driver.DiscardNode(node)
        self._nodes.clear()

    def _Act(self) -> None:
        """Now and then, and not from within another action."""
        if self._is_acting or self.random.random() > 0.03:
            return
        self._is_acting = True
        try:
            with suppress(*HOST_ERRORS, ParseError):
                self.random.choice(self._actions)()
        finally:
            self._is_acting = False

    def _Actions(self) -> list[Callable[[], object]]:
        def Node() -> CNode:
            return self.random.choice(self._nodes)

        return [
            lambda: Node().fChildren.clear(),
            lambda: Node().fChildren.append(Node()),
            lambda: Node().fChildren.reverse(),
            lambda: treesift.FinishedWithNode(Node()),
            lambda: self._driver.DiscardNode(Node()),
            lambda: self._driver.ParseToNode(self._other),
            lambda: self._walks[0](Node(), self._other),
            lambda: self._walks[1](Node(), self._logical),
            lambda: self._logical.ClearDerivedInfo(),
            lambda: self._logical.AppendTypeEquiv(b"x", b"y"),
            lambda: self._logical.AppendArgTypeEquiv("x", _Text("y")),
            lambda: self._logical.fTypeEquivs.clear(),
            lambda: (self._logical.fTypeEquivs, self._logical.fArgTypeEquivs, self._logical.fPositions),
            self._nodes.clear,
        ]

    @contextmanager
    def _Collecting(self) -> Iterator[None]:
        """The collector runs all the time, and host code with it."""

        def OnCollection(phase: str, _: dict[str, int]) -> None:
            self._Act()

        thresholds = gc.get_threshold()
        gc.callbacks.append(OnCollection)
        gc.set_threshold(50, 100, 100)
        try:
            yield
        finally:
            gc.set_threshold(*thresholds)
            gc.callbacks.remove(OnCollection)

    def _Subclass(self, cls: type) -> type:
        names = {name for base in cls.__mro__ for name in vars(base) if base is not object}
        operations = [name for name in sorted(names) if not name.startswith("__") and _IsOperation(cls, name)]
        body = {name: self._Override(getattr(cls, name)) for name in operations}
        if cls is CPGenParserImpl:
            body["_BuildClsForStateList"] = lambda driver: self._NodeClasses(driver)
        return type(f"Odd{cls.__name__}", (cls,), body)

    def _Override(self, operation: Callable[..., object]) -> Callable[..., object]:
        def Override(this: object, *arguments: object) -> object:
            self._nodes += [thing for thing in (this, *arguments) if isinstance(thing, CNode)]
            del self._nodes[:-_MOST_KEPT]
            self._Act()
            result = operation(this, *arguments)
            self._Act()
            return None if self.random.random() < 0.0003 else result

        return Override

    def _NodeClasses(self, driver: CPGenParserImpl) -> list[type | None]:
        """Half of the classes stay native, since their nodes take other roads."""
        classes = CPGenParserImpl._BuildClsForStateList(driver)
        odd = {
            cls: self._Subclass(cls) for cls in dict.fromkeys(classes) if cls and self.random.random() < 0.5
        }
        return [odd.get(cls, cls) for cls in classes]


class _Text(str):
    """A text that is more than a text."""

    def __del__(self) -> None:
        gc.collect()


def _IsOperation(cls: type, name: str) -> bool:
    return callable(getattr(cls, name)) and not inspect.isclass(getattr(cls, name))
