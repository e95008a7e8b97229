"""Many sources at once: tables in, tables out.

    tables = codeloom.corpus.analyze_batch(batch)

It takes a table with a column of paths and one of sources from any library that knows the Arrow C
interfaces, and gives tables that any such library takes. It needs no library itself.
"""

from codeloom.corpus.batch import MOST_BYTES, MOST_SECONDS, TABLES, analyze_batch

__all__ = ["MOST_BYTES", "MOST_SECONDS", "TABLES", "analyze_batch"]
