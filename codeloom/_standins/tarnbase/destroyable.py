"""Objects with an explicit end of life; the engine binds these by name and does nothing with them."""

from collections.abc import Callable


class _CHandlerRecord:
    """One handler connected to a signal of an object."""

    def __init__(self, signal: str, handler: Callable[..., object]) -> None:
        self.signal = signal
        self.handler = handler


class _CEmissionStackItem:
    """One emission of a signal that is under way."""

    def __init__(self, signal: str) -> None:
        self.signal = signal


class CDestroyable:
    """An object that can be destroyed; afterwards `destroyed` is true."""

    destroyed = False

    def Destroy(self) -> None:
        """End the object's life."""
        self.destroyed = True
