"""Source text into logical lines."""

from codeloom._neighbours import GetLogicalsFromText

__all__ = ["GetLogicalsFromText"]
