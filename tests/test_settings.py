"""What a run is asked: settings, versions, files that are left out."""

import pytest

from codeloom.reading.languages import NEWEST, oldest_admitted, version_named


class TestSettings:
    def test_the_nearest_file_holds(self, write_files, run_cli):
        write_files(
            {
                "pyproject.toml": "[tool.codeloom]\nignore = ['CL4']\npython = '3.11'\n[project]\n",
                "a/codeloom.toml": "select = ['CL401']\n",
                "a/pyproject.toml": "[tool.codeloom]\nselect = []\n",
                "a/b/pyproject.toml": "[project]\nrequires-python = '>=3.8'\n",
                "a/b/x.py": "f() = 1\ntype A = 1\n)\n",
                "y.py": "f() = 1\ntype A = 1\n",
            }
        )

        def Codes(*arguments):
            rows = run_cli("check", "--format", "concise", *arguments).stdout.splitlines()
            return [row.split()[1] for row in rows]

        assert Codes("a/b/x.py") == ["CL401"]
        assert Codes("y.py") == ["CL701"]
        assert Codes("y.py", "--python", "3.12") == []
        assert Codes("y.py", "--ignore", "CL7") == ["CL401"]
        assert Codes("y.py", "--config", "a/codeloom.toml") == ["CL401"]
        assert "must be" not in run_cli("check", "-v", "a/b/x.py").stderr
        assert "a/codeloom.toml" in run_cli("check", "-v", "a/b/x.py").stderr
        assert "read as Python 3.8" in run_cli("check", "-v", "a/b/x.py").stderr

    @pytest.mark.parametrize(
        ("text", "words"),
        [
            ("selct = []", "codeloom.toml: selct isn't a setting: did you mean 'select'?"),
            ("select = 'CL9x'", "codeloom.toml: select: 'CL9X' isn't a code"),
            ("jobs = true", "codeloom.toml: jobs: it must be a number"),
            ("python = 3.12", "codeloom.toml: python: it must be a string"),
            ("python = '4'", "codeloom.toml: python: python: unknown version '4'"),
            ("exclude = ['!']", "codeloom.toml: exclude: '!' isn't a pattern"),
            ("exclude = [1]", "codeloom.toml: exclude: it must be a list of strings"),
            ("exit-zero = 'no'", "codeloom.toml: exit-zero: it must be true or false"),
            ("format = 'xml'", "codeloom.toml: format: unknown value 'xml'"),
            ("a = ", "codeloom.toml: Invalid value"),
            ("a = " + "[" * 10_000, "codeloom.toml: maximum recursion depth"),
        ],
    )
    def test_wrong_ones(self, write_files, run_cli, text, words):
        write_files({"codeloom.toml": text, "a.py": "x\n"})
        done = run_cli("check", "a.py")
        assert (done.returncode, done.stdout) == (2, "")
        assert words in done.stderr and done.stderr.count("\n") == 1

    def test_a_broken_project_file_matters_when_it_holds_settings(self, write_files, run_cli):
        write_files({"pyproject.toml": "[project\nrequires-python = '>=3.8'\n", "a.py": "x\n"})
        assert run_cli("check", "a.py").returncode == 0
        write_files({"pyproject.toml": "[tool.codeloom\n"})
        assert run_cli("check", "a.py").returncode == 2

    def test_a_format_is_for_the_commands_that_have_it(self, write_files, run_cli):
        write_files({"codeloom.toml": "format = 'github'\n", "a.py": ")\n"})
        assert run_cli("check", "a.py").stdout.startswith("::error")
        assert run_cli("names", "a.py").stdout.startswith("a.py:1:1: CL203")


class TestVersions:
    @pytest.mark.parametrize(
        ("name", "version"),
        [
            ("3.12", "3.12"),
            ("py312", "3.12"),
            ("3", NEWEST),
            ("2", "2.7"),
            ("python3.8", "3.8"),
            ("3.9.1", "3.9"),
        ],
    )
    def test_names(self, name, version):
        assert version_named(name) == version

    @pytest.mark.parametrize("name", ["", "4", "3.99", "py", "py3.x", "2.6", "3."])
    def test_unknown_names(self, name):
        with pytest.raises(ValueError, match="unknown version"):
            version_named(name)

    @pytest.mark.parametrize(
        ("requirement", "version"),
        [
            (">=3.9", "3.9"),
            (">=3.9,<4", "3.9"),
            ("~=3.8", "3.8"),
            ("~=3.8.1", "3.8"),
            ("==3.11.*", "3.11"),
            (">3.7, !=3.8.*", "3.7"),
            (">=3.8, !=3.8.*", "3.9"),
            (">=2.7, !=3.0.*, !=3.1.*", "3.2"),
            ("<3", "2.7"),
            (">=3.99", None),
            ("nonsense", None),
            ("", "3.0"),
        ],
    )
    def test_requirements(self, requirement, version):
        assert oldest_admitted(requirement) == version


