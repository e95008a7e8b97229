"""The recipes for Spark and Dask in docs/corpus.md run, and give what a single batch gives.

Not among the other tests, since the engines are large: `make engines` installs and runs them.
"""

import os
import re
import subprocess
import sys
import textwrap
from pathlib import Path

import pyarrow
import pyarrow.parquet
import pytest

from codeloom.corpus import analyze_batch

PAGE = Path(__file__).parent.parent / "docs/corpus.md"
RECIPE = re.compile(r"(?:^    .*\n|^\n(?=    ))+", re.MULTILINE)
pytestmark = pytest.mark.slow
COLUMNS = ["file_id", "code", "row", "message"]


def RecipeOf(engine):
    """The one block of code that names an engine."""
    (recipe,) = (block for block in RECIPE.findall(PAGE.read_text()) if f"{engine}." in block)
    return textwrap.dedent(recipe)


@pytest.mark.parametrize("engine", ["pyspark", "dask"])
def test_a_recipe(engine, tmp_path):
    contents = ["x = (1\n", "y = 2\n", "def f(:\n    print 1\n"] * 20
    sources = pyarrow.table({"path": [f"{i}.py" for i in range(len(contents))], "content": contents})
    pyarrow.parquet.write_table(sources, tmp_path / "sources.parquet", row_group_size=10)
    program = f"if __name__ == '__main__':\n{textwrap.indent(RecipeOf(engine), '    ')}"
    subprocess.run([sys.executable, "-P", "-c", program], cwd=tmp_path, env=os.environ, check=True)
    found = pyarrow.parquet.read_table(tmp_path / "problems", columns=COLUMNS)
    expected = pyarrow.table(analyze_batch(sources, ("problems",))["problems"]).select(COLUMNS)
    assert sorted(map(str, found.to_pylist())) == sorted(map(str, expected.to_pylist()))
