"""codeloom analyses Python source one logical line at a time.

For each line it says whether the line is sound, with the exact place of a fault, and what it says
about names. A broken line never spoils its neighbours.

The engine is the native module `codeloom.treesift`; `codeloom.check` reads whole files with it.
"""

__version__ = "0.1.0"
