"""The table-driven parser and its grammar loader."""

from codeloom._neighbours import (
    CreateParser,
    NodeConverter,
    ParseError,
    Parser,
    ParserGenerator,
)

__all__ = ["CreateParser", "NodeConverter", "ParseError", "Parser", "ParserGenerator"]
