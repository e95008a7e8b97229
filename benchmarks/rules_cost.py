"""What the rules after the grammar cost, in instructions a line on sound text.

    python benchmarks/rules_cost.py [FOLDER]

The one pass is counted as a program of its own, with all rules and with some of them replaced by empty
functions. FOLDER is where it is built, build/rules_cost unless given.
"""

import subprocess
import sys
import sysconfig
from pathlib import Path

from corpus import WARM_UP, count_rows, files
from counting import instructions

ROOT = Path(__file__).parent.parent
PROGRAMS = ["pass", "pass_without_declarations", "pass_without_rules"]


def main() -> int:
    folder = Path(sys.argv[1]) if len(sys.argv) > 1 else ROOT / "build/rules_cost"
    build(folder)
    all_rules, without_declarations, without_rules = (per_row(str(folder / program)) for program in PROGRAMS)
    print(f"the pass with all rules          {all_rules:8,.0f} instructions a line")
    print(f"without the rules                {without_rules:8,.0f}")
    print(f"the rules of lines and blocks    {(without_declarations - without_rules) / without_rules:8.1%}")
    print(f"those of global and nonlocal     {(all_rules - without_declarations) / without_rules:8.1%}")
    print(f"together                         {(all_rules - without_rules) / without_rules:8.1%}")
    return 0


def build(folder: Path) -> None:
    """Make the programs, as a release is made."""
    if not (folder / "CMakeCache.txt").exists():
        settings = ["-DCMAKE_BUILD_TYPE=Release", f"-DPython_EXECUTABLE={sys.executable}"]
        scripts = Path(sysconfig.get_path("scripts"))
        if (scripts / "ninja").exists():
            settings += ["-G", "Ninja", f"-DCMAKE_MAKE_PROGRAM={scripts / 'ninja'}"]
        subprocess.run(
            ["cmake", "-S", str(ROOT), "-B", str(folder), *settings], check=True, stdout=subprocess.DEVNULL
        )
    command = ["cmake", "--build", str(folder), "--target", *PROGRAMS]
    subprocess.run(command, check=True, stdout=subprocess.DEVNULL)


def per_row(program: str) -> float:
    """What a line costs a program, start-up left out."""
    paths = files()
    many, few = instructions([program, *paths]), instructions([program, *paths[:WARM_UP]])
    return (many - few) / count_rows(paths[WARM_UP:])


if __name__ == "__main__":
    sys.exit(main())
