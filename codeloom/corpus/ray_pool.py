"""Workers of a cluster of Ray, on any number of machines.

    parts on a desk -> their numbers -> a worker each -> Parquet files as bytes -> index

The desk is an actor to which the process that leads brings the sources of parts. Ray Data streams their
numbers: a reader gives them as they come, and each worker takes one part at a time from the desk and makes
its files. Only the process that leads reads sources and touches the index, so that workers need no disk in
common. A part stays on the desk until its files are on the disk, for whoever has to do it again when a worker
dies.
"""

import asyncio
import contextlib
import logging
import os
import pickle
import socket
from collections import Counter
from collections.abc import Callable, Iterator, Sequence
from functools import partial
from itertools import count
from typing import Any

import pyarrow
import ray
import ray.data
from ray.data.block import BlockMetadata
from ray.data.datasource import Datasource, ReadTask
from ray.util.scheduling_strategies import NodeAffinitySchedulingStrategy

from codeloom.corpus.index import PoolError
from codeloom.corpus.part import Hashed, Settings, parquet_files
from codeloom.corpus.store import WritableStore

# How many workers may die of a part.
_TRIES = 6
# Seconds that a cluster may take to answer.
_PATIENCE = 5


class RayPool:
    """Analyses parts by a data set of Ray."""

    def __init__(self, store: WritableStore, address: str | None, jobs: int | None) -> None:
        """With a cluster's address, or "auto" for the one that this machine belongs to; without one a
        cluster is started here. ConnectionError where there is none. There are `jobs` workers, as many as the
        cluster has processors unless told otherwise."""
        self._store = store
        self._is_ours = not ray.is_initialized()
        if self._is_ours:
            _connect(address, jobs)
        self.jobs = jobs or max(int(ray.cluster_resources().get("CPU", 1)), 1)
        # On the machine that reads the sources, if that is one of the cluster.
        here = NodeAffinitySchedulingStrategy(ray.get_runtime_context().get_node_id(), soft=True)
        self._desk = ray.remote(num_cpus=0, scheduling_strategy=here)(_Desk).remote()
        self._results = self._begin()
        # What came before it was asked for.
        self._files: dict[int, pyarrow.Table] = {}

    def submit(self, part: int, sources: Sequence[Hashed]) -> Callable[[], None]:
        """Begin with a part; the call waits for it, and writes its files."""
        number = ray.get(self._desk.put.remote(pickle.dumps(list(sources))))
        return partial(self._write, number, part)

    def _begin(self) -> Iterator[pyarrow.Table]:
        """The files of the parts, in the order in which workers are done."""
        numbers = ray.data.read_datasource(Parts(self._desk), concurrency=1, num_cpus=0)
        files = numbers.map_batches(
            _files_of,
            fn_kwargs={"desk": self._desk, "settings": self._store.settings},
            batch_size=None,
            batch_format="pyarrow",
            num_cpus=1,
            concurrency=self.jobs,
        )
        files.context.target_max_block_size = 1  # numbers aren't gathered until they fill a block
        files.context.enable_progress_bars = False
        return iter(files.iter_batches(batch_size=None, batch_format="pyarrow", prefetch_batches=0))

    def _write(self, number: int, part: int) -> None:
        files = self._files_of(number)
        for name in self._store.tables:
            self._store.write(name, part, files[name][0].as_buffer())
        self._desk.drop.remote(number)

    def _files_of(self, number: int) -> pyarrow.Table:
        while number not in self._files:
            files = next(self._results)
            if "error" in files.column_names:
                raise PoolError(files["error"][0].as_py())
            self._files[files["number"][0].as_py()] = files
        return self._files.pop(number)

    def close(self) -> None:
        """Leave the cluster, and end it if it was started here."""
        del self._results  # it ends by asking Ray, which would begin anew
        if self._is_ours:
            ray.shutdown()
        else:
            self._desk.close.remote()


def _connect(address: str | None, jobs: int | None) -> None:
    logging.getLogger("ray.data").setLevel(logging.ERROR)
    options: dict[str, Any] = {"address": address, "log_to_driver": False, "logging_level": logging.ERROR}
    if address is None:
        options |= {"address": "local", "num_cpus": jobs, "include_dashboard": False}
    try:
        _reach(address or "")
        # Workers look for modules in the folder in which Ray is asked for them, before all others: a source
        # that is to be indexed could hide one of the library.
        with contextlib.chdir(os.sep):
            ray.init(**options)
    except (OSError, ValueError) as error:
        raise ConnectionError(str(error)) from None


def _reach(address: str) -> None:
    """OSError where nothing answers, for which Ray would wait minutes."""
    host, _, port = address.removeprefix("ray://").rpartition(":")
    if port.isdigit():
        socket.create_connection((host.strip("[]"), int(port)), _PATIENCE).close()


class _Desk:
    """Holds the parts that are under way, by their numbers."""

    def __init__(self) -> None:
        self._parts: dict[int, bytes] = {}
        self._tries: Counter[int] = Counter()
        self._size = 0
        self._is_closed = False
        self._changed = asyncio.Condition()

    async def put(self, sources: bytes) -> int:
        """Add a part, and give its number."""
        number = self._size
        self._parts[number] = sources
        self._size += 1
        async with self._changed:
            self._changed.notify_all()
        return number

    async def has(self, number: int) -> bool:
        """Wait for a part; false when it won't come."""
        async with self._changed:
            await self._changed.wait_for(lambda: number < self._size or self._is_closed)
        return number < self._size

    async def take(self, number: int) -> tuple[bytes, int]:
        """The sources of a part, and how often they were taken before."""
        self._tries[number] += 1
        return self._parts[number], self._tries[number] - 1

    async def drop(self, number: int) -> None:
        """Forget a part that is done."""
        del self._parts[number], self._tries[number]

    async def close(self) -> None:
        """Let no more parts come."""
        self._is_closed = True
        async with self._changed:
            self._changed.notify_all()


class Parts(Datasource):  # type: ignore[misc]  # its base has no types here
    """The numbers of the parts on a desk, each in a block of its own."""

    def __init__(self, desk: Any) -> None:
        super().__init__()
        self._desk = desk

    def estimate_inmemory_data_size(self) -> int | None:
        """Not known."""
        return None

    def get_read_tasks(self, parallelism: int, *_: object, **__: object) -> list[ReadTask]:
        """Only one, since parts come one after the other."""
        unknown = BlockMetadata(num_rows=None, size_bytes=None, input_files=None, exec_stats=None)
        return [ReadTask(partial(_numbers_on, self._desk), unknown)]


def _numbers_on(desk: Any) -> Iterator[pyarrow.Table]:
    for number in count():
        if not ray.get(desk.has.remote(number)):
            return
        yield pyarrow.table({"number": [number]})


def _files_of(part: pyarrow.Table, desk: Any, settings: Settings) -> pyarrow.Table:
    """The Parquet files of a part: a row with a column for each table, or with the column `error`."""
    number = part["number"][0].as_py()
    pickled, tries = ray.get(desk.take.remote(number))
    sources = pickle.loads(pickled)
    if tries == _TRIES:
        error = f"{tries} workers died of the files from {sources[0].entry.path} to {sources[-1].entry.path}"
        return pyarrow.table({"number": [number], "error": [error]})
    files = {
        name: pyarrow.array([data], pyarrow.large_binary())
        for name, data in parquet_files(settings, sources).items()
    }
    return pyarrow.table({"number": [number], **files})
