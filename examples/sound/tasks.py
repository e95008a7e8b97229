# Python 3.12: type parameters, type statements, except*, fields that reuse the quotes around them.
import asyncio
from collections.abc import Awaitable, Callable

type Job[**P, T] = Callable[P, Awaitable[T]]


class Results[T: (str, bytes)]:
    def __init__(self) -> None:
        self.done: dict[str, T] = {}

    def __str__(self) -> str:
        return f"{", ".join(f"{name}={value!r}" for name, value in self.done.items())}"


async def run_all[T](jobs: dict[str, Job[[], T]], timeout: float = 1.0) -> Results[T]:
    results, tasks = Results[T](), {}
    try:
        async with asyncio.timeout(timeout), asyncio.TaskGroup() as group:
            for name, job in jobs.items():
                tasks[name] = group.create_task(job())
    except* ValueError as errors:
        print(f"{len(errors.exceptions)} jobs failed:\n{'\n'.join(map(str, errors.exceptions))}")
    else:
        results.done = {name: await task for name, task in tasks.items()}
    return results
