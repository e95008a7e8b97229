"""Which problems count: by code, by comments, by what was there before, by what git says has changed."""

import json
import subprocess

import pytest


@pytest.fixture
def places(run_cli):
    """Row, column and code of what is reported of files."""

    def Places(*arguments):
        rows = run_cli("check", "--format", "concise", *arguments).stdout.splitlines()
        return [row[: row.index(" CL") + 6] for row in rows]

    return Places


def test_codes(write_files, places, run_cli):
    write_files({"a.py": "f() = 1\ndel f()\n)\ny\n  x\n"})
    assert len(places("a.py")) == 4
    assert places("a.py", "--select", "CL4") == ["a.py:1:1: CL401", "a.py:2:5: CL402"]
    assert places("a.py", "--select", "cl401,CL3") == ["a.py:1:1: CL401", "a.py:5:3: CL301"]
    assert places("a.py", "--ignore", "CL4", "--select", "CL402") == ["a.py:2:5: CL402"]
    assert places("a.py", "--select", "CL4", "--ignore", "CL402") == ["a.py:1:1: CL401"]
    assert places("a.py", "--ignore", "ALL") == []
    assert run_cli("check", "--ignore", "CL", "a.py").returncode == 0
    assert run_cli("check", "--exit-zero", "a.py").returncode == 0
    assert run_cli("check", "--exit-zero", "a.py", "absent.py").returncode == 2


def test_comments(write_files, places):
    write_files(
        {
            "a.py": "f() = 1  # codeloom: ignore\n"
            "f() = 1  # codeloom: ignore[CL4]\n"
            "f() = 1  # codeloom: ignore[CL402, CL401] because\n"
            "f() = 1  # codeloom: ignore[CL402]\n"
            "f() = (1,\n  2)  # CodeLoom:ignore[cl401]\n"
            "# codeloom: ignore\nf() = 1\n"
        }
    )
    assert places("a.py") == ["a.py:4:1: CL401", "a.py:8:1: CL401"]


@pytest.mark.parametrize("form", ["json", "jsonl"])
def test_a_baseline(write_files, places, run_cli, form):
    folder = write_files({"a.py": "f() = 1\nf() = 1\n", "b.py": ")\n"})
    run_cli("check", ".", "--format", form, "-o", "known.json")
    assert places(".", "--baseline", "known.json") == []
    write_files({"a.py": "x\n\n  \nif x:\n    f() = 1\nf() = 1\nf() = 1\ng() = 1\n", "c.py": ")\n"})
    new = ["./a.py:7:1: CL401", "./a.py:8:1: CL401", "./c.py:1:1: CL203"]
    assert places(".", "--baseline", "known.json") == new
    # The same from another folder, and by the settings.
    (folder / "codeloom.toml").write_text("baseline = 'known.json'\n")
    assert [row.removeprefix(str(folder)) for row in places(str(folder / "b.py"))] == []
    run_cli("check", ".", "--format", form, "-o", "known.json")  # written anew
    assert places(".") == []
    for text in ("", "{}", '{"run"', "[1]"):
        write_files({"known.json": text})
        done = run_cli("check", "a.py")
        assert done.returncode == 2 and "isn't a report of codeloom" in done.stderr
    assert "No such file" in run_cli("check", "a.py", "--baseline", "absent").stderr


class TestDiff:
    @pytest.fixture
    def git(self, tmp_path, monkeypatch):
        monkeypatch.setenv("GIT_CONFIG_GLOBAL", "/dev/null")

        def Git(*arguments):
            names = ("-c", "user.name=a", "-c", "user.email=a@b", "-c", "init.defaultBranch=main")
            subprocess.run(["git", *names, *arguments], cwd=tmp_path, check=True, capture_output=True)

        return Git

    def test_lines_that_differ(self, git, write_files, places):
        old = ")\n" * 3 + "x = [\n  1,\n  2 3,\n]\nif y:\n    pass\nf() = 1\n"
        write_files({"a.py": old, "same.py": ")\n", "sub/ä.py": "1\n", 'q"\t.py': "1\n"})
        git("init")
        git("add", ".")
        git("commit", "-m", "m")
        assert places(".", "--diff", "HEAD") == []
        new = ")\n" * 2 + "] # new\n" + "x = [\n  1,\n  2 3,\n  4\n]\nif y:\nf() = 1\n"
        write_files({"a.py": new, "sub/ä.py": "1\n)\n", 'q"\t.py': ")\n", "new.py": ")\n)\n"})
        write_files({"new.ipynb": json.dumps({"cells": [{"cell_type": "code", "source": ")"}]})})
        assert [one.rpartition(":")[0] for one in places(".", "--diff", "HEAD")] == [
            "./a.py:3:1",  # changed
            "./a.py:6:3",  # of a line that has changed
            "./a.py:10:1",  # next to what was taken out
            "./a.py:10:1",
            "./new.ipynb:cell 1:1:1",
            "./new.py:1:1",
            "./new.py:2:1",
            './q"\ufffd.py:1:1',
            "./sub/ä.py:2:1",
        ]
        assert places("same.py", "a.py", "--diff", "HEAD", "--select", "CL3") == ["a.py:10:1: CL302"]

    def test_what_git_cannot_tell(self, git, write_files, run_cli):
        write_files({"a.py": ")\n"})
        assert "not a git repository" in run_cli("check", "a.py", "--diff", "HEAD").stderr
        git("init")
        done = run_cli("check", "a.py", "--diff", "--output=x")
        assert done.returncode == 2
        done = run_cli("check", "a.py", "--diff=--output=x")
        assert (done.returncode, done.stdout) == (2, "") and "Traceback" not in done.stderr
