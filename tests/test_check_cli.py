"""The command line: exit statuses, output, how files are found, how it ends."""

import os
import re
import signal
import subprocess
import sys
from pathlib import Path

import pytest

from codeloom.cli.arguments import COMMANDS
from codeloom.reading.files import _Seen

EXAMPLES = Path(__file__).parent.parent / "examples"


@pytest.mark.parametrize(
    ("arguments", "status", "summary"),
    [
        (["sound.py"], 0, "0 problems in 1 file, 1 logical line"),
        (["broken.py"], 1, "2 problems in 1 of 1 file, 3 logical lines"),
        (["sound.py", "broken.py"], 1, "2 problems in 1 of 2 files, 4 logical lines"),
        (["absent.py", "sound.py", "absent.py"], 2, "0 problems in 1 file, 1 logical line; 1 not read"),
        (["broken.py", "absent.py"], 2, "2 problems in 1 of 1 file, 3 logical lines; 1 not read"),
        (["--python", "2.7", "old.py"], 0, "0 problems in 1 file, 1 logical line"),
        (["--python=3.5", "old.py"], 1, "1 problem in 1 of 1 file, 1 logical line"),
        (["empty"], 0, "0 problems in 0 files, 0 logical lines"),
        ([], 1, "3 problems in 2 of 4 files, 12,350 logical lines"),
        (["many.py"], 0, "0 problems in 1 file, 12,345 logical lines"),
    ],
)
def test_statuses_and_summaries(write_files, run_cli, arguments, status, summary):
    sources = {"sound.py": "x = 1\n", "broken.py": "x = 1 1\ny = 1\nz = )\n", "old.py": "print 1\n"}
    folder = write_files({**sources, "many.py": "x = 1\n" * 12_345})
    (folder / "empty").mkdir()
    done = run_cli("check", *arguments)
    assert (done.returncode, done.stdout.splitlines()[-1]) == (status, summary)
    said = {
        2: "codeloom: can't read absent.py: No such file or directory\n",
        "empty": "codeloom: nothing to read in empty: it holds no Python file and no notebook\n",
    }
    assert done.stderr == said.get(status, said.get(" ".join(arguments), ""))


def test_warnings_are_problems_and_look_different(write_files, run_cli):
    write_files({"a.py": "x = 1  # type: List[\n"})
    done = run_cli("check", "a.py", "--color", "always")
    assert done.returncode == 1 and "\033[33mCL601\033[0m warning: type hint: '[' was" in done.stdout
    assert "CL601 warning: type hint: '[' was" in run_cli("check", "a.py", "--format", "concise").stdout
    assert run_cli("check", "a.py", "--ignore", "CL601").returncode == 0


def test_what_is_read_is_not_overwritten(write_files, run_cli):
    folder = write_files({"a.py": "x = )\n"})
    done = run_cli("check", "./a.py", "-o", "a.py")
    assert done.returncode == 2 and "a.py is to be read: name another file" in done.stderr
    assert (folder / "a.py").read_text() == "x = )\n"


def test_output(write_files, run_cli):
    write_files({"a b.py": "if x:\n\ty = '日本' )\r\n", "c.py": b"'\xe9'\n" + b"z = 1 ) " + b"+ 1 " * 60})
    done = run_cli("check", "a b.py", "c.py")
    assert done.stdout.splitlines() == [
        "a b.py:2:11: CL203 unmatched ')'",
        "    2 |     y = '日本' )",
        "      |                ^",
        "c.py:1:2: CL101 byte 0xE9 can't be read as utf-8: save the file as UTF-8, or name its encoding "
        "in the first row, as in `# coding: latin-1`",
        "    1 | '\ufffd'",
        "      |  ^",
        "c.py:2:7: CL203 unmatched ')'",
        "    2 | " + ("z = 1 ) " + "+ 1 " * 60)[:86] + "...",
        "      |       ^",
        "3 problems in 2 of 2 files, 4 logical lines",
    ]


