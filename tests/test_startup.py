"""What a start imports: each module costs time before the first output."""

from run_python import RunPython

# Large modules that a run needs only for what is asked.
NEEDED_BY_FEW = {
    "difflib", "importlib.resources", "json", "pathlib", "pathspec", "rich", "shutil", "subprocess",
    "tempfile", "tomllib", "typing", "urllib.parse", "xml.sax",
}  # fmt: skip


def modules_after(code: str) -> set[str]:
    """The modules that `code` imports."""
    printed = RunPython(
        f"import sys; before = set(sys.modules)\n{code}\nprint(*(set(sys.modules) - before), sep='\\n')"
    )
    return set(printed.splitlines())


def test_the_package_imports_nothing():
    assert modules_after("import codeloom") == {"codeloom"}


def test_the_version_needs_no_more_than_itself():
    loaded = modules_after("from codeloom.cli import main; main(['--version'])")
    assert {name for name in loaded if "grammars" not in name} == {
        "codeloom",
        "codeloom.cli",
        "codeloom.cli.version",
    }


def test_a_check_loads_what_it_needs(write_files):
    path = write_files({"a.py": "x = )\n"}) / "a.py"
    loaded = modules_after(f"from codeloom.cli import main; main(['check', {str(path)!r}])")
    assert "codeloom.cli.check" in loaded
    assert not NEEDED_BY_FEW & loaded
    assert not {"codeloom.treesift", "codeloom._neighbours", "codeloom.explanations"} & loaded
