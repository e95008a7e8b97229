"""Record classes of byte buffers; the engine binds them by name and does nothing with them."""


class CWritableByteBuffer(bytearray):
    """A byte buffer that grows by appending."""


class CEncodedByteBufferReader:
    """Reads a byte string from its start.

    `data` is a byte string; `pos` is the byte offset of what is read next.
    """

    def __init__(self, data: bytes) -> None:
        self.data = data
        self.pos = 0

    def Read(self, count: int) -> bytes:
        """The next `count` bytes, fewer at the end."""
        piece = self.data[self.pos : self.pos + count]
        self.pos += len(piece)
        return piece
