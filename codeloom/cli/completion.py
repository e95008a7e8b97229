"""`codeloom completion`: what completes commands and options in a shell."""

import argparse
from collections.abc import Iterable, Iterator
from shlex import quote

from codeloom.cli.arguments import COMMANDS, command_named, parser_of
from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.options import Options, choice_of

SHELLS = ("bash", "zsh", "fish")

# Words by what goes before them: of a command its options, of an option its choices.
_BASH = """\
_codeloom() {{
    local current=${{COMP_WORDS[COMP_CWORD]}} before=${{COMP_WORDS[COMP_CWORD - 1]}} words=
    if [ "$COMP_CWORD" -eq 1 ]; then
        words="{commands}"
    else
        case "${{COMP_WORDS[1]}} $before" in
{choices}
        esac
        if [ -z "$words" ]; then
            case "${{COMP_WORDS[1]}}" in
{options}
            esac
            [[ $current == -* ]] || words=
        fi
    fi
    COMPREPLY=($(compgen -W "$words" -- "$current"))  # the words hold no blanks
}}
complete -o default -o bashdefault -F _codeloom codeloom
"""
# Read at the start of a shell, or put into a folder of functions, where it is run at the first use.
_ZSH = """\
#compdef codeloom
_codeloom() {{
    local -a commands
    commands=(
{commands}
    )
    if (( CURRENT == 2 )); then
        _describe command commands
        return
    fi
    case "${{words[2]}} ${{words[CURRENT - 1]}}" in
{choices}
    esac
    if [[ ${{words[CURRENT]}} != -* ]]; then
        _files
        return
    fi
    case "${{words[2]}}" in
{options}
    esac
}}
if [[ ${{funcstack[1]}} == _codeloom ]]; then
    _codeloom "$@"
else
    (( $+functions[compdef] )) || {{ autoload -U compinit && compinit; }}
    compdef _codeloom codeloom
fi
"""


class CompletionCommand(Command):
    """Prints a script for a shell."""

    NAME = "completion"
    DESCRIPTION = "Print a script that completes commands and options, for your shell to read when it starts."
    EXAMPLES = (
        "cd ~/.local/share/bash-completion/completions",
        "codeloom completion bash > codeloom",
        "codeloom completion zsh >> ~/.zshrc",
        "codeloom completion fish > ~/.config/fish/completions/codeloom.fish",
    )

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the shell."""
        parser.add_argument("shell", **choice_of(SHELLS), metavar="SHELL", help="bash, zsh or fish")

    def run(self, options: Options) -> ExitStatus:
        """Print the script."""
        console = Console()
        console.write(script_for(options.shell))
        return ExitStatus.SOUND


def script_for(shell: str) -> str:
    """The script that a shell reads."""
    if shell == "fish":
        return "".join(f"{row}\n" for row in _fish_rows())
    if shell == "zsh":
        return _ZSH.format(
            commands=_rows(8, (quote(f"{name}:{help}") for name, (*_, help) in COMMANDS.items())),
            choices=_cases(8, _choices(), "compadd -- {}; return"),
            options=_cases(8, _options(), "compadd -- {}"),
        )
    return _BASH.format(
        commands=" ".join(COMMANDS),
        choices=_cases(12, _choices(), 'words="{}"'),
        options=_cases(16, _options(), 'words="{}"'),
    )


def _cases(indent: int, words: Iterable[tuple[str, Iterable[object]]], action: str) -> str:
    """Branches of a `case`: what is before the cursor, and what to do with the words that fit there."""
    return _rows(
        indent, (f'"{before}") {action.format(" ".join(map(str, fitting)))} ;;' for before, fitting in words)
    )


def _rows(indent: int, rows: Iterable[str]) -> str:
    return "\n".join(" " * indent + row for row in rows)


def _choices() -> Iterator[tuple[str, Iterable[object]]]:
    """A command with one of its options, or with itself for an argument, and what may follow."""
    for command, action in _actions():
        if action.choices:
            for name in action.option_strings or (command,):
                yield f"{command} {name}", action.choices


def _options() -> Iterator[tuple[str, Iterable[object]]]:
    """Each command and its options."""
    for command in COMMANDS:
        yield (
            command,
            [option for name, action in _actions() if name == command for option in action.option_strings],
        )


def _fish_rows() -> Iterator[str]:
    for name, (*_, help) in COMMANDS.items():
        yield f"complete -c codeloom -n __fish_use_subcommand -f -a {name} -d {_quoted(help)}"
    for command, action in _actions():
        row = f"complete -c codeloom -n '__fish_seen_subcommand_from {command}'"
        for option in action.option_strings:
            row += f" -l {option[2:]}" if option.startswith("--") else f" -s {option[1:]}"
        if action.choices:
            row += f" -x -a {_quoted(' '.join(map(str, action.choices)))}"
        elif action.nargs != 0:
            row += " -r" if action.option_strings else ""
        if action.option_strings or action.choices:
            yield f"{row} -d {_quoted((action.help or '').partition(';')[0])}"


def _quoted(text: str) -> str:
    return "'" + text.replace("\\", "\\\\").replace("'", "\\'") + "'"


def _actions() -> Iterator[tuple[str, argparse.Action]]:
    for name in COMMANDS:
        for action in parser_of(command_named(name))._actions:
            yield name, action
