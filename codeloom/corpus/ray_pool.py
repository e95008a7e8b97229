"""Workers of a cluster of Ray, on any number of machines.

A worker gets sources and gives back Parquet files; only the process that leads touches the index. So workers
need no disk in common, and a part of a worker that dies is simply made again, by another one.
"""

from collections.abc import Callable, Sequence

import ray

from codeloom.corpus.part import Hashed, parquet_files
from codeloom.corpus.store import WritableStore

# How often a part is tried again when its worker dies.
_RETRIES = 5


class RayPool:
    """Analyses parts by tasks of Ray."""

    def __init__(self, store: WritableStore, address: str | None, jobs: int | None) -> None:
        """With a cluster's address, or "auto" for the one that this machine belongs to; without one a
        cluster is started here. ConnectionError where there is none. `jobs` parts are under way at once, as
        many as the cluster has processors unless told otherwise."""
        self._store = store
        self._is_ours = not ray.is_initialized()
        if self._is_ours:
            own = {} if address is not None or jobs is None else {"num_cpus": jobs}
            ray.init(
                address=address,
                log_to_driver=False,
                include_dashboard=False if address is None else None,
                **own,
            )
        self.jobs = jobs or max(int(ray.cluster_resources().get("CPU", 1)), 1)
        self._task = ray.remote(max_retries=_RETRIES)(parquet_files)
        self._settings = ray.put(store.settings)

    def submit(self, part: int, sources: Sequence[Hashed]) -> Callable[[], None]:
        """Begin with a part; the call waits for it, and writes its files."""
        result = self._task.remote(self._settings, list(sources))

        def wait() -> None:
            for name, data in ray.get(result).items():
                self._store.write(name, part, data)

        return wait

    def close(self) -> None:
        """Leave the cluster, and end it if it was started here."""
        if self._is_ours:
            ray.shutdown()
