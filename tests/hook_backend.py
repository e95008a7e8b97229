"""A build backend whose wheel holds installed packages, so that nothing is compiled or fetched.

The folders of the packages are in packages.json beside it.
"""

import json
import zipfile
from pathlib import Path

_ENTRIES = {
    "METADATA": "Metadata-Version: 2.1\nName: codeloom\nVersion: 0.0.0\n",
    "WHEEL": "Wheel-Version: 1.0\nRoot-Is-Purelib: true\nTag: py3-none-any\n",
    "entry_points.txt": "[console_scripts]\ncodeloom = codeloom.cli:main\n",
    "RECORD": "",
}


def build_wheel(folder: str, settings: object = None, metadata_folder: object = None) -> str:
    """Write the wheel, and give its name."""
    name = "codeloom-0.0.0-py3-none-any.whl"
    packages = json.loads(Path(__file__).with_name("packages.json").read_text())
    with zipfile.ZipFile(Path(folder) / name, "w") as wheel:
        for package in map(Path, packages):
            for path in package.rglob("*"):
                if path.is_file() and path.suffix != ".pyc":
                    wheel.write(path, path.relative_to(package.parent))
        for entry, text in _ENTRIES.items():
            wheel.writestr(f"codeloom-0.0.0.dist-info/{entry}", text)
    return name
