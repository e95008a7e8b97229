"""Token classification: `GetTokenType` and the numbers that it gives, `kTokenId_...`."""

from codeloom import _neighbours
from codeloom._neighbours import GetTokenType

__all__ = ["GetTokenType"]

_TOKEN_IDS = {
    name: value for name, value in vars(_neighbours).items() if name.startswith("kTokenId_")
}
globals().update(_TOKEN_IDS)
__all__ += _TOKEN_IDS
