"""What several test files share."""

import os
import random
import subprocess
import sys
import threading
from collections.abc import Callable, Iterator
from pathlib import Path
from typing import Any

import pytest
from hypothesis import settings


def pytest_addoption(parser: pytest.Parser) -> None:
    parser.addoption("--rewrite", action="store_true", help="write what comes out into the golden files")
    parser.addoption(
        "--seed", default="1", help="of the tests with random input; `random` for another one each time"
    )


def pytest_configure(config: pytest.Config) -> None:
    is_random = config.getoption("--seed") == "random"
    settings.register_profile("seeded", derandomize=not is_random, deadline=None)
    settings.load_profile("seeded")


@pytest.fixture
def seed(request: pytest.FixtureRequest) -> int:
    """Of random input: what the option says, or one that is always the same. A failure shows it."""
    option: str = request.config.getoption("--seed")
    number = random.randrange(1 << 30) if option == "random" else int(option)
    print(f"--seed {number}")
    return number


@pytest.fixture
def rewrite(request: pytest.FixtureRequest) -> bool:
    """True when golden files are to be rewritten, not compared."""
    return request.config.getoption("--rewrite")


@pytest.fixture
def in_small_thread() -> Iterator[Callable[..., Any]]:
    """Calls a function in a thread of `kib` KiB, and gives its result or raises its exception."""

    def Call(function: Callable[[], Any], kib: int = 256) -> Any:
        def Run() -> None:
            try:
                outcome.append(function())
            except BaseException as error:
                failure.append(error)

        outcome: list[Any] = []
        failure: list[BaseException] = []
        # A call takes several times the room in a build with sanitizers.
        room = 8 if "ASAN_OPTIONS" in os.environ else 1
        threading.stack_size(room * kib * 1024)
        thread = threading.Thread(target=Run)
        thread.start()
        thread.join()
        if failure:
            raise failure[0]
        return outcome[0]

    old_size = threading.stack_size()
    yield Call
    threading.stack_size(old_size)


@pytest.fixture
def write_files(tmp_path: Path) -> Callable[[dict[str, str | bytes]], Path]:
    """Writes files, path below the temporary folder to content, and gives that folder."""

    def Write(files: dict[str, str | bytes]) -> Path:
        for name, content in files.items():
            path = tmp_path / name
            path.parent.mkdir(parents=True, exist_ok=True)
            path.write_bytes(content.encode() if isinstance(content, str) else content)
        return tmp_path

    return Write


@pytest.fixture
def cli_environment() -> dict[str, str]:
    """The environment of a command line that writes UTF-8 and knows nothing of this terminal."""
    terminal = ("COLUMNS", "LINES", "NO_COLOR", "TERM")
    kept = {name: value for name, value in os.environ.items() if name not in terminal}
    return {**kept, "PYTHONIOENCODING": "utf-8", "TERM": "xterm"}


@pytest.fixture
def run_cli(
    tmp_path: Path, cli_environment: dict[str, str]
) -> Callable[..., subprocess.CompletedProcess[str]]:
    """Runs `python -m codeloom` in the temporary folder."""

    def Run(*arguments: str | Path, stdin: bytes = b"") -> subprocess.CompletedProcess[str]:
        done = subprocess.run(
            [sys.executable, "-m", "codeloom", *map(str, arguments)],
            input=stdin,
            capture_output=True,
            cwd=tmp_path,
            env=cli_environment,
            timeout=60,
        )
        stdout, stderr = done.stdout.decode(), done.stderr.decode()
        return subprocess.CompletedProcess(done.args, done.returncode, stdout, stderr)

    return Run
