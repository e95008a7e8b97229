"""Peak memory beyond the text itself, in bytes a row; each in a process of its own."""

import subprocess
import sys
from pathlib import Path

ROWS = 100_000

_MEASURE = """
import resource, sys
sys.path.insert(0, {folder!r})
from corpus import text_of
from workloads import OURS, PEERS
work = (OURS | PEERS)[{name!r}]
text = text_of({rows})
work([text[:20000].rpartition(b"\\n\\n\\n")[0]])
before = resource.getrusage(resource.RUSAGE_SELF).ru_maxrss
work([text])
print((resource.getrusage(resource.RUSAGE_SELF).ru_maxrss - before) * 1024 / {rows})
"""


def bytes_per_row(name: str) -> int:
    """What a workload takes at its peak."""
    code = _MEASURE.format(folder=str(Path(__file__).parent), name=name, rows=ROWS)
    done = subprocess.run([sys.executable, "-P", "-c", code], capture_output=True, text=True, check=True)
    return round(float(done.stdout))
