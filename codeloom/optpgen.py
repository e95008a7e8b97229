"""The table-driven parser and its grammar loader."""

from codeloom._neighbours import (
    CreateParser,
    Grammar,
    NodeConverter,
    ParseError,
    Parser,
    ParserGenerator,
    ParserImpl,
)

__all__ = [
    "CreateParser",
    "Grammar",
    "NodeConverter",
    "ParseError",
    "Parser",
    "ParserGenerator",
    "ParserImpl",
]
