"""An index by a cluster of Ray with two workers, of which one is killed in the middle.

Not among the other tests, since Ray is large: `make engines` installs it and runs them.
"""

import os
import signal
import threading
import time
from pathlib import Path

import pytest
import ray
from index_kills import Corpus, RowsOf

from codeloom.cli import main
from codeloom.corpus.store import MANIFEST

pytestmark = pytest.mark.slow


@pytest.fixture(scope="module")
def corpus(tmp_path_factory):
    return Corpus(tmp_path_factory.mktemp("corpus"), 1000, 1)


@pytest.fixture(scope="module")
def by_threads(corpus):
    """The index that threads make."""
    folder = corpus.sources.parent / "threads"
    assert Index(corpus, folder, "--jobs", "2") == 0
    return folder


def Index(corpus, folder, *options):
    return main(["index", "-q", "--part-size", "1", str(corpus.sources), "-o", str(folder), *options])


def IndexByRay(corpus, folder, *options):
    return Index(corpus, folder, "--engine", "ray", "--jobs", "2", *options)


def FilesIn(folder):
    """The content of each file by its path."""
    return {str(path.relative_to(folder)): path.read_bytes() for path in folder.rglob("*") if path.is_file()}


def ProcessesBelow(parent):
    """The processes below a process, with what they call themselves."""
    parents = {}
    for path in Path("/proc").glob("[0-9]*/stat"):
        try:
            pid, _, rest = path.read_text().partition(" (")
            parents[int(pid)] = int(rest.rpartition(")")[2].split()[1])
        except OSError:  # it has ended
            continue

    def IsBelow(pid):
        while pid and pid != parent:
            pid = parents.get(pid, 0)
        return pid == parent

    for pid in filter(IsBelow, parents):
        try:
            yield pid, Path(f"/proc/{pid}/cmdline").read_bytes().decode(errors="replace")
        except OSError:
            continue


def KillOne(name, folder, killed):
    """Kill a process of this name when some parts of the index are there."""
    deadline = time.monotonic() + 120
    while time.monotonic() < deadline and not killed:
        if len(list(folder.glob("files/*.parquet"))) > 1:
            for pid, called in ProcessesBelow(os.getpid()):
                if called.startswith(f"ray::{name}") and not killed:
                    os.kill(pid, signal.SIGKILL)
                    killed.append(pid)
        time.sleep(0.01)


@pytest.mark.parametrize("name", ["MapBatches", "ReadParts"])
def test_an_index_is_that_of_threads_though_a_process_dies(corpus, by_threads, tmp_path, name):
    killed = []
    killer = threading.Thread(target=KillOne, args=(name, tmp_path / "index", killed))
    killer.start()
    assert IndexByRay(corpus, tmp_path / "index") == 0
    killer.join()
    assert killed
    assert RowsOf(tmp_path / "index") == RowsOf(by_threads)
    assert FilesIn(tmp_path / "index") == FilesIn(by_threads)


def test_a_part_that_kills_each_worker_ends_the_run(corpus, tmp_path, monkeypatch, capfd):
    (tmp_path / "sitecustomize.py").write_text(
        "import os, codeloom.corpus.part as part\n"
        "made = part.parquet_files\n"
        "def parquet_files(settings, sources):\n"
        "    if any('/00500_' in one.entry.path for one in sources):\n"
        "        os._exit(1)\n"
        "    return made(settings, sources)\n"
        "part.parquet_files = parquet_files\n"
    )
    monkeypatch.setenv("PYTHONPATH", f"{tmp_path}:{os.environ.get('PYTHONPATH', '')}")
    assert IndexByRay(corpus, tmp_path / "index") == 2
    assert "6 workers died of the files from" in capfd.readouterr().err


def test_a_run_by_threads_is_gone_on_with(corpus, by_threads, tmp_path, monkeypatch):
    """As if it had been killed after three parts, with a cluster that runs already."""
    folder = tmp_path / "index"
    for path, content in FilesIn(by_threads).items():
        (folder / path).parent.mkdir(parents=True, exist_ok=True)
        (folder / path).write_bytes(content)
    rows = (folder / MANIFEST).read_bytes().splitlines(keepends=True)
    (folder / MANIFEST).write_bytes(b"".join(rows[:4]))
    monkeypatch.chdir(tmp_path)  # where workers look for modules
    ray.init(num_cpus=2, include_dashboard=False)
    try:
        assert IndexByRay(corpus, folder) == 2
        assert IndexByRay(corpus, folder, "--resume") == 0
        assert ray.is_initialized()
    finally:
        ray.shutdown()
    assert FilesIn(folder) == FilesIn(by_threads)


@pytest.mark.parametrize(
    "address", ["127.0.0.1:9", "nowhere.invalid:6379", "ray://127.0.0.1:9", "[::1]:9", "no address", "auto"]
)
def test_there_is_no_such_cluster(corpus, tmp_path, capfd, address):
    began = time.monotonic()
    assert IndexByRay(corpus, tmp_path / "index", "--address", address) == 2
    assert time.monotonic() - began < 30
    told = capfd.readouterr().err
    assert f"there is no cluster of Ray at {address}" in told and "Traceback" not in told
