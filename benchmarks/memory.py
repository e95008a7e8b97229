"""Peak memory beyond the text itself, in bytes a row; each in a process of its own."""

import subprocess
import sys
from pathlib import Path

ROWS = 100_000

_MEASURE = """
import sys
sys.path.insert(0, {folder!r})
from corpus import text_of
from workloads import OURS, PEERS

def peak():
    with open("/proc/self/status") as status:  # the peak that rusage knows begins with the parent's
        return int(next(row for row in status if row.startswith("VmHWM:")).split()[1])

work = (OURS | PEERS)[{name!r}]
text = text_of({rows})
work([text_of(1000)])
before = peak()
work([text])
print((peak() - before) * 1024 / text.count(b"\\n"))
"""


def bytes_per_row(name: str) -> int:
    """What a workload takes at its peak."""
    code = _MEASURE.format(folder=str(Path(__file__).parent), name=name, rows=ROWS)
    done = subprocess.run([sys.executable, "-P", "-c", code], capture_output=True, text=True, check=True)
    return round(float(done.stdout))
