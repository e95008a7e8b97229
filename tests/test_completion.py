"""What the shells themselves complete, by the scripts that `codeloom completion` prints."""

import os
import select
import shutil
import signal
import subprocess
import time

import pytest

COMMANDS = ["check", "names", "hints", "tree", "explain", "completion"]
SHELLS = {shell: shutil.which(shell) for shell in ("bash", "zsh", "fish")}
# What is typed, some of what is offered for it, and what isn't.
CASES = [
    ("codeloom ch", ["check"], ["names", "--format"]),
    ("codeloom ", COMMANDS, ["--format"]),
    ("codeloom check --fo", ["--force-exclude", "--format"], ["--statistics", "concise"]),
    ("codeloom check --format j", ["json", "jsonl", "junit"], ["text", "a.py"]),
    ("codeloom names --format ", ["text", "concise", "json", "jsonl"], ["sarif", "a.py"]),
    ("codeloom completion ", ["bash", "zsh", "fish"], ["text", "--format"]),
    ("codeloom check src/", ["a.py", "b.py"], ["--format", "check"]),
]


def offered_by_bash(script, typed, folder):
    *words, current = typed.split(" ")
    probe = f"""
        source {script}
        COMP_WORDS=({" ".join(words)} '{current}'); COMP_CWORD={len(words)}
        _codeloom
        [ ${{#COMPREPLY[@]}} -gt 0 ] || COMPREPLY=($(compgen -f -- '{current}'))  # as -o default does
        echo "${{COMPREPLY[@]}}"
    """
    done = subprocess.run(
        [SHELLS["bash"], "--norc", "-c", probe], cwd=folder, capture_output=True, text=True, timeout=60
    )
    assert done.stderr == ""
    return done.stdout


def offered_by_fish(script, typed, folder):
    probe = f"source {script}; complete -C '{typed}'"
    done = subprocess.run(
        [SHELLS["fish"], "--no-config", "-c", probe],
        cwd=folder,
        capture_output=True,
        text=True,
        timeout=60,
        env={**os.environ, "HOME": str(folder)},
    )
    assert done.stderr == ""
    return "\n".join(row.partition("\t")[0] for row in done.stdout.splitlines())


class Zsh:
    """A shell on a terminal, which alone completes."""

    def __init__(self, folder):
        import pty

        self.process, self.terminal = pty.fork()
        if self.process == 0:
            os.chdir(folder)
            os.environ.update(TERM="dumb", COLUMNS="200", LINES="60", PS1="> ", HOME=str(folder))
            os.execv(SHELLS["zsh"], ["zsh", "-f", "-i"])

    def type(self, text, until):
        """What the terminal shows from then on, until it shows all of `until`."""
        os.write(self.terminal, text.encode())
        shown, end = b"", time.monotonic() + 30
        while not all(word in shown.decode(errors="replace") for word in until):
            assert time.monotonic() < end, f"{until} isn't in {shown!r}"
            if select.select([self.terminal], [], [], 1)[0]:
                shown += os.read(self.terminal, 1 << 16)
        return shown.decode()

    def close(self):
        os.kill(self.process, signal.SIGKILL)
        os.waitpid(self.process, 0)
        os.close(self.terminal)


def offered_by_zsh(script, typed, folder):
    shell = Zsh(folder)
    try:
        # ^X lists what fits and completes nothing.
        shell.type(f"PS1='> '; source {script}; bindkey '^X' list-choices; echo re''ady\n", ["ready"])
        expected = next(fitting for case, fitting, _ in CASES if case == typed)
        if len(expected) == 1:  # nothing to choose from
            return shell.type(f"{typed}\t", expected)
        return shell.type(f"{typed}\x18", expected).replace(typed, " ")
    finally:
        shell.close()


OFFERED_BY = {"bash": offered_by_bash, "zsh": offered_by_zsh, "fish": offered_by_fish}


@pytest.mark.parametrize(("typed", "offered", "not_offered"), CASES, ids=[case[0] for case in CASES])
@pytest.mark.parametrize("shell", OFFERED_BY)
def test_completion(run_cli, write_files, shell, typed, offered, not_offered):
    if SHELLS[shell] is None:
        pytest.skip(f"{shell} isn't installed")
    script = run_cli("completion", shell).stdout
    folder = write_files({"script": script, "src/a.py": "", "src/b.py": "", "a.py": ""})
    found = OFFERED_BY[shell](folder / "script", typed, folder).replace("src/", "").split()
    assert [word for word in offered if word not in found] == []
    assert [word for word in not_offered if word in found] == []