def test_the_examples(run_cli):
    done = run_cli("check", "--python", "3.12", EXAMPLES / "sound")
    assert done.returncode == 0
    assert run_cli("check", "--python=2.7", EXAMPLES / "sound/inventory.py2").returncode == 0
    done = run_cli("check", EXAMPLES / "broken")
    places = re.findall(r"^.*/broken/(.*):(\d+:\d+): ", done.stdout, re.MULTILINE)
    assert {name: [place for other, place in places if other == name] for name, _ in places} == {
        "fstring_field.py": ["4:25", "5:40", "8:12", "14:38"],
        "half_written.py": ["4:14", "6:7", "10:17", "16:43", "20:65", "23:66"],
        "missing_quote.py": ["3:12"],
        "tabs_and_wide_text.py": ["6:34", "7:22", "8:45"],
        "unclosed_bracket.py": ["10:24"],
    }


@pytest.mark.parametrize(
    ("arguments", "words"),
    [
        ([], "usage: codeloom COMMAND"),
        (["help", "chek"], "did you mean 'check'?"),
        (["mend", "a.py"], "no command 'mend'"),
        (["chek", "a.py"], "did you mean 'check'?"),
        (["check", "--statistic", "a.py"], "no option --statistic: did you mean '--statistics'?"),
        (["check", "--format", "jsn", "a.py"], "did you mean 'json'?"),
        (["check", "--select", "E9", "a.py"], "'E9' isn't a code"),
        (["check", "--ignore", "CL399", "a.py"], "there is no code CL399: did you mean 'CL"),
        (["check", "--jobs", "0", "a.py"], "a number from 1"),
        (["check", "--python", "3.99", "a.py"], "choose 2.7, or one from 3.0 to 3.15"),
        (["check", "--fast", "a.py"], "--fast"),
        (["tree"], "name a line as FILE:ROW, or give one with -c CODE"),
        (["check", "--config", "absent.toml"], "can't read absent.toml: No such file or directory"),
        (["check", "--baseline", "absent.json"], "can't read absent.json: No such file or directory"),
        (["--verson"], "no option --verson: did you mean '--version'?"),
        (["completion", "csh"], "unknown value 'csh'"),
        (["check", "--stdin-filename", "a.py", "."], "name - to read it"),
        (["index", "-o", "i", "--part-size", "inf"], "a number of more than 0, not inf"),
        (["check", "-o", "absent/a.txt", "."], "can't write absent/a.txt: No such file or directory"),
        (["tree", "f.py:1", "-c", "x"], "not allowed with"),
        (["tree", "-c", "x", "--format", "xml"], "unknown value 'xml'"),
    ],
)
def test_wrong_use(run_cli, arguments, words):
    done = run_cli(*arguments)
    assert (done.returncode, done.stdout) == (2, "")
    assert words in done.stderr and "Traceback" not in done.stderr


def test_version_and_help(run_cli):
    assert run_cli("--version").stdout.startswith("codeloom ")
    for arguments in (["--help"], ["help"], ["check", "--help"], ["-h", "check"], ["help", "tree"]):
        done = run_cli(*arguments)
        assert done.returncode == 0 and "examples:" in done.stdout
        assert ("--python" in done.stdout) == (len(arguments) == 2)


@pytest.mark.parametrize("command", COMMANDS)
def test_help_fits_a_terminal_of_80_columns(run_cli, command):
    done = run_cli("help", command)
    assert done.returncode == 0 and "examples:" in done.stdout
    assert max(map(len, done.stdout.splitlines())) < 80


