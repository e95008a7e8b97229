"""What an extra of the package brings, and what to say without it."""

from collections.abc import Iterator
from contextlib import contextmanager

from codeloom.cli.project import WrongUseError


@contextmanager
def needing_extra(what: str, extra: str, *packages: str) -> Iterator[None]:
    """For imports that take these packages: WrongUseError that names the extra where one is missing."""
    try:
        yield
    except ModuleNotFoundError as error:
        if (error.name or "").partition(".")[0] not in packages:
            raise
        raise WrongUseError(f"{what} needs the extra {extra}: pip install 'codeloom[{extra}]'") from None
