"""Reporting and raising of exceptions.

It is a part of the engine's start, so what costs time to import waits until it is needed.
"""

from __future__ import annotations

TYPE_CHECKING = False
if TYPE_CHECKING:
    from types import TracebackType
    from typing import NoReturn


def ReportCurrentException(suppress_gui: bool = False) -> None:
    """Log the exception being handled, with its traceback.

    `suppress_gui` says that no dialog is to be shown; there is none here.
    """
    import logging

    logging.getLogger("codeloom").exception("Exception in codeloom")


def RaiseWithTraceback(exc: BaseException, traceback: TracebackType | None) -> NoReturn:
    """Raise `exc` with the given traceback."""
    raise exc.with_traceback(traceback)
