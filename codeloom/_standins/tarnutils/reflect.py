"""Reporting and raising of exceptions."""

import logging
from types import TracebackType
from typing import NoReturn

_logger = logging.getLogger("codeloom")


def ReportCurrentException(suppress_gui: bool = False) -> None:
    """Log the exception being handled, with its traceback.

    `suppress_gui` says that no dialog is to be shown; there is none here.
    """
    _logger.exception("Exception in codeloom")


def RaiseWithTraceback(exc: BaseException, traceback: TracebackType | None) -> NoReturn:
    """Raise `exc` with the given traceback."""
    raise exc.with_traceback(traceback)
