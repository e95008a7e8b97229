"""Host code in the middle of native work: the collector runs it."""

import gc
from collections.abc import Callable, Iterator
from contextlib import contextmanager


@contextmanager
def OnCollection(action: Callable[[], object], phases: tuple[str, ...] = ("start",)) -> Iterator[None]:
    """Nearly every new object starts a collection meanwhile, which calls `action` in each of the phases."""

    def OnPhase(phase: str, _: dict[str, int]) -> None:
        if phase in phases:
            action()

    thresholds = gc.get_threshold()
    gc.callbacks.append(OnPhase)
    gc.set_threshold(1)
    try:
        yield
    finally:
        gc.set_threshold(*thresholds)
        gc.callbacks.remove(OnPhase)