class TestExclusion:
    @pytest.fixture
    def found(self, run_cli):
        return lambda *arguments: run_cli("check", "--show-files", *arguments).stdout.split()

    def test_patterns(self, write_files, found):
        write_files(dict.fromkeys(["a.py", "b/c.py", "b/d/e.py", "t/b/c.py", ".h/x.py", "n.ipynb"], ""))
        everything = ["./a.py", "./b/c.py", "./b/d/e.py", "./n.ipynb", "./t/b/c.py"]
        assert found(".") == everything
        assert found(".", "--extend-exclude", "/b") == ["./a.py", "./n.ipynb", "./t/b/c.py"]
        assert found(".", "--extend-exclude", "c.py,") == everything
        assert found(".", "--extend-exclude", "c.py", "--extend-exclude", "*.ipynb") == [
            "./a.py",
            "./b/d/e.py",
        ]
        assert "./.h/x.py" in found(".", "--exclude", "b/")
        assert found("b/c.py", "--extend-exclude", "/b") == ["b/c.py"]
        assert found("b/c.py", "a.py", "--extend-exclude", "/b", "--force-exclude") == ["a.py"]

    def test_gitignore_files(self, write_files, found):
        write_files(
            {
                **dict.fromkeys(["a.py", "gen/x.py", "b/gen.py", "b/keep.py", "b/c/local.py"], ""),
                ".git/HEAD": "",
                ".gitignore": "gen/\nkeep.py\n!\nlocal.py\n",
                "b/.gitignore": "!keep.py\n/gen.py\n",
                "b/c/.gitignore": b"\xff\n",
            }
        )
        assert found(".") == ["./a.py", "./b/keep.py"]
        assert found("b") == ["b/keep.py"]
        assert len(found(".", "--no-gitignore")) == 5
        assert found("gen") == ["gen/x.py"]
        assert found("b/c/local.py", "--force-exclude") == []

    def test_a_named_folder_is_read_though_folders_above_ignore_it(self, write_files, found):
        ignored = {"home/.gitignore": "/versions\n*.tmp.py\n", "home/versions/3/.gitignore": "lib/\n"}
        files = ["a.py", "b.tmp.py", "lib/c.py"]
        write_files(
            {**ignored, **{f"home/versions/3/{name}": "" for name in files}, "own/pyproject.toml": ""}
        )
        assert found("home") == []
        assert found("home/versions/3") == ["home/versions/3/a.py", "home/versions/3/b.tmp.py"]
        assert found("home/versions", "--force-exclude") == []

    def test_what_stands_for_no_file_says_why(self, write_files, run_cli):
        files = ["a/build/x.py", "a/empty.txt", "b/.hidden/y.py", "c/env/pyvenv.cfg", "c/env/z.py", "d/k.py"]
        folder = write_files({**dict.fromkeys(files, ""), "a/.gitignore": "\n# made\nbuild/\n"})
        (folder / "e/.git").mkdir(parents=True)

        def Said(*arguments):
            done = run_cli("check", *arguments)
            assert (done.returncode, done.stdout) == (0, "0 problems in 0 files, 0 logical lines\n")
            return done.stderr

        said = "codeloom: nothing to read in "
        assert Said("a", "a") == 2 * (
            f"{said}a: a/build/ is left out by 'build/' in row 3 of a/.gitignore; --no-gitignore reads it\n"
        )
        by_default = "b/.hidden/ is left out by the default pattern '.*/'; --exclude replaces the defaults"
        assert Said("b") == f"{said}b: {by_default}\n"
        assert Said("c").startswith(f"{said}c: c/env/ is left out by its pyvenv.cfg")
        assert Said("d", "--exclude", "k.py").startswith(f"{said}d: d/k.py is left out by the pattern 'k.py'")
        assert Said("e") == f"{said}e: it holds no Python file and no notebook\n"
        forced = ["--force-exclude", "--exclude", "k.py"]
        by_force = "--force-exclude leaves it out by the pattern 'k.py' to exclude\n"
        assert Said("d/k.py", *forced) == f"{said}d/k.py: {by_force}"
        assert Said("-", "--stdin-filename", "d/k.py", *forced) == f"{said}-: {by_force}"
        done = run_cli("check", "d", "./d", "d/k.py")
        assert (done.stdout, done.stderr) == ("0 problems in 1 file, 0 logical lines\n", "")

    def test_the_standard_input(self, write_files, run_cli):
        write_files({"codeloom.toml": "exclude = ['gen/']\nforce-exclude = true\n"})
        done = run_cli("check", "--stdin-filename", "gen/a.py", "-", stdin=b")")
        assert (done.returncode, done.stdout) == (0, "0 problems in 0 files, 0 logical lines\n")
        assert run_cli("check", "--stdin-filename", "src/a.py", "-", stdin=b")").stdout.startswith(
            "src/a.py:1:1:"
        )


def test_colours(write_files, run_cli, cli_environment):
    write_files({"a.py": ")\n"})
    assert "\033[" not in run_cli("check", "a.py").stdout
    assert "\033[" in run_cli("check", "--color", "always", "a.py").stdout
    cli_environment["FORCE_COLOR"] = "1"
    assert "\033[" in run_cli("check", "a.py").stdout
    assert "\033[" not in run_cli("check", "--color", "never", "a.py").stdout
    assert "\033[" not in run_cli("check", "--format", "json", "a.py").stdout
    cli_environment["NO_COLOR"] = "1"
    assert "\033[" not in run_cli("check", "a.py").stdout
