"""An index by a cluster of Ray with two workers, one of which is killed in the middle.

Not among the other tests, since Ray is large: `make engines` installs and runs it.
"""

import os
import signal
import threading
import time
from pathlib import Path

import ray
from index_kills import Corpus, Leftovers, RowsOf

from codeloom.cli import main


def WorkersBelow(parent):
    """The processes of Ray's workers below a process that run a task."""
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
            if b"ray::_files_of" in Path(f"/proc/{pid}/cmdline").read_bytes():
                yield pid
        except OSError:
            continue


def KillOne(killed):
    """Kill the first worker that is seen at work."""
    deadline = time.monotonic() + 120
    while time.monotonic() < deadline and not killed:
        for pid in WorkersBelow(os.getpid()):
            os.kill(pid, signal.SIGKILL)
            killed.append(pid)
            break
        time.sleep(0.01)


def test_every_file_is_there_once_though_a_worker_dies(tmp_path):
    corpus = Corpus(tmp_path, 1000, 1)
    arguments = ["index", "-q", "--part-size", "1", str(corpus.sources)]
    assert main([*arguments, "--jobs", "2", "-o", str(tmp_path / "threads")]) == 0
    ray.init(num_cpus=2, include_dashboard=False)
    killed = []
    killer = threading.Thread(target=KillOne, args=(killed,))
    killer.start()
    try:
        assert main([*arguments, "--engine", "ray", "-o", str(tmp_path / "ray")]) == 0
        killer.join()
    finally:
        ray.shutdown()
    assert killed
    assert RowsOf(tmp_path / "ray") == RowsOf(tmp_path / "threads")
    assert not Leftovers(tmp_path / "ray")
