"""`python -m codeloom`."""

import sys

from codeloom.cli import main

if __name__ == "__main__":
    sys.exit(main())