class TestFiles:
    """Which files are checked; each is broken, so that its path is printed."""

    @pytest.fixture
    def checked(self, run_cli):
        def Checked(*arguments, **options):
            done = run_cli("check", *arguments, **options)
            return [row.split(":")[0] for row in done.stdout.splitlines() if ":" in row and row[0] != " "]

        return Checked

    def test_folders(self, write_files, checked):
        sources = ["c/d.pyi", "b.py", "a.py", "c/b.PYW", "c-d.py", "c/e/f.py"]
        others = ["z.txt", "Makefile", "c/env/pyvenv.cfg", "c/env/lib/a.py", "__pycache__/a.py"]
        hidden = [".git/a.py", ".hidden/a.py"]
        write_files({name: ")" for name in sources + others + hidden})
        found = ["a.py", "b.py", "c/b.PYW", "c/d.pyi", "c/e/f.py", "c-d.py"]
        assert checked(".") == [f"./{name}" for name in found]
        named = [".hidden/a.py", "c/env/lib/a.py", "z.txt", "Makefile"]
        assert checked(".hidden", "c/env", "z.txt", "Makefile") == named

    def test_nothing_is_checked_twice(self, write_files, checked):
        folder = write_files({"a.py": ")", "b/c.py": ")", "b/d.py": ")"})
        assert checked("a.py", "./a.py", folder / "a.py", "b/../a.py") == ["a.py"]
        assert checked("b/d.py", "b", "b/c.py", "b/") == ["b/d.py", "b/c.py"]
        assert checked("b", ".") == ["b/c.py", "b/d.py", "./a.py"]
        (folder / "b/link.py").symlink_to("../a.py")
        assert checked("a.py", "b") == ["a.py", "b/c.py", "b/d.py"]
        (folder / "b/hard.py").hardlink_to(folder / "b/d.py")
        assert checked("b") == ["b/c.py", "b/d.py", "b/link.py"]

    def test_files_that_share_a_number(self, write_files):
        """As on two devices; one of them is gone when it is compared."""
        folder = write_files({"a.py": "", "b.py": "", "c.py": ""})
        (folder / "link.py").symlink_to("b.py")
        seen = _Seen()
        new = [
            name
            for name in ("a.py", "b.py", "c.py", "link.py", "a.py", "gone.py", "gone.py")
            if seen.add(str(folder / name), 7)
        ]
        assert new == ["a.py", "b.py", "c.py", "gone.py"]

    def test_links_of_folders_are_followed_only_when_they_are_named(self, write_files, checked):
        folder = write_files({"a/b.py": ")", "other/c.py": ")"})
        (folder / "a/loop").symlink_to(".", target_is_directory=True)
        (folder / "a/up").symlink_to("..", target_is_directory=True)
        assert checked("a") == ["a/b.py"]
        assert checked("a/up/other") == ["a/up/other/c.py"]

    def test_broken_links_and_pipes(self, write_files, run_cli):
        folder = write_files({"a.py": "x = 1\n"})
        (folder / "gone.py").symlink_to("nowhere.py")
        (folder / "self.py").symlink_to("self.py")
        (folder / ".#lock.py").symlink_to("user@host")
        os.mkfifo(folder / "pipe.py")
        (folder / "null.py").symlink_to("/dev/null")
        done = run_cli("check", ".")
        assert done.returncode == 2
        assert done.stderr.splitlines() == [
            "codeloom: can't read ./gone.py: No such file or directory",
            "codeloom: can't read ./self.py: Too many levels of symbolic links",
        ]

    @pytest.mark.parametrize("jobs", ["1", "2"])
    def test_files_that_vanish(self, write_files, cli_environment, jobs):
        """Between the search and the reading; the others are read."""
        folder = write_files({f"{i:03}.py": "x = )\n" for i in range(300)})
        program = f"""if True:
            import os, sys, codeloom.cli as cli, codeloom.cli.run as run
            find = run.find_files
            def find_and_remove(*arguments):
                for path in find(*arguments):
                    if path.endswith("7.py"):
                        os.remove(path)
                    yield path
            run.find_files = find_and_remove
            sys.exit(cli.main(["check", "--jobs", "{jobs}", "--format", "concise", "."]))"""
        command = [sys.executable, "-P", "-c", program]
        done = subprocess.run(command, capture_output=True, text=True, cwd=folder, env=cli_environment)
        gone = [f"{i:03}.py" for i in range(300) if i % 10 == 7]
        assert done.returncode == 2
        assert done.stderr.splitlines() == [
            f"codeloom: can't read ./{name}: No such file or directory" for name in gone
        ]
        assert len(done.stdout.splitlines()) == 300 - len(gone)

    @pytest.mark.skipif(os.geteuid() == 0, reason="root may read everything")
    def test_files_that_nobody_may_read(self, write_files, run_cli):
        folder = write_files({"a.py": ")", "b/c.py": ")"})
        (folder / "a.py").chmod(0)
        (folder / "b").chmod(0)
        done = run_cli("check", ".")
        (folder / "b").chmod(0o755)
        assert (done.returncode, done.stdout[:10]) == (2, "0 problems")
        assert done.stderr.splitlines() == [
            "codeloom: can't read ./a.py: Permission denied",
            "codeloom: can't read ./b/: Permission denied",
        ]

    def test_what_is_no_regular_file_or_no_source(self, write_files, run_cli):
        folder = write_files({"a.ipynb": "{}"})
        os.mkfifo(folder / "pipe")
        done = run_cli("check", "pipe", "/dev/zero", "a.ipynb")
        assert (done.returncode, done.stdout) == (2, "0 problems in 0 files, 0 logical lines; 3 not read\n")
        assert done.stderr.splitlines() == [
            "codeloom: can't read pipe: it isn't a regular file",
            "codeloom: can't read /dev/zero: it isn't a regular file",
            "codeloom: can't read a.ipynb: it isn't a notebook: it has no cells",
        ]

    def test_a_pipe_of_the_shell(self, run_cli, tmp_path):
        command = f"{sys.executable} -m codeloom check <(echo 'x = )')"
        done = subprocess.run(["bash", "-c", command], capture_output=True, text=True, cwd=tmp_path)
        assert "1 problem in 1 of 1 file" in done.stdout

    def test_deep_folders(self, tmp_path, checked):
        folder = tmp_path
        for _ in range(1_100):
            folder /= "d"
            folder.mkdir()
        (folder / "a.py").write_text(")")
        assert len(checked(".")) == 1
        # Pytest can't remove what is nested deeper than its own stack.
        (folder / "a.py").unlink()
        while folder != tmp_path:
            folder.rmdir()
            folder = folder.parent

    def test_paths_that_are_no_text(self, tmp_path, run_cli):
        try:
            (tmp_path / os.fsdecode(b"\xff\x1b.py")).write_text(")")
        except OSError:
            pytest.skip("this file system takes only text")
        assert run_cli("check", ".").stdout.startswith("./\\xff\ufffd.py:1:1: CL203 unmatched ')'")

    def test_standard_input(self, checked, run_cli):
        assert checked("-", "-", stdin=b")") == ["<stdin>"]
        done = run_cli("check", "-", stdin=b"# coding: latin-1\r'\xe9' )\r")
        assert done.stdout.splitlines()[:2] == ["<stdin>:2:5: CL203 unmatched ')'", "    2 | 'é' )"]


