"""Trees that no parser makes, and the parsers that make the others."""

from types import SimpleNamespace

from codeloom.reading.languages import language_named
from codeloom.treesift import CNode, CNodeClassInfo, CNodeFactory, CPGenParserImpl
from codeloom.utils import GetLogicalsFromText

_FACTORY = CNodeFactory(SimpleNamespace(number2symbol={}), [], {}, {}, {})


def Node(cls, *children, text=None, context=None):
    """A node of the class with the children, which may be anything."""
    return _FACTORY.NewNode(CNodeClassInfo(cls, 0, cls.__name__), 0, text, context, list(children))


def Leaf(text=None, context=0, cls=CNode):
    return _FACTORY.NewNode(CNodeClassInfo(cls, 0, cls.__name__), 0, text, context, None)


def Driver(version):
    language = language_named(version)
    return CPGenParserImpl(language.version_triple, language.grammar_file, language.keywords, language.is_py3)


DRIVERS = {version: Driver(version) for version in ("3.8", "2.7")}


def Parse(source, version="3.8", driver=None):
    (logical,) = GetLogicalsFromText(source)
    return (driver or DRIVERS[version]).ParseToNode(logical, in_async_def=True)


def Tokens(node):
    """The node's tokens with a blank between; nothing for None."""
    if node is None:
        return ""
    return node.fText if node.fChildren is None else " ".join(map(Tokens, node.fChildren))