class TestEndings:
    """What else may end a run, and what the streams are."""

    @pytest.fixture
    def start_cli(self, tmp_path, cli_environment):
        def Start(*arguments, **options):
            command = [sys.executable, "-m", "codeloom", "check", *arguments]
            options = {"stdout": subprocess.PIPE, "stderr": subprocess.PIPE} | options
            # Whoever runs the tests in the background has SIGINT ignored, which a child inherits.
            inherited = signal.signal(signal.SIGINT, signal.SIG_DFL)
            try:
                return subprocess.Popen(command, cwd=tmp_path, env=cli_environment, **options)
            finally:
                signal.signal(signal.SIGINT, inherited)

        return Start

    def test_a_reader_that_goes_away(self, write_files, start_cli):
        write_files({"a.py": "x = )\n" * 20_000})
        process = start_cli("a.py")
        process.stdout.readline()
        process.stdout.close()
        assert process.stderr.read() == b""
        assert process.wait(30) == 141
        process.stderr.close()

    def test_an_interrupt(self, write_files, start_cli):
        write_files({"a.py": "x = )\n"})
        process = start_cli("a.py", "-", stdin=subprocess.PIPE)
        # The problems of a file are seen at once, before the next file is read.
        assert b"a.py:1:5" in process.stdout.readline()
        process.send_signal(signal.SIGINT)
        _, stderr = process.communicate(timeout=30)
        assert (process.returncode, stderr) == (130, b"")

    @pytest.mark.skipif(not os.path.exists("/dev/full"), reason="needs a full device")
    @pytest.mark.parametrize("argument", ["a.py", "--help"])
    def test_a_full_disk(self, write_files, start_cli, argument):
        write_files({"a.py": "x = )\n"})
        with open("/dev/full", "wb") as full:
            process = start_cli(argument, stdout=full)
            _, stderr = process.communicate(timeout=30)
        assert (process.returncode, stderr) == (2, b"codeloom: can't write: No space left on device\n")

    @pytest.mark.parametrize("redirection", ["2>&-", "2>/dev/full"])
    def test_a_standard_error_that_takes_nothing(self, tmp_path, cli_environment, redirection):
        command = f"{sys.executable} -m codeloom check absent.py {redirection}"
        done = subprocess.run(
            ["sh", "-c", command], stdout=subprocess.PIPE, text=True, cwd=tmp_path, env=cli_environment
        )
        assert (done.returncode, done.stdout) == (2, "0 problems in 0 files, 0 logical lines; 1 not read\n")

    @pytest.mark.skipif(
        "ASAN_OPTIONS" in os.environ, reason="the sanitizer ends a process that runs out of memory"
    )
    def test_out_of_memory(self, write_files, tmp_path, cli_environment):
        write_files({"a.py": "x = 1\n" * 10_000_000})
        command = f"ulimit -v 250000; exec {sys.executable} -m codeloom check a.py"
        done = subprocess.run(
            ["sh", "-c", command], capture_output=True, text=True, cwd=tmp_path, env=cli_environment
        )
        assert (done.returncode, done.stdout) == (2, "")
        assert done.stderr.startswith("codeloom: out of memory") and done.stderr.count("\n") == 1

    def test_an_ascii_terminal(self, write_files, start_cli, cli_environment):
        write_files({"a.py": "é = '日' )\n"})
        cli_environment["PYTHONIOENCODING"] = "ascii"
        stdout, _ = start_cli("a.py").communicate(timeout=30)
        _, row, caret, _ = stdout.decode("ascii").splitlines()
        assert row[caret.index("^")] == ")" and "| \\xe9 = '\\u65e5'" in row

    @pytest.mark.parametrize(("no_colour", "coloured"), [(None, True), ("", True), ("1", False)])
    def test_colour_on_a_terminal(self, write_files, start_cli, cli_environment, no_colour, coloured):
        pty = pytest.importorskip("pty")
        write_files({"a.py": "x = )\n"})
        if no_colour is not None:
            cli_environment["NO_COLOR"] = no_colour
        terminal, terminal_of_process = pty.openpty()
        process = start_cli("a.py", stdout=terminal_of_process)
        os.close(terminal_of_process)
        assert process.wait(30) == 1
        output = os.read(terminal, 65_536)
        os.close(terminal)
        process.stderr.close()
        assert (b"\033[" in output) == coloured

    def test_a_narrow_terminal(self, write_files, start_cli, cli_environment):
        """Long messages are broken between words; a row never wraps by itself."""
        pty = pytest.importorskip("pty")
        write_files({"a.py": "f() = 1\nx = [" + "'日本', " * 20 + "1 2]\n"})
        cli_environment |= {"NO_COLOR": "1", "COLUMNS": "60"}
        terminal, terminal_of_process = pty.openpty()
        process = start_cli("a.py", stdout=terminal_of_process)
        os.close(terminal_of_process)
        process.stderr.close()
        assert process.wait(30) == 1
        rows = os.read(terminal, 65_536).decode().splitlines()
        os.close(terminal)
        assert rows[:2] == [
            "a.py:1:1: CL401 cannot assign to function call here. Maybe",
            "    you meant '==' instead of '='?",
        ]
        assert all(len(row) + row.count("日") + row.count("本") <= 60 for row in rows)
